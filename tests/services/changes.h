// Tables of modifications: what a client changes, what it is answered, and what the log says.
#ifndef TESTS_SERVICES_CHANGES_H
#define TESTS_SERVICES_CHANGES_H

#include "tests/road/road.h"

namespace services {

// The next call of that function answers the status.
struct Fault {
    const char* function = nullptr;
    std::uint64_t status = 0;
};

struct Change {
    host::Named_Values values; // and no other property is named
    CMPIrc status;
    const char* line; // of the log, from then on
    Fault fault = {};
    const char* call = nullptr; // the last one that the library got, as it is recorded
};

// Makes the changes one after the other, each of the instance as it is given. Needs the log.
inline void expect_changes(road::Road& road, const host::Instance& instance,
                           std::initializer_list<Change> changes) {
    for (const Change& change : changes) {
        host::Instance changed = instance;
        std::vector<std::string> names;
        for (const host::Named_Value& each : change.values) {
            host::set(changed.properties, each.name, each.value);
            names.push_back(each.name);
        }
        if (change.fault.function)
            vlnsim_fault(change.fault.function, 1, VLNSIM_STATUS, change.fault.status);
        const std::size_t before = road.log_text().size();
        vlnsim_record_calls(1);
        EXPECT_EQ(road.manager().modify(changed, names).rc, change.status) << change.line;
        EXPECT_NE(road.log_text().find(change.line, before), std::string::npos) << change.line;
        std::string calls;
        char line[256];
        for (std::size_t i = 0; vlnsim_recorded_call(i, line, sizeof line) == 0; ++i)
            calls += std::string(line) + "\n";
        EXPECT_NE(calls.find(change.call ? change.call : ""), std::string::npos)
            << change.line << "\n"
            << calls;
        vlnsim_record_calls(0);
        vlnsim_clear_calls();
        vlnsim_clear_faults();
    }
}

inline host::Value number(CMPIType type, std::uint64_t value) {
    return host::Value::unsigned_number(type, value);
}

} // namespace services

#endif // TESTS_SERVICES_CHANGES_H
