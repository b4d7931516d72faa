// Data centre bridging in the picture of the host: the service, and for each port its priority
// groups, configured and in force, and what it exchanges with its switch.
#ifndef VLN_SERVICES_BRIDGING_INSTANCES_H
#define VLN_SERVICES_BRIDGING_INSTANCES_H

#include "agent/class_groups.h"
#include "classes/VLNMPCA_PGData.h"
#include "operations/method_wrapper.h"

namespace cimple {

// The lists of priorities of an instance, by the place that Priority_Groups has for them.
using Priority_List = Property<Array<uint32>> VLNMPCA_PGData::*;
inline constexpr Priority_List PRIORITY_LISTS[Priority_Groups::GROUPS] = {
    &VLNMPCA_PGData::PriorityGroupOne,     &VLNMPCA_PGData::PriorityGroupTwo,
    &VLNMPCA_PGData::PriorityGroupThree,   &VLNMPCA_PGData::PriorityGroupFour,
    &VLNMPCA_PGData::PriorityGroupFive,    &VLNMPCA_PGData::PriorityGroupSix,
    &VLNMPCA_PGData::PriorityGroupSeven,   &VLNMPCA_PGData::PriorityGroupEight,
    &VLNMPCA_PGData::PriorityGroupFifteen,
};

// What the instances of settings that a console may change begin with.
inline constexpr char CONFIGURED_SETTINGS[] = "Configured";

// For each kind of function, MAP_OK or SKIP_DEVICE; a port that cannot be read has no settings.
uint32 create_nic_bridging(const Map_Scope& scope);
uint32 create_fcoe_bridging(const Map_Scope& scope);
uint32 create_iscsi_bridging(const Map_Scope& scope);
// Empties all that these fill.
void clear_bridging(ProviderAgent& agent);

// The same anew for all kinds, with the ports as they were found by the last refresh. m_DataMutex
// is held, as for all below.
void rebuild_bridging(ProviderAgent& agent);

// Writes what the adapter has into the priority groups of that port, or into what it exchanges.
// The library's status; instances whose port cannot be read stay as they are.
AX_STATUS read_groups_back(ProviderAgent& agent, const String& device_id, const HBA_WWN& name);
AX_STATUS read_exchange_back(ProviderAgent& agent, const String& device_id, const HBA_WWN& name);

} // namespace cimple

#endif // VLN_SERVICES_BRIDGING_INSTANCES_H
