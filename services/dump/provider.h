// The service that takes dumps, lists and deletes their files, and sets what dumps will contain.
//
// Every method holds m_DataMutex through the call into the library, so a dump of minutes holds back
// refreshes for as long.
#ifndef VLN_SERVICES_DUMP_PROVIDER_H
#define VLN_SERVICES_DUMP_PROVIDER_H

#include "classes/CIM_LogicalPort.h"
#include "classes/VLNMPCA_DumpService.h"
#include "derivedObjects/provider_for.h"

namespace cimple {

// What a method answers stands in return_value: 0, 4097 for a port without a name, 32968 and 33068
// as Method_Result has them, 5 for another argument, or what is told here. The status of the call
// is INVOKE_METHOD_OK unless told otherwise.
struct Dump_Service_Provider : Pattern_Provider<VLNMPCA_DumpService> {
    using Service = VLNMPCA_DumpService;
    using Target_Port = CIM_LogicalPort* const*;
    using Result = Property<uint32>;

    // "ram" or "flash". The library's own status on failure.
    sint32 GenerateExtFATDump(const Service* self, Target_Port target, Property<String>* mode,
                              Result* result);
    // All others answer 40000 plus the library's status.
    sint32 GetDumpFileNames(const Service* self, Target_Port target, Property<Array<String>>* files,
                            Result* result);
    // The library's own status on failure.
    sint32 DeleteDumpFiles(const Service* self, Target_Port target, Result* result);
    // These two read the settings back. If that fails they answer its status, and the call fails.
    sint32 SetAdvancedFATDumpTraceLevel(const Service* self, Target_Port target,
                                        Property<String>* level, Property<Array<String>>* modes,
                                        Result* result);
    sint32 RestoreAdvancedFATDumpSetting(const Service* self, Target_Port target, Result* result);
    // Also of a port whose firmware has failed. 0 as well when a reboot is needed: then the port
    // tells 40247 as its CoreDumpStatus.
    sint32 GenerateCoreDump(const Service* self, Target_Port target, Property<String>* options,
                            Result* result);
    // Without a target all adapters are asked.
    sint32 RetrieveFATDump(const Service* self, Target_Port target, Result* result);
};

template <>
struct Provider_For<VLNMPCA_DumpService> {
    using type = Dump_Service_Provider;
};

} // namespace cimple

#endif // VLN_SERVICES_DUMP_PROVIDER_H
