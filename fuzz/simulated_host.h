// The product's module over a simulated host, for fuzzers that go through its entry points: loaded
// once, asked by the in-process object manager, and put back cheaply where an input changed it.
#ifndef FUZZ_SIMULATED_HOST_H
#define FUZZ_SIMULATED_HOST_H

#include "host/core.h"
#include "host/manager.h"

#include <string>
#include <vector>

namespace fuzz {

// A class that the module serves, with what the host has of it when nothing has changed it.
struct Stocked_Class {
    const host::Class* known;
    std::vector<host::Instance> instances;
};

// One per process, to its end: threads of the module live as long.
class Simulated_Host {
public:
    Simulated_Host(const std::string& module, const std::string& scenario);

    host::Manager& manager() { return _manager; }
    // For calls that are not checked as those of a manager are.
    host::Core& core() { return _core; }
    const std::vector<Stocked_Class>& stock() const { return _stock; }
    const std::vector<host::Instance>* stock_of(const std::string& class_name) const;
    const std::string& root() const { return _root; }

    // The next look at a class starts a refresh.
    void outdate();
    // Waits for a refresh, if one is due.
    void settle();
    // Ends the process with a message if the provider made a fault or broke the libraries'
    // contract. Lenient: names, handles and numbers that are unknown to the library are no breach,
    // as it may have told them.
    void check(bool lenient = false);
    // The host, its files and the provider as they were at first. Ends the process with a message
    // if an object of the broker is left.
    void restart();
    // Whether a function was called since the last restart that changes the host.
    bool is_changed() const;

private:
    void prepare_root() const;

    std::string _root;
    host::Manager _manager;
    host::Core& _core;
    std::vector<Stocked_Class> _stock;
};

} // namespace fuzz

#endif // FUZZ_SIMULATED_HOST_H
