// What the simulated libraries refuse, and note as a breach of their contract.
#include "tests/simulator/simulated.h"

#include <cstring>
#include <fstream>
#include <sstream>

namespace {

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

    vlnsim_restart();
    LOCAL(AX_InitLib)();
    ASSERT_EQ(0u, LOCAL(AX_Ini_GetNetworkProperties)(iscsi, &network));
    EXPECT_EQ(20, network.vlanID) << "a restart forgets what calls have changed";
}

// One at a time on an adapter, on the simulator's clock, and with arguments that a test can have.
TEST_F(Simulated, DiagnosticTestsTakeTheirTimeAndRefuseWhatIsWrong) {
    start_text(R"({"cards": [{"type": "nic", "wwpn": "100002450000000{port}", "ports": 2,
                              "functions": [{}], "diagnostics": {"pendingTime": 1000}}]})");
    vlnsim_use_virtual_clock(0);
    std::uint32_t handle = 0, second = 0;
    const auto loopback = [&](std::uint32_t* out, std::uint32_t type = 2, std::uint32_t cycles = 20,
                              std::uint32_t halt = 0, std::uint32_t reserved = 0,
                              const char* pattern = nullptr) {
        return LOCAL(AX_DiagLoopBackTestV3)(wwn_of(out == &second), type, cycles, halt, out,
                                            reserved, pattern);
    };
    for (const AX_STATUS status :
         {loopback(nullptr), loopback(&handle, 1), loopback(&handle, 2, 4001),
          loopback(&handle, 2, 20, 2), loopback(&handle, 2, 20, 0, 1),
          loopback(&handle, 2, 20, 0, 0, "123456789"), loopback(&handle, 2, 20, 0, 0, "0x12")})
        EXPECT_EQ(4u, status);
    AX_DiagResults results{};
    EXPECT_EQ(4u, LOCAL(AX_DiagGetResults)(wwn_of(0), 99, &results));
    EXPECT_EQ(4u, LOCAL(AX_DiagCancelDiagnostic)(wwn_of(0), 0));
    EXPECT_EQ(9u, vlnsim_violations());

    ASSERT_EQ(0u, loopback(&handle));
    ASSERT_EQ(0u, loopback(&second));
    EXPECT_EQ(4u, LOCAL(AX_DiagGetResults)(wwn_of(1), handle, &results)) << "of another port";
    const struct {
        std::uint32_t handle, status, state, cycles, result;
    } looks[] = {{handle, 0, 2, 0, 0}, {handle, 60, 1, 10, 0}, {handle, 0, 6, 20, 0}};
    for (const auto& look : looks) {
        EXPECT_EQ(look.status, LOCAL(AX_DiagGetResults)(wwn_of(0), handle, &results));
        EXPECT_EQ(look.state, results.state);
        EXPECT_EQ(look.cycles, results.cyclesComplete);
        vlnsim_advance(look.status ? 500000 : 1500000);
    }
    EXPECT_EQ(0u, LOCAL(AX_DiagGetResults)(wwn_of(1), second, &results));
    EXPECT_EQ(13u, results.resultCode) << "another test ran";
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
        {"driverParameters", "tune_07", R"({"current": 60})"},
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

TEST_F(Simulated, AHandleIsGoodUntilItIsClosed) {
    start("two-port-cna.json");
    char name[256] = "kept";
    EXPECT_EQ(HBA_STATUS_ERROR_ILLEGAL_INDEX, HBA(HBA_GetAdapterName)(2, name));
    EXPECT_STREQ("kept", name);
    ASSERT_EQ(0u, HBA(HBA_GetAdapterName)(1, name));
    const HBA_HANDLE handle = HBA(HBA_OpenAdapter)(name);
    HBA_PORTATTRIBUTES port{};
    ASSERT_EQ(0u, HBA(HBA_GetAdapterPortAttributes)(handle, 0, &port));
    EXPECT_EQ(HBA_STATUS_ERROR_ILLEGAL_INDEX, HBA(HBA_GetAdapterPortAttributes)(handle, 1, &port));
    EXPECT_EQ(1u, vlnsim_open_handles());
    HBA(HBA_CloseAdapter)(handle);
    EXPECT_EQ(0u, vlnsim_open_handles());
    EXPECT_EQ(0u, vlnsim_violations());
    EXPECT_EQ(HBA_STATUS_ERROR_INVALID_HANDLE, HBA(HBA_GetAdapterPortAttributes)(handle, 0, &port));
    HBA(HBA_CloseAdapter)(handle);
    EXPECT_EQ(2u, vlnsim_violations());
}

} // namespace
