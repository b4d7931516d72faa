#include "services/channels/provider.h"

#include "cimple/meta.h"
#include "operations/method_wrapper.h"
#include "services/channels/channel_rules.h"
#include "services/channels/instances.h"
#include "services/method_call.h"

namespace cimple {

namespace {

#define OF_PROVIDER "VLNMPCA_ChannelMgmtService_Provider"

constexpr uint32 NOT_READ_ANEW = 32769;
constexpr char BANDWIDTHS_FAILED[] = OF_PROVIDER "::SetCMBandwidths call method failed";

Channel_Values values_of(const Property<Array<uint16>>& values) {
    return {values.value.begin(), values.value.size()};
}

// One call on the service. Its checks answer false when they have put what is wrong into the
// result.
struct Channel_Call {
    ProviderAgent& agent;
    const VLNMPCA_ChannelMgmtService* self;
    const Instance* target; // of any class
    uint32 result = METHOD_DONE;
    String channel = {};                // identifier of the setting, once find_channel has it
    String adapter = {};                // device identifier of the port that tells it
    uint32 configured_mode = 0;         // of the setting
    HBA_WWN name{};                     // of the adapter
    AX_ChannelMgmtCNAInfo management{}; // once read_management has it
    AX_ChannelMgmtPortInfo port{};      // once read_port has it

    bool refuse(uint32 value, const char* line) {
        VLN_LOG(VLN_ERR, "%s", line);
        result = value;
        return false;
    }
    bool obey(const Refused& refused) { return !refused || refuse(refused->number, refused->line); }
    bool accept(AX_STATUS status) {
        if (status == AX_STATUS_OK)
            return true;
        result = METHOD_LIBRARY_STATUS + status;
        return false;
    }

    bool check_service() {
        return (self && agent.m_VLNMPCA_ChannelMgmtService_map.lookup(self)) ||
               refuse(METHOD_UNKNOWN_INSTANCE, "Invalid instance of VLNMPCA_ChannelMgmtService");
    }
    bool check_target() {
        return target || refuse(METHOD_INVALID_TARGET, "Invalid Target is passed");
    }

    bool convert(const String& device_id) {
        if (nameOfDeviceId(device_id.c_str(), name, OF_PROVIDER "::", VLN_ERR))
            return true;
        result = METHOD_INVALID_TARGET;
        return false;
    }

    bool find_channel() {
        const auto& settings = agent.m_VLNMPCA_ChannelSettingData_map;
        const auto* setting = cast<VLNMPCA_ChannelSettingData>(settings.lookup(target));
        if (!setting)
            return refuse(METHOD_UNKNOWN_INSTANCE,
                          "Invalid instance of VLNMPCA_ChannelSettingData");
        channel = setting->InstanceID.value;
        adapter = setting->Adapter.value;
        configured_mode = setting->ConfiguredMgmtType.value;
        return true;
    }

    bool read_management() {
        return accept(VLN_MethodWrapper::GetChannelMgmtCNAInfo(&name, &management));
    }
    bool read_port() { return accept(VLN_MethodWrapper::GetChannelMgmtPortInfo(&name, &port)); }
    bool ask_kind(bool& current) {
        return accept(VLN_MethodWrapper::HasFeature(
            &name, VLN_MethodWrapper::HAS_CURRENT_CHANNEL_MGMT, &current));
    }
    bool write_port(uint32 mask) {
        port.mask = mask;
        return accept(VLN_MethodWrapper::SetChannelMgmtPortInfo(&name, port));
    }

    bool check_enabled() {
        const Refused refused = management_is_on(management);
        if (refused)
            VLN_LOG(VLN_ERR, OF_PROVIDER ":: CM is disabled %s", channel.c_str());
        return obey(refused);
    }

