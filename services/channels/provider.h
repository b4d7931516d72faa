// The service that divides links into channels, and what a console changes of an adapter's split.
//
// Every method holds m_DataMutex through its calls into the library.
#ifndef VLN_SERVICES_CHANNELS_PROVIDER_H
#define VLN_SERVICES_CHANNELS_PROVIDER_H

#include "classes/VLNMPCA_ChannelMgmtService.h"
#include "classes/VLNMPCA_ChannelSettingData.h"
#include "classes/VLNMPCA_EthernetPort.h"
#include "classes/VLNMPCA_PortConfigData.h"
#include "derivedObjects/provider_for.h"

namespace cimple {

// What a method answers stands in return_value: 0, the values of channel_rules.h, 32968 and 33068
// as Method_Result has them, or 40000 plus the library's status.
struct Channel_Service_Provider : Pattern_Provider<VLNMPCA_ChannelMgmtService> {
    using Service = VLNMPCA_ChannelMgmtService;
    using Channel = VLNMPCA_ChannelSettingData* const*;
    using Result = Property<uint32>;

    // In force after the next reboot.
    sint32 SetCMMode(const Service* self, Channel target, Property<uint8>* mode, Result* result);
    // Of the first two channels. 32769 when they were set and could not be read anew.
    sint32 SetCMChannelType(const Service* self, Channel target, Property<uint8>* type1,
                            Property<uint8>* type2, Result* result);
    sint32 SetCMBandwidths(const Service* self, Channel target, Property<Array<uint16>>* minimums,
                           Property<Array<uint16>>* maximums, Result* result);
    sint32 SetCMLPVIDs(const Service* self, Channel target, Property<Array<uint16>>* lpvids,
                       Result* result);
    sint32 SetVEPAState(const Service* self, VLNMPCA_EthernetPort* const* target,
                        Property<boolean>* enabled, Result* result);
};

struct Port_Config_Provider : Pattern_Provider<VLNMPCA_PortConfigData> {
    // Writes a whole configuration, in force after the next reboot; only that in force is taken.
    sint32 modify_instance(const VLNMPCA_PortConfigData* model,
                           const VLNMPCA_PortConfigData* instance);
};

template <>
struct Provider_For<VLNMPCA_ChannelMgmtService> {
    using type = Channel_Service_Provider;
};

template <>
struct Provider_For<VLNMPCA_PortConfigData> {
    using type = Port_Config_Provider;
};

} // namespace cimple

#endif // VLN_SERVICES_CHANNELS_PROVIDER_H
