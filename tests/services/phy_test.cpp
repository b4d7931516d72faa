// PHYs of copper ports and the speed of physical ports, as a client sees and sets them.
#include "tests/hostile/sudden_ends.h"
#include "tests/services/changes.h"

#include "tests/road/properties.h"

using host::Named_Values;
using host::Value;
using road::end_of;
using road::expect_properties;
using road::find;
using road::Road;
using road::text_of;
using services::Change;
using services::expect_changes;
using services::number;

namespace {

constexpr const char* PORT = "VR10420117:0"; // of the card, with these functions
constexpr const char* NIC_PORT = "100002564C000000";
constexpr const char* FC_PORT = "100002564C000002";
constexpr const char* ABSENT = "10GBaseT %s is not supported for Port VR10420117:0 ";

class Phy : public testing::Test {
protected:
    explicit Phy(const char* scenario = "copper-rack.json")
        : road({.scenario = scenario, .log = true}) {
        road.enumerate("VLNMPCA_Card");
    }

    host::Instance phy() { return find(road, "VLNMPCA_PHYPhysicalComponent", "Description", PORT); }
    host::Instance data() {
        return find(road, "VLNMPCA_PHYPhysicalComponentData", "Description", PORT);
    }
    host::Instance controller() { return find(road, "VLNMPCA_PortController", "DeviceID", PORT); }
    // What the log has of the refresh that comes now.
    std::string refreshed() {
        road.wait_for_refreshes(refreshes); // whose end counts for the age of the data
        const std::size_t before = road.log_text().size();
        vlnsim_advance(sudden_ends::STALE);
        road.enumerate("VLNMPCA_Card");
        road.wait_for_refreshes(++refreshes);
        vlnsim_clear_faults();
        return road.log_text().substr(before);
    }

