// Instances, records and attributes of the scenarios that come with the simulator.
#include "tests/simulator/simulated.h"

#include <cstring>
#include <fstream>
#include <sstream>

namespace {

TEST_F(Simulated, TheTableOfInstancesIsTakenInTwoCalls) {
    start("two-port-cna.json");
    std::uint32_t table[8] = {77, 77, 77, 77, 77, 77, 77, 77};
    std::uint32_t count = 1;
    EXPECT_EQ(7u, LOCAL(AX_GetAllLocalHBAInstances)(&count, table));
    EXPECT_EQ(6u, count);
    EXPECT_EQ(77u, table[0]);
    EXPECT_EQ(0u, LOCAL(AX_GetAllLocalHBAInstances)(&count, table));
    EXPECT_EQ(0u, table[0]);
    EXPECT_EQ(5u, table[5]);
    EXPECT_EQ(77u, table[6]) << "written beyond the stated room";
    EXPECT_EQ(4u, LOCAL(AX_GetAllLocalHBAInstances)(nullptr, table));
}

TEST_F(Simulated, ScenariosDescribeTheHostsThatTheyAreNamedAfter) {
    const struct {
        const char* file;
        std::vector<std::uint32_t> features; // of the instances, in order
        AX_STATUS v4;
    } rows[] = {
        {"two-port-cna.json", {8, 8, 4, 4, 16, 16}, 0},
        {"no-adapters.json", {}, 0},
        {"no-nic.json", {4, 4, 16, 16}, 0},
        {"old-records.json", {8, 8, 4, 4, 16, 16}, 190},
        {"blade-16-functions.json", {8, 8, 16, 16, 8, 8, 16, 16, 8, 8, 4, 4, 8, 8, 4, 4}, 0},
        {"san-4096-luns.json", {8, 8, 16, 16}, 0},
    };
    for (const auto& row : rows) {
        start(row.file);
        ASSERT_EQ(row.features.size(), LOCAL(AX_GetNumberOfLocalAdapters)()) << row.file;
        for (std::uint32_t i = 0; i < row.features.size(); ++i) {
            const HBAIdentifier identifier = identifier_of(i);
            LocalHBAInfoV4 record{};
            LocalHBAInfoV3 old{};
            EXPECT_EQ(row.v4, LOCAL(AX_GetLocalHBAInfoV4)(&identifier, &record)) << row.file;
            EXPECT_EQ(0u, LOCAL(AX_GetLocalHBAInfoV3)(&identifier, &old)) << row.file;
            EXPECT_EQ(row.features[i], old.SpecialFeatures) << row.file << " " << i;
            EXPECT_STREQ("VMC-2210", old.model);
            EXPECT_TRUE(row.v4 != 0 || std::memcmp(&record, &old, sizeof old) == 0)
                << "the forms differ";
        }
        EXPECT_EQ(0u, vlnsim_violations()) << row.file << ": " << violations().front();
    }
}

TEST_F(Simulated, RecordCallsWantAnIdentifierOfTheEnumeration) {
    start("two-port-cna.json");
    HBAIdentifier identifier = identifier_of(0);
    LocalHBAInfoV4 record{};
    identifier.instance = 9;
    EXPECT_EQ(4u, LOCAL(AX_GetLocalHBAInfoV4)(&identifier, &record));
    identifier.instance = 0;
    identifier.instanceCount = 1;
    EXPECT_EQ(4u, LOCAL(AX_GetLocalHBAInfoV4)(&identifier, &record));
    EXPECT_EQ((std::vector<std::string>{
                  "AX_GetLocalHBAInfoV4: unknown instance 9",
                  "AX_GetLocalHBAInfoV4: the instance count 1 is not that of an enumeration"}),
              violations());
}

TEST_F(Simulated, AttributesAreReadOutOfABufferOfTheLibrarysOwn) {
    start("two-port-cna.json");
    std::vector<std::uint8_t> buffer(AX_ADAPTER_ATTRIBUTES_SIZE);
    auto size = static_cast<std::uint32_t>(buffer.size());
    ASSERT_EQ(0u, LOCAL(AX_GetHBAAttributes)(wwn_of(1), buffer.data(), &size));
    EXPECT_LT(size, buffer.size());
    EXPECT_EQ("VR10420117", attribute_text(buffer, 515));
    EXPECT_EQ("VMC-2210", attribute_text(buffer, 516));
    EXPECT_EQ(std::string("\x01\0\0\0", 4), attribute_text(buffer, 559)) << "port number";
    EXPECT_EQ(std::string("\x02VL\0\x01\x01", 6), attribute_text(buffer, 531));
    EXPECT_EQ("status 251", attribute_text(buffer, 529));
    std::vector<std::uint8_t> port(AX_PORT_ATTRIBUTES_SIZE);
    size = static_cast<std::uint32_t>(port.size());
    ASSERT_EQ(0u, LOCAL(AX_GetPortAttributes)(wwn_of(1), port.data(), &size));
    EXPECT_EQ("02:56:4c:00:01:01", attribute_text(port, 804));
    EXPECT_EQ("vln0p1", attribute_text(port, 803));
    EXPECT_EQ(0u, vlnsim_violations());
}

TEST_F(Simulated, AttributeBuffersThatAreTooSmallStayAsTheyAre) {
    start("two-port-cna.json");
    const AX_WWN wwn = wwn_of(0);
    std::vector<std::uint8_t> buffer(64, 0x77);
    std::uint32_t size = 64;
    EXPECT_EQ(255u, LOCAL(AX_GetHBAAttributes)(wwn, buffer.data(), &size));
    EXPECT_EQ(std::vector<std::uint8_t>(64, 0x77), buffer);
    // Exactly what was told is enough, and one byte less is not.
    buffer.assign(size, 0);
    std::uint32_t less = size - 1;
    EXPECT_EQ(255u, LOCAL(AX_GetHBAAttributes)(wwn, buffer.data(), &less));
    EXPECT_EQ(size, less);
    EXPECT_EQ(0u, LOCAL(AX_GetHBAAttributes)(wwn, buffer.data(), &size));
    EXPECT_EQ(255u, LOCAL(AX_GetPortStatistics)(wwn_of(4), buffer.data(), 8));
}

TEST_F(Simulated, ABufferThatTheCallerSpoiltIsFoundOut) {
    start("two-port-cna.json");
    std::vector<std::uint8_t> buffer(AX_PORT_ATTRIBUTES_SIZE);
    std::uint32_t size = AX_PORT_ATTRIBUTES_SIZE;
    EXPECT_EQ("status 4", attribute_text(buffer, 774)) << "never filled";
    ASSERT_EQ(0u, LOCAL(AX_GetPortAttributes)(wwn_of(0), buffer.data(), &size));
    for (const std::size_t at : {std::size_t{4}, std::size_t{20}, std::size_t{size - 1}}) {
        std::vector<std::uint8_t> spoilt = buffer;
        std::memset(&spoilt[at], 0xFF, 1);
        EXPECT_EQ("status 4", attribute_text(spoilt, 865)) << "byte " << at;
    }
    EXPECT_EQ(4u, vlnsim_violations());
}

TEST_F(Simulated, UnknownNamesAndNullPointersAreRefusedAndNoted) {
    start("two-port-cna.json");
    const AX_WWN stranger{{0x11223310, 0x44556677}};
    std::uint32_t value = 77;
    EXPECT_EQ(5u, LOCAL(AX_GetHBAFeature)(stranger, 402, &value));
    EXPECT_EQ(77u, value);
    EXPECT_EQ(4u, LOCAL(AX_GetHBAFeature)(wwn_of(0), 402, nullptr));
    EXPECT_EQ((std::vector<std::string>{"AX_GetHBAFeature: unknown WWN 1033221177665544",
                                        "AX_GetHBAFeature: value is null"}),
              violations());
    std::uint32_t local = 77;
    EXPECT_EQ(0u, LOCAL(AX_IsLocalHBA)(stranger, &local));
    EXPECT_EQ(0u, local);
    EXPECT_EQ(0u, LOCAL(AX_IsLocalHBA)(wwn_of(5), &local));
    EXPECT_EQ(1u, local);
}

TEST_F(Simulated, StatisticsAreSixtyFourBitsWide) {
    start("two-port-cna.json");
    const AX_WWN wwn = wwn_of(4);
    ASSERT_EQ(0, vlnsim_set_value("100002564C000004", "statistics", "LinkFailures",
                                  "18446744073709551615", nullptr, 0));
    ASSERT_EQ(0, vlnsim_set_value("100002564C000004", "statistics", "1040", nullptr, nullptr, 0));
    std::vector<std::uint8_t> buffer(AX_PORT_STATISTICS_SIZE);
    ASSERT_EQ(0u, LOCAL(AX_GetPortStatistics)(wwn, buffer.data(), AX_PORT_STATISTICS_SIZE));
    EXPECT_EQ(std::string(8, '\xFF'), attribute_text(buffer, 1039));
    EXPECT_EQ(std::string("\xE8\x03\0\0\0\0\0\0", 8), attribute_text(buffer, 1025));
    EXPECT_EQ("status 251", attribute_text(buffer, 1040));
}

TEST_F(Simulated, VitalProductDataIsWalkedEntryByEntry) {
    start("two-port-cna.json");
    std::vector<char> buffer(AX_VPD_BUFFER_SIZE);
    std::uint32_t size = AX_VPD_BUFFER_SIZE;
    EXPECT_EQ(4u, LOCAL(AX_GetVPDV2)(wwn_of(0), 2, buffer.data(), &size));
    ASSERT_EQ(0u, LOCAL(AX_GetVPDV2)(wwn_of(0), 1, buffer.data(), &size));
    std::string tags;
    std::string fru;
    int card_function = 0;
    char tag[AX_VPD_TAG_SIZE];
    char value[AX_VPD_VALUE_SIZE];
    void* cursor = buffer.data();
    while ((cursor = LOCAL(AX_GetNextVpdEntry)(cursor, tag, sizeof tag, value, sizeof value))) {
        tags += tag;
        if (tags.ends_with("FN"))
            fru = value;
        if (tags.ends_with("CF"))
            card_function = value[0];
    }
    EXPECT_EQ("PASNPNMNDMUUCFRIFNFW", tags);
    EXPECT_EQ("00VM221", fru);
    EXPECT_EQ(64, card_function);
    // A value is cut to its room.
    std::memset(value, 0x77, sizeof value);
    LOCAL(AX_GetNextVpdEntry)(buffer.data(), tag, 2, value, 6);
    EXPECT_EQ("Vorlan\x77", std::string(value, 7));
}

TEST_F(Simulated, WhatIsSetIsReadBack) {
    start("two-port-cna.json");
    const AX_WWN iscsi = wwn_of(2);
    AX_Ini_NetworkProperties network{};
    ASSERT_EQ(0u, LOCAL(AX_Ini_GetNetworkProperties)(iscsi, &network));
    EXPECT_EQ(198, network.address.address[0]);
    network.vlanID = 33;
    ASSERT_EQ(0u, LOCAL(AX_Ini_SetNetworkProperties)(iscsi, &network));
    network.vlanID = 0;
    ASSERT_EQ(0u, LOCAL(AX_Ini_GetNetworkProperties)(iscsi, &network));
    EXPECT_EQ(33, network.vlanID);
    EXPECT_EQ(251u, LOCAL(AX_Ini_GetNetworkProperties)(wwn_of(0), &network));

    std::uint32_t beacon = 0;
    ASSERT_EQ(0u, LOCAL(AX_DiagBeacon)(wwn_of(0), AX_BEACON_ON));
    ASSERT_EQ(0u, LOCAL(AX_DiagBeaconState)(wwn_of(0), &beacon));
    EXPECT_EQ(3u, beacon);
    EXPECT_EQ(4u, LOCAL(AX_DiagBeacon)(wwn_of(0), 9));

    ASSERT_EQ(0u, LOCAL(AX_SetPhyPortSpeedSettings)(wwn_of(0), "1Gb", 2, -1));
    std::vector<std::uint8_t> port(AX_PORT_ATTRIBUTES_SIZE);
    std::uint32_t size = AX_PORT_ATTRIBUTES_SIZE;
    ASSERT_EQ(0u, LOCAL(AX_GetPortAttributes)(wwn_of(0), port.data(), &size));
    EXPECT_EQ("1Gb", attribute_text(port, AX_PA_CONFIGURED_PORT_SPEED));

    char error[512];
    ASSERT_EQ(0, vlnsim_save_state("set.json", error, sizeof error)) << error;
    vlnsim_restart();
    LOCAL(AX_InitLib)();
    ASSERT_EQ(0u, LOCAL(AX_Ini_GetNetworkProperties)(iscsi, &network));
    EXPECT_EQ(20, network.vlanID) << "a restart forgets what calls have changed";

    ASSERT_EQ(0, vlnsim_load_state("set.json", error, sizeof error)) << error;
    ASSERT_EQ(0u, LOCAL(AX_Ini_GetNetworkProperties)(iscsi, &network));
    EXPECT_EQ(33, network.vlanID);
    ASSERT_EQ(0u, LOCAL(AX_DiagBeaconState)(wwn_of(0), &beacon));
    EXPECT_EQ(3u, beacon);
    ASSERT_EQ(0u, LOCAL(AX_GetPortAttributes)(wwn_of(0), port.data(), &size));
    EXPECT_EQ("1Gb", attribute_text(port, AX_PA_CONFIGURED_PORT_SPEED));
}

std::string file_text(const char* path) {
    std::ostringstream text;
    text << std::ifstream(path).rdbuf();
    return text.str();
}

// Every kind of value is kept, those that scenarios write in some other way as well.
TEST_F(Simulated, AStateIsWhatDiffersAndReadsBackTheSame) {
    start("fcoe-pair.json");
    char error[512];
    ASSERT_EQ(0, vlnsim_save_state("none.json", error, sizeof error));
    EXPECT_EQ("{\n  \"scenario\": \"fcoe-pair.json\",\n  \"functions\": {}\n}\n",
              file_text("none.json"));
    const char* wwn = "100002564C000001";
    const char* const changes[][3] = {
        {"portAttributes", "FunctionalPortState", "6"},
        {"portAttributes", "PermanentMACAddress", "null"},
        {"portAttributes", "IfName", "\"{{x\\u00e9\""},
        {"portAttributes", "999", "\"of no table\""},
        {"portAttributes", "998", R"({"bytes": "00FF7B"})"},
        {"adapterAttributes", "IEEEAddress", R"("010203040506")"},
        {"adapterAttributes", "FirmwareVersion", R"({"bytes": "FFFE"})"},
        {"statistics", "LinkFailures", "18446744073709551615"},
        {"statistics", "1040", "null"},
        {"features", "SRIOV", R"({"status": 190})"},
        {"features", "35", "7"},
        {"driverParameters", "nodev_tmo", "44"},
    };
    for (const auto& [table, name, value] : changes)
        ASSERT_EQ(0, vlnsim_set_value(wwn, table, name, value, error, sizeof error)) << error;
    ASSERT_EQ(0, vlnsim_save_state("some.json", error, sizeof error));
    vlnsim_restart();
    ASSERT_EQ(0, vlnsim_load_state("some.json", error, sizeof error)) << error;
    ASSERT_EQ(0, vlnsim_save_state("again.json", error, sizeof error));
    EXPECT_EQ(file_text("some.json"), file_text("again.json"));
    EXPECT_NE(std::string::npos, file_text("some.json").find("\"nodev_tmo\": 44"));
    vlnsim_restart();
    ASSERT_EQ(0, vlnsim_save_state("again.json", error, sizeof error));
    EXPECT_EQ(file_text("none.json"), file_text("again.json"));

    const std::pair<const char*, const char*> wrong[] = {
        {R"({"scenario": "x.json"})", "does not go with"},
        {R"({"scenario": "fcoe-pair.json", "functions": {"77": {}}})", "no function"},
        {R"({"scenario": "fcoe-pair.json", "functions": {"0": {"beacom": 1}}})", "unknown key"},
        {R"({"scenario": "fcoe-pair.json", "functions": {"0": {"network": "00"}}})", "bytes"},
        {"{", "bad.json:1: "},
    };
    for (const auto& [text, says] : wrong) {
        std::ofstream("bad.json") << text;
        EXPECT_EQ(1, vlnsim_load_state("bad.json", error, sizeof error)) << text;
        EXPECT_NE(std::string::npos, std::string(error).find(says)) << error;
    }
}

TEST_F(Simulated, HardwareChangesUnderARunningHost) {
    start("two-port-cna.json");
    const char* wwn = "100002564C000000";
    char error[256];
    ASSERT_EQ(0, vlnsim_set_value(wwn, "portAttributes", "FunctionalPortState", "6", nullptr, 0));
    ASSERT_EQ(0, vlnsim_set_value(wwn, "features", "SRIOV", R"({"status": 190})", nullptr, 0));
    std::vector<std::uint8_t> buffer(AX_PORT_ATTRIBUTES_SIZE);
    std::uint32_t size = AX_PORT_ATTRIBUTES_SIZE;
    ASSERT_EQ(0u, LOCAL(AX_GetPortState)(wwn_of(0), buffer.data(), &size));
    EXPECT_EQ(std::string("\x06\0\0\0", 4), attribute_text(buffer, 774));
    std::uint32_t value = 77;
    EXPECT_EQ(190u, LOCAL(AX_GetHBAFeature)(wwn_of(0), 35, &value));
    EXPECT_EQ(1, vlnsim_set_value(wwn, "ports", "x", "1", error, sizeof error));
    EXPECT_TRUE(std::string(error).find("unknown table \"ports\"") != std::string::npos) << error;
    EXPECT_EQ(1, vlnsim_set_value("12", "features", "35", "1", error, sizeof error));
}

TEST_F(Simulated, DriverParametersComeInATableThatIsLargeEnough) {
    start("fcoe-pair.json");
    const AX_WWN wwn = wwn_of(1);
    std::vector<AX_DriverParam> table(64);
    std::uint32_t count = 59;
    EXPECT_EQ(191u, LOCAL(AX_GetDriverParams)(wwn, table.data(), &count));
    EXPECT_EQ(60u, count);
    EXPECT_EQ(0, table[0].name[0]) << "nothing is written";
    count = 61;
    EXPECT_EQ(0u, LOCAL(AX_GetDriverParams)(wwn, table.data(), &count));
    EXPECT_EQ(60u, count);
    EXPECT_STREQ("nodev_tmo", table[0].name);
    EXPECT_EQ(45u, table[0].current);
    EXPECT_STREQ("tune_59", table[59].name);
    EXPECT_EQ(0xA5, static_cast<std::uint8_t>(table[60].name[0])) << "room that is left is soiled";
    EXPECT_EQ(0, table[61].name[0]) << "written beyond the stated room";
    count = 64;
    EXPECT_EQ(0u, LOCAL(AX_GetDriverParamsGlobal)(wwn, table.data(), &count));
    EXPECT_EQ(2u, count);
    EXPECT_EQ(251u, LOCAL(AX_GetDriverParams)(wwn_of(0), table.data(), &count)) << "a NIC";
    EXPECT_TRUE(violations().empty());
    EXPECT_EQ(4u, LOCAL(AX_GetDriverParams)(wwn, nullptr, &count));
    EXPECT_EQ(1u, violations().size());
}

} // namespace
