// Libraries, devices and files that tell nonsense: a clear log line, defaults kept, nothing lost.
#include "tests/road/hosts.h"
#include "tests/road/properties.h"

#include <fstream>
#include <random>
#include <sstream>

using road::expect_counts;
using road::Road;
using road::set_value;
using road::text_of;

namespace {

// One two-port card with NIC and FCoE functions; the text stands among the card's values.
std::string card(const std::string& values) {
    return road::card(R"({"use": "nic"}, {"use": "fcoe",
        "targets": {"luns": 4, "wwpn": "50:25:64:C{port}:00:00:00:{target:02X}"}})",
                      values + (values.empty() ? "" : ", ") + R"("ports": 2, )");
}

constexpr const char* FIRST_NIC = "100002564C000000";
constexpr const char* SECOND_NIC = "100002564C000101";

TEST(Bad_Data, AnEmptySerialNumberCostsNoPort) {
    Road road({.scenario = card(R"("serial": "")")});
    expect_counts(road, {{"VLNMPCA_EthernetPort", 2}, {"VLNMPCA_Card", 1}});
}

// A list of instances that fails when the adapters are made leaves a table of zeros: the first
// function, again and again. It is shown once; the others do not take its place.
TEST(Bad_Data, OfPortsWithOneNameTheFirstIsShown) {
    Road road({.scenario = card("")});
    constexpr unsigned CREATING_PASS = 3;
    ASSERT_EQ(vlnsim_fault("AX_GetAllLocalHBAInstances", CREATING_PASS, VLNSIM_STATUS, 1), 0);
    const auto ports = road.enumerate("VLNMPCA_EthernetPort");
    ASSERT_EQ(ports.size(), 1u);
    EXPECT_EQ(text_of(ports[0], "DeviceID"), FIRST_NIC);
}

#ifdef CIMPLE_CHECK_LOCKS
TEST(Bad_Data_Death, AnAddressWithoutTwelveDigitsEndsADevelopmentBuild) {
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    EXPECT_DEATH(
        {
            Road road({.scenario = card("")});
            set_value(FIRST_NIC, "portAttributes", "CurrentMACAddress", "\"02-56-4C\"");
            road.enumerate("VLNMPCA_EthernetPort");
        },
        "12 == strlen");
}
#else
TEST(Bad_Data, AnAddressWithoutTwelveDigitsCostsItsPortAndNoOther) {
    for (const char* address : {"\"\"", "\"02-56-4C\"", "\"02-56-4C-00-00-00-00\"", "null"}) {
        SCOPED_TRACE(address);
        Road road({.scenario = card(""), .log = true});
        set_value(FIRST_NIC, "portAttributes", "CurrentMACAddress", address);
        const auto ports = road.enumerate("VLNMPCA_EthernetPort");
        ASSERT_EQ(ports.size(), 1u);
        EXPECT_EQ(text_of(ports[0], "DeviceID"), SECOND_NIC);
        EXPECT_EQ(road.enumerate("VLNMPCA_Card").size(), 1u);
        road.close();
        EXPECT_GE(road.count_in_log("is not a MAC address"), 1u);
    }
}
#endif

TEST(Bad_Data, AnAddressOfTwelveWildBytesCostsItsPortAndNoOther) {
    for (const char* kind : {"CurrentMACAddress", "PermanentMACAddress"}) {
        SCOPED_TRACE(kind);
        Road road({.scenario = card(""), .log = true});
        set_value(FIRST_NIC, "portAttributes", kind, R"({"bytes": "3032FF3634633A303030303A3031"})");
        road.census();
        expect_counts(road, {{"VLNMPCA_EthernetPort", 1}, {"VLNMPCA_Card", 1}});
        road.close();
        EXPECT_GE(road.count_in_log("is not a MAC address"), 1u);
    }
}

// The longest text that a reader keeps has 255 bytes; each byte that is no UTF-8 is replaced.
TEST(Bad_Data, OverlongTextsAreCutAndWildBytesHarmNobody) {
    Road road({.scenario = card("")});
    const std::string longest(255, 'x');
    set_value(FIRST_NIC, "portAttributes", "IfName", ("\"" + longest + "yyy\"").c_str());
    set_value(SECOND_NIC, "portAttributes", "IfName", R"({"bytes": "41FF80C328F09F"})");
    set_value(FIRST_NIC, "adapterAttributes", "Model", ("\"" + longest + "\"").c_str());
    set_value(FIRST_NIC, "adapterAttributes", "HWVersion", R"("1.2")");
    set_value(FIRST_NIC, "adapterAttributes", "FirmwareVersion", R"("....")");
    set_value(SECOND_NIC, "adapterAttributes", "FirmwareVersion", R"("10.2.x.-4294967296")");
    set_value(SECOND_NIC, "adapterAttributes", "DriverVersion", R"({"bytes": "00"})");
    const auto ports = road.enumerate("VLNMPCA_EthernetPort");
    ASSERT_EQ(ports.size(), 2u);
    EXPECT_EQ(text_of(ports[0], "Name"), longest);
    EXPECT_EQ(road::first(road, "VLNMPCA_PortController", "Name"), longest + ":VR10420117:0");
    EXPECT_EQ(text_of(ports[1], "Name"),
              "A\xEF\xBF\xBD\xEF\xBF\xBD\xEF\xBF\xBD(\xEF\xBF\xBD\xEF\xBF\xBD");
    road.census();
}

