#include "services/firmware/port_switches.h"

#include "agent/status/dynamic_status.h"
#include "services/method_call.h"

#include <memory>
#include <new>

namespace cimple {

namespace {

constexpr char INVALID_PORT[] = "VLNMPCA_SoftwareInstallationService_Provider invalid port passed";

// False, with the line, for a target that is missing, or that no port of the host is.
bool is_port(const ProviderAgent& agent, const CIM_LogicalPort* target,
             const char* missing = INVALID_PORT) {
    if (target && is_known_port(agent, target->DeviceID.value))
        return true;
    VLN_LOG(VLN_ERR, "%s", target ? INVALID_PORT : missing);
    return false;
}

} // namespace

bool adapter_name(const CIM_LogicalPort& target, HBA_WWN& name) {
    return nameOfDeviceId(target.DeviceID.value.c_str(), name,
                          "VLNMPCA_SoftwareInstallationService_Provider::", VLN_ERR);
}

uint32 reset_adapter(ProviderAgent& agent, const CIM_LogicalPort* target) {
    HBA_WWN name{};
    if (!is_port(agent, target, "Invalid Port is passed") || !adapter_name(*target, name))
        return METHOD_INVALID_TARGET;
    if (const AX_STATUS status = VLN_MethodWrapper::vlncimReset(&name))
        return METHOD_LIBRARY_STATUS + status;
    VLN_LOG(VLN_WARN,
            "VLNMPCA_SoftwareInstallationService_Provider::vlncimReset for target %s is "
            "Successful.. Updating the Provider Data",
            target->DeviceID.value.c_str());
    agent.m_bAdapterRefreshRequested = true;
    return METHOD_DONE;
}

uint32 set_port_enabled(ProviderAgent& agent, const CIM_LogicalPort* target,
                        const Property<boolean>& enabled, Property<uint8>& config_status) {
    if (!is_port(agent, target))
        return METHOD_INVALID_TARGET;
    const String device_id = target->DeviceID.value;
    if (!agent.m_VLNMPCA_EthernetPort_map.lookup(target)) {
        VLN_LOG(VLN_ERR, "Invalid Port is passed, Cannot Enable/Disable port");
        return METHOD_INVALID_TARGET;
    }
    if (enabled.is_null()) {
        VLN_LOG(VLN_ERR, "Invalid input for PortEnabled argument ");
        return METHOD_INVALID_TARGET;
    }
    uint32 dynamic = 0;
    if (const AX_STATUS status =
            VLN_MethodWrapper::SetPortEnabled(device_id.c_str(), enabled.value, &dynamic)) {
        VLN_LOG(VLN_ERR,
                "VLNMPCA_SoftwareInstallationService_Provider::SetPortEnabled failed for target %s",
                device_id.c_str());
        return METHOD_LIBRARY_STATUS + status;
    }
    config_status.set(static_cast<uint8>(dynamic));
    readEthernetPortStatus(agent, device_id);
    return METHOD_DONE;
}

uint32 set_sriov_state(ProviderAgent& agent, const CIM_LogicalPort* target,
                       const Property<boolean>& enabled) {
    if (!target) {
        VLN_LOG(VLN_ERR, "Target Port is NULL");
        return METHOD_INVALID_TARGET;
    }
    auto& ports = agent.m_VLNMPCA_EthernetPort_map;
    if (!ports.lookup(target)) {
        VLN_LOG(VLN_ERR, "Invalid Port is passed, Cannot Enable/Disable SRIOV");
        return METHOD_INVALID_TARGET;
    }
    if (enabled.is_null()) {
        VLN_LOG(VLN_ERR, "Invalid input for EnableState argument ");
        return METHOD_INVALID_TARGET;
    }
    HBA_WWN name{};
    if (!adapter_name(*target, name))
        return METHOD_INVALID_TARGET;
    const uint16 state = enabled.value ? 1 : 0;
    if (const AX_STATUS status = VLN_MethodWrapper::SetSRIOVEnabledState(&name, state))
        return METHOD_LIBRARY_STATUS + status;
    change(ports, target, [state](VLNMPCA_EthernetPort& port) { port.SRIOVState.set(state); });
    VLN_LOG(VLN_WARN,
            "VLNMPCA_SoftwareInstallationService_Provider::SetSRIOVState for target %s is "
            "Successful. Reboot Required ",
            target->DeviceID.value.c_str());
    return METHOD_DONE;
}

uint32 get_features(const ProviderAgent& agent, const CIM_LogicalPort* target,
                    Property<Array<uint8>>& features) {
    HBA_WWN name{};
    if (!is_port(agent, target) || !adapter_name(*target, name))
        return METHOD_INVALID_TARGET;
    const std::unique_ptr<uint8[]> list(new (std::nothrow) uint8[AX_FEATURE_LIST_SIZE]);
    if (!list) {
        VLN_LOG(VLN_ERR, "Unable to allocate the memory for retrieving features. ");
        return METHOD_NO_MEMORY;
    }
    if (const AX_STATUS status = VLN_MethodWrapper::GetHBAFeatureList(&name, list.get()))
        return METHOD_LIBRARY_STATUS + status;
    features.value.assign(list.get(), AX_FEATURE_LIST_SIZE);
    features.null = 0;
    return METHOD_DONE;
}

} // namespace cimple
