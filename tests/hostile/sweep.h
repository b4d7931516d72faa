// One sweep for all: an operation is repeated with its n-th event failing, for every n.
//
//  1. An operation is a refresh of a scenario (the load of all classes, what the first clients wait
//     for, and the end), a look at a class in every way (names, instances, get, association
//     walks), or a change of changes.tsv. A class or service joins by its census
//     or its row.
//  2. A healthy run counts its events, of nine kinds (events.h). Each becomes a point, or several:
//     a library call fails with each status that it is known for (statuses.tsv), with 1, with two
//     that nobody documents, as an absent function; a broker call gives null with a status and
//     without one.
//  3. Each point runs in a life of its own: fresh host, fresh agent, one event refused, a second
//     look at the same agent, its end. After it no object of the broker, thread, descriptor
//     or breach of the libraries' contract is left. Only looks share an agent: a look
//     changes nothing.
//  4. The next life shows the whole host, or the look after it the whole class: whatever a failure
//     spoils shows there. A lock that is still held shows as a hang. Where a refresh has many
//     points, the whole host is looked at after every eighth.
//  5. Lives run in forked children. One that crashes, hangs or finds something costs its point; the
//     next child goes on behind it. A watchdog prints the stacks of all threads of a hang.
//  6. The suite takes a sample, the same each time: environment variable VLN_SWEEP_SEED gives
//     another, VLN_SWEEP=all takes all points, VLN_SWEEP=100 so many of each kind and operation,
//     VLN_SWEEP_OPERATIONS those of some operations, VLN_SWEEP_POINT="allocation 7" one of each.
#ifndef TESTS_HOSTILE_SWEEP_H
#define TESTS_HOSTILE_SWEEP_H

#include "tests/hostile/changes.h"
#include "tests/hostile/events.h"

#include <array>
#include <optional>
#include <set>

namespace sweep {

const char* kind_name(Kind kind);

// Of the module, which must be loaded.
Events& events_of_module();

inline constexpr std::size_t ALL = ~std::size_t(0);

struct Operation {
    std::string name;
    std::string scenario;        // a file of the scenarios, or a JSON text
    bool log = false;            // with the provider's log at its most talkative
    bool is_judged = false;      // what a failed call costs it; the scenario is WITH_TARGETS
    std::size_t most = ALL;      // points of one kind that are worth their time
    std::string class_name = {}; // of a look
    std::optional<hostile::Change> row = {}; // of a change
    bool is_refresh() const { return class_name.empty() && !row; }
};

// Those whose name contains one of the words, or all without a word; by scenario.
std::vector<Operation> all_operations(const std::vector<std::string>& words);

// One failure: of the event of that number, or as the simulator has it.
struct Point {
    Kind kind;
    unsigned long number; // of its kind, from 1
    CMPIrc code = CMPI_RC_ERR_FAILED;
    std::string function = {};
    unsigned call = 0;
    vlnsim_fault_kind fault = VLNSIM_STATUS;
    std::uint64_t value = 0;
    std::string line = {}; // the call as a healthy run makes it

    std::string text() const;
};

using Counts = std::array<unsigned long, KINDS>;

extern const std::string WITH_TARGETS;
// What the failure has cost that it must not; "" for nothing. Both are looks at all.
std::string judged(const Point& point, const std::string& healthy, const std::string& shown);

// What the points of an operation are taken by.
struct Choice {
    std::size_t most = 0; // points of one kind and operation; 0: the suite's sample
    unsigned seed = 1;
    std::string text = {}; // of the only point to be taken; "": any
};

// A host in this process, and the operations on it.
class Stage {
public:
    Stage(const std::string& scenario, bool log);

    // Runs it healthy, and answers its points: all of them in found, those chosen as a result.
    std::vector<Point> prepare(const Operation& operation, const Choice& choice, Counts& found);
    // whole: the next agent is looked at too, as it always is after a change.
    void run(const Operation& operation, const Point& point, bool whole);
    void close();

private:
    std::string look(); // all paths of all classes
    void fetch();
    std::string perform(const Operation& operation);
    std::string look_at(const std::string& class_name);
    std::filesystem::path saved_settings() const;
    void begin_life();
    void end_life(const Point* point = nullptr);
    void arm(const Point& point);
    void disarm();
    bool refuses(bool is_up_call, const char* function, CMPIrc& code);
    std::vector<std::string> recorded_calls() const;

    CMPIrc _code = CMPI_RC_ERR_FAILED; // of what the broker refuses
    Events* _events = nullptr;
    road::Road _road;
    std::optional<hostile::Prepared_Change> _change;
    std::string _whole;   // the healthy look
    std::string _healthy; // answer of the operation
    bool _lives = false;
    std::size_t _objects = 0;     // of a life between calls
    std::size_t _threads = 0;     // after a life
    std::size_t _descriptors = 0; // likewise
};

// Runs all points of the operations in children of so many jobs; answers how many findings there
// were, after a table on the standard output.
unsigned long sweep_all(const std::vector<Operation>& operations, const Choice& choice,
                        unsigned jobs);

} // namespace sweep

#endif // TESTS_HOSTILE_SWEEP_H
