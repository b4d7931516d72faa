// Prio Via: the logical units that the driver serves before others, a setting each.
//
// The adapter knows them, the driver's and those of the configuration apart. A setting stands in
// the stores from a client's change or from the building of the maps, whichever comes first, to the
// next building. Everything here runs with m_DataMutex held.
#ifndef VLN_SERVICES_DRIVER_PARAMETERS_LUN_PRIORITIES_H
#define VLN_SERVICES_DRIVER_PARAMETERS_LUN_PRIORITIES_H

#include "agent/class_groups.h"
#include "classes/VLNMPCA_DriverParameterSettingData.h"
#include "classes/VLNMPCA_FCPort.h"
#include "classes/VLNMPCA_VirtualFCPort.h"

#include <functional>
#include <optional>

namespace cimple {

inline constexpr char PRIORITY_PARAMETER[] = "PrioVia"; // ParameterName, and of the identifier

// The port that sees a unit; one of the two, or neither when no port has the name.
struct Initiator {
    const VLNMPCA_FCPort* physical = nullptr;
    const VLNMPCA_VirtualFCPort* virtual_port = nullptr;

    bool known() const { return physical || virtual_port; }
};
Initiator find_initiator(const ProviderAgent& agent, const String& wwpn);

// The pieces of a setting's identifier by their places. Of an identifier that is too short they are
// short or empty.
struct Priority_Name {
    explicit Priority_Name(const String& instance_id);

    std::optional<uint32> option() const; // AX_OAS_

    String option_word;
    String initiator;
    String target;
    String lun;
};
// "Driver" or "Config".
const char* priority_option_word(uint32 option);

Ref<VLNMPCA_DriverParameterSettingData>
priority_setting(const String& instance_id, const char* element_name, uint32 option, uint32 state);
// Puts the setting into its store and joins it with the service and the port. False, with a line,
// for one that is there.
bool show_priority(ProviderAgent& agent, Ref<VLNMPCA_DriverParameterSettingData> setting,
                   const Initiator& initiator);
// Takes the settings that are wanted, with what joins them, out of the stores. It allocates
// nothing. False when not each was joined with the service.
using Wanted_Priority = std::function<bool(const VLNMPCA_DriverParameterSettingData& setting)>;
bool hide_priorities(ProviderAgent& agent, const Wanted_Priority& wanted);

// What the adapters tell, of FC ports and of the virtual ports on them, which are there by then.
uint32 create_lun_priorities(const Map_Scope& scope);

} // namespace cimple

#endif // VLN_SERVICES_DRIVER_PARAMETERS_LUN_PRIORITIES_H
