#include "agent/hardware/vpd_maps.h"

#include "agent/associations.h"
#include "agent/store_search.h"
#include "agent/text.h"
#include "classes/VLNMPCA_Card.h"
#include "classes/VLNMPCA_EthernetPort.h"
#include "classes/VLNMPCA_FRUVitalProductData.h"
#include "classes/VLNMPCA_SoftwareIdentity.h"

#include <algorithm>
#include <cctype>

namespace cimple {

namespace {

constexpr uint32 INSERT_FAILED = 32769;
constexpr uint16 FIRMWARE = 10; // CIM_SoftwareIdentity.Classifications

void set_unless_empty(Property<String>& property, const String& value) {
    if (!value.empty())
        property.set(value);
}

bool contains(const Array<String>& values, const String& value) {
    return std::find(values.begin(), values.end(), value) != values.end();
}

// What the console shows for the card; left alone without a maker or a known function.
void set_card_name(VLNMPCA_Card& card, const FRUVPD& record, uint32 index) {
    std::string function;
    const String maker = field_text(record.manufacturer);
    if (maker.empty() || VLN_Vpd::GetCardFunctionText(record.cardFunction, function) != 0)
        return;
    const String serial = field_text(record.serialNumber);
    card.Name.set(serial.empty() ? format_text("%s %s Onboard Adapter %d", maker.c_str(),
                                               function.c_str(), static_cast<int>(index))
                                 : format_text("%s %s Adapter %s", maker.c_str(), function.c_str(),
                                               serial.c_str()));
}

void add_asic(VLNMPCA_FRUVitalProductData& fru, const String& name) {
    if (!name.empty() && !contains(fru.ASICId.value, name))
        fru.ASICId.append(name);
}

Ref<VLNMPCA_FRUVitalProductData> fru_instance(const VLNMPCA_Card& card, const String& asic_name,
                                              const FRUVPD& record) {
    auto fru = make_instance<VLNMPCA_FRUVitalProductData>();
    const String& serial = card.VLNSerialNumber.value;
    fru->InstanceID.set(serial);
    fru->ElementName.set(format_text("VLN MPCA FRU:%s", serial.c_str()));
    fru->ProductName.set(field_text(record.productName));
    fru->SerialNumber.set(field_text(record.serialNumber));
    fru->PartNumber.set(field_text(record.partNumber));
    fru->Manufacturer.set(field_text(record.manufacturer));
    fru->Date.set(field_text(record.date));
    fru->UUID.set(field_text(record.uuid));
    fru->FRUNumber.set(field_text(record.fruNumber));
    fru->FRUFirmwareDetail.append(field_text(record.firmware));
    add_asic(*fru, asic_name);
    fru->CardFunction.set(record.cardFunction);
    fru->RevisionID.set(record.revisionId);
    return fru;
}

bool is_firmware(const VLNMPCA_SoftwareIdentity& software) {
    const Array<uint16>& classes = software.Classifications.value;
    return !classes.empty() && classes[0] == FIRMWARE;
}

// "mmddyyyy" to a date at midnight. False for another form.
bool release_date(const String& text, Datetime& date) {
    if (text.size() != 8)
        return false;
    const String moved = text.substr(4, 4) + text.substr(0, 4);
    return date.set((moved + "000000.000000+360").c_str());
}

// The identity pairs of another firmware of the same card whose types it does not have itself.
void copy_identities(VLNMPCA_SoftwareIdentity& firmware, const VLNMPCA_SoftwareIdentity& other) {
    const Array<String>& types = other.IdentityInfoType.value;
    const Array<String>& values = other.IdentityInfoValue.value;
    for (uint32 i = 0; i < std::min(types.size(), values.size()); ++i) {
        if (contains(firmware.IdentityInfoType.value, types[i]))
            continue;
        firmware.IdentityInfoType.append(types[i]);
        firmware.IdentityInfoValue.append(values[i]);
    }
}

} // namespace

uint32 VPD_Maps::UpdateFRUToCard(VLNMPCA_Card& card, std::span<const FRU_Source> functions,
                                 uint32 index) {
    uint32 result = 0;
    for (const FRU_Source& function : functions) {
        // The number under which the unit is ordered comes from its FRU data alone.
        const uint32 status =
            card.SKU.value.empty() ? takeFRUData(card, function, index) : addASIC(card, function);
        if (status != 0)
            result = status;
    }
    return result;
}

void VPD_Maps::joinFRUData(const VLNMPCA_Card& card) {
    if (const auto* fru = findFRUData(card))
        associate_once(_agent.m_VLNMPCA_FRUElementVPD_map, &card, fru,
                       "Insert Failed : VLNMPCA_FRUElementVPD");
}

const VLNMPCA_FRUVitalProductData* VPD_Maps::findFRUData(const VLNMPCA_Card& card) const {
    return find_by_key(_agent.m_VLNMPCA_FRUVitalProductData_map,
                       &VLNMPCA_FRUVitalProductData::InstanceID, card.VLNSerialNumber.value);
}

uint32 VPD_Maps::takeFRUData(VLNMPCA_Card& card, const FRU_Source& function, uint32 index) {
    VLN_LOG(VLN_DBG, "VLN_Vpd::UpdateFRUToCard");
    FRUVPD record{};
    if (const AX_STATUS status = GetFRUVPD(function.deviceId.c_str(), &record)) {
        VLN_LOG(VLN_DBG, "Unable to get the FRU VPD for Card : %s ", card.Tag.value.c_str());
        return status;
    }
    set_unless_empty(card.Manufacturer, field_text(record.manufacturer));
    set_unless_empty(card.SerialNumber, field_text(record.serialNumber));
    set_unless_empty(card.PartNumber, field_text(record.partNumber));
    set_unless_empty(card.SKU, field_text(record.fruNumber));
    set_card_name(card, record, index);
    setCardTag(card, field_text(record.uuid));
    // Data without an order number have been taken from another function before.
    if (const auto* fru = findFRUData(card)) {
        addASICName(*fru, function.asicName);
        return 0;
    }
    return insert_instance(_agent.m_VLNMPCA_FRUVitalProductData_map,
                           fru_instance(card, function.asicName, record))
               ? 0
               : INSERT_FAILED;
}

void VPD_Maps::setCardTag(VLNMPCA_Card& card, const String& tag) const {
    if (!tag.empty() && !find_by_key(_agent.m_VLNMPCA_Card_map, &VLNMPCA_Card::Tag, tag))
        card.Tag.set(tag);
}

void VPD_Maps::addASICName(const VLNMPCA_FRUVitalProductData& fru, const String& name) {
    change(_agent.m_VLNMPCA_FRUVitalProductData_map, &fru,
           [&](VLNMPCA_FRUVitalProductData& data) { add_asic(data, name); });
}

uint32 VPD_Maps::addASIC(const VLNMPCA_Card& card, const FRU_Source& function) {
    const auto* fru = findFRUData(card);
    if (!fru)
        return VLN_NOT_FOUND;
    if (function.asicName.empty() || contains(fru->ASICId.value, function.asicName))
        return 0;
    // The ASIC counts as the card's only if it tells that card's data.
    FRUVPD record{};
    if (const AX_STATUS status = GetFRUVPD(function.deviceId.c_str(), &record))
        return status;
    addASICName(*fru, function.asicName);
    return 0;
}

uint32 VPD_Maps::UpdateFRUToSoftwareInstance() {
    const auto& software = _agent.m_VLNMPCA_SoftwareIdentity_map;
    if (software.size() == 0) {
        VLN_LOG(VLN_DBG, "No SoftwareIdentity instance to update the FRU Data");
        return VLN_NOT_FOUND;
    }
    uint32 result = 0;
    for (uint32 i = 0; i < software.size(); ++i)
        if (is_firmware(*software[i]))
            if (const uint32 status = updateFirmware(i))
                result = status;
    return result;
}

uint32 VPD_Maps::updateFirmware(uint32 index) {
    auto& software = _agent.m_VLNMPCA_SoftwareIdentity_map;
    FRUVPD record{};
    const String reference = software[index]->SerialNumber.value;
    String address;
    if (const uint32 status = GetLogicalPortAddress(reference, PORT_ADDRESS, &address))
        return status;
    if (const AX_STATUS status = GetFRUVPD(address.c_str(), &record))
        return status;

    change(software, index, [&](VLNMPCA_SoftwareIdentity& firmware) {
        describeFirmware(firmware, reference, record);
        for (uint32 i = 0; i < software.size(); ++i)
            if (i != index && is_firmware(*software[i]) &&
                software[i]->SerialNumber.value == reference)
                copy_identities(firmware, *software[i]);
    });
    return 0;
}

void VPD_Maps::describeFirmware(VLNMPCA_SoftwareIdentity& firmware, const String& reference,
                                const FRUVPD& record) const {
    Datetime date;
    if (release_date(field_text(record.firmwareDate), date))
        firmware.ReleaseDate.set(date);
    set_unless_empty(firmware.VersionString, field_text(record.firmwareVersion));

    std::string function;
    std::string classification;
    const auto* card = find_first(_agent.m_VLNMPCA_Card_map, [&](const VLNMPCA_Card& candidate) {
        return candidate.VLNSerialNumber.value == reference;
    });
    if (card && GetCardFunctionText(record.cardFunction, function) == 0 &&
        GetClassificationText(FIRMWARE, classification) == 0)
        firmware.Name.set(format_text("%s %s Adapter %s %s", card->Manufacturer.value.c_str(),
                                      function.c_str(), card->Model.value.c_str(),
                                      classification.c_str()));
}

uint32 VPD_Maps::GetLogicalPortAddress(const String& reference, uint32 type,
                                       String* address) const {
    if (!address) {
        VLN_LOG(VLN_DBG, "Invalid PortAddress");
        return VLN_NOT_FOUND;
    }
    if (type != PORT_ADDRESS)
        return VLN_NOT_FOUND;
    // What a port says of itself ends with the serial number of its card.
    const auto* port =
        find_first(_agent.m_VLNMPCA_EthernetPort_map, [&](const VLNMPCA_EthernetPort& candidate) {
            return reference.empty() || contains(candidate.OtherIdentifyingInfo.value, reference);
        });
    if (!port)
        return VLN_NOT_FOUND;
    *address = port->DeviceID.value;
    return 0;
}

} // namespace cimple
