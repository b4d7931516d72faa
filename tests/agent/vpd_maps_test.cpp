// FRU data in the stores, and the SAN pass over the device model, on simulated hosts.

#include "agent/associations.h"
#include "agent/hardware/vpd_maps.h"
#include "classes/VLNMPCA_Card.h"
#include "classes/VLNMPCA_FRUElementVPD.h"
#include "classes/VLNMPCA_FRUVitalProductData.h"
#include "classes/VLNMPCA_ProductPhysicalComponent.h"
#include "classes/VLNMPCA_SoftwareIdentity.h"
#include "tests/agent/maps_fixture.h"

#include <optional>

namespace cimple {

namespace {

constexpr char PORT[] = "100002564C000000";
constexpr char SERIAL[] = "VR10420117";
constexpr char UUID[] = "0f4a2c117d3e4b529a0102564c000001";

// A host whose first refresh has run, after the faults are set.
class Vpd_Maps_Test : public Maps_Test {
protected:
    void refresh() {
        agent.emplace();
        EXPECT_EQ(refreshes_started(**agent), 1);
    }
    void TearDown() override {
        agent.reset();
        Maps_Test::TearDown();
    }
    VLNMPCA_Card* card(uint32 index = 0) { return (*agent)->m_VLNMPCA_Card_map[index]; }

    VLNMPCA_SoftwareIdentity* add_software(const char* instance_id, uint16 classification,
                                           const char* serial) {
        auto software = make_instance<VLNMPCA_SoftwareIdentity>();
        software->InstanceID.set(instance_id);
        software->Classifications.append(classification);
        software->SerialNumber.set(serial);
        software->VersionString.set("old");
        software->Name.set("old");
        return insert_instance((*agent)->m_VLNMPCA_SoftwareIdentity_map, software);
    }

