// What a scan of the SAN finds through the adapters, and what it asks of the library for it.

#include "tests/device/fake_san.h"
#include "tests/device/model_fixture.h"

#include "device/fc_adapter.h"

#include <algorithm>
#include <typeinfo>

namespace cimple {

class San_Test : public Model_Test {
protected:
    void SetUp() override {
        Model_Test::SetUp();
        fake_san = Fake_San{};
        addFunction(3, FCOE, "fcoe3");
    }

    static void addFunction(uint8_t low, uint32 kind, const char* hbaName) {
        Fake_Instance& instance = fake_library.add(low, kind);
        instance.adapterValues = {{553, number(1)}};
        if (hbaName)
            fake_library.addHba(hbaName, low);
    }

    // The scan makes adapters only behind a first NIC function.
    void scan() {
        addFunction(0x70, NIC, nullptr);
        data.buildAdapterData();
        fake_library.openHandles = 0; // the search for the adapter's name leaves its handles open
        fake_library.calls.clear();
        log_capture::take();
    }

    Port* fcoePort(std::size_t which = 0) {
        for (const auto& adapter : data.adapters)
            if (adapter->getAdapterType() == ADAPTER_FCOE && which-- == 0 &&
                !adapter->getPorts().empty())
                return adapter->getPort(0);
        return nullptr;
    }

    VLN_Data data;
};

TEST_F(San_Test, ThreeTriesAndNoMore) {
    const struct {
        std::deque<HBA_STATUS> script;
        int refreshes;
        uint32 targets;
        const char* line;
    } rows[] = {
        {{8, 8, 8}, 3, 0, "5:Successful target info fetched"},
        {{8, 7, 0}, 1, 1, "5:Refresh and retry ... "},
        {{7, 7, 7}, 0, 0, "5:Successful target info fetched"},
        {{8, 2}, 1, 0, "3:Error hbaStatus=2"},
    };
    fake_san.add(1);
    scan();
    for (const auto& row : rows) {
        fake_san.mappingStatus = row.script;
        fake_san.rooms.clear();
        fake_library.calls.clear();
        data.buildSANData();
        EXPECT_EQ(fake_san.rooms.size(), row.script.size());
        EXPECT_EQ(fake_library.calls["HBA_RefreshInformation"], row.refreshes);
        EXPECT_EQ(fcoePort()->getTargetCount(), row.targets);
        EXPECT_EQ(logged(row.line), 1) << row.line;
        EXPECT_EQ(fake_library.openHandles, 0);
    }
}

TEST_F(San_Test, FailuresStayWithTheirPortAndTheirUnit) {
    addFunction(4, FCOE, "fcoe4");
    fake_san.add(1);
    scan();
    data.buildSANData();
    ASSERT_EQ(fcoePort(0)->getTargetCount(), 1u);
    // The first adapter does not open any more: its port has nothing, the other is whole.
    fake_library.hbas[0].opens = false;
    data.buildSANData();
    EXPECT_EQ(fcoePort(0)->getTargetCount(), 0u);
    EXPECT_EQ(fcoePort(1)->getTargetCount(), 1u);
    auto lines = log_capture::take();
    EXPECT_EQ(log_capture::count(lines, "3:HBA_OpenAdapter failed, skipping Adapter fcoe3"), 1);
    EXPECT_EQ(log_capture::count(lines, "3:Issue with Target Rescan - moving to the next Port"), 1);
    EXPECT_EQ(log_capture::count(lines, "5:Freeing Target: 5006016446E01A2B"), 2);

    // It opens for the port, but not for the unit.
    fake_library.hbas[0].opens = true;
    fake_san.onMapping = [](HBA_UINT32&) { fake_library.hbas[0].opens = false; };
    data.buildSANData();
    EXPECT_EQ(fcoePort(0)->getTargetCount(), 0u);
    EXPECT_EQ(logged("3:target creation failed - moving to the next target"), 1);
    EXPECT_EQ(fake_library.openHandles, 0);
}

// The mapping of a native FC adapter is read, but a target is made for FCoE adapters only.
TEST_F(San_Test, FcPortsComeToNoTarget) {
    Fake_Instance& instance = fake_library.add(5, 0);
    instance.adapterValues = {{519, "node"}, {553, number(1)}, {586, "1"}, {528, "12.0"}};
    instance.portValues = {{802, number(6)}, {864, number(1)}};
    fake_library.addHba("vfc0", 5);
    FCAdapter adapter("vfc0", 0);
    ASSERT_EQ(adapter.getPortCount(), 1u);
    fake_san.add(1);
    fake_library.openHandles = 0;
    log_capture::take();
    adapter.rescanTargets();
    EXPECT_EQ(adapter.getPort(0)->getTargetCount(), 0u);
    EXPECT_EQ(fake_san.rooms.size(), 1u);
    EXPECT_TRUE(fake_san.commands.empty());
    EXPECT_EQ(fake_library.openHandles, 0);
    EXPECT_EQ(logged("3:target creation failed - moving to the next target"), 1);
    EXPECT_THROW(Target(adapter, fake_san.units[0].entry), std::bad_cast);
}

} // namespace cimple
