// The settings of NICs: network boot, bandwidth, and the virtual functions of their ports.
#include "tests/hostile/sudden_ends.h"
#include "tests/road/properties.h"
#include "tests/services/changes.h"

using host::Named_Values;
using host::Value;
using road::end_of;
using road::expect_properties;
using road::find;
using road::Road;
using road::text_of;
using road::walk;
using services::expect_changes;
using services::number;

namespace {

constexpr const char* PORT = "100002564C000000";
constexpr const char* BOOT_ID = "VLN:NICNetworkboot:100002564C000000";
constexpr const char* QOS_ID = "VLN:NICQOS:100002564C000000";

class NIC_Settings : public testing::Test {
protected:
    NIC_Settings() : road({.scenario = "copper-rack.json", .log = true}) {
        road.enumerate("VLNMPCA_Card");
    }
    host::Instance boot() {
        return find(road, "VLNMPCA_NICNetworkBootData", "InstanceID", BOOT_ID);
    }
    host::Instance qos() { return find(road, "VLNMPCA_NICQOSData", "InstanceID", QOS_ID); }
    void refresh() {
        road.wait_for_refreshes(refreshes); // whose end counts for the age of the data
        vlnsim_advance(sudden_ends::STALE);
        road.enumerate("VLNMPCA_Card");
        road.wait_for_refreshes(++refreshes);
        vlnsim_clear_faults();
    }
    std::size_t count(const char* class_name) { return road.enumerate(class_name).size(); }