    std::optional<Loaded_Agent> agent;
};

} // namespace

TEST_F(Vpd_Maps_Test, NewCardTakesItsFruData) {
    load(R"({"use": "nic"}, {"use": "nic"})", R"("subAdapter": 3, )");
    refresh();
    expect_counts(**agent, {{STORE_VLNMPCA_Card, 1},
                            {STORE_VLNMPCA_FRUVitalProductData, 1},
                            {STORE_VLNMPCA_FRUElementVPD, 1}});
    // Once for all four functions of the card, and once for its firmware.
    EXPECT_EQ(vlnsim_calls("AX_GetVPDV2"), 2u);
    const struct {
        const Property<String>& property;
        const char* value;
    } rows[] = {{card()->Tag, UUID},
                {card()->Name, "Vorlan Ethernet Adapter VR10420117"},
                {card()->Manufacturer, "Vorlan"},
                {card()->SKU, "00VM221"},
                {card()->PartNumber, "VMC-2210"},
                {card()->SerialNumber, SERIAL},
                {card()->VLNSerialNumber, SERIAL}};
    for (const auto& row : rows)
        EXPECT_STREQ(row.property.value.c_str(), row.value);

    // The card is found by its new key, and what refers to it uses that key.
    const auto& cards = (*agent)->m_VLNMPCA_Card_map;
    EXPECT_EQ(cards.lookup(card()), card());
    EXPECT_EQ(cards.lookup((*agent)->m_VLNMPCA_FRUElementVPD_map[0]->ManagedElement), card());
    EXPECT_EQ(cards.lookup((*agent)->m_VLNMPCA_ProductPhysicalComponent_map[0]->PartComponent),
              card());

    std::string text = "\n";
    for (const std::string& line : lines_of((*agent)->m_VLNMPCA_FRUVitalProductData_map.at(0)))
        text += line + "\n";
    EXPECT_EQ(text, R"(
string __name_space = "root/vorlan";
string InstanceID = "VR10420117";
string ElementName = "VLN MPCA FRU:VR10420117";
string ProductName = "Vorlan VMC-2210 Converged Network Adapter";
string SerialNumber = "VR10420117";
string PartNumber = "VMC-2210";
string Manufacturer = "Vorlan";
string Date = "1214";
string UUID = "0f4a2c117d3e4b529a0102564c000001";
string FRUNumber = "00VM221";
string FRUFirmwareDetail = { "V:10.2.261.13,D:03152014" };
string ASICId = { "VR10420117:03" };
uint32 CardFunction = 64;
uint32 RevisionID = 3;
)");
}

TEST_F(Vpd_Maps_Test, CardWithoutFruDataKeepsWhatItHas) {
    load(R"({"use": "nic"})");
    ASSERT_EQ(vlnsim_fault("AX_GetVPDV2", VLNSIM_EVERY, VLNSIM_STATUS, 1), 0);
    Log_Capture log;
    refresh();
    expect_counts(**agent, {{STORE_VLNMPCA_Card, 1},
                            {STORE_VLNMPCA_FRUVitalProductData, 0},
                            {STORE_VLNMPCA_ProductPhysicalComponent, 1},
                            {STORE_VLNMPCA_EthernetPort, 2}});
    EXPECT_EQ(card()->Tag.value, SERIAL);
    EXPECT_EQ(card()->Name.value, "VMC-2210");
    EXPECT_EQ(log.count(VLN_DBG, "Unable to get the FRU VPD for Card : VR10420117 "), 2);
    EXPECT_EQ(log.count(VLN_DBG, "Updating FRU information to Softwareidentity Class"), 1);
    EXPECT_EQ(log.count(VLN_DBG, "Failed to update FRU VPD data to cim_softwareidentity instances"),
              1);
}

TEST_F(Vpd_Maps_Test, NamesFollowWhatTheDataHold) {
    const struct {
        const char* vpd;
        const char* name;
        const char* tag;
    } rows[] = {
        {R"({"MN": "Maker", "SN": "S1", "CF": 80})", "Maker Fibre Channel Adapter S1", SERIAL},
        {R"({"MN": "Maker", "SN": null, "CF": 96})", "Maker iSCSI Onboard Adapter 0", SERIAL},
        {R"({"MN": "Maker", "SN": "S1", "CF": 7})", "VMC-2210", SERIAL},
        {R"({"SN": "S1", "MN": null, "CF": 80})", "VMC-2210", SERIAL},
    };
    for (const auto& row : rows) {
        const std::string vpd =
            std::string(row.vpd, std::string(row.vpd).size() - 1) + R"(, "UU": null, "FN": null})";
        load(R"({"use": "nic", "vpd": )" + vpd + "}");
        refresh();
        EXPECT_EQ(card()->Name.value, row.name);
        EXPECT_EQ(card()->Tag.value, row.tag);
        EXPECT_TRUE(card()->SKU.is_null());
        agent.reset();
        vlnsim_close_libraries();
    }
}

// One UUID burnt into two cards must not cost the second card its place.
TEST_F(Vpd_Maps_Test, CardsOfOneUuidStayApart) {
    load(R"({"use": "nic", "vpd": {"UU": {"bytes": "00000000000000000000000000000000"}}})",
         R"("count": 2, )");
    refresh();
    expect_counts(**agent, {{STORE_VLNMPCA_Card, 2}, {STORE_VLNMPCA_FRUElementVPD, 2}});
    EXPECT_EQ(card(0)->Tag.value, "00000000000000000000000000000000");
    EXPECT_EQ(card(1)->Tag.value, "VR10420118");
    EXPECT_EQ(card(1)->SKU.value, "00VM222");
    for (uint32 i : {0u, 1u})
        EXPECT_EQ((*agent)->m_VLNMPCA_Card_map.lookup(card(i)), card(i));
}

TEST_F(Vpd_Maps_Test, FirmwareIdentitiesTakeTheirCardsData) {
    load(R"({"use": "nic"})");
    refresh();
    Log_Capture log;
    (*agent)->m_VLNMPCA_SoftwareIdentity_map.clear();
    EXPECT_EQ(VPD_Maps(**agent).UpdateFRUToSoftwareInstance(), 32768u);
    EXPECT_EQ(log.count(VLN_DBG, "No SoftwareIdentity instance to update the FRU Data"), 1);

    auto* driver = add_software("driver", 2, SERIAL);
    auto* firmware = add_software("firmware", 10, SERIAL);
    auto* further = add_software("further", 10, SERIAL);
    further->IdentityInfoType.append(String("Kind"));
    further->IdentityInfoValue.append(String("value"));
    further->IdentityInfoType.append(String("Without a value"));
    VPD_Maps maps(**agent);
    EXPECT_EQ(maps.UpdateFRUToSoftwareInstance(), 0u);
    EXPECT_EQ(driver->VersionString.value, "old");
    EXPECT_TRUE(driver->ReleaseDate.is_null());
    EXPECT_EQ(firmware->VersionString.value, "10.2.261.13");
    EXPECT_EQ(firmware->ReleaseDate.value.ascii(), "20140315000000.000000+360");
    EXPECT_EQ(firmware->Name.value, "Vorlan Ethernet Adapter VMC-2210 Firmware");
    ASSERT_EQ(firmware->IdentityInfoValue.value.size(), 1u);
    EXPECT_EQ(firmware->IdentityInfoValue.value[0], "value");
    EXPECT_EQ(further->IdentityInfoValue.value.size(), 1u);
    EXPECT_TRUE(driver->IdentityInfoValue.is_null());

    // One of a card that is not there fails; the others are served.
    add_software("stranger", 10, "unknown");
    firmware->VersionString.set("old");
    EXPECT_EQ(maps.UpdateFRUToSoftwareInstance(), 32768u);
    EXPECT_EQ(firmware->VersionString.value, "10.2.261.13");
    ASSERT_EQ(vlnsim_fault("AX_GetVPDV2", VLNSIM_EVERY, VLNSIM_STATUS, 63), 0);
    firmware->VersionString.set("old");
    EXPECT_NE(maps.UpdateFRUToSoftwareInstance(), 0u);
    EXPECT_EQ(firmware->VersionString.value, "old");
}

TEST_F(Vpd_Maps_Test, DatesOfAnotherFormAreLeftOut) {
    for (const char* text : {"D:0315201", "D:031520145", "D:aa152014", "V:only"}) {
        load(R"({"use": "nic", "vpd": {"FW": ")" + std::string(text) + R"("}})");
        refresh();
        auto* firmware = add_software("firmware", 10, SERIAL);
        EXPECT_EQ(VPD_Maps(**agent).UpdateFRUToSoftwareInstance(), 0u);
        EXPECT_TRUE(firmware->ReleaseDate.is_null()) << text;
        agent.reset();
        vlnsim_close_libraries();
    }
}

TEST_F(Vpd_Maps_Test, PortsAndSoftwareFindEachOther) {
    load(R"({"use": "nic"})");
    refresh();
    VPD_Maps maps(**agent);
    String text;
    EXPECT_EQ(maps.GetLogicalPortAddress(SERIAL, 2, &text), 0u);
    EXPECT_EQ(text, PORT);
    EXPECT_EQ(maps.GetLogicalPortAddress("VR10420117:1", 2, &text), 0u);
    EXPECT_STREQ(text.c_str(), "100002564C000101");
    EXPECT_EQ(maps.GetLogicalPortAddress("", 2, &text), 0u);
    EXPECT_EQ(text, PORT);
    EXPECT_EQ(maps.GetLogicalPortAddress("other", 2, &text), 32768u);
    EXPECT_EQ(maps.GetLogicalPortAddress(SERIAL, 1, &text), 32768u);
    EXPECT_EQ(maps.GetLogicalPortAddress(SERIAL, 2, nullptr), 32768u);

    (*agent)->m_VLNMPCA_SoftwareIdentity_map.clear();
    EXPECT_EQ(maps.GetSoftwareInstanceName(PORT, text), 32768u);
    add_software("driver", 2, SERIAL);
    add_software("firmware", 10, SERIAL);
    EXPECT_EQ(maps.GetSoftwareInstanceName(PORT, text), 0u);
    EXPECT_EQ(text, "firmware");
    EXPECT_EQ(maps.GetSoftwareInstanceName("0000000000000000", text), 32768u);
    Log_Capture log;
    EXPECT_EQ(maps.GetSoftwareInstanceName(nullptr, text), 32768u);
    EXPECT_EQ(log.count(VLN_DBG, "Invalid PortAddress"), 1);
    (*agent)->m_VLNMPCA_EthernetPort_map.clear();
    EXPECT_EQ(maps.GetLogicalPortAddress("", 2, &text), 32768u);
}

} // namespace cimple
