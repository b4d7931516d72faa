// Units that are seen twice and paths that lack an end.
#include "agent/san/logical_unit_maps.h"

#include "agent/associations.h"
#include "classes/CIM_ComputerSystem.h"
#include "classes/CIM_SCSIInitiatorTargetLogicalUnitPath.h"
#include "classes/VLNMPCA_SCSIProtocolEndpoint.h"
#include "classes/VLNMPCA_SCSIProtocolInitiatorEndpoint.h"
#include "tests/agent/agent_fixture.h"

namespace cimple {

class Logical_Units_Test : public Agent_Test {
protected:
    static Logical_Unit tape(uint64 number) {
        Logical_Unit unit;
        unit.peripheral_type = 1;
        unit.number = number;
        unit.device_id = "I_T_N_";
        unit.os_device_name = "/dev/st0";
        return unit;
    }

    template <class T>
    static Ref<T> endpoint(const char* name) {
        auto instance = make_instance<T>();
        instance->CreationClassName.set(T::static_meta_class.name);
        instance->Name.set(name);
        return instance;
    }
};

TEST_F(Logical_Units_Test, APathNeedsItsEndsAndStandsOnce) {
    Loaded_Agent agent;
    const auto system = make_instance<CIM_ComputerSystem>();
    Logical_Unit_Maps maps(*agent, system.get());
    const auto initiator = endpoint<VLNMPCA_SCSIProtocolInitiatorEndpoint>("I");
    const auto target = endpoint<VLNMPCA_SCSIProtocolEndpoint>("T");
    const Logical_Unit unit = tape(65536);
    const auto device = maps.findOrMake(unit);
    Instance_Map_Base& paths = agent->store(STORE_VLNMPCA_SCSIInitiatorTargetTapeDrivePath);

    Agent_Log log;
    const auto join = [&](const Instance* from, const Instance* to) {
        return maps.joinPath({Unit_Transport::FC, from, to, "I:T"}, unit, device);
    };
    EXPECT_FALSE(join(nullptr, target.get()));
    EXPECT_EQ(log.count(VLN_ERR, "Could not find VLNMPCA_SCSIProtocolEndpoint Initiator instance."),
              1);
    EXPECT_FALSE(join(initiator.get(), nullptr));
    const Unit_Path wrong = {Unit_Transport::ISCSI, initiator.get(), target.get(), "I:T"};
    EXPECT_FALSE(maps.joinPath(wrong, unit, device)) << "endpoints of the other transport";
    EXPECT_EQ(paths.size(), 0u);
    EXPECT_TRUE(join(initiator.get(), target.get()));
    EXPECT_FALSE(join(initiator.get(), target.get()));
    ASSERT_EQ(paths.size(), 1u);
    const auto* path = cast<CIM_SCSIInitiatorTargetLogicalUnitPath>(paths.at(0));
    EXPECT_STREQ(path->OSDeviceName.value.c_str(), "/dev/st0");
    EXPECT_TRUE(path->LogicalUnitNumber.is_null()) << "a number that the property can't hold";
}

} // namespace cimple
