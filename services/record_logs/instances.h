// The logs that a console can read, in the picture of the host.
#ifndef VLN_SERVICES_RECORD_LOGS_INSTANCES_H
#define VLN_SERVICES_RECORD_LOGS_INSTANCES_H

#include "agent/class_groups.h"
#include "agent/provider_agent.h"
#include "classes/VLNMPCA_EnabledRecordLogCapabilities.h"
#include "classes/VLNMPCA_RecordLog.h"

namespace cimple {

struct VLNMPCA_SoftwareIdentity;

// How the identifiers of logs begin, before a colon and the name of the host.
inline constexpr char PROVIDER_LOG_HEAD[] = "VLNMPCA:ProviderLog";
inline constexpr char NIMA_LOG_HEAD[] = "VLN:MPCA NIMA Record Log";

// EnabledState and RequestedState of a log.
inline constexpr uint16 LOG_ENABLED = 2;
inline constexpr uint16 LOG_DISABLED = 3;

// The provider's log and the management library's. MAP_OK or END_PASS.
uint32 create_record_logs(const Map_Scope& scope);

// What all logs are made of.
Ref<VLNMPCA_RecordLog> record_log_instance(const char* id_head, const CIM_ComputerSystem& system,
                                           const char* name);
// Of a log that can be switched on and off.
Ref<VLNMPCA_EnabledRecordLogCapabilities> log_capabilities_instance(const char* id,
                                                                    const char* name);
void join_log_with_capabilities(ProviderAgent& agent, const VLNMPCA_RecordLog& log,
                                const VLNMPCA_EnabledRecordLogCapabilities* capabilities);
void join_log_with_user(Instance_Map_Base& store, const VLNMPCA_RecordLog& log,
                        const VLNMPCA_SoftwareIdentity& user);

// The file of the provider's log; empty for none.
String trace_path(Provider_Loggers& loggers);

} // namespace cimple

#endif // VLN_SERVICES_RECORD_LOGS_INSTANCES_H
