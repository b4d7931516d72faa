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
    explicit Session(const Settings& settings);

    const Settings& settings;
    host::Manager& manager() { return *_manager; }

    // What the command line names, or Usage_Error with the nearest names.
    const host::Class& known_class(const std::string& name) const;
    const host::Class& known_association(const std::string& name) const;
    const host::Method& known_method(const host::Class& known, const std::string& name) const;
    host::ObjectPath path() const;
    host::Property_List properties(const host::Class* known) const; // null: of any class

    // Unloads the module and reports faults and leaks on standard error. The exit status.
    int finish();

private:
    std::unique_ptr<Simulation> _simulation; // outlives the manager
    std::unique_ptr<host::Manager> _manager;
};

} // namespace mpcactl

#endif // MPCACTL_SESSION_H
