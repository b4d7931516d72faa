#include "services/diagnostics/test_provider.h"

#include "agent/gates.h"
#include "agent/hardware/port_identity.h"
#include "agent/store_search.h"
#include "agent/text.h"
#include "classes/VLNMPCA_PHYPhysicalComponentData.h"
#include "services/diagnostics/polling.h"
#include "services/diagnostics/runners.h"
#include "services/diagnostics/test_support.h"
#include "services/method_call.h"
#include "services/waiting_call.h"

namespace cimple {

namespace {

constexpr uint32 NO_NAME = 1;
constexpr uint32 INVALID_ARGUMENT = 5;
constexpr char DUMP_DIAGNOSTIC[] = "DumpDiagnostic";

uint32 refuse(uint32 value, const char* line) {
    VLN_LOG(VLN_ERR, "%s", line);
    return value;
}

// ---- The port ----

struct Tested_Port {
    const CIM_LogicalPort* port = nullptr; // in its store; null for what is no port of ours
    Port_Element element = Port_Element::ETHERNET;
};

template <class Port>
const CIM_LogicalPort* find_port(const Instance_Map<Port>& ports, const Instance* element) {
    const Port* port = cast<Port>(element);
    return port ? find_port(ports, port->DeviceID.value) : nullptr;
}

Tested_Port find_tested_port(const ProviderAgent& agent, const Instance* element) {
    if (const auto* port = find_port(agent.m_VLNMPCA_EthernetPort_map, element))
        return {port, Port_Element::ETHERNET};
    return {find_port(agent.m_VLNMPCA_FCPort_map, element), Port_Element::FC};
}

// ---- The cable test's own test ----

uint32 check_cable(const Test_Run& run) {
    const String& device_id = run.port->DeviceID.value;
    if (ISDiagTestSupported(device_id, run.row.type) != 0)
        return refuse(INVALID_ARGUMENT,
                      "Invalid ManagedElement/Test not supported for this element");
    const String* physical_port = port_identity(*run.port, IDENTITY_PHYSICAL_PORT);
    const auto* phy =
        find_first(run.agent.m_VLNMPCA_PHYPhysicalComponentData_map,
                   [&](const VLNMPCA_PHYPhysicalComponentData& data) {
                       return physical_port && data.Description.value == *physical_port;
                   });
    if (phy)
        VLN_LOG(VLN_INFO, "The Current CableNVP value : %u",
                static_cast<unsigned>(phy->CableNVP.value));
    return METHOD_DONE;
}

// ---- The runners ----

struct Runner_Row {
    Run_Result (*run)(const Test_Run& run);
    const char* failure;
    const char* no_settings;
};

constexpr char NO_SETTINGS[] = "Unable to get he default Job/DiagnosticSettingData to continue";

// By Diagnostic_Runner.
constexpr Runner_Row RUNNERS[] = {
    {SetBeaconState, "VLNMPCA_DiagTestFunc::SetBeaconState failed", NO_SETTINGS},
    {LoopBackTest, "VLNMPCA_DiagTestFunc::LoopBackTest failed", NO_SETTINGS},
    {EchoTest, "VLNMPCA_DiagTestFunc::EchoTest failed",
     "Unable to get the default Job/DiagnosticSettingData to continue"},
    {PHYTest, "VLNMPCA_DiagTestFunc::PHYTest failed", NO_SETTINGS},
};

// The client gets the store's own instance, which nobody writes.
CIM_ConcreteJob* shared_job(Ref<const VLNMPCA_ConcreteJob>& job) {
    return const_cast<VLNMPCA_ConcreteJob*>(job.release());
}

uint32 run_test(const Test_Run& run, CIM_ConcreteJob*& job) {
    const Runner_Row& runner = RUNNERS[static_cast<std::size_t>(run.row.runner)];
    if (!run.setting || !run.job_setting)
        return refuse(INVALID_ARGUMENT, runner.no_settings);
    if (run.row.runner == Diagnostic_Runner::CABLE)
        if (const uint32 refused = check_cable(run))
            return refused;
    Run_Result result = runner.run(run);
    // What is made of it for the client takes the broker, which goes with the class.
    if (!load_flag(run.stop))
        job = shared_job(result.job);
    return result.status == AX_STATUS_OK
               ? METHOD_DONE
               : refuse(METHOD_LIBRARY_STATUS + result.status, runner.failure);
}

uint32 run_service(ProviderAgent& agent, const VLNMPCA_DiagnosticTest* self,
                   const Instance* element, const bool& stop, CIM_ConcreteJob*& job) {
    const auto* test = self ? agent.m_VLNMPCA_DiagnosticTest_map.lookup(self) : nullptr;
    if (!test)
        return refuse(INVALID_ARGUMENT, "Invalid instance of Run Diagnostic Service");
    if (!element)
        return refuse(INVALID_ARGUMENT, "ManagedElement has a null pointer");
    const Tested_Port tested = find_tested_port(agent, element);
    if (!tested.port)
        return refuse(INVALID_ARGUMENT, "Invalid ManagedElement EthernetPort|FCPort");
    HBA_WWN name{};
    if (!nameOfDeviceId(tested.port->DeviceID.value.c_str(), name,
                        "VLNMPCA_DiagnosticTest_Provider::", VLN_ERR))
        return NO_NAME;
    const String& test_name = test->Name.value;
    if (test_name == DUMP_DIAGNOSTIC)
        return METHOD_DONE;
    const Diagnostic_Row* row = find_diagnostic_test(test_name);
    if (!row)
        return refuse(INVALID_ARGUMENT, "ERROR: Inavlid instance of VLNMPCA_DiagnosticTest");
    const Test_Run run{agent,
                       *row,
                       test,
                       find_by_key(agent.m_VLNMPCA_DiagnosticSettingData_map,
                                   &VLNMPCA_DiagnosticSettingData::InstanceID, test_name),
                       find_by_key(agent.m_VLNMPCA_JobSettingData_map,
                                   &VLNMPCA_JobSettingData::InstanceID, test_name),
                       tested.port,
                       tested.element,
                       name,
                       stop};
    return run_test(run, job);
}

} // namespace

sint32 Diagnostic_Test_Provider::unload() {
    Waiting_Call::end_all(VLNMPCA_DiagnosticTest::static_meta_class);
    return Pattern_Provider<VLNMPCA_DiagnosticTest>::unload();
}

sint32 Diagnostic_Test_Provider::RunDiagnosticService(const VLNMPCA_DiagnosticTest* self,
                                                      CIM_ManagedElement** element,
                                                      CIM_DiagnosticSettingData**,
                                                      CIM_JobSettingData**, CIM_ConcreteJob** job,
                                                      Property<uint32>* return_value) {
    const Waiting_Call waiting(VLNMPCA_DiagnosticTest::static_meta_class);
    return answer_method(*return_value, [&](ProviderAgent& agent) {
        const Operation_Prologue prologue(agent);
        return run_service(agent, self, *element, waiting.stop(), *job);
    });
}

sint32 Diagnostic_Test_Provider::RunDiagnostic(const VLNMPCA_DiagnosticTest*, CIM_ManagedElement**,
                                               CIM_DiagnosticSetting**, CIM_JobSettingData**,
                                               CIM_ConcreteJob**, Property<uint32>* return_value) {
    answer_method(*return_value, [](ProviderAgent& agent) {
        const Operation_Prologue prologue(agent);
        VLN_LOG(VLN_DBG, "entering RunDiagnostic method");
        return uint32{METHOD_DONE};
    });
    return INVOKE_METHOD_UNSUPPORTED;
}

} // namespace cimple
