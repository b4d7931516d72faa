// The two classes of dump settings that a console modifies.
#ifndef VLN_SERVICES_DUMP_SETTINGS_PROVIDER_H
#define VLN_SERVICES_DUMP_SETTINGS_PROVIDER_H

#include "classes/VLNMPCA_ExtFATDumpAdvancedData.h"
#include "classes/VLNMPCA_ExtFATDumpData.h"
#include "derivedObjects/provider_for.h"

namespace cimple {

struct Dump_Data_Provider : Pattern_Provider<VLNMPCA_ExtFATDumpData> {
    // Sets RetentionCount. DumpDirectory is not to be changed here: a call that gives it answers
    // MODIFY_INSTANCE_UNSUPPORTED, after the count has been set.
    sint32 modify_instance(const VLNMPCA_ExtFATDumpData* model,
                           const VLNMPCA_ExtFATDumpData* instance);
};

struct Advanced_Dump_Data_Provider : Pattern_Provider<VLNMPCA_ExtFATDumpAdvancedData> {
    // Sets what the module traces in the modes that Modes lists. Other modes, and what is not given
    // of these, stay as the adapter has them.
    sint32 modify_instance(const VLNMPCA_ExtFATDumpAdvancedData* model,
                           const VLNMPCA_ExtFATDumpAdvancedData* instance);
};

template <>
struct Provider_For<VLNMPCA_ExtFATDumpData> {
    using type = Dump_Data_Provider;
};

template <>
struct Provider_For<VLNMPCA_ExtFATDumpAdvancedData> {
    using type = Advanced_Dump_Data_Provider;
};

} // namespace cimple

#endif // VLN_SERVICES_DUMP_SETTINGS_PROVIDER_H