    Road road;
    std::size_t refreshes = 1;
};

TEST_F(Phy, TellsWhatThePortReads) {
    expect_properties(phy(), {{"Tag", "VLN:MPCA PHY PhysicalComponent:VR10420117:0"},
                              {"ElementName", "VLN:MPCA PHY PhysicalComponent:VR10420117:0"},
                              {"CreationClassName", "VLNMPCA_PHYPhysicalComponent"},
                              {"AutoNegotiationStatus", "1"},
                              {"AutoNegotiationEnabled", "1"},
                              {"LinkPartnerAutoNegotiation", "1"},
                              {"Temperature", "61"},
                              {"TemperatureUnit", "Celsius"},
                              {"OnlineLengthEstimation", "42"},
                              {"PairA_SNR", "3.3 dB"},
                              {"PairD_SNR", "4.2 dB"},
                              {"LinkUPTime", "86400"},
                              {"PairA_AverageMSE", "412"},
                              {"PairD_AverageMSE", "401"},
                              {"CableNVP", "69"},
                              {"LPPCFrameErrors", "12"},
                              {"PhyCRC8Errors", "3"},
                              {"PHYConfigCRC", "C0A1"},
                              {"PHYFirmwareVersion", "1.38.2"},
                              {"MDI_PLLEvents", "2"},
                              {"MDI_LinkUpTime", "86400"},
                              {"EMI10GEvents", "1"},
                              {"PHYFrames", "4294967298"},
                              {"MDI_CRC8Errors", "4"}});
    expect_properties(data(), {{"InstanceID", "VLN:MPCA PHY PhysicalComponentData:VR10420117:0"},
                               {"LineRateAdvertised_10G", "1"},
                               {"LineRateAdvertised_1G", "1"},
                               {"LineRateAdvertised_100MB", "1"},
                               {"CableNVP", "69"}});
    EXPECT_EQ(end_of(road.enumerate("VLNMPCA_PHYComponent").at(0), "GroupComponent", "DeviceID"),
              PORT);
    EXPECT_EQ(road.count_in_log("10GBaseT feature classes created Successfully"), 1u);

    // Of values that are missing, and of those that say so, nothing is left but 0.
    const std::string none = "18446744073709551615";
    for (const char* name : {"TimeSinceLink", "LDPCErrs"})
        road::set_value(NIC_PORT, "portAttributes", name, none.c_str());
    for (const char* name : {"CableNVP", "PHYCRCErrs", "PHYConfigID"})
        road::set_value(NIC_PORT, "portAttributes", name, "null");
    road::set_value(NIC_PORT, "portAttributes", "LineRateAdvertised", "4");
    road::set_value(NIC_PORT, "statistics", "PHYFrames", none.c_str());
    road::set_value(NIC_PORT, "statistics", "MDI_PLLEvents", "null");
    EXPECT_NE(
        refreshed().find("ERROR: AX_GetAttributeValue call failed for Attribute ID 424 (251)"),
        std::string::npos);
    expect_properties(phy(), {{"LinkUPTime", "0"},
                              {"LPPCFrameErrors", "0"},
                              {"PhyCRC8Errors", "0"},
                              {"CableNVP", "0"},
                              {"PHYConfigCRC", ""},
                              {"PHYFrames", "0"},
                              {"MDI_PLLEvents", "0"},
                              {"MDI_CRC8Errors", "4"}});
    expect_properties(data(), {{"LineRateAdvertised_10G", "1"},
                               {"LineRateAdvertised_1G", "0"},
                               {"LineRateAdvertised_100MB", "0"}});
}

// The codes of ratios, over all that the field can hold; four to a refresh.
TEST_F(Phy, RatiosOverTheSignedRange) {
    const struct {
        const char* code;
        const char* text;
    } rows[] = {
        {"0x80000000", "--214745088.0 dB"},
        {"0x80000001", "--214745088.1 dB"},
        {"0xFFFF7FFF", "--6553.5 dB"},
        {"0xFFFF8000", "-0.0 dB"},
        {"0xFFFF8001", "--0.1 dB"},
        {"0xFFFFFFFF", "--3276.7 dB"},
        {"0", "-3276.8 dB"},
        {"1", "3276.9 dB"},
        {"0x7FFF", "6553.5 dB"},
        {"0x8000", "0.0 dB"},
        {"0x8001", "0.1 dB"},
        {"0x802A", "4.2 dB"},
        {"0xFFFF", "3276.7 dB"},
        {"0x10000", "9830.4 dB"},
        {"0x7FFF7FFF", "214748364.7 dB"},
        {"0x7FFFFFFF", "214745087.9 dB"},
    };
    constexpr const char* CODES[] = {"Pair-A-SNR", "Pair-B-SNR", "Pair-C-SNR", "Pair-D-SNR"};
    constexpr const char* TEXTS[] = {"PairA_SNR", "PairB_SNR", "PairC_SNR", "PairD_SNR"};
    for (std::size_t first = 0; first < std::size(rows); first += std::size(CODES)) {
        for (std::size_t i = 0; i < std::size(CODES); ++i)
            road::set_value(NIC_PORT, "portAttributes", CODES[i],
                            ('"' + std::string(rows[first + i].code) + '"').c_str());
        refreshed();
        const host::Instance shown = phy();
        for (std::size_t i = 0; i < std::size(CODES); ++i)
            EXPECT_EQ(text_of(shown, TEXTS[i]), rows[first + i].text) << rows[first + i].code;
    }
}

// A port that cannot be read is left out, and the other one stands.
TEST_F(Phy, APortThatFailsDropsOutAlone) {
    const auto absent = [](const char* what) {
        char line[128];
        std::snprintf(line, sizeof line, ABSENT, what);
        return std::string(line);
    };
    const struct {
        const char* feature;
        std::string line;
    } features[] = {
        {"Feature10GBaseT", absent("feature")},
        {"Counters10GBaseT", absent("statistics")},
    };
    for (const auto& row : features) {
        road::set_value(NIC_PORT, "features", row.feature, "0");
        EXPECT_NE(refreshed().find(row.line), std::string::npos) << row.line;
        EXPECT_EQ(road.enumerate("VLNMPCA_PHYPhysicalComponent").size(), 1u);
        road::set_value(NIC_PORT, "features", row.feature, "1");
    }
    vlnsim_fault("AX_GetPortStatistics", 1, VLNSIM_STATUS, 190);
    EXPECT_NE(refreshed().find("AX_GetPortStatistics call failed, exited with error code : 190"),
              std::string::npos);
    EXPECT_EQ(road.count_in_log("Failed to get the statistics for port : VR10420117:0"), 1u);
    expect_properties(phy(), {{"CableNVP", "69"}, {"PHYFrames", "0"}});
    EXPECT_EQ(text_of(find(road, "VLNMPCA_PHYPhysicalComponent", "Description", "VR10420117:1"),
                      "PHYFrames"),
              "4294967298");
}

TEST_F(Phy, SettingsOfTheCable) {
    const auto nvp = [](std::uint32_t percent) {
        return Named_Values{{"CableNVP", number(CMPI_uint32, percent)}};
    };
    const Named_Values one_rate = {{"LineRateAdvertised_1G", number(CMPI_uint32, 0)}};
    const char* const range = "Invalid CableNVP value, Vaild values range 1 - 100";
    const char* const nothing = "No Modifiable parameter specified/Invalid Value passed";
    vlnsim_clear_calls();
    expect_changes(road, data(),
                   {{nvp(0), CMPI_RC_ERR_INVALID_PARAMETER, range},
                    {nvp(101), CMPI_RC_ERR_INVALID_PARAMETER, nothing},
                    {{}, CMPI_RC_ERR_INVALID_PARAMETER, nothing}});
    EXPECT_EQ(vlnsim_calls("AX_DiagSetNVP"), 0u);
    expect_changes(road, data(),
                   {{nvp(1), CMPI_RC_OK, "CableNVP data is passed"},
                    {nvp(100),
                     CMPI_RC_OK,
                     "Successfully set the CableNVP",
                     {},
                     "AX_DiagSetNVP(100002564C000000, 100) = 0"},
                    {nvp(50),
                     CMPI_RC_ERR_INVALID_PARAMETER,
                     "SetCableNVP setting is not supported, exited with the error code 190",
                     {"AX_GetHBAFeature", 190}},
                    {nvp(50),
                     CMPI_RC_ERR_INVALID_PARAMETER,
                     "Unable to Set the CableNVP",
                     {"AX_DiagSetNVP", 60}},
                    {one_rate,
                     CMPI_RC_ERR_INVALID_PARAMETER,
                     "Failed to set the LineRateAdvertised",
                     {"AX_SetAdapterAttribute", 60}},
                    {one_rate,
                     CMPI_RC_OK,
                     "Successfully set the LineRateAdvertised",
                     {},
                     "AX_SetAdapterAttribute(100002564C000000, 825, 4) = 0"},
                    {{{"CableNVP", number(CMPI_uint32, 101)},
                      {"LineRateAdvertised_100MB", number(CMPI_uint32, 0)}},
                     CMPI_RC_OK,
                     range},
                    {{{"CableNVP", number(CMPI_uint32, 77)},
                      {"LineRateAdvertised_10G", number(CMPI_uint32, 1)}},
                     CMPI_RC_OK,
                     "Successfully set the CableNVP"}});
    expect_properties(data(), {{"CableNVP", "77"},
                               {"LineRateAdvertised_10G", "1"},
                               {"LineRateAdvertised_1G", "1"},
                               {"LineRateAdvertised_100MB", "1"}});
    expect_changes(road, data(), {{one_rate, CMPI_RC_OK, "Found Functional port for adapter : "}});
    EXPECT_EQ(text_of(data(), "LineRateAdvertised_1G"), "0");
    EXPECT_EQ(text_of(phy(), "CableNVP"), "77");
    EXPECT_EQ(text_of(find(road, "VLNMPCA_PHYPhysicalComponentData", "Description", "VR10420117:1"),
                      "CableNVP"),
              "69");

    road::set_value(NIC_PORT, "features", "LineRateAdvertisement", "0");
    const Named_Values shortest = {{"InstanceID", *data().property("InstanceID")}};
    expect_changes(road, {data().path, shortest}, {{nvp(76), CMPI_RC_OK, "Successfully set"}});
    EXPECT_EQ(text_of(phy(), "CableNVP"), "76");
    host::Instance elsewhere = data();
    host::set(elsewhere.properties, "Description", Value::text("VR10420117:9"));
    host::Instance unknown = data();
    for (auto* values : {&unknown.path.keys, &unknown.properties})
        host::set(*values, "InstanceID", Value::text("VLN:MPCA PHY PhysicalComponentData:none"));
    expect_changes(
        road, data(),
        {{one_rate, CMPI_RC_ERR_INVALID_PARAMETER,
          "LineRateAdvertised setting is not supported, exited with the error code 251"}});
    expect_changes(
        road, elsewhere,
        {{nvp(60), CMPI_RC_ERR_FAILED, "Unable to find the functional port for this instance"}});
    expect_changes(road, unknown,
                   {{nvp(60), CMPI_RC_ERR_INVALID_PARAMETER,
                     "Invalid instance of VLNMPCA_PHYPhysicalComponentData_Provider"}});
    refreshed();
    expect_properties(data(), {{"CableNVP", "76"}, {"LineRateAdvertised_1G", "1"}});
}

// A speed is asked for through the FC port, if the physical port has one.
TEST_F(Phy, TheSpeedOfAPort) {
    const Value forced = number(CMPI_uint16, 3), named = number(CMPI_uint16, 2),
                chosen = number(CMPI_uint16, 1), metres = number(CMPI_uint32, 5);
    const auto speed = [](const char* text) { return Value::text(text); };
    const char* const refused = "ERROR: VLNMPCA_PortController::SetPhyPortSpeed failed";
    const std::string prefix = "ERROR: VLNMPCA_PortController::modify_instance ";
    const std::string no_values =
        prefix + "Invalid or unsupported value specified for mode, speed or length parameters.";
    const std::string no_mode = prefix + "No PortSpeedMode Specified";
    const std::string no_speed = prefix + "No ConfiguredPortSpeed Specified";
    expect_changes(
        road, controller(),
        {{{}, CMPI_RC_ERR_INVALID_PARAMETER, no_values.c_str()},
         {{{"DACCableLength", metres}}, CMPI_RC_ERR_INVALID_PARAMETER, no_mode.c_str()},
         {{{"ConfiguredPortSpeed", speed("1Gb")}}, CMPI_RC_ERR_INVALID_PARAMETER, no_mode.c_str()},
         {{{"PortSpeedMode", named}}, CMPI_RC_ERR_INVALID_PARAMETER, no_speed.c_str()},
         {{{"PortSpeedMode", forced}}, CMPI_RC_ERR_INVALID_PARAMETER, no_speed.c_str()},
         {{{"PortSpeedMode", chosen}, {"DACCableLength", metres}},
          CMPI_RC_OK,
          "modify_instance Cable Length:-1, Mode: 1 ,PortSpeed : ",
          {},
          R"(AX_SetPhyPortSpeedSettings(100002564C000002, "", 1, -1) = 0)"},
         {{{"PortSpeedMode", forced}, {"ConfiguredPortSpeed", speed("10Gb")}},
          CMPI_RC_ERR_FAILED,
          refused},
         {{{"PortSpeedMode", named}, {"ConfiguredPortSpeed", speed("10Gb")}},
          CMPI_RC_ERR_FAILED,
          "ERROR: VLNMPCA_PortController::GetPhyPortSpeedAttributesValues failed",
          {"AX_GetPortAttributes", 190}},
         {{{"PortSpeedMode", forced},
           {"ConfiguredPortSpeed", speed("1Gb")},
           {"DACCableLength", metres}},
          CMPI_RC_OK,
          "modify_instance- Successfully got portWWN,100002564C000002",
          {},
          R"(AX_SetPhyPortSpeedSettings(100002564C000002, "1Gb", 3, 5) = 0)"}});
    expect_properties(controller(), {{"MICallRMStatus", "40004"},
                                     {"PortSpeedMode", "3"},
                                     {"ConfiguredPortSpeed", "1Gb"},
                                     {"DACCableLength", "5"}});
    host::Instance optical = controller();
    host::set(optical.properties, "InterfaceType", number(CMPI_uint32, 4));
    const std::string length = prefix + "Cable Length specified when mode is FORCE and "
                                        "SFP_PLUS_10GB_TYPE";
    expect_changes(road, optical,
                   {{{{"PortSpeedMode", forced}, {"ConfiguredPortSpeed", speed("1Gb")}},
                     CMPI_RC_ERR_INVALID_PARAMETER,
                     length.c_str()}});
    host::Instance unknown = controller();
    for (auto* values : {&unknown.path.keys, &unknown.properties})
        host::set(*values, "DeviceID", Value::text("VR10420117:9"));
    expect_changes(road, unknown,
                   {{{{"PortSpeedMode", chosen}},
                     CMPI_RC_ERR_FAILED,
                     "ERROR: Invalid instance of VLNMPCA_PortController Data"}});
    refreshed();
    expect_properties(controller(), {{"MICallRMStatus", "-"}, {"ConfiguredPortSpeed", "1Gb"}});
}

// A cable test measures by what the PHY was told of its cable.
TEST_F(Phy, ACableTestTellsTheVelocity) {
    const auto test = find(road, "VLNMPCA_DiagnosticTest", "Name", "VLNMPCA: PHY TDRTest").path;
    const auto port = find(road, "VLNMPCA_EthernetPort", "DeviceID", NIC_PORT).path;
    const auto reply = road.manager().invoke(test, "RunDiagnosticService",
                                             {{"ManagedElement", Value::reference(port)}});
    EXPECT_TRUE(reply.ok());
    EXPECT_EQ(road.count_in_log("The Current CableNVP value : 69"), 1u);
}

struct Phy_Of_Blade : Phy {
    Phy_Of_Blade() : Phy("blade-16-functions.json") {}
};

TEST_F(Phy_Of_Blade, APortWithoutStorageIsReachedAsEthernetPort) {
    EXPECT_TRUE(road.enumerate("VLNMPCA_PHYPhysicalComponent").empty());
    EXPECT_EQ(road.count_in_log("10GBaseT feature is not supported for Port "), 8u);
    EXPECT_EQ(
        road.count_in_log("10GBaseT feature is either Not Supported/Failed to Create the feature"),
        1u);
    expect_changes(
        road, find(road, "VLNMPCA_PortController", "DeviceID", "VR10420119:1"),
        {{{{"PortSpeedMode", number(CMPI_uint16, 2)}, {"ConfiguredPortSpeed", Value::text("1Gb")}},
          CMPI_RC_OK,
          "modify_instance- Successfully Got MAC,100002564C020101"}});
}

} // namespace