// The texts that adapters and ports tell, of bytes that are none: the object manager looks at all
// that becomes of them. Without a firmware version of numbers there would be no NIC classes at all.
TEST(Bad_Data, NoWildByteReachesAClient) {
    constexpr const char* ADAPTER_TEXTS =
        "Manufacturer SerialNumber Model ModelDescription NodeSymbolicName HWVersion DriverName "
        "OptionROMVersion DriverVersion BootVersion OperationalFirmwareVersion FirmwareOnFlash "
        "IPLFilename FunctionalFirmwareVersion Subadapter_number ULPFirmwareName "
        "ULPFirmwareVersion "
        "KernelFirmwareVersion PCIBusSpeed FCUniversalVersion";
    constexpr const char* PORT_TEXTS =
        "PortSymbolicName OSDeviceName IfName ProtocolIFType LinkTechnology Capabilities "
        "IPv4Address SubnetMask IPProtocolEndpointName AddressOrigin FuncPortSpeed VNICName "
        "FuncQosBandwidth FuncQosMinBandwidth GatewayAddress AutoNegSupportedSpeeds "
        "ConfiguredPortSpeed ForceSupportedSpeeds";
    const auto wild = [](const char* names) {
        std::istringstream words(names);
        std::string values;
        for (std::string name; words >> name;)
            values += (values.empty() ? "\"" : ", \"") + name + R"(": {"bytes": "41FF80C328F09F"})";
        return "{" + values + "}";
    };
    std::string scenario =
        card(R"("adapterAttributes": )" + wild(ADAPTER_TEXTS) + R"(, "portAttributes": )" +
             wild(PORT_TEXTS));
    scenario.insert(1, R"("server": {"targetOS": {"bytes": "41FF80C328F09F"}}, )");
    Road road({.scenario = scenario});
    road.census();
    EXPECT_EQ(road::first(road, "VLNMPCA_SoftwareIdentity", "TargetOperatingSystems"),
              "{A\xEF\xBF\xBD\xEF\xBF\xBD\xEF\xBF\xBD(\xEF\xBF\xBD\xEF\xBF\xBD}");
    expect_counts(road, {{"VLNMPCA_EthernetPort", 2}, {"VLNMPCA_Card", 1}, {"VLNMPCA_FCPort", 2}});
    EXPECT_EQ(road::first(road, "VLNMPCA_PortController", "ConfiguredPortSpeed"),
              "A\xEF\xBF\xBD\xEF\xBF\xBD\xEF\xBF\xBD(\xEF\xBF\xBD\xEF\xBF\xBD");
}

TEST(Bad_Data, AbsurdNumbersOfInstancesAndOfMappingsAreRefused) {
    for (const std::uint64_t count : {65537ull, 1ull << 31, (1ull << 32) - 1}) {
        SCOPED_TRACE(count);
        Road instances({.scenario = card("")});
        vlnsim_fault("AX_GetAllLocalHBAInstances", VLNSIM_EVERY, VLNSIM_TOO_SMALL,
                     count == 65537 ? 4097 : count);
        expect_counts(instances, {{"VLNMPCA_Card", 0}, {"VLNMPCA_ProviderConfigSetting", 3}});
        instances.close();
        EXPECT_GE(instances.count_in_log("ERROR: AX_GetAllLocalHBAInstances reports "), 1u);

        Road mappings({.scenario = card("")});
        vlnsim_fault("HBA_GetFcpTargetMapping", VLNSIM_EVERY, VLNSIM_TOO_SMALL, count);
        expect_counts(mappings, {{"VLNMPCA_StorageVolume", 0}, {"VLNMPCA_EthernetPort", 2}});
        EXPECT_EQ(vlnsim_calls("HBA_SendScsiInquiry"), 0u);
    }
}

// Bytes without sense in the answers of all units, each of its own length, always the same ones.
TEST(Bad_Data, ScsiResponsesOfRandomBytesEndTheScanOfNoUnit) {
    std::mt19937 random(20101); // NOLINT: repeatable on purpose
    std::string units;
    constexpr unsigned UNITS = 64;
    const auto bytes = [&] {
        std::string digits = "\"";
        char piece[3];
        for (auto n = random() % 300; n > 0; --n) {
            std::snprintf(piece, sizeof piece, "%02X", static_cast<unsigned>(random() & 0xFF));
            digits += piece;
        }
        return digits + "\"";
    };
    for (unsigned lun = 0; lun < UNITS; ++lun)
        units += std::string(lun ? "," : "") + R"({"responses": {"inquiry": )" + bytes() +
                 R"(, "serialPage": )" + bytes() + R"(, "identityPage": )" + bytes() +
                 R"(, "capacity": )" + bytes() + "}}";
    Road road({.scenario = road::card(R"({"use": "nic"}, {"use": "fcoe", "targets": {"luns": [)" +
                                      units + R"(], "wwpn": "50:25:64:C0:00:00:00:01"}})")});
    road.enumerate("VLNMPCA_StorageVolume");
    EXPECT_EQ(vlnsim_calls("HBA_SendScsiInquiry"), UNITS * 3ul);
    EXPECT_EQ(vlnsim_calls("HBA_SendReadCapacity"), UNITS * 1ul);
    EXPECT_EQ(vlnsim_calls("HBA_CloseAdapter"), UNITS + 1ul);
    road.census();
}

} // namespace
