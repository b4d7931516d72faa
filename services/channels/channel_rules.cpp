#include "services/channels/channel_rules.h"

#include <numeric>

namespace cimple {

namespace {

#define OF_PROVIDER "VLNMPCA_ChannelMgmtService_Provider"

constexpr uint32 INVALID = 32968;

// Kinds of channel management.
constexpr uint32 FIXED_WITH_INNER_VLANS = 2, FIXED = 4, WHOLE_LINK_GRANTED = 16;

constexpr uint32 NEEDED_CHANNELS = 3; // for types to be set
constexpr uint32 WHOLE_LINK = 100;    // percent
constexpr uint32 FIRST_VLAN = 2, LAST_VLAN = 4094;
constexpr uint32 FIRST_VLAN_MODE = 1, LAST_VLAN_MODE = 3;

bool is_fixed(const AX_ChannelMgmtCNAInfo& management) {
    return management.mgmtType == FIXED_WITH_INNER_VLANS || management.mgmtType == FIXED;
}

bool is_nic(const AX_Channel& channel) {
    return channel.type == AX_CHANNEL_NIC || channel.type == AX_CHANNEL_NIC_ROCE;
}

Refused channels_are_there(const AX_ChannelMgmtPortInfo& port) {
    if (port.count == 0)
        return refusal(CHANNELS_NOT_AVAILABLE, OF_PROVIDER ":: The port has no channels.");
    return std::nullopt;
}

Refused values_fit(const AX_ChannelMgmtPortInfo& port, std::size_t values) {
    if (port.count != values)
        return refusal(INVALID, OF_PROVIDER ":: The port has %u channels, not %zu", port.count,
                       values);
    return std::nullopt;
}

} // namespace

Refused types_can_stand_together(uint32 type1, uint32 type2) {
    if (type1 != type2 || type1 == AX_CHANNEL_NIC)
        return std::nullopt;
    return refusal(INVALID,
                   OF_PROVIDER " Invalid Parameters passed. ChannelType1: %u, ChannelType2: %u",
                   type1, type2);
}

Refused management_is_current(bool current) {
    if (current)
        return std::nullopt;
    return refusal(CHANNELS_FIXED, OF_PROVIDER "::The remote host is running an older version of "
                                               "Netquill Manager.");
}

Refused management_is_on(const AX_ChannelMgmtCNAInfo& management) {
    if (management.currentState != 0)
        return std::nullopt;
    return refusal(CHANNELS_DISABLED, OF_PROVIDER ":: Enable CM and reboot the system. ");
}

Refused types_are_free(const AX_ChannelMgmtCNAInfo& management) {
    if (!is_fixed(management))
        return std::nullopt;
    return refusal(CHANNELS_FIXED,
                   " Cannot set channel protocols for the configured channel management mode: %u",
                   management.mgmtType);
}

Refused types_can_be_set(const AX_ChannelMgmtPortInfo& port) {
    if (Refused none = channels_are_there(port))
        return none;
    if (port.count < NEEDED_CHANNELS)
        return refusal(CHANNELS_TOO_FEW, OF_PROVIDER ":: The port has %u channels only.",
                       port.count);
    if (!(port.mask & AX_CHANNEL_MASK_TYPE))
        return refusal(CHANNELS_NOT_AVAILABLE,
                       OF_PROVIDER ":: Channel protocols cannot be changed for this port.");
    return std::nullopt;
}

bool has_types(const AX_ChannelMgmtPortInfo& port, uint32 type1, uint32 type2) {
    return port.channel[0].type == type1 && port.channel[1].type == type2;
}

Refused bandwidths_are_given(bool target, std::size_t minimums, std::size_t maximums) {
    if (target && minimums != 0 && minimums == maximums)
        return std::nullopt;
    return refusal(INVALID,
                   "Invalid Port is passed or Size of bandwidth values improper: MinBW Size: "
                   "[ %zu ], MaxBW Size: [ %zu ]",
                   minimums, maximums);
}

Refused bandwidths_are_free(const AX_ChannelMgmtCNAInfo& management) {
    if (!is_fixed(management))
        return std::nullopt;
    return refusal(CHANNELS_NOT_AVAILABLE,
                   " Cannot set channel bandwidths for the configured channel management mode. %u",
                   management.mgmtType);
}

Refused bandwidths_can_be_set(const AX_ChannelMgmtPortInfo& port, std::size_t values) {
    if (Refused none = channels_are_there(port))
        return none;
    if (Refused other = values_fit(port, values))
        return other;
    if (!(port.mask & AX_CHANNEL_MASK_BANDWIDTH))
        return refusal(CHANNELS_NOT_AVAILABLE,
                       OF_PROVIDER "::Channel Bandwidths cannot be configured for this port.");
    return std::nullopt;
}

Refused bandwidths_fit_channels(const AX_ChannelMgmtPortInfo& port, Channel_Values minimums,
                                Channel_Values maximums) {
    for (std::size_t i = 0; i < minimums.size(); ++i) {
        const uint32 minimum = minimums[i], maximum = maximums[i];
        if (port.channel[i].type == AX_CHANNEL_NIC_ROCE && (minimum != 0 || maximum != 0))
            return refusal(INVALID, "For NIC+RoCE channels, the minimum and maximum bandwidths "
                                    "must be 0.");
        if (minimum > maximum || maximum > WHOLE_LINK)
            return refusal(INVALID, OF_PROVIDER "::Invalid bandwidths: [ %u ] to [ %u ]", minimum,
                           maximum);
    }
    return std::nullopt;
}

Refused bandwidths_add_up(const AX_ChannelMgmtCNAInfo& management, Channel_Values minimums) {
    const uint32 sum = std::accumulate(minimums.begin(), minimums.end(), uint32{0});
    const bool whole = management.mgmtType == WHOLE_LINK_GRANTED;
    if (sum == WHOLE_LINK || (sum == 0 && !whole))
        return std::nullopt;
    return refusal(INVALID, "%s",
                   whole ? OF_PROVIDER "::TotalBW should be 100"
                         : OF_PROVIDER "::TotalBW should be either 0 or 100");
}

bool has_bandwidths(const AX_ChannelMgmtPortInfo& port, Channel_Values minimums,
                    Channel_Values maximums) {
    for (std::size_t i = 0; i < minimums.size(); ++i)
        if (port.channel[i].minBandwidth != minimums[i] ||
            port.channel[i].maxBandwidth != maximums[i])
            return false;
    return true;
}

Refused lpvids_are_supported(const AX_ChannelMgmtCNAInfo& management, bool current) {
    const bool supported =
        current ? management.mgmtType >= FIRST_VLAN_MODE && management.mgmtType <= LAST_VLAN_MODE
                : management.currentState == 1;
    if (supported)
        return std::nullopt;
    return refusal(CHANNELS_NOT_AVAILABLE, OF_PROVIDER ":: GMC/SIMode/vNIC1 not supported: %u",
                   current ? management.mgmtType : management.currentState);
}

Refused lpvids_are_on(const AX_ChannelMgmtCNAInfo& management) {
    if (management.currentState != 0)
        return std::nullopt;
    return refusal(CHANNELS_DISABLED, OF_PROVIDER ":: Enable GMC and reboot the system. ");
}

Refused lpvids_can_be_set(const AX_ChannelMgmtPortInfo& port, std::size_t values) {
    if (Refused other = values_fit(port, values))
        return other;
    if (!(port.mask & (AX_CHANNEL_MASK_LPVID | AX_CHANNEL_MASK_INNER_LPVID)))
        return refusal(CHANNELS_NOT_AVAILABLE,
                       OF_PROVIDER ":: LPVIDs cannot be configured for this port.");
    return std::nullopt;
}

Refused lpvids_are_valid(const AX_ChannelMgmtCNAInfo& management,
                         const AX_ChannelMgmtPortInfo& port, Channel_Values lpvids) {
    for (std::size_t i = 0; i < lpvids.size(); ++i) {
        const uint32 lpvid = lpvids[i];
        if (!is_nic(port.channel[i])) {
            if (lpvid != 0)
                return refusal(INVALID,
                               OF_PROVIDER "::LPVIDs for non NIC Channels should be zero. User has "
                                           "passed %u",
                               lpvid);
            continue;
        }
        if (lpvid == 0 && lpvids_are_inner(management))
            continue; // no VLAN, which several channels may have
        if (lpvid < FIRST_VLAN || lpvid > LAST_VLAN)
            return refusal(INVALID, OF_PROVIDER "::Invalid LPVID [ %u ]", lpvid);
        for (std::size_t before = 0; before < i; ++before)
            if (is_nic(port.channel[before]) && lpvids[before] == lpvid)
                return refusal(INVALID,
                               OF_PROVIDER "::Duplicate LPVID found: %u at indexes: [ %zu ] and "
                                           "[ %zu ]",
                               lpvid, before, i);
    }
    return std::nullopt;
}

bool lpvids_are_inner(const AX_ChannelMgmtCNAInfo& management) {
    return management.mgmtType == FIXED_WITH_INNER_VLANS;
}

} // namespace cimple
