// Modifying how a port boots over the network.
#include "services/method_call.h"
#include "services/nic_settings/instances.h"
#include "services/nic_settings/provider.h"

#include <strings.h>

namespace cimple {

namespace {

using Data = VLNMPCA_NICNetworkBootData;
using Wrapper = VLN_MethodWrapper;

constexpr uint32 OFF = 0;
constexpr uint32 ON = 1;

// What is to be set; method is BOOT_UNKNOWN where it is left to us.
struct Wanted_Boot {
    uint32 value;
    Wrapper::Boot_Method method;
};

Wrapper::Boot_Method method_of(const Property<String>& text) {
    for (const auto method : {Wrapper::BOOT_PXE, Wrapper::BOOT_IBFT})
        if (!text.is_null() && strcasecmp(text.value.c_str(), boot_method_text(method)) == 0)
            return method;
    return Wrapper::BOOT_UNKNOWN;
}

// False for a client that tells no value that there is.
bool read_wanted(const Data& model, Wanted_Boot& wanted) {
    if (model.Value.is_null())
        return false;
    wanted = {model.Value.value, Wrapper::BOOT_UNKNOWN};
    if (wanted.value == ON)
        wanted.method = method_of(model.BootMethod);
    else if (wanted.value != OFF)
        VLN_LOG(VLN_DBG, "Value passed: %d ", static_cast<int>(wanted.value));
    return wanted.value == ON || wanted.value == OFF;
}

bool is_so(const Data& stored, const Wanted_Boot& wanted) {
    return stored.Value.value == wanted.value && (wanted.method == Wrapper::BOOT_UNKNOWN ||
                                                  wanted.method == method_of(stored.BootMethod));
}

sint32 set_boot(ProviderAgent& agent, const Data& stored, const HBA_WWN& name,
                const Wanted_Boot& wanted) {
    const auto method = wanted.method == Wrapper::BOOT_UNKNOWN ? Wrapper::BOOT_PXE : wanted.method;
    const AX_STATUS status =
        Wrapper::SetNICNetworkBootParams(&name, wanted.value == ON ? "E" : "D", method);
    if (status != AX_STATUS_OK) {
        VLN_LOG(VLN_ERR, "AX Error for modifying the NIC Network Boot Params. Status: %d",
                static_cast<int>(status));
        return MODIFY_INSTANCE_FAILED;
    }
    const auto shown = wanted.value == ON ? method : Wrapper::BOOT_NONE;
    change(agent.m_VLNMPCA_NICNetworkBootData_map, &stored, [&](Data& data) {
        data.Value.set(wanted.value);
        data.BootMethod.set(boot_method_text(shown));
    });
    VLN_LOG(VLN_DBG, "Successfully modified the NIC Network Boot Status");
    return MODIFY_INSTANCE_OK;
}

sint32 modify(ProviderAgent& agent, const Data* model, const Data* instance) {
    if (!model || !instance)
        return refuse_modify(MODIFY_INSTANCE_INVALID_PARAMETER,
                             "VLNMPCA_NICNetworkBootData::modify_instance invalid parameter");
    const Data* stored = agent.m_VLNMPCA_NICNetworkBootData_map.lookup(instance);
    if (!stored)
        return refuse_modify(MODIFY_INSTANCE_FAILED,
                             "Invalid instance of VLNMPCA_NICNetworkBootData ");
    HBA_WWN name{};
    if (!port_of_setting(*stored, name))
        return MODIFY_INSTANCE_FAILED;
    Wanted_Boot wanted{};
    if (!read_wanted(*model, wanted))
        return refuse_modify(MODIFY_INSTANCE_INVALID_PARAMETER, "No Value parameter specified");
    if (is_so(*stored, wanted)) {
        VLN_LOG(VLN_DBG, "Boot is not modified, since the same state exists");
        return MODIFY_INSTANCE_OK;
    }
    return set_boot(agent, *stored, name, wanted);
}

} // namespace

sint32 Network_Boot_Provider::modify_instance(const Data* model, const Data* instance) {
    return answer_modify([&](ProviderAgent& agent) { return modify(agent, model, instance); });
}

} // namespace cimple
