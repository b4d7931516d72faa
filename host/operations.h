// The operations of a manager, once for its clients and once more for up-calls.
//
// Each call here runs one provider, which is chosen already. Complete checks of what the client
// gave come before; what the provider answers was checked by the time it comes back.
#ifndef HOST_OPERATIONS_H
#define HOST_OPERATIONS_H

#include "host/core.h"

namespace host {

// Where a request goes.
struct Target {
    const Class* known = nullptr;
    std::string name_space;
    bool platform = false; // else the class has a provider
};
// Who answers a request of the kind. Of a class that is not registered a client reaches the
// provider in any namespace.
Status find_target(Core& core, const std::string& class_name, const std::string& name_space,
                   Interface kind, Target& target);

Reply<std::vector<Instance>> enumerate(Core& core, const Target& target,
                                       const Property_List& properties);
Reply<std::vector<ObjectPath>> enumerate_names(Core& core, const Target& target);
Reply<Instance> get(Core& core, const Target& target, const ObjectPath& path,
                    const Property_List& properties);
Reply<ObjectPath> create(Core& core, const Target& target, const Instance& instance);
Status modify(Core& core, const Target& target, const Instance& instance,
              const Property_List& properties);
Status remove(Core& core, const Target& target, const ObjectPath& path);
Reply<Method_Result> invoke(Core& core, const Target& target, const ObjectPath& path,
                            const std::string& method, const Named_Values& inputs);

// The properties are the class's, of its types, references complete; keys of the path only if the
// object exists already. Fits null types and spelling.
Status check_instance(Core& core, Instance& instance, bool exists);
Status check_complete(Core& core, ObjectPath& path);
// Inputs of a method, fitted.
Status check_inputs(Core& core, const Class& known, const std::string& method,
                    Named_Values& inputs);

// ---- Associations ----

enum class Walk { associators, references };

Reply<std::vector<Instance>> walk(Core& core, const ObjectPath& path, Walk what,
                                  const Association_Filter& filter,
                                  const Property_List& properties);
Reply<std::vector<ObjectPath>> walk_names(Core& core, const ObjectPath& path, Walk what,
                                          const Association_Filter& filter);

} // namespace host

#endif // HOST_OPERATIONS_H