    // Writes into the setting of each channel what set(setting, number) puts there.
    template <class Set>
    void change_settings(Set set) {
        auto& settings = agent.m_VLNMPCA_ChannelSettingData_map;
        for (uint32 number = 0; number < port.count; ++number) {
            const String mac = mac_of_channel(port.channel[number]);
            for (uint32 i = 0; i < settings.size(); ++i)
                if (settings[i]->MACAddress.value == mac)
                    change(settings, i,
                           [&](VLNMPCA_ChannelSettingData& setting) { set(setting, number); });
        }
    }
};

// Runs the steps of a method behind the prologue, on a service that there is.
template <class Steps>
sint32 run(const VLNMPCA_ChannelMgmtService* self, const Instance* target, Property<uint32>* result,
           Steps steps) {
    return answer_method(*result, [&](ProviderAgent& agent) {
        const Operation_Prologue prologue(agent);
        Channel_Call call{agent, self, target};
        if (call.check_service())
            steps(call);
        return call.result;
    });
}

// ---- Steps ----

bool prepare_types(Channel_Call& call, uint32 type1, uint32 type2) {
    bool current = false;
    return call.check_target() && call.find_channel() &&
           call.obey(types_can_stand_together(type1, type2)) && call.convert(call.adapter) &&
           call.ask_kind(current) && call.obey(management_is_current(current)) &&
           call.read_management() && call.check_enabled() &&
           call.obey(types_are_free(call.management)) && call.read_port() &&
           call.obey(types_can_be_set(call.port));
}

void set_types(Channel_Call& call, uint32 type1, uint32 type2) {
    if (has_types(call.port, type1, type2)) {
        VLN_LOG(VLN_DBG, OF_PROVIDER "::Specified settings match the exisiting configuration. ");
        return;
    }
    call.port.channel[0].type = type1;
    call.port.channel[1].type = type2;
    if (!call.write_port(AX_CHANNEL_MASK_TYPE))
        return;
    if (rebuild_channel_settings(call.agent, call.adapter) != AX_STATUS_OK)
        call.refuse(NOT_READ_ANEW, OF_PROVIDER "::SetCMChannelType Succesful. But updation in the "
                                               "maps failed.");
}

bool prepare_bandwidths(Channel_Call& call, Channel_Values minimums, Channel_Values maximums) {
    return call.obey(bandwidths_are_given(call.target, minimums.size(), maximums.size())) &&
           call.find_channel() && call.convert(call.adapter) && call.read_management() &&
           call.check_enabled() && call.obey(bandwidths_are_free(call.management)) &&
           call.read_port() && call.obey(bandwidths_can_be_set(call.port, minimums.size()));
}

void set_bandwidths(Channel_Call& call, Channel_Values minimums, Channel_Values maximums) {
    if (!call.obey(bandwidths_fit_channels(call.port, minimums, maximums)) ||
        !call.obey(bandwidths_add_up(call.management, minimums))) {
        VLN_LOG(VLN_ERR, "%s", BANDWIDTHS_FAILED);
        return;
    }
    if (has_bandwidths(call.port, minimums, maximums)) {
        VLN_LOG(VLN_DBG,
                OF_PROVIDER "::Need not set the bandwidths since same configuration exists. ");
        return;
    }
    for (std::size_t i = 0; i < minimums.size(); ++i) {
        call.port.channel[i].minBandwidth = minimums[i];
        call.port.channel[i].maxBandwidth = maximums[i];
    }
    if (!call.write_port(AX_CHANNEL_MASK_BANDWIDTH)) {
        VLN_LOG(VLN_ERR, "%s", BANDWIDTHS_FAILED);
        return;
    }
    call.change_settings([&](VLNMPCA_ChannelSettingData& setting, uint32 number) {
        setting.MinBandwidth.set(minimums[number]);
        setting.MaxBandwidth.set(maximums[number]);
    });
}

bool prepare_lpvids(Channel_Call& call, Channel_Values lpvids) {
    bool current = false;
    if (lpvids.empty())
        return call.refuse(METHOD_INVALID_TARGET, "No LPVIDs are passed");
    return call.check_target() && call.find_channel() && call.convert(call.adapter) &&
           call.ask_kind(current) && call.read_management() &&
           call.obey(lpvids_are_supported(call.management, current)) &&
           call.obey(lpvids_are_on(call.management)) && call.read_port() &&
           call.obey(lpvids_can_be_set(call.port, lpvids.size())) &&
           call.obey(lpvids_are_valid(call.management, call.port, lpvids));
}

void set_lpvids(Channel_Call& call, Channel_Values lpvids) {
    const bool inner = lpvids_are_inner(call.management);
    if (inner)
        VLN_LOG(VLN_DBG, OF_PROVIDER "::Update mask for Inner VLAN Ids");
    else
        VLN_LOG(VLN_DBG, OF_PROVIDER "::Update mask for Outer VLAN Ids");
    const auto member = inner ? &AX_Channel::innerLPVID : &AX_Channel::lpvid;
    for (std::size_t i = 0; i < lpvids.size(); ++i)
        call.port.channel[i].*member = lpvids[i];
    if (!call.write_port(inner ? AX_CHANNEL_MASK_INNER_LPVID : AX_CHANNEL_MASK_LPVID))
        return;
    call.change_settings([&](VLNMPCA_ChannelSettingData& setting, uint32 number) {
        setting.LPVId.set(lpvids[number]);
        if (inner)
            setting.InnerLPVId.set(lpvids[number]);
    });
}

void set_mode(Channel_Call& call, uint32 mode) {
    if (call.configured_mode == mode) {
        VLN_LOG(VLN_DBG, "Need not set the CM mode since same management type exists");
        return;
    }
    if (!call.convert(call.adapter))
        return;
    if (!call.accept(VLN_MethodWrapper::SetCMMode(&call.name, mode))) {
        VLN_LOG(VLN_ERR, OF_PROVIDER "::SetCMMode failed for target %s", call.channel.c_str());
        return;
    }
    if (rebuild_channel_settings(call.agent, call.adapter) != AX_STATUS_OK)
        VLN_LOG(VLN_ERR, OF_PROVIDER "::SetCMMode done, but the channels could not be read anew");
}

void set_vepa(Channel_Call& call, const Property<boolean>& enabled) {
    auto& ports = call.agent.m_VLNMPCA_EthernetPort_map;
    const auto* port =
        call.target ? cast<VLNMPCA_EthernetPort>(ports.lookup(call.target)) : nullptr;
    if (!port) {
        call.refuse(METHOD_INVALID_TARGET, "Invalid Port is passed, Cannot Enable/Disable VEPA");
        return;
    }
    if (enabled.is_null()) {
        call.refuse(METHOD_INVALID_TARGET, "Invalid input for EnableState argument ");
        return;
    }
    const uint8 state = enabled.value ? 1 : 0;
    if (!call.convert(port->DeviceID.value) ||
        !call.accept(VLN_MethodWrapper::SetVEPAState(&call.name, state)))
        return;
    change(ports, call.target, [state](VLNMPCA_EthernetPort& each) { each.VEPAState.set(state); });
}

} // namespace

// ---- Methods ----

sint32 Channel_Service_Provider::SetCMMode(const Service* self, Channel target,
                                           Property<uint8>* mode, Result* result) {
    return run(self, *target, result, [&](Channel_Call& call) {
        if (!call.check_target() || !call.find_channel())
            return;
        if (mode->is_null())
            call.refuse(METHOD_INVALID_TARGET, "Invalid input for CMMode argument ");
        else
            set_mode(call, mode->value);
    });
}

sint32 Channel_Service_Provider::SetCMChannelType(const Service* self, Channel target,
                                                  Property<uint8>* type1, Property<uint8>* type2,
                                                  Result* result) {
    return run(self, *target, result, [&](Channel_Call& call) {
        if (prepare_types(call, type1->value, type2->value))
            set_types(call, type1->value, type2->value);
    });
}

sint32 Channel_Service_Provider::SetCMBandwidths(const Service* self, Channel target,
                                                 Property<Array<uint16>>* minimums,
                                                 Property<Array<uint16>>* maximums,
                                                 Result* result) {
    return run(self, *target, result, [&](Channel_Call& call) {
        const Channel_Values low = values_of(*minimums), high = values_of(*maximums);
        if (prepare_bandwidths(call, low, high))
            set_bandwidths(call, low, high);
    });
}

sint32 Channel_Service_Provider::SetCMLPVIDs(const Service* self, Channel target,
                                             Property<Array<uint16>>* lpvids, Result* result) {
    return run(self, *target, result, [&](Channel_Call& call) {
        if (prepare_lpvids(call, values_of(*lpvids)))
            set_lpvids(call, values_of(*lpvids));
    });
}

sint32 Channel_Service_Provider::SetVEPAState(const Service* self,
                                              VLNMPCA_EthernetPort* const* target,
                                              Property<boolean>* enabled, Result* result) {
    return run(self, *target, result, [&](Channel_Call& call) { set_vepa(call, *enabled); });
}

} // namespace cimple
