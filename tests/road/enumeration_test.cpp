// What a client sees of the two-port card, class by class and property by property.
#include "tests/road/road.h"

using road::Road;
using road::text_of;

namespace {

struct Expected {
    const char* property;
    const char* first;  // of the first port
    const char* second; // of the second
};

// "-" stands for a property that has no value.
constexpr Expected ETHERNET_PORT[] = {
    {"PortNumber", "0", "1"},
    {"InstanceID", "VMC-2210:100002564C000000", "VMC-2210:100002564C000101"},
    {"Description", "Vorlan VMC-2210 10Gb 2-port PCIe Converged Network Adapter",
     "Vorlan VMC-2210 10Gb 2-port PCIe Converged Network Adapter"},
    {"SystemCreationClassName", "CIM_ComputerSystem", "CIM_ComputerSystem"},
    {"ElementName", "vln0p0", "vln0p1"},
    {"Name", "vln0p0", "vln0p1"},
    {"CreationClassName", "VLNMPCA_EthernetPort", "VLNMPCA_EthernetPort"},
    {"DeviceID", "100002564C000000", "100002564C000101"},
    {"OperationalStatus", "{2}", "{2}"},
    {"StatusDescriptions", "{OK}", "{OK}"},
    {"PermanentAddress", "02564c000000", "02564c000101"},
    {"NetworkAddresses", "{02564c000000}", "{02564c000101}"},
    {"LinkTechnology", "2", "2"},
    {"Capabilities", "{2, 3, 4}", "{2, 3, 4}"},
    {"EnabledCapabilities", "{3, 4}", "{3, 4}"},
    {"RequestedState", "12", "12"},
    {"EnabledState", "2", "2"},
    {"Speed", "10000000000", "10000000000"},
    {"MaxSpeed", "10000000000", "10000000000"},
    {"FunctionalPortSpeed", "10 Gbps", "10 Gbps"},
    {"PortType", "0", "0"},
    {"SupportedMaximumTransmissionUnit", "9000", "9000"},
    {"ActiveMaximumTransmissionUnit", "1500", "1500"},
    {"Generation", "0", "1"},
    {"OtherIdentifyingInfo", "{VR10420117:00, VR10420117:0, VR10420117, 0, NotSupported}",
     "{VR10420117:00, VR10420117:1, VR10420117, 1, NotSupported}"},
    {"IdentifyingDescriptions",
     "{SerialNumber + Sub-AdapterID, SerialNumber:PhysicalPortNumber, SerialNumber, "
     "PhysicalPortNumber, VirtualPortNumber}",
     "{SerialNumber + Sub-AdapterID, SerialNumber:PhysicalPortNumber, SerialNumber, "
     "PhysicalPortNumber, VirtualPortNumber}"},
    {"FunctionalQosBandwidth", "10 Gbps", "10 Gbps"},
    {"FunctionalQosMinBandwidth", "1 Gbps", "1 Gbps"},
    {"PCIBusNumber", "16", "16"},
    {"OtherEnabledState", "-", "-"},
    {"FullDuplex", "-", "-"},
};

TEST(Enumeration, EthernetPortShowsEveryPropertyOfItsPort) {
    Road road;
    const auto ports = road.enumerate("VLNMPCA_EthernetPort");
    ASSERT_EQ(ports.size(), 4u); // those of the iSCSI functions come after those of the NICs
    for (const Expected& row : ETHERNET_PORT) {
        EXPECT_EQ(text_of(ports[0], row.property), row.first) << row.property;
        EXPECT_EQ(text_of(ports[1], row.property), row.second) << row.property;
    }
}

TEST(Enumeration, NamesAndGetAgreeWithInstances) {
    Road road;
    const auto names = road.manager().enumerate_names("VLNMPCA_PortController");
    ASSERT_TRUE(names.ok());
    const auto instances = road.enumerate("VLNMPCA_PortController");
    ASSERT_EQ(names.value.size(), instances.size());
    for (std::size_t i = 0; i < instances.size(); ++i) {
        EXPECT_EQ(names.value[i], instances[i].path);
        const auto got = road.manager().get(names.value[i]);
        ASSERT_TRUE(got.ok());
        EXPECT_EQ(got.value, instances[i]);
    }
    host::ObjectPath nobody = names.value[0];
    host::set(nobody.keys, "DeviceID", host::Value::text("no such device"));
    EXPECT_EQ(road.manager().get(nobody).status.rc, CMPI_RC_ERR_NOT_FOUND);
}

TEST(Enumeration, APropertyListNarrowsWhatIsSet) {
    Road road;
    const auto reply = road.manager().enumerate("VLNMPCA_Card", {{"Model", "NoSuchProperty"}});
    ASSERT_TRUE(reply.ok());
    ASSERT_EQ(reply.value.size(), 1u);
    EXPECT_EQ(text_of(reply.value[0], "Model"), "VMC-2210");
    EXPECT_EQ(text_of(reply.value[0], "Tag"),
              "0f4a2c117d3e4b529a0102564c000001"); // keys come along
    EXPECT_EQ(text_of(reply.value[0], "Manufacturer"), "-");
}

// What is made while answering is given back as it is handed over.
TEST(Enumeration, ALargeAnswerHoldsNoMoreObjectsThanASmallOne) {
    Road road({.scenario = R"({"include": ")" VLN_SCENARIOS
                           R"(/parts/cna.json", "cards": [{"use": "cna", "functions": [
        {"use": "nic"}, {"use": "fcoe", "targets": {"luns": 200,
                                                    "wwpn": "50:25:64:C0:00:00:00:01"}}]}]})"});
    EXPECT_EQ(road.enumerate("VLNMPCA_StorageVolume").size(), 200u);
    host::Manager& manager = road.manager();
    manager.restart_peak();
    EXPECT_EQ(manager.enumerate_names("VLNMPCA_StorageVolume").value.size(), 200u);
    EXPECT_EQ(road.enumerate("VLNMPCA_StorageVolume").size(), 200u);
    const auto initiators = road.enumerate("VLNMPCA_SCSIProtocolEndpoint");
    ASSERT_FALSE(initiators.empty());
    EXPECT_GE(manager.associators(initiators[0].path).value.size(), 200u);
    EXPECT_LT(manager.statistics().objects_peak, 50u);
}

} // namespace
