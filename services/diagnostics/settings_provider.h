// How a diagnostic test runs the next time, as a console sets it.
#ifndef VLN_SERVICES_DIAGNOSTICS_SETTINGS_PROVIDER_H
#define VLN_SERVICES_DIAGNOSTICS_SETTINGS_PROVIDER_H

#include "classes/VLNMPCA_DiagnosticSettingData.h"
#include "derivedObjects/provider_for.h"

namespace cimple {

struct Diagnostic_Settings_Provider : Pattern_Provider<VLNMPCA_DiagnosticSettingData> {
    using Setting = VLNMPCA_DiagnosticSettingData;

    // Sets what the test takes of the properties that the model has, all of them or none. What it
    // does not take is passed over. The settings last until the next refresh.
    sint32 modify_instance(const Setting* model, const Setting* instance);
};

template <>
struct Provider_For<VLNMPCA_DiagnosticSettingData> {
    using type = Diagnostic_Settings_Provider;
};

} // namespace cimple

#endif // VLN_SERVICES_DIAGNOSTICS_SETTINGS_PROVIDER_H
