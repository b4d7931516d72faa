// The calls that change something, for tests that let each event of them fail in turn. A service
// joins by a line of changes.tsv for each method, modify, create and delete.
#ifndef TESTS_HOSTILE_CHANGES_H
#define TESTS_HOSTILE_CHANGES_H

#include "tests/road/road.h"

namespace hostile {

struct Change {
    std::string scenario; // a file of the scenarios
    // "CLASS.METHOD", called on the first instance of the class; "CLASS", whose first instance is
    // modified; "+CLASS", of which an instance is created; "-CLASS", whose first instance is
    // deleted. "CLASS#2" stands for the second instance, here and below.
    std::string what;
    // As mpcactl takes them, where <CLASS> stands for the path of the first instance of a class,
    // and <> for the folder of the host's root, in which the image new.img lies.
    std::vector<std::string> values;
    // What each try of it begins with: the rows before it whose `what` stands behind "&".
    std::vector<Change> before = {};
};

// All lines of changes.tsv: scenario, what and values between tabs.
std::vector<Change> read_changes();

// A change on the road's host, with its values read and its image written, so that it can be made
// again and again.
class Prepared_Change {
public:
    Prepared_Change(road::Road& road, const Change& change);

    const std::string& class_name() const { return _instance.path.class_name; }
    void make_ready() const; // makes what stands before it
    // As "OK 0" or "CMPI_RC_ERR_FAILED": the status, and what a method returned.
    std::string make() const;

private:
    std::string make_of_instance() const; // all but a method

    road::Road& _road;
    char _kind = 0; // '+', '-', or neither
    std::string _method;
    host::Instance _instance;
    host::Named_Values _values;
    std::vector<Prepared_Change> _before;
};

} // namespace hostile

#endif // TESTS_HOSTILE_CHANGES_H
