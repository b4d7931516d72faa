#include "agent/platform/host_identity.h"
#include "classes/CIM_Chassis.h"
#include "classes/CIM_ComputerSystem.h"
#include "tests/agent/agent_fixture.h"

namespace cimple {

namespace {

class Platform_Test : public Agent_Test {
protected:
    void TearDown() override {
        replace_host_queries(nullptr);
        Agent_Test::TearDown();
    }
};

std::string joined(const Property<Array<String>>& property) {
    std::string text;
    for (const String& item : property.value)
        text += std::string(item.c_str()) + ";";
    return text;
}

} // namespace

TEST_F(Platform_Test, OwnComputerSystemIsNamedAfterTheHost) {
    static constexpr auto plain_name = [](char* name, std::size_t size) {
        std::snprintf(name, size, "box");
        return 0;
    };
    static constexpr auto no_name = [](char*, std::size_t) { return -1; };
    static constexpr auto resolved = [](const char* name, std::string& canonical, std::string& ip) {
        canonical = std::string(name) + ".example.org";
        ip = "192.0.2.1";
        return true;
    };
    static constexpr auto unresolved = [](const char*, std::string&, std::string&) {
        return false;
    };
    const struct {
        Host_Queries queries;
        const char* name;
        const char* address;
    } rows[] = {
        {{plain_name, resolved}, "box.example.org", "192.0.2.1"},
        {{plain_name, unresolved}, "box", "unknown"},
        {{no_name, resolved}, "unknown", "unknown"},
    };
    Loaded_Agent agent;
    for (const auto& row : rows) {
        replace_host_queries(&row.queries);
        agent->m_bAdapterRefreshRequested = true;
        EXPECT_EQ(refreshes_started(*agent), 1);
        ASSERT_EQ(agent->m_CIM_ComputerSystem_map.size(), 1u);
        const CIM_ComputerSystem* system = agent->m_CIM_ComputerSystem_map[0];
        EXPECT_STREQ(system->Name.value.c_str(), row.name);
        EXPECT_EQ(joined(system->OtherIdentifyingInfo),
                  std::string(row.address) + ";Linux version 6.1.0;");
        EXPECT_EQ(joined(system->IdentifyingDescriptions), "VORLAN:IP_ADDRESS;VORLAN:OS_NAME;");
        EXPECT_TRUE(system->EnabledState.is_null());
    }
    EXPECT_STREQ(agent->m_CIM_Chassis_map[0]->Tag.value.c_str(), "VLN MPCA:Chassis");
}

} // namespace cimple
