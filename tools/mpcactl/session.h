// One run of the program: the object manager with its module, and what there is to say at the end.
#ifndef MPCACTL_SESSION_H
#define MPCACTL_SESSION_H

#include "host/manager.h"
#include "tools/mpcactl/settings.h"
#include "tools/mpcactl/simulation.h"

#include <memory>

namespace mpcactl {

class Session {
public:
    // Loads classes, platform, simulator and module. Throws Usage_Error.
    Session(const Session_Settings& settings, const std::string& name_space);

    host::Manager& manager() { return *_manager; }
    const host::ClassRepository& classes() const { return _manager->classes(); }
    Simulation& simulation(); // throws Usage_Error: there is none

    // What a command names, or Usage_Error with the nearest names.
    const host::Class& known_class(const std::string& name) const;
    const host::Class& known_association(const std::string& name) const;
    const host::Method& known_method(const host::Class& known, const std::string& name) const;
    host::ObjectPath path(const Command& command) const;

    // Writes faults and breaches since the last report to standard error. The exit status.
    int report();
    // Unloads the module, keeps the simulated host's state and reports. The exit status; throws
    // Usage_Error if the state cannot be kept.
    int finish();

private:
    std::unique_ptr<Simulation> _simulation; // outlives the manager
    std::unique_ptr<host::Manager> _manager;
    std::size_t _breaches_told = 0;
};

} // namespace mpcactl

#endif // MPCACTL_SESSION_H
