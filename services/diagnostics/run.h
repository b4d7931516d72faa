// One run of a diagnostic test: what it is about, and what became of it.
#ifndef VLN_SERVICES_DIAGNOSTICS_RUN_H
#define VLN_SERVICES_DIAGNOSTICS_RUN_H

#include "agent/provider_agent.h"
#include "classes/CIM_LogicalPort.h"
#include "classes/VLNMPCA_ConcreteJob.h"
#include "classes/VLNMPCA_DiagnosticSettingData.h"
#include "classes/VLNMPCA_DiagnosticTest.h"
#include "classes/VLNMPCA_JobSettingData.h"
#include "services/diagnostics/catalogue.h"

#include <optional>

namespace cimple {

enum class Port_Element : uint8 { ETHERNET = 1, FC = 3 };

// The pointers are into the stores: m_DataMutex is held from here to the end of the run.
struct Test_Run {
    ProviderAgent& agent;
    const Diagnostic_Row& row;
    const VLNMPCA_DiagnosticTest* test;
    const VLNMPCA_DiagnosticSettingData* setting;
    const VLNMPCA_JobSettingData* job_setting;
    const CIM_LogicalPort* port;
    Port_Element element;
    HBA_WWN name;     // of the port
    const bool& stop; // goes up when the class of the tests is unloaded
};

struct Test_Report {
    uint32 handle = 0;
    bool passed = false;
    uint16 percent = 0; // of a test that did not pass
    String text;        // the result, for people
    // What the library told last; zero as far as it told nothing.
    AX_DiagResults results{};
    std::optional<AX_CableResults> cable{}; // of a cable test that came to its end
};

// What a runner answers.
struct Run_Result {
    AX_STATUS status = AX_STATUS_OK;      // why there was no test; 0 whatever a test's outcome
    Ref<const VLNMPCA_ConcreteJob> job{}; // null without a test, and when nobody wants to see it
};

} // namespace cimple

#endif // VLN_SERVICES_DIAGNOSTICS_RUN_H
