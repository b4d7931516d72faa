#include "services/firmware/provider.h"

#include "agent/gates.h"
#include "classes/CIM_LogicalPort.h"
#include "services/firmware/install.h"
#include "services/firmware/port_switches.h"
#include "services/method_call.h"
#include "services/waiting_call.h"

namespace cimple {

namespace {

bool is_known_service(const ProviderAgent& agent, const Instance* self) {
    if (agent.m_VLNMPCA_SoftwareInstallationService_map.lookup(self))
        return true;
    VLN_LOG(VLN_ERR, "Invalid instance of Software Installation Service");
    return false;
}

// Runs body(agent) behind the prologue, on an instance that there is.
template <class Body>
sint32 answer_call(const Instance* self, Property<uint32>* return_value, Body body) {
    return answer_method(*return_value, [&](ProviderAgent& agent) -> uint32 {
        const Operation_Prologue prologue(agent);
        return is_known_service(agent, self) ? body(agent) : METHOD_UNKNOWN_INSTANCE;
    });
}

} // namespace

sint32 Installation_Service_Provider::unload() {
    Waiting_Call::end_all(Service::static_meta_class);
    return Pattern_Provider::unload();
}

sint32 Installation_Service_Provider::InstallFromURI(
    const Service* self, CIM_ConcreteJob**, Property<String>* uri, CIM_ManagedElement** target,
    Property<Array<uint16>>* options, Property<Array<String>>*, Property<uint32>* return_value) {
    VLN_LOG(VLN_DBG, "VLNMPCA_SoftwareInstallationService_Provider::InstallFromURI()");
    const Waiting_Call waiting(Service::static_meta_class);
    return answer_call(self, return_value, [&](ProviderAgent& agent) {
        return install_from_uri(agent, *target, uri->value, options->value, waiting.stop());
    });
}

sint32 Installation_Service_Provider::InstallFromByteStream(const Service* self, CIM_ConcreteJob**,
                                                            Property<Array<uint8>>* image,
                                                            CIM_ManagedElement** target,
                                                            Property<Array<uint16>>* options,
                                                            Property<Array<String>>* values,
                                                            Property<uint32>* return_value) {
    VLN_LOG(VLN_DBG, "VLNMPCA_SoftwareInstallationService_Provider::InstallFromByteStream()");
    return answer_call(self, return_value, [&](ProviderAgent& agent) {
        return install_from_bytes(agent, *target, image->value, options->value, values->value);
    });
}

sint32 Installation_Service_Provider::Reset(const Service* self, CIM_LogicalPort** target,
                                            Property<uint32>* return_value) {
    VLN_LOG(VLN_DBG, "VLNMPCA_SoftwareInstallationService_Provider::Reset()");
    const sint32 status = answer_call(
        self, return_value, [&](ProviderAgent& agent) { return reset_adapter(agent, *target); });
    // The refresh decision has a lock of its own, which is never taken under m_DataMutex.
    if (status == INVOKE_METHOD_OK && return_value->value == METHOD_DONE)
        run_guarded([] { ProviderAgent::current()->BuildCimpleInfo(); });
    return status;
}

sint32 Installation_Service_Provider::SetPortEnabled(const Service* self, CIM_LogicalPort** target,
                                                     Property<boolean>* enabled,
                                                     Property<uint8>* config_status,
                                                     Property<uint32>* return_value) {
    VLN_LOG(VLN_DBG, "VLNMPCA_SoftwareInstallationService_Provider::SetPortEnabled()");
    return answer_call(self, return_value, [&](ProviderAgent& agent) {
        return set_port_enabled(agent, *target, *enabled, *config_status);
    });
}

sint32 Installation_Service_Provider::SetSRIOVState(const Service* self, CIM_LogicalPort** target,
                                                    Property<boolean>* enabled,
                                                    Property<uint32>* return_value) {
    VLN_LOG(VLN_DBG, "VLNMPCA_SoftwareInstallationService_Provider::SetSRIOVState()");
    return answer_call(self, return_value, [&](ProviderAgent& agent) {
        return set_sriov_state(agent, *target, *enabled);
    });
}

sint32 Installation_Service_Provider::GetHBAFeatures(const Service* self, CIM_LogicalPort** target,
                                                     Property<Array<uint8>>* features,
                                                     Property<uint32>* return_value) {
    VLN_LOG(VLN_DBG, "VLNMPCA_SoftwareInstallationService_Provider::GetHBAFeatures()");
    return answer_call(self, return_value, [&](ProviderAgent& agent) {
        return get_features(agent, *target, *features);
    });
}

} // namespace cimple
