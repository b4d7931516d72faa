// The logs that a console sets, switches and empties, and their records.
//
// Records are made anew at each look: of the provider's own log from the logger's ring, of a
// driver's from the lines that the last refresh has read.
#ifndef VLN_SERVICES_RECORD_LOGS_PROVIDER_H
#define VLN_SERVICES_RECORD_LOGS_PROVIDER_H

#include "classes/VLNMPCA_FCDriverLogEntry.h"
#include "classes/VLNMPCA_FCDriverRecordLogManagesRecord.h"
#include "classes/VLNMPCA_ISCSIDriverLogEntry.h"
#include "classes/VLNMPCA_ISCSIRecordLogManagesRecord.h"
#include "classes/VLNMPCA_LogEntry.h"
#include "classes/VLNMPCA_NICDriverLogEntry.h"
#include "classes/VLNMPCA_NICDriverRecordLogManagesRecord.h"
#include "classes/VLNMPCA_RecordLog.h"
#include "classes/VLNMPCA_RecordLogManagesRecord.h"
#include "derivedObjects/provider_for.h"

namespace cimple {

struct Record_Log_Provider : Pattern_Provider<VLNMPCA_RecordLog> {
    using Log = VLNMPCA_RecordLog;
    using Result = Property<uint32>;

    // Switches the log on (2) or off (3). The call fails for another state and an unknown log; the
    // management library's log cannot be switched, and the call is not supported.
    sint32 RequestStateChange(const Log* self, Property<uint16>* state, CIM_ConcreteJob** job,
                              Property<Datetime>* timeout, Result* result);
    // Empties the log; of a driver's until the next refresh. 0, or 33068 for an unknown log.
    sint32 ClearLog(const Log* self, Result* result);
    // Level, target and file of the provider's log, or the level of the library's, whose status is
    // answered behind 40000. 32968 for a value that the log cannot have, 33068 for an unknown log;
    // not supported for the log of a driver.
    sint32 SetLogParams(const Log* self, Property<uint16>* level, Property<uint16>* mode,
                        Property<String>* path, Result* result);
};

// Whose records.
enum class Record_Class : uint8 { PROVIDER, FC, ISCSI, NIC };

// Delivers the records of a class, or the associations with their log. Answers 0 always.
sint32 enumerate_records(Record_Class records, const Meta_Class& delivered,
                         const Enum_Instances_Handler& handler);

template <class C, Record_Class RECORDS>
struct Record_Provider : Pattern_Provider<C> {
    sint32 enum_instances(const C*, const Enum_Instances_Handler& handler) {
        return enumerate_records(RECORDS, C::static_meta_class, handler);
    }
};

template <>
struct Provider_For<VLNMPCA_RecordLog> {
    using type = Record_Log_Provider;
};

#define VLN_RECORDS(class_name, records)                                                           \
    template <>                                                                                    \
    struct Provider_For<class_name> {                                                              \
        using type = Record_Provider<class_name, Record_Class::records>;                           \
    };
VLN_RECORDS(VLNMPCA_LogEntry, PROVIDER)
VLN_RECORDS(VLNMPCA_RecordLogManagesRecord, PROVIDER)
VLN_RECORDS(VLNMPCA_FCDriverLogEntry, FC)
VLN_RECORDS(VLNMPCA_FCDriverRecordLogManagesRecord, FC)
VLN_RECORDS(VLNMPCA_ISCSIDriverLogEntry, ISCSI)
VLN_RECORDS(VLNMPCA_ISCSIRecordLogManagesRecord, ISCSI)
VLN_RECORDS(VLNMPCA_NICDriverLogEntry, NIC)
VLN_RECORDS(VLNMPCA_NICDriverRecordLogManagesRecord, NIC)
#undef VLN_RECORDS

} // namespace cimple

#endif // VLN_SERVICES_RECORD_LOGS_PROVIDER_H
