// Changes of diagnostic settings that no client of a simulated host can make: without an instance,
// and of a dump test, which only other hosts have.
#include "agent/associations.h"
#include "classes/VLNMPCA_EthernetPort.h"
#include "services/diagnostics/settings_provider.h"
#include "tests/agent/agent_fixture.h"

namespace cimple {

namespace {

using Diagnostic_Settings_Test = Agent_Test;
using Setting = VLNMPCA_DiagnosticSettingData;

TEST_F(Diagnostic_Settings_Test, TheDumpTestSetsHowManyDumpsTheAdaptersKeep) {
    Loaded_Agent agent;
    Agent_Log log;
    Diagnostic_Settings_Provider provider;
    refreshes_started(*agent);
    settle(*agent);
    EXPECT_EQ(provider.modify_instance(nullptr, nullptr), MODIFY_INSTANCE_FAILED);
    EXPECT_EQ(
        log.count(VLN_ERR,
                  "VLNMPCA_DiagnosticSettingData_Provider::modify_instance invalid parameter"),
        1);

    auto setting = make_instance<Setting>();
    setting->InstanceID.set("VLN FC HBA:Diagnostic Dump");
    setting->RetentionCount.set(5);
    insert_instance(agent->m_VLNMPCA_DiagnosticSettingData_map, setting);
    const auto change_to = [&](uint32 count) {
        auto model = make_instance<Setting>();
        model->InstanceID = setting->InstanceID;
        model->RetentionCount.set(count);
        const sint32 status = provider.modify_instance(model.get(), model.get());
        const auto kept = agent->m_VLNMPCA_DiagnosticSettingData_map[0]->RetentionCount.value;
        return std::pair(status, kept);
    };
    const std::pair refused(sint32{MODIFY_INSTANCE_FAILED}, uint32{5});
    EXPECT_EQ(change_to(7), refused) << "the host has no port";
    auto port = make_instance<VLNMPCA_EthernetPort>();
    port->DeviceID.set("100002564C000000");
    insert_instance(agent->m_VLNMPCA_EthernetPort_map, port);
    EXPECT_EQ(change_to(21), refused);
    EXPECT_EQ(log.count(VLN_ERR, "VLNMPCA_DiagnosticSettingData_Provider::MODIFY_INSTANCE_FAILED"),
              2);
    EXPECT_EQ(change_to(7), std::pair(sint32{MODIFY_INSTANCE_OK}, uint32{7}));
    EXPECT_EQ(Fake_Library::kept_dumps, 7u);
}

} // namespace

} // namespace cimple
