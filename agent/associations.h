// The one way in which the agent makes instances, and the one way in which it joins two of them.
//
// The stores named here are written: m_DataMutex and the ready mutex of their group are held.
#ifndef VLN_AGENT_ASSOCIATIONS_H
#define VLN_AGENT_ASSOCIATIONS_H

#include "agent/name_spaces.h"
#include "cimple/instance_map.h"
#include "classes/CIM_ComputerSystem.h"
#include "foundation/logger.h"

#include <functional>
#include <initializer_list>

namespace cimple {

// A new instance in "root/vorlan" with every property null, as each map builder starts from.
Instance* make_instance(const Meta_Class* meta_class);

template <class T>
Ref<T> make_instance() {
    return Ref<T>(make_instance(&T::static_meta_class));
}

// The keys of an instance that is weak to its system: the system's, and its own class.
template <class T>
void name_in_system(T& instance, const CIM_ComputerSystem& system) {
    instance.SystemCreationClassName.set(system.CreationClassName.value);
    instance.SystemName.set(system.Name.value);
    instance.CreationClassName.set(instance.__meta_class->name);
}

// What a failed insertion says, and at which level; a null text stands for "Insert Failed :
// m_<class>_map".
struct Insert_Failure {
    const char* text = nullptr;
    int level = VLN_CRIT;

    Insert_Failure() = default;
    Insert_Failure(const char* failure_text, int failure_level = VLN_CRIT)
        : text(failure_text), level(failure_level) {}
};

// Hands the instance to the store. On a duplicate key it logs the failure, destroys the instance
// and answers null; otherwise the store owns what is answered.
const Instance* insert_instance(Instance_Map_Base& store, Ref<Instance> instance,
                                const Insert_Failure& failure = {});

template <class T>
const T* insert_instance(Instance_Map<T>& store, Ref<T> instance,
                         const Insert_Failure& failure = {}) {
    return static_cast<const T*>(insert_instance(static_cast<Instance_Map_Base&>(store),
                                                 Ref<Instance>(instance.release()), failure));
}

// An association whose references, in the order in which the class declares them, share the ends.
// Null, with a line in the log, if an end is null or not of the class that the reference wants.
using Association_Ends = std::initializer_list<const Instance*>;
Ref<Instance> association_of(const Meta_Class* meta_class, Association_Ends ends);

// Joins two instances: makes an instance of the store's class as association_of does. Answers
// the instance, owned by the store, or null with a line in the log: it could not be made, or the
// store holds the association already.
// What it tells beside its ends is set by details, before the store has it.
using Association_Details = std::function<void(Instance& association)>;
const Instance* associate(Instance_Map_Base& store, const Instance* first, const Instance* second,
                          const Insert_Failure& failure = {},
                          const Association_Details& details = {});

// The same for two that may be joined already, by another function of the same hardware: then
// nothing is done, and null answered without a line.
const Instance* associate_once(Instance_Map_Base& store, const Instance* first,
                               const Instance* second, const Insert_Failure& failure = {},
                               const Association_Details& details = {});

// The same for any number of ends.
const Instance* associate(Instance_Map_Base& store, Association_Ends ends,
                          const Insert_Failure& failure = {},
                          const Association_Details& details = {});

// The same for two ends after a line that tells the class and, in the text, who is joined.
const Instance* associate_as(Instance_Map_Base& store, const String& text, const Instance* first,
                             const Instance* second, const Insert_Failure& failure = {},
                             const Association_Details& details = {});

} // namespace cimple

#endif // VLN_AGENT_ASSOCIATIONS_H
