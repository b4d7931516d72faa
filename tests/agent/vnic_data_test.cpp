// Which channel a port is, from what stands in the stores.
#include "agent/associations.h"
#include "agent/hardware/port_identity.h"
#include "classes/VLNMPCA_ChannelSettingData.h"
#include "classes/VLNMPCA_EthernetPort.h"
#include "services/nic_settings/vnic_data.h"
#include "tests/agent/agent_fixture.h"

#include <optional>

namespace cimple {

namespace {

class VNIC_Data : public Agent_Test {
protected:
    // A function of one of two ASICs.
    void put_port(const char* id, const char* asic, uint64 function, bool physical = true) {
        auto port = make_instance<VLNMPCA_EthernetPort>();
        name_in_system(*port, *system);
        port->DeviceID.set(id);
        port->Generation.set(function);
        append_port_identity(*port, IDENTITY_ASIC, String(asic));
        if (physical)
            append_port_identity(*port, IDENTITY_PHYSICAL_PORT, String("S1:3"));
        insert_instance((*agent)->m_VLNMPCA_EthernetPort_map, port);
    }
    // As the enumeration shows it: the numbers of the physical and of the virtual port, and the
    // kind.
    std::string shown(uint32 index) {
        const auto* port = (*agent)->m_VLNMPCA_EthernetPort_map[index];
        std::string text;
        for (const char* name : {"PhysicalPortNumber", "VirtualPortNumber"}) {
            const String* identity = port_identity(*port, name);
            text += std::string(identity ? identity->c_str() : "-") + " ";
        }
        return text + port->OtherPortType.value.c_str();
    }

    void SetUp() override {
        Agent_Test::SetUp();
        agent.emplace();
        (*agent)->clearAdapterMaps();
        auto computer = make_instance<CIM_ComputerSystem>();
        computer->CreationClassName.set("CIM_ComputerSystem");
        computer->Name.set("host");
        system = insert_instance((*agent)->m_CIM_ComputerSystem_map, computer);
    }
    void TearDown() override {
        agent.reset();
        Agent_Test::TearDown();
    }

    std::optional<Loaded_Agent> agent;
    const CIM_ComputerSystem* system = nullptr;
};

TEST_F(VNIC_Data, AChannelIsFoundByItsAsicAndItsFunction) {
    put_port("one", "S1:00", 0);
    put_port("two", "S1:00", 2);
    put_port("other", "S1:01", 2);
    put_port("one_8", "S1:00", 2, false);
    auto channel = make_instance<VLNMPCA_ChannelSettingData>();
    channel->InstanceID.set("c");
    channel->Adapter.set("one"); // which tells the channels of its whole link
    channel->FunctionNumber.set(2);
    insert_instance((*agent)->m_VLNMPCA_ChannelSettingData_map, channel);
    const Map_Scope scope{**agent, system};
    Log_Capture log;
    for (int times = 0; times < 2; ++times) {
        EXPECT_EQ(update_vnic_data(scope), MAP_OK);
        EXPECT_EQ(shown(0), "3 NotSupported ");
        EXPECT_EQ(shown(1), "3 2 vNIC");
        EXPECT_EQ(shown(2), "3 NotSupported ");
        EXPECT_EQ(shown(3), "- - ") << "a virtual function is no channel";
        EXPECT_EQ(log.count(VLN_DBG, "vNIC Details already filled: two "), times);
    }
}

} // namespace

} // namespace cimple
