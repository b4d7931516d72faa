// Units, targets and mappings that go wrong: what they told is shown, the others stand.
#include "tests/road/hosts.h"
#include "tests/road/properties.h"

using road::expect_properties;
using road::Road;
using road::text_of;

namespace {

#define REPLACED "\xEF\xBF\xBD" // U+FFFD

// One port that sees a target with these units.
std::string san(const std::string& units) {
    return road::card(R"({"use": "nic"}, {"use": "fcoe",
        "targets": {"wwpn": "50:25:64:C0:00:00:00:01", "luns": [)" +
                      units + "]}}");
}

// The object manager finds every property that is no UTF-8.
TEST(Bad_San, TextsOfUnitsBecomeTextsWhateverTheirBytesAre) {
    Road road({.scenario = san(R"({"vendor": {"bytes": "56C3"}, "product": "P",
            "revision": {"bytes": "C3A4FFE2"}, "serial": {"bytes": "E282AC80"},
            "osDeviceName": {"bytes": "2F646576FE"}},
        {"serial": {"bytes": "58585858585858585858585858585858585858585858585858585858585858585858585858585858C3A9"}},
        {})"),
               .log = true});
    const auto units = road.enumerate("VLNMPCA_StorageVolume");
    ASSERT_EQ(units.size(), 3u);
    EXPECT_EQ(text_of(units[0], "Description"),
              "V" REPLACED "       P                Revision \xC3\xA4" REPLACED REPLACED);
    EXPECT_EQ(text_of(units[0], "OtherIdentifyingInfo"),
              "{/dev" REPLACED ", V" REPLACED
              "       P                Revision \xC3\xA4" REPLACED REPLACED
              " Serial Number \xE2\x82\xAC" REPLACED "}");
    // The number is cut at 40 bytes, in front of the character.
    EXPECT_TRUE(text_of(units[1], "OtherIdentifyingInfo").ends_with("XX}"));
    EXPECT_EQ(text_of(units[2], "Description"), "VORLAN   SIMULATED UNIT   Revision 1.00");
    road.census();
    road.close();
    EXPECT_EQ(road.count_in_log("Texts of unit 0 of target 502564C000000001 are no UTF-8"), 1u);
    EXPECT_EQ(road.count_in_log("are no UTF-8"), 1u);
}

TEST(Bad_San, UnitsThatDoNotAnswerAreShownAsTheyAre) {
    Road road({.scenario = san(R"({"silent": true}, {"checkConditions": 4000000000},
        {"checkConditions": 2}, {"responses": {"serialPage": false}},
        {"responses": {"capacity": "", "identityPage": "", "inquiry": "", "serialPage": ""}},
        {"responses": {"inquiry": "60", "identityPage": false}})"),
               .log = true});
    const auto units = road.enumerate("VLNMPCA_StorageVolume");
    ASSERT_EQ(units.size(), 6u); // the bits above the type of the last one count nothing
    for (std::size_t silent : {0u, 1u})
        expect_properties(
            units[silent],
            {{"DeviceID",
              ("100002564C000001_502564C000000001_" + std::to_string(silent) + "_").c_str()},
             {"Description", "Unknown Unknown Revision Unkn"},
             {"Capacity", "-"},
             {"BlockSize", "-"},
             {"NumberOfBlocks", "-"},
             {"NameFormat", "-"}});
    EXPECT_EQ(text_of(units[2], "Capacity"), "1073741824");
    EXPECT_EQ(text_of(units[4], "Description"), "  Revision ");
    EXPECT_EQ(road.enumerate("VLNMPCA_SCSIInitiatorTargetStorageVolumePath").size(), units.size());
    road.close();
    EXPECT_EQ(road.count_in_log("Sense Data: 70 00 05 00 00 00 00 0a 00 00 00 00 24 00 00 00 00 00 "
                                "00 00 00 00 00 00 \n"),
              1u);
}

// Only three lengths have a text; the key is unique by the number of the unit in any case.
TEST(Bad_San, DescriptorsOfEveryLength) {
    constexpr std::size_t LENGTHS = 248; // as many as fit into a response
    std::string units;
    for (std::size_t length = 0; length < LENGTHS; ++length) {
        units += (length ? "," : "") + std::string(R"({"identifier": {"type": 3, "bytes": ")");
        for (std::size_t i = 0; i < length; ++i)
            units += "A5";
        units += "\"}}";
    }
    Road road({.scenario = san(units), .log = true});
    const auto volumes = road.enumerate("VLNMPCA_StorageVolume");
    ASSERT_EQ(volumes.size(), LENGTHS);
    for (std::size_t length = 0; length < LENGTHS; ++length) {
        std::string id = "100002564C000001_502564C000000001_" + std::to_string(length) + "_";
        if (length == 8 || length == 12 || length == 16)
            for (std::size_t i = 0; i < length; ++i)
                id += "A5";
        EXPECT_EQ(text_of(volumes[length], "DeviceID"), id);
        EXPECT_EQ(text_of(volumes[length], "NameFormat"), length ? "9" : "-") << length;
    }
    road.close();
    EXPECT_EQ(road.count_in_log("INVALID Descriptor"), LENGTHS - 3);
}

// A length in the descriptor that its page does not hold, up to the largest that a byte can tell.
TEST(Bad_San, DescriptorsThatLieAboutTheirLength) {
    Road road({.scenario = san(R"({"responses": {"identityPage": "00830004010300FF"}},
        {"responses": {"identityPage": "0083000401030010"}}, {"responses": {"identityPage": "00"}})")});
    const auto volumes = road.enumerate("VLNMPCA_StorageVolume");
    ASSERT_EQ(volumes.size(), 3u);
    EXPECT_EQ(text_of(volumes[0], "DeviceID"), "100002564C000001_502564C000000001_0_");
    EXPECT_EQ(text_of(volumes[1], "DeviceID"),
              "100002564C000001_502564C000000001_1_" + std::string(32, '0'));
}

// Each time that the provider has made room, there is more. After three times it leaves the port
// alone until the next refresh.
TEST(Bad_San, AMappingThatGrowsWhileItIsRead) {
    constexpr std::uint64_t ELEVEN_MINUTES = 11 * 60000000ull;
    Road once({.scenario = san(R"({"count": 300}, {"count": 20, "fromCall": 2})")});
    EXPECT_EQ(once.enumerate("VLNMPCA_StorageVolume").size(), 320u);
    EXPECT_EQ(vlnsim_calls("HBA_GetFcpTargetMapping"), 3u);
    once.close();

    Road road({.scenario = san(R"({"count": 300}, {"count": 20, "fromCall": 2},
                                         {"count": 20, "fromCall": 3})"),
               .log = true});
    EXPECT_TRUE(road.enumerate("VLNMPCA_StorageVolume").empty());
    EXPECT_TRUE(road.enumerate("VLNMPCA_SCSIProtocolEndpoint").empty());
    EXPECT_EQ(road.enumerate("VLNMPCA_EthernetPort").size(), 1u);
    road.wait_for_refreshes(1);
    vlnsim_advance(ELEVEN_MINUTES);
    road.enumerate("VLNMPCA_EthernetPort");
    road.wait_for_refreshes(2);
    EXPECT_EQ(road.enumerate("VLNMPCA_StorageVolume").size(), 340u);
}

} // namespace
