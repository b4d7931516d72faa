// What road tests share: a simulated host with the product's module loaded by the object manager.
//
// Every Road works in a fresh folder as the host's root, with a virtual clock that starts at a
// fixed time, and fails its test if the provider left a fault, a leak or a breach of the libraries'
// contract.
#ifndef TESTS_ROAD_ROAD_H
#define TESTS_ROAD_ROAD_H

#include "host/manager.h"
#include "simulator/vlnsim.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <functional>
#include <map>
#include <string>

namespace road {

struct Setup {
    std::string scenario = "two-port-cna.json"; // a file of the scenarios, or a JSON text
    std::string platform = {};                  // a JSON text, "" for none
    bool libraries = true;                      // false: the host has none of the closed libraries
    bool log = false;                           // level 5 to the provider's log file
    bool elements_marked_null = false;          // as host::Options has it
    // As host::Options has it; off, so that a test sees what the provider itself gave.
    bool class_defaults = false;
    std::function<void(const std::string&)> trace = {}; // see host::Options
    decltype(host::Options::refuse) refuse = {};        // see host::Options
};

class Road {
public:
    explicit Road(const Setup& setup = {});
    ~Road();

    host::Manager& manager() { return *_manager; }
    // The instances of a class; the call must succeed, and the MOF have a word for each number that
    // stands for one.
    std::vector<host::Instance> enumerate(const std::string& class_name);
    // Instances of every class that has any.
    std::map<std::string, std::size_t> census();
    // Ends the module, with all checks; the log is complete afterwards.
    void close();

    std::filesystem::path root() const { return _root; }
    std::string log_text() const; // of the provider's log file
    std::size_t count_in_log(const std::string& text) const;
    // The lines of level 1 but the logger's own first one.
    std::string faults_in_log() const;
    // Until that many refresh threads have ended since the start. Needs the log.
    void wait_for_refreshes(std::size_t count);

private:
    std::filesystem::path _root;
    std::unique_ptr<host::Manager> _manager;
};

// A property as text: numbers in decimal, arrays in braces, "-" for null or not set.
std::string text_of(const host::Instance& instance, const std::string& property);

// The instance that a text names: the first of "CLASS", the second of "CLASS#2", the first whose
// property is so, as text_of gives it, of "CLASS[PROPERTY=TEXT]"; and each of them with another
// text, "CLASS!PROPERTY=TEXT". Throws if there is none.
host::Instance instance_of(Road& road, const std::string& text);
// The text with the path of the instance that "<CLASS...>" names, and the folder of the host's root
// for "<>".
std::string filled_in(Road& road, const std::string& text);

} // namespace road

#endif // TESTS_ROAD_ROAD_H
