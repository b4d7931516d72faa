// What the methods and the modifications of all services share: the frames that an exception does
// not leave, and the ports that a client may mean.
#ifndef VLN_SERVICES_METHOD_CALL_H
#define VLN_SERVICES_METHOD_CALL_H

#include "agent/gates.h"
#include "agent/provider_agent.h"
#include "agent/store_search.h"
#include "cimple/guard.h"
#include "classes/VLNMPCA_EthernetPort.h"
#include "classes/VLNMPCA_FCPort.h"

namespace cimple {

// Return values that the services have in common.
enum Method_Result : uint32 {
    METHOD_DONE = 0,
    METHOD_NO_MEMORY = 32774,
    METHOD_INVALID_TARGET = 32968,
    METHOD_UNKNOWN_INSTANCE = 33068,
    METHOD_LIBRARY_STATUS = 40000, // plus the status of the management library
};

// Runs body(agent), which answers the method's return value.
template <class Body>
sint32 answer_method(Property<uint32>& return_value, Body body) {
    ProviderAgent* agent = ProviderAgent::current();
    if (!agent)
        return INVOKE_METHOD_FAILED;
    uint32 value = METHOD_NO_MEMORY;
    if (!run_guarded([&] { value = body(*agent); }))
        VLN_LOG(VLN_ERR, "A method ended for want of memory");
    return_value.set(value);
    return INVOKE_METHOD_OK;
}

// Runs body(agent) behind the prologue, which answers the status of a change of instances; failed
// when it does not come to its end.
template <class Body>
sint32 answer_change(sint32 failed, Body body) {
    ProviderAgent* agent = ProviderAgent::current();
    if (!agent)
        return failed;
    sint32 status = failed;
    const bool complete = run_guarded([&] {
        const Operation_Prologue prologue(*agent);
        status = body(*agent);
    });
    return complete ? status : failed;
}

// The same for modify_instance.
template <class Modify>
sint32 answer_modify(Modify modify) {
    return answer_change(MODIFY_INSTANCE_FAILED, modify);
}

// The status of a modify_instance that ends with a line of the log.
inline sint32 refuse_modify(sint32 status, const char* line) {
    VLN_LOG(VLN_ERR, "%s", line);
    return status;
}

// The port of a store that has the identifier, or null.
template <class Port>
const Port* find_port(const Instance_Map<Port>& ports, const String& device_id) {
    return find_first(ports, [&](const Port& port) { return port.DeviceID.value == device_id; });
}

// Whether any port of the host has the identifier: of a NIC or iSCSI function, or of an FCoE one.
inline bool is_known_port(const ProviderAgent& agent, const String& device_id) {
    return find_port(agent.m_VLNMPCA_EthernetPort_map, device_id) ||
           find_port(agent.m_VLNMPCA_FCPort_map, device_id);
}

} // namespace cimple

#endif // VLN_SERVICES_METHOD_CALL_H
