// What can be set of a port's channels, as rules over what is asked and what the library tells.
// They look at values alone: operations/refusal.h. The number of a refusal is what the method
// answers.
#ifndef VLN_SERVICES_CHANNELS_CHANNEL_RULES_H
#define VLN_SERVICES_CHANNELS_CHANNEL_RULES_H

#include "device/library/axapi.h"
#include "operations/refusal.h"

#include <span>

namespace cimple {

// Return values of the methods beside those that all services have.
enum Channel_Result : uint32 {
    CHANNELS_NOT_AVAILABLE = 40001, // or not to be changed so
    CHANNELS_FIXED = 40002,         // by the mode, or by the age of the adapter's management
    CHANNELS_TOO_FEW = 40032,
    CHANNELS_DISABLED = 40070,
};

using Channel_Values = std::span<const uint16>;

// ---- Types of the first two channels ----

Refused types_can_stand_together(uint32 type1, uint32 type2);
Refused management_is_current(bool current);
Refused management_is_on(const AX_ChannelMgmtCNAInfo& management);
Refused types_are_free(const AX_ChannelMgmtCNAInfo& management);
Refused types_can_be_set(const AX_ChannelMgmtPortInfo& port);
bool has_types(const AX_ChannelMgmtPortInfo& port, uint32 type1, uint32 type2);

// ---- Bandwidths ----

Refused bandwidths_are_given(bool target, std::size_t minimums, std::size_t maximums);
Refused bandwidths_are_free(const AX_ChannelMgmtCNAInfo& management);
Refused bandwidths_can_be_set(const AX_ChannelMgmtPortInfo& port, std::size_t values);
// minimums and maximums: one for each channel.
Refused bandwidths_fit_channels(const AX_ChannelMgmtPortInfo& port, Channel_Values minimums,
                                Channel_Values maximums);
Refused bandwidths_add_up(const AX_ChannelMgmtCNAInfo& management, Channel_Values minimums);
bool has_bandwidths(const AX_ChannelMgmtPortInfo& port, Channel_Values minimums,
                    Channel_Values maximums);

// ---- VLANs ----

// current: the adapter has channel management of the present kind.
Refused lpvids_are_supported(const AX_ChannelMgmtCNAInfo& management, bool current);
Refused lpvids_are_on(const AX_ChannelMgmtCNAInfo& management);
Refused lpvids_can_be_set(const AX_ChannelMgmtPortInfo& port, std::size_t values);
// lpvids: one for each channel.
Refused lpvids_are_valid(const AX_ChannelMgmtCNAInfo& management,
                         const AX_ChannelMgmtPortInfo& port, Channel_Values lpvids);
// Whether the VLANs that are set are those inside the link's own tag.
bool lpvids_are_inner(const AX_ChannelMgmtCNAInfo& management);

} // namespace cimple

#endif // VLN_SERVICES_CHANNELS_CHANNEL_RULES_H
