#include "tests/device/model_fixture.h"

#include "device/fc_adapter.h"
#include "device/fcoe_adapter.h"
#include "device/iscsi_adapter.h"

#include <cstring>

namespace cimple {

class Hba_Test : public Model_Test {
protected:
    // Makes the FCoE adapter of the first instance and tells the name that it found.
    static std::string matched() {
        return FCoEAdapter("Vorlan", 0, identifier, info()).getHbaAdapterName();
    }
    static int portReads() { return fake_library.calls["HBA_GetAdapterPortAttributes"]; }
};

TEST_F(Hba_Test, FcoeAdapterIsMatchedByItsPortName) {
    fake_library.add(3, FCOE);
    fake_library.addHba("unnamed", 3).nameStatus = 1;
    fake_library.addHba("closed", 3).opens = false;
    fake_library.addHba("silent", 3).attributesStatus = {1};
    fake_library.addHba("portless", 3).attributes.NumberOfPorts = 0;
    fake_library.addHba("stranger", 9);
    fake_library.addHba("ours", 3);
    fake_library.addHba("too late", 3);
    EXPECT_EQ(matched(), "ours");
    const auto lines = log_capture::take();
    for (const char* line :
         {"5:HBA_GetAdapterName(0) failed with status 1", "5:HBA_OpenAdapter(closed) failed",
          "5:matching axapi wwpn:10000090FA000003 with hbaapi wwpn:10000090FA000009",
          "5:match succesful", "5:HBAAPI AdapterName:ours:AXAPI AdapterNameVorlan"})
        EXPECT_EQ(log_capture::count(lines, line), 1) << line;
    EXPECT_EQ(portReads(), 2);
    EXPECT_EQ(fake_library.calls["HBA_GetAdapterName"], 6);
}

TEST_F(Hba_Test, WithoutAMatchTheLastNameStands) {
    fake_library.add(3, FCOE);
    EXPECT_EQ(matched(), "");
    EXPECT_EQ(logged("5:HBAAPI reports that there are NO HBAs in the system."), 1);
    // Three ports: the first one is asked three times.
    Fake_Hba& other = fake_library.addHba("other", 8);
    other.attributes.NumberOfPorts = 3;
    other.ports.push_back(fake_library.addHba("gone", 3).ports[0]);
    fake_library.hbas[1].nameStatus = 1;
    EXPECT_EQ(matched(), "other");
    EXPECT_EQ(portReads(), 3);
}

TEST_F(Hba_Test, AbsurdNumbersEndTheSearch) {
    fake_library.add(3, FCOE);
    fake_library.hbaCount = 0xFFFFFFF0U;
    fake_library.addHba("liar", 8).attributes.NumberOfPorts = 0xFFFFFFFFU;
    EXPECT_EQ(matched(), "liar");
    EXPECT_EQ(portReads(), 1024);
    EXPECT_EQ(logged("3:ERROR: HBA API reports 4294967280 adapters, taking 1024"), 1);
}

TEST_F(Hba_Test, IscsiAdapterTakesTheNameOfItsNumber) {
    fake_library.add(1, ISCSI);
    fake_library.addHba("zero", 0);
    fake_library.addHba("one", 0);
    EXPECT_EQ(iSCSIAdapter("Vorlan", 1, identifier, info()).getHbaAdapterName(), "one");
    EXPECT_EQ(iSCSIAdapter("Vorlan", 2, identifier, info()).getHbaAdapterName(), "");
    EXPECT_EQ(logged("5:AdapterName::adapterNumber2"), 1);
}

// ---- The FC kind ----

class FC_Test : public Hba_Test {
protected:
    void SetUp() override {
        Hba_Test::SetUp();
        Fake_Instance& instance = fake_library.add(5, 0);
        instance.adapterValues = {{519, "node"}, {553, number(1)}, {586, "1"}, {528, "12.0"}};
        instance.portValues = {{802, number(6)}, {864, number(1)}};
        Fake_Hba& hba = fake_library.addHba("vfc0", 5);
        std::strcpy(hba.attributes.SerialNumber, "FC1");
        std::memset(hba.attributes.Manufacturer, 'V', sizeof hba.attributes.Manufacturer);
        HBA_PORTATTRIBUTES& port = hba.ports[0];
        port.NodeWWN.wwn[7] = 0x55;
        port.FabricName.wwn[0] = 0x10;
        port.PortState = 2;
        port.PortSupportedFc4Types.bits[2] = 1;
        std::strcpy(port.PortSymbolicName, "vfc symbolic");
    }
    Fake_Hba& hba() { return fake_library.hbas[0]; }
};

TEST_F(FC_Test, ReadsBothLibraries) {
    {
        FCAdapter adapter("vfc0", 4);
        const auto& a = static_cast<FCAdapterAttributes&>(*adapter.getAdapterAttributes());
        EXPECT_EQ(adapter.getAdapterType(), ADAPTER_FC);
        EXPECT_EQ(adapter.getDriverType(), 3U);
        EXPECT_EQ(a.SerialNumber, "FC1");
        EXPECT_EQ(a.Manufacturer, std::string(64, 'V')) << "a field without terminator";
        EXPECT_EQ(a.NodeSymbolicName, "node");
        EXPECT_EQ(a.PortWWN, "10000090FA000005");
        EXPECT_EQ(a.NodeWWN, "0000000000000055");
        EXPECT_EQ(a.PortNumber, 1U);
        ASSERT_EQ(adapter.getPortCount(), 1U);
        auto& port = static_cast<FCPort&>(*adapter.getPort(0));
        EXPECT_EQ(port.getPortName(), "10000090FA000005");
        EXPECT_EQ(port.getNodeName(), "0000000000000055");
        const auto& p = static_cast<FCPortAttributes&>(*port.getPortAttributes());
        EXPECT_EQ(p.PortState, 6U) << "the physical state has the last word";
        EXPECT_EQ(p.FECState, 1U);
        EXPECT_EQ(p.FabricName, "1000000000000000");
        EXPECT_EQ(p.PortSymbolicName, "vfc symbolic");
        EXPECT_EQ(p.PortSupportedFc4Types[2], 1);
        EXPECT_NE(port.getPortStatistics(), nullptr);
    }
    EXPECT_EQ(fake_library.openHandles, 0);
    const auto lines = log_capture::take();
    EXPECT_EQ(log_capture::count(lines, "5:Operational Firmware : [ 12.0 ]"), 1);
    EXPECT_EQ(log_capture::count(lines, "5:_PortState: [ 6 ]"), 1);
}

TEST_F(FC_Test, PortKeepsThePublishedStateAndTheDefaults) {
    FCAdapter adapter("vfc0", 0);
    fake_library.instances[0].portValues.clear();
    const FCPortAttributes p(adapter, 0);
    EXPECT_EQ(p.PortState, 2U);
    EXPECT_EQ(p.FECState, 2U);
}

TEST_F(FC_Test, StaleDataIsRefreshedOnce) {
    hba().attributesStatus = {8};
    hba().portStatus = {8, 0, 8};
    EXPECT_EQ(FCAdapter("vfc0", 0).getPortCount(), 1U);
    EXPECT_EQ(fake_library.calls["HBA_RefreshInformation"], 3);

    log_capture::take();
    hba().portStatus = {0, 8, 8};
    EXPECT_EQ(FCAdapter("vfc0", 0).getPortCount(), 0U);
    EXPECT_EQ(logged("3:(portIndex=0) failed with hbaStatus 8"), 1);
    hba().portStatus = {8, 8};
    EXPECT_THROW(FCAdapter("vfc0", 0), std::exception);
    EXPECT_EQ(logged("3:(portIndex = 0) failed with hbaStatus 8"), 1);
    hba().attributesStatus = {8, 8};
    EXPECT_THROW(FCAdapter("vfc0", 0), std::exception);
    EXPECT_EQ(logged("3:Error hbaStatus=8, skipping Adapter vfc0"), 1);
    EXPECT_EQ(fake_library.openHandles, 0);
}

TEST_F(FC_Test, AdapterThatDoesNotOpen) {
    EXPECT_THROW(FCAdapter("nobody", 0), std::exception);
    EXPECT_EQ(logged("3:HBA_OpenAdapter failed, skipping Adapter nobody"), 1);
}

TEST_F(FC_Test, PortsThatAreNotThereAreLeftOut) {
    hba().attributes.NumberOfPorts = 0xFFFFFFFFU;
    EXPECT_EQ(FCAdapter("vfc0", 0).getPortCount(), 1U);
}

} // namespace cimple
