// The diagnostic tests as a client calls them.
//
// A test runs to its end in the call, and m_DataMutex is held for as long: up to twenty minutes in
// which clients of all classes and refreshes wait.
#ifndef VLN_SERVICES_DIAGNOSTICS_TEST_PROVIDER_H
#define VLN_SERVICES_DIAGNOSTICS_TEST_PROVIDER_H

#include "classes/VLNMPCA_DiagnosticTest.h"
#include "derivedObjects/provider_for.h"

namespace cimple {

struct Diagnostic_Test_Provider : Pattern_Provider<VLNMPCA_DiagnosticTest> {
    // Has a test that runs cancelled first.
    sint32 unload();

    // Runs the test on the port, as the stored settings of its name say: those of the call are not
    // read. 0: it ran, whatever came of it; the job tells. 1: the port has no name. 5: a wrong
    // argument. 40000 plus what the runner answers: it could not run.
    sint32 RunDiagnosticService(const VLNMPCA_DiagnosticTest* self, CIM_ManagedElement** element,
                                CIM_DiagnosticSettingData** settings,
                                CIM_JobSettingData** job_settings, CIM_ConcreteJob** job,
                                Property<uint32>* return_value);

    // The method's former name. It is known, and not supported.
    sint32 RunDiagnostic(const VLNMPCA_DiagnosticTest* self, CIM_ManagedElement** element,
                         CIM_DiagnosticSetting** setting, CIM_JobSettingData** job_setting,
                         CIM_ConcreteJob** job, Property<uint32>* return_value);
};

template <>
struct Provider_For<VLNMPCA_DiagnosticTest> {
    using type = Diagnostic_Test_Provider;
};

} // namespace cimple

#endif // VLN_SERVICES_DIAGNOSTICS_TEST_PROVIDER_H
