// The logs of the three drivers, whose lines are found in the host's log by a key word.
//
// Everything here runs with m_DataMutex held, the groups with the adapter maps' ready mutex as
// well.
#ifndef VLN_SERVICES_RECORD_LOGS_DRIVER_LOGS_H
#define VLN_SERVICES_RECORD_LOGS_DRIVER_LOGS_H

#include "services/record_logs/instances.h"

namespace cimple {

struct VLNMPCA_ProviderUseOfLog;

struct Driver_Log_Row {
    const char* key_word;
    uint32 adapter;            // Adapter_Type: a host has the log with the first of the kind
    const char* adapter_name;  // in the line of an adapter of another kind; null: no line
    const char* driver_head;   // of the identity of the driver, before its name and version
    const char* log_head;      // of the log's identifier, before the name of the host
    const char* record_head;   // of the identifier of a record, before its number
    const char* found;         // the line of a log that is cleared
    const char* switched_on;   // the same of one that is switched on; null: none
    const char* no_parameters; // the same of one that is to take parameters
    Instance_Map<VLNMPCA_RecordLog> Instance_Stores::*logs;
    Instance_Map<VLNMPCA_EnabledRecordLogCapabilities> Instance_Stores::*capabilities;
    Instance_Map<VLNMPCA_ProviderUseOfLog> Instance_Stores::*uses;
};

// By Driver_Kind.
extern const Driver_Log_Row driver_log_table[NUM_DRIVER_KINDS];

// The groups of the adapter pass: the lines of all logs that the host has and that are on, and each
// log, which a host has with the first adapter of its kind.
uint32 read_driver_events(const Map_Scope& scope);
uint32 create_nic_driver_log(const Map_Scope& scope);
uint32 create_fc_driver_log(const Map_Scope& scope);
uint32 create_iscsi_driver_log(const Map_Scope& scope);

// Reads the lines of one driver alone.
void read_driver_events(ProviderAgent& agent, Driver_Kind kind);

// How many records the log has.
uint64 driver_record_count(const ProviderAgent& agent, Driver_Kind kind);

} // namespace cimple

#endif // VLN_SERVICES_RECORD_LOGS_DRIVER_LOGS_H
