// The logs of the diagnostic tests, and their help.
#ifndef VLN_SERVICES_DIAGNOSTICS_LOG_PROVIDER_H
#define VLN_SERVICES_DIAGNOSTICS_LOG_PROVIDER_H

#include "classes/VLNMPCA_DiagnosticsLog.h"
#include "classes/VLNMPCA_HelpService.h"
#include "derivedObjects/provider_for.h"

namespace cimple {

struct Diagnostics_Log_Provider : Pattern_Provider<VLNMPCA_DiagnosticsLog> {
    // Drops the records of the log's test, with what they are joined to; its jobs stay. 0, or 33068
    // for an unknown log.
    sint32 ClearLog(const VLNMPCA_DiagnosticsLog* self, Property<uint32>* return_value);
};

struct Help_Provider : Pattern_Provider<VLNMPCA_HelpService> {
    // The help of the test with the name that `document` has: 4 for a name that this service does
    // not have, 5 for an argument that is missing, or a format or delivery other than 1.
    sint32 GetHelp(const VLNMPCA_HelpService* self, const Property<String>* document,
                   const Property<uint16>* format, const Property<uint16>* delivery,
                   Property<String>* text, Property<uint32>* return_value);
};

template <>
struct Provider_For<VLNMPCA_DiagnosticsLog> {
    using type = Diagnostics_Log_Provider;
};

template <>
struct Provider_For<VLNMPCA_HelpService> {
    using type = Help_Provider;
};

} // namespace cimple

#endif // VLN_SERVICES_DIAGNOSTICS_LOG_PROVIDER_H