    Road road;
    std::size_t refreshes = 1;
};

TEST_F(NIC_Settings, WhatThereIsOfAPort) {
    expect_properties(road.enumerate("VLNMPCA_NICSettingService").at(0),
                      {{"Name", "Vorlan NIC Setting Service"},
                       {"InstanceID", "VLN:NIC Setting Service"},
                       {"EnabledState", "2"}});
    expect_properties(qos(), {{"ParameterName", "QOS"}, {"Value", "1000"}});
    EXPECT_EQ(road.count_in_log("NIC Setting Service classes are successfully created"), 1u);
    EXPECT_EQ(road.count_in_log("since it is not an NIC Adapter"), 2u) << "the FCoE functions";
    const host::Instance port = find(road, "VLNMPCA_EthernetPort", "DeviceID", PORT);
    EXPECT_EQ(text_of(walk(road, port, "VLNMPCA_PortNICQOSSettingData").at(0), "InstanceID"),
              QOS_ID);
    EXPECT_EQ(
        text_of(walk(road, port, "VLNMPCA_PortNICNetworkBootSettingData").at(0), "InstanceID"),
        BOOT_ID);

    // How the adapter's words become the class's; null for what it does not tell.
    const struct {
        const char* state;
        const char* method;
        const char* available;
        const char* shown_method;
        const char* shown_available;
    } rows[] = {
        {"1", "\"PXE\"", "\"PXE,iBFT\"", "PXE", "PXE,iBFT"},
        {"1", "\"iBFT\"", "\"PXE\"", "iBFT", "PXE"},
        {"1", "\"ibft\"", "\"iBFT,PXE\"", "Not Applicable", "PXE"},
        {"0", "\"iBFT\"", "null", "None", "PXE"},
        {"2", "\"PXE\"", "null", "Not Applicable", "PXE"},
        {"0", "null", "\"PXE\"", "PXE", "PXE"},
        {"1", "null", "null", "PXE", "PXE"},
        {"2", "null", "\"PXE,iBFT\"", "Not Applicable", "PXE,iBFT"},
    };
    for (const auto& row : rows) {
        road::set_value(PORT, "adapterAttributes", "BootCodeEnabled", row.state);
        road::set_value(PORT, "adapterAttributes", "BootMethod", row.method);
        road::set_value(PORT, "adapterAttributes", "BootMethodsAvailable", row.available);
        refresh();
        expect_properties(boot(), {{"Value", row.state},
                                   {"BootMethod", row.shown_method},
                                   {"AvailableMethods", row.shown_available}});
    }
    road::set_value(PORT, "adapterAttributes", "BootCodeEnabled", "null");
    refresh();
    EXPECT_EQ(road.count_in_log("AX_GetHBAAttributeValue HA_BOOTBIOS_STATE call failed: 251"), 1u);
    EXPECT_EQ(count("VLNMPCA_NICNetworkBootData"), 1u) << "the other port's";
    EXPECT_EQ(count("VLNMPCA_NICSettingServiceAffectsPort"), 2u);
}

TEST_F(NIC_Settings, NetworkBoot) {
    const auto value = [](std::uint32_t on) {
        return Named_Values{{"Value", number(CMPI_uint32, on)}};
    };
    const auto with = [&](std::uint32_t on, const char* method) {
        Named_Values values = value(on);
        values.push_back({"BootMethod", Value::text(method)});
        return values;
    };
    const char* const same = "Boot is not modified, since the same state exists";
    const char* const done = "Successfully modified the NIC Network Boot Status";
    const char* const nothing = "No Value parameter specified";
    expect_changes(road, boot(),
                   {{{}, CMPI_RC_ERR_INVALID_PARAMETER, nothing},
                    {{{"BootMethod", Value::text("iBFT")}}, CMPI_RC_ERR_INVALID_PARAMETER, nothing},
                    {value(2), CMPI_RC_ERR_INVALID_PARAMETER, "Value passed: 2 "},
                    {value(7), CMPI_RC_ERR_INVALID_PARAMETER, nothing},
                    {value(1), CMPI_RC_OK, same},
                    {with(1, "pxe"), CMPI_RC_OK, same},
                    {with(1, "tape"), CMPI_RC_OK, same},
                    {with(1, "iBFT"),
                     CMPI_RC_ERR_FAILED,
                     "AX Error for modifying the NIC Network Boot Params. Status: 60",
                     {"AX_SetNetbootParams", 60}},
                    {with(1, "iBFT"),
                     CMPI_RC_ERR_FAILED,
                     "AX Error for modifying the NIC Network Boot Params. Status: 190",
                     {"AX_GetHBAAttributes", 190}},
                    {with(1, "IBFT"),
                     CMPI_RC_OK,
                     done,
                     {},
                     "AX_SetNetbootParams(100002564C000000, 1, 2) = 0"}});
    expect_properties(boot(), {{"Value", "1"}, {"BootMethod", "iBFT"}});
    expect_changes(
        road, boot(),
        {{with(0, "pxe"), CMPI_RC_OK, done, {}, "AX_SetNetbootParams(100002564C000000, 0, 0) = 0"},
         {value(0), CMPI_RC_OK, same}});
    expect_properties(boot(), {{"Value", "0"}, {"BootMethod", "None"}});
    refresh();
    expect_properties(boot(), {{"Value", "0"}, {"BootMethod", "None"}});
    expect_changes(
        road, boot(),
        {{value(1), CMPI_RC_OK, done, {}, "AX_SetNetbootParams(100002564C000000, 1, 1) = 0"}});
    EXPECT_EQ(text_of(boot(), "BootMethod"), "PXE");

    // An adapter that does not tell its method has one switch.
    road::set_value(PORT, "adapterAttributes", "BootMethod", "null");
    expect_changes(
        road, boot(),
        {{value(0),
          CMPI_RC_ERR_FAILED,
          "AX_SetBootBiosState call failed (60)",
          {"AX_SetBootBiosState", 60}},
         {value(0), CMPI_RC_OK, "BootBios State has been set", {}, "AX_SetBootBiosState("}});
    host::Instance unknown = boot();
    for (auto* values : {&unknown.path.keys, &unknown.properties})
        host::set(*values, "InstanceID", Value::text("VLN:NICNetworkboot:100002564CFFFFFF"));
    expect_changes(
        road, unknown,
        {{value(1), CMPI_RC_ERR_FAILED, "Invalid instance of VLNMPCA_NICNetworkBootData "}});
}

TEST_F(NIC_Settings, Bandwidth) {
    const auto value = [](std::uint32_t limit) {
        return Named_Values{{"Value", number(CMPI_uint32, limit)}};
    };
    const Named_Values typed = {{"Value", number(CMPI_uint32, 10)},
                                {"ChangeableType", number(CMPI_uint16, 2)}};
    expect_changes(
        road, qos(),
        {{{}, CMPI_RC_ERR_INVALID_PARAMETER, "Error: No parameter specified"},
         {typed, CMPI_RC_ERR_INVALID_PARAMETER,
          "Error:Invalid Input parameter, Modifiable parameter is Value only"},
         {value(1001), CMPI_RC_ERR_FAILED, "Err: Invalid value of maxBytesPerSecond specified"},
         {value(5),
          CMPI_RC_ERR_FAILED,
          "Err: Unable to determine if port is a NIC port",
          {"AX_GetHBAFeature", 190}},
         {value(5),
          CMPI_RC_ERR_FAILED,
          "Err: SetQoSInfo Failed, exited with error code 60",
          {"AX_SetQoS", 60}},
         {value(5),
          CMPI_RC_ERR_FAILED,
          "Failed to get the modified NIC Qos Info for InstanceID VLN:NICQOS:100002564C000000",
          {"AX_GetQoS", 60}},
         {value(0), CMPI_RC_OK, "Successfully modified the QoS parameters"},
         {value(1000), CMPI_RC_OK, "Successfully", {}, "AX_SetQoS(100002564C000000, 1, 1000) = 0"},
         {value(250), CMPI_RC_OK, "Successfully modified the QoS parameters"}});
    EXPECT_EQ(text_of(qos(), "Value"), "250");
    road::set_value(PORT, "features", "NIC", "0");
    host::Instance unknown = qos();
    for (auto* values : {&unknown.path.keys, &unknown.properties})
        host::set(*values, "InstanceID", Value::text("VLN:NICQOS:100002564CFFFFFF"));
    expect_changes(road, qos(),
                   {{value(7), CMPI_RC_ERR_FAILED, "Err: QoS is not supported on this adapter"}});
    expect_changes(road, unknown,
                   {{value(7), CMPI_RC_ERR_FAILED, "Invalid instance of VLNMPCA_NICQOSData Data"}});
    refresh();
    EXPECT_EQ(text_of(qos(), "Value"), "250");
    vlnsim_fault("AX_GetQoS", 1, VLNSIM_STATUS, 190);
    refresh();
    EXPECT_EQ(count("VLNMPCA_NICQOSData"), 1u) << "the other port's";
}

// ---- Virtual functions ----

TEST_F(NIC_Settings, AVirtualFunctionIsADeviceAndAPort) {
    EXPECT_EQ(road.count_in_log("VLNMPCA_NICSrIovSupport::No of virtual functions: [ 4 ] for " +
                                std::string(PORT)),
              1u);
    const host::Instance device =
        find(road, "VLNMPCA_NICLogicalDevice", "DeviceID", "0:0:100202564C000000");
    expect_properties(device, {{"ElementName", "VorlanNIC(SRIOV)Function:9"},
                               {"OtherIdentifyingInfo", "{02564c000000, VR10420117}"},
                               {"IdentifyingDescriptions", "{PhysicalMACAddress, SerialNumber}"},
                               {"BusNumber", "16"},
                               {"FunctionNumber", "9"},
                               {"SubsystemId", "66"},
                               {"SubystemVendorId", "22186"},
                               {"PCIDeviceId", "8720"},
                               {"VendorId", "22186"},
                               {"RevisionId", "3"},
                               {"MACAddress", "06-01-4c-00-00-00"},
                               {"VLanId", "101"},
                               {"LinkStatus", "1"},
                               {"TransmitRate", "10 Gbps"}});
    expect_properties(walk(road, device, "VLNMPCA_NICControlledBy").at(0),
                      {{"DeviceID", "0:0:0x2210"}});
    const host::Instance port = walk(road, device, "VLNMPCA_LogicalConcreteIdentity").at(0);
    expect_properties(port, {{"DeviceID", "100002564C000000_9"},
                             {"Name", "SRIOV"},
                             {"SRIOVState", "3"},
                             {"OtherIdentifyingInfo", "{VR10420117:00}"},
                             {"IdentifyingDescriptions", "{SerialNumber + Sub-AdapterID}"}});
    expect_properties(walk(road, port, "VLNMPCA_VFElementSettingData").at(0),
                      {{"InstanceID", "VLN:EthernetPortAllocationSettingData:100002564C000000_9"},
                       {"ResourceType", "11"},
                       {"ConsumerVisibility", "3"},
                       {"MappingBehavior", "2"}});
    EXPECT_EQ(text_of(walk(road, port, "VLNMPCA_ControlledBy").at(0), "DeviceID"), "VR10420117:0");
    const host::Instance endpoint = walk(road, port, "VLNMPCA_NICSAPImplementation").at(0);
    expect_properties(endpoint, {{"Name", "06-01-4c-00-00-00"}, {"NameFormat", "Ethernet"}});
    EXPECT_EQ(text_of(walk(road, endpoint, "VLNMPCA_VFActiveConnection").at(0), "Name"), PORT);
    expect_properties(
        walk(road, endpoint, "VLNMPCA_VFBindsToLANEndpoint").at(0),
        {{"Name", "VR10420117:100002564C000000_9"}, {"OtherTypeDescription", "vNIC"}});
}

TEST_F(NIC_Settings, OnlyWhatAnswersIsThere) {
    vlnsim_fault("AX_GetVirtualFunctionProperties", 2, VLNSIM_STATUS, 190);
    refresh();
    EXPECT_EQ(road.count_in_log("No VF properties available for VF: 100202564C000000"), 1u);
    EXPECT_EQ(count("VLNMPCA_NICLogicalDevice"), 7u);
    EXPECT_EQ(count("VLNMPCA_VFBindsToLANEndpoint"), 7u);
    vlnsim_fault("AX_GetVirtualFunctionList", 1, VLNSIM_STATUS, 190);
    refresh();
    EXPECT_EQ(count("VLNMPCA_NICLogicalDevice"), 4u);
    EXPECT_EQ(road.count_in_log("SR-IOV classes are not created"), 1u);
    // A PCI function without registers shows none of the kind, but its virtual functions.
    vlnsim_fault("AX_DiagReadPCIRegistersV2", 1, VLNSIM_STATUS, 190);
    refresh();
    EXPECT_EQ(count("VLNMPCA_NICLogicalDevice"), 8u);
    EXPECT_EQ(count("VLNMPCA_NICControlledBy"), 4u);

    road::set_value(PORT, "portAttributes", "SRIOVState", "2");
    refresh();
    EXPECT_EQ(count("VLNMPCA_NICLogicalDevice"), 4u);
    EXPECT_EQ(road.count_in_log("VLNMPCA_NICSrIovSupport::SR-IOV State Disabled "), 1u);
    EXPECT_EQ(text_of(find(road, "VLNMPCA_EthernetPort", "DeviceID", PORT), "SRIOVState"), "2");
}

// More than one buffer's worth of them, and not all with a name of their own.
TEST(Virtual_Functions, ManyAndAlike) {
    const std::string scenario = R"({"include": ")" VLN_SCENARIOS R"(/parts/cna.json",
        "cards": [{"use": "cna", "functions": [{"use": "nic",
            "portAttributes": {"SRIOVState": 1}, "virtualFunctions": [
                {"count": 100},
                {"count": 2, "mac": "02:00:00:00:00:01", "functionNumber": 200,
                 "transmitRate": {"bytes": "FFFE"}}]}]}]})";
    Road road({.scenario = scenario, .log = true});
    EXPECT_EQ(road.enumerate("VLNMPCA_NICLogicalDevice").size(), 102u);
    EXPECT_EQ(road.enumerate("VLNMPCA_VFElementSettingData").size(), 101u);
    EXPECT_EQ(road.enumerate("VLNMPCA_VFActiveConnection").size(), 101u);
    EXPECT_EQ(road.count_in_log("Insert Failed : m_VLNMPCA_EthernetPort_map"), 1u);
    expect_properties(find(road, "VLNMPCA_NICLogicalDevice", "DeviceID", "0:0:106502564C000000"),
                      {{"TransmitRate", "\xEF\xBF\xBD\xEF\xBF\xBD"}});
}

} // namespace
