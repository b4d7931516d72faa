#include "agent/platform/host_identity.h"
#include "cimple/thread_context.h"
#include "classes/CIM_Chassis.h"
#include "classes/CIM_ComputerSystem.h"
#include "classes/IBMSD_Chassis.h"
#include "classes/IBMSD_ComputerSystem.h"
#include "classes/VLNMPCA_ProviderConfigSetting.h"
#include "tests/agent/agent_fixture.h"

#include <cstring>

namespace cimple {

namespace {

// An enumeration: the instances still to come.
struct Platform_Enumeration : Instance_Enumerator_Rep {
    std::vector<Ref<Instance>> left;
};

std::vector<Ref<Instance>>& left_of(Instance_Enumerator_Rep* rep) {
    return static_cast<Platform_Enumeration*>(rep)->left;
}

// An object manager that serves the platform's two classes, each with an instance of another class
// in front and one too many behind.
class Platform_Context : public Thread_Context {
public:
    Thread_Context* thread_create_hook(void*) override { return new Platform_Context; }
    void thread_start_hook() override {}
    void thread_exit_hook() override {}

    Instance_Enumerator_Rep* start_enum(const char* name_space, const Instance* model) override {
        if (std::strcmp(name_space, "root/ibmse") != 0)
            return nullptr;
        auto* rep = new Platform_Enumeration;
        if (model->__meta_class == &IBMSD_ComputerSystem::static_meta_class)
            rep->left = {Ref<Instance>(create<IBMSD_Chassis>()), computer_system("platform-1"),
                         computer_system("platform-2")};
        else if (model->__meta_class == &IBMSD_Chassis::static_meta_class)
            rep->left = {computer_system("platform-1"), Ref<Instance>(create<IBMSD_Chassis>())};
        return rep;
    }
    void destroy_enum(Instance_Enumerator_Rep* rep) override {
        delete static_cast<Platform_Enumeration*>(rep);
    }
    bool more(Instance_Enumerator_Rep* rep) override { return !left_of(rep).empty(); }
    void next(Instance_Enumerator_Rep* rep) override { left_of(rep).erase(left_of(rep).begin()); }
    Ref<Instance> get(Instance_Enumerator_Rep* rep) override { return left_of(rep).front(); }

    Ref<Instance> get_instance(const char*, const Instance*) override { return {}; }
    int create_instance(const char*, const Instance*) override { return -1; }
    int delete_instance(const char*, const Instance*) override { return -1; }
    int modify_instance(const char*, const Instance*) override { return -1; }
    int invoke_method(const char*, const Instance*, Instance*) override { return -1; }
    void allow_unload(bool) override {}
    bool get_username(String&) override { return false; }

private:
    static Ref<Instance> computer_system(const char* name) {
        auto* system = create<IBMSD_ComputerSystem>();
        system->Name.set(name);
        return Ref<Instance>(system);
    }
};

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

TEST_F(Platform_Test, FirstPlatformInstanceIsLinkedTo) {
    Loaded_Agent agent;
    Platform_Context context;
    Thread_Context::push(&context);
    EXPECT_EQ(refreshes_started(*agent), 1);
    Thread_Context::pop();

    ASSERT_EQ(agent->m_CIM_ComputerSystem_map.size(), 1u);
    const CIM_ComputerSystem* system = agent->m_CIM_ComputerSystem_map[0];
    EXPECT_EQ(system->__meta_class, &IBMSD_ComputerSystem::static_meta_class);
    EXPECT_STREQ(system->Name.value.c_str(), "platform-1");
    EXPECT_STREQ(system->__name_space.c_str(), "root/ibmse");
    EXPECT_FALSE(agent->m_bOwnComputerSystem);
    ASSERT_EQ(agent->m_CIM_Chassis_map.size(), 1u);
    EXPECT_EQ(agent->m_CIM_Chassis_map.at(0)->__meta_class, &IBMSD_Chassis::static_meta_class);

    // A platform that has gone leaves the provider's own.
    agent->m_bAdapterRefreshRequested = true;
    EXPECT_EQ(refreshes_started(*agent), 1);
    EXPECT_EQ(agent->m_CIM_ComputerSystem_map.at(0)->__meta_class,
              &CIM_ComputerSystem::static_meta_class);
    EXPECT_TRUE(agent->m_bOwnComputerSystem);
}

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

TEST_F(Platform_Test, SettingsShowTheConfiguration) {
    Loaded_Agent agent;
    agent->m_ConfigFile.set_cache_timeout(4);
    agent->m_ConfigFile.set_refresh_adapter(1);
    agent->m_ConfigFile.set_refresh_san(0);
    EXPECT_EQ(refreshes_started(*agent), 1);
    const struct {
        const char* name;
        uint32 low, high, def, current;
    } rows[] = {
        {"cachetimeout", 5, 30, 10, 4}, {"adapterrefresh", 0, 1, 0, 1}, {"sanrefresh", 0, 1, 1, 0}};
    const auto& settings = agent->m_VLNMPCA_ProviderConfigSetting_map;
    ASSERT_EQ(settings.size(), std::size(rows));
    for (uint32 i = 0; i < settings.size(); ++i) {
        EXPECT_EQ(settings[i]->InstanceID.value,
                  String((std::string("Vorlan MPCA Provider:") + rows[i].name).c_str()));
        EXPECT_STREQ(settings[i]->paramname.value.c_str(), rows[i].name);
        EXPECT_EQ(settings[i]->lowRange.value, rows[i].low);
        EXPECT_EQ(settings[i]->highRange.value, rows[i].high);
        EXPECT_EQ(settings[i]->def.value, rows[i].def);
        EXPECT_EQ(settings[i]->current.value, rows[i].current);
        EXPECT_TRUE(settings[i]->ConfigurationName.is_null());
    }
}

} // namespace cimple
