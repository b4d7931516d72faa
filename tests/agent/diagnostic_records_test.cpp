#include "agent/associations.h"
#include "classes/VLNMPCA_DiagnosticCompletionRecord.h"
#include "classes/VLNMPCA_DiagnosticsLog.h"
#include "classes/VLNMPCA_EthernetPort.h"
#include "services/diagnostics/records.h"
#include "tests/agent/agent_fixture.h"

namespace cimple {

namespace {

// What is left of runs, store by store.
std::string left(const ProviderAgent& agent) {
    std::string counts;
    for (const Instance_Map_Base* store : std::initializer_list<const Instance_Map_Base*>{
             &agent.m_VLNMPCA_ConcreteJob_map, &agent.m_VLNMPCA_OwningJobElement_map,
             &agent.m_VLNMPCA_AffectedJobElement_map, &agent.m_VLNMPCA_DiagnosticServiceRecord_map,
             &agent.m_VLNMPCA_LogManagesRecord_map, &agent.m_VLNMPCA_RecordAppliesToElement_map,
             &agent.m_VLNMPCA_DiagnosticCompletionRecord_map})
        counts += std::to_string(store->size());
    return counts;
}

class Records_Test : public Agent_Test {
protected:
    void SetUp() override {
        Agent_Test::SetUp();
        agent.emplace();
        run.emplace(Test_Run{**agent, diagnostic_tests[1], test.get(), nullptr, job_setting.get(),
                             port.get(), Port_Element::ETHERNET, HBA_WWN{}, stop});
        job_setting->DeleteOnCompletion.set(false);
        port->DeviceID.set("100002564C000000");
    }
    void TearDown() override {
        agent.reset();
        Agent_Test::TearDown();
    }
    void add_log() {
        auto instance = make_instance<VLNMPCA_DiagnosticsLog>();
        instance->InstanceID.set(diagnostic_tests[1].name);
        insert_instance((*agent)->m_VLNMPCA_DiagnosticsLog_map, instance);
    }

    std::optional<Loaded_Agent> agent;
    Ref<VLNMPCA_DiagnosticTest> test = make_instance<VLNMPCA_DiagnosticTest>();
    Ref<VLNMPCA_JobSettingData> job_setting = make_instance<VLNMPCA_JobSettingData>();
    Ref<VLNMPCA_EthernetPort> port = make_instance<VLNMPCA_EthernetPort>();
    const bool stop = false;
    std::optional<Test_Run> run;
};

} // namespace

TEST_F(Records_Test, AJobGoesAtOnceWhereItIsToAndTheRecordsStay) {
    add_log();
    EXPECT_TRUE(record_run(*run, {}));
    EXPECT_EQ(left(**agent), "1111111");
    job_setting->DeleteOnCompletion.set(true);
    EXPECT_FALSE(record_run(*run, {}));
    EXPECT_EQ(left(**agent), "1112222");
    delete_records(**agent, diagnostic_tests[2].name);
    EXPECT_EQ(left(**agent), "1112222");
    delete_records(**agent, diagnostic_tests[1].name);
    EXPECT_EQ(left(**agent), "1110000");
}

TEST_F(Records_Test, ARunLeavesAllOrNothing) {
    Agent_Log log;
    EXPECT_FALSE(record_run(*run, {})) << "nothing to join the record with";
    EXPECT_EQ(left(**agent), "0000000");
    add_log();
    const String id = record_run(*run, {})->InstanceID.value;
    EXPECT_EQ(left(**agent), "1111111");

    // The next run's completion record, the last of all, is there already.
    std::string next = id.c_str();
    const std::size_t number = next.rfind(':', next.rfind(':') - 1) + 1;
    next.replace(number, next.rfind(':') - number,
                 std::to_string(std::stoi(next.substr(number)) + 1));
    auto stranger = make_instance<VLNMPCA_DiagnosticCompletionRecord>();
    stranger->InstanceID.set(next.c_str());
    insert_instance((*agent)->m_VLNMPCA_DiagnosticCompletionRecord_map, stranger);
    EXPECT_FALSE(record_run(*run, {}));
    EXPECT_EQ(left(**agent), "1111112");
    EXPECT_EQ(log.count(VLN_ERR, "Insert in DiagnosticCompletionRecord Failed"), 1);
    EXPECT_EQ(log.count(VLN_ERR, "Unable to create VLNMPCA_ConcreteJob"), 2);
}

} // namespace cimple
