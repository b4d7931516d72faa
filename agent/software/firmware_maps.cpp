// The firmware that runs on an ASIC, and what its flash memory holds.

#include "agent/adapter_map_builder.h"
#include "agent/associations.h"
#include "agent/hardware/port_identity.h"
#include "agent/hardware/port_name.h"
#include "agent/profiles/profile_maps.h"
#include "agent/software/install_service.h"
#include "agent/software/software_identity.h"
#include "agent/store_search.h"
#include "agent/text.h"
#include "classes/VLNMPCA_Chip.h"
#include "classes/VLNMPCA_FlashImageSoftwareIdentity.h"
#include "classes/VLNMPCA_SoftwareIdentity.h"
#include "foundation/common.h"

namespace cimple {

namespace {

// The parts of a version of the form d.ddXd. Others stand in VersionString alone.
void set_firmware_numbers(VLNMPCA_SoftwareIdentity& firmware, const std::string& version) {
    VLN_FirmwareVersion parsed;
    if (VLN_Common::parseVersion(version.c_str(), parsed) != 0)
        return;
    firmware.MajorVersion.set(parsed.major);
    firmware.MinorVersion.set(parsed.minor);
    firmware.RevisionNumber.set(parsed.revision);
    firmware.BuildNumber.set(parsed.build);
    firmware.ReleaseType.set(text(parsed.releaseType));
    if (!parsed.testRevision.empty())
        firmware.TestReleaseVersion.set(text(parsed.testRevision));
}

Ref<VLNMPCA_SoftwareIdentity> firmware_instance(const NICAdapterAttributes& adapter) {
    auto firmware = make_instance<VLNMPCA_SoftwareIdentity>();
    const std::string& version = adapter.OpertionalFirmwareVersion;
    const String key = asic_name(adapter);
    firmware->Description.set("Vorlan CNA Firmware");
    firmware->ElementName.set(format_text("CNA Firmware v%s %s", version.c_str(), key.c_str()));
    firmware->Name.set(format_text("%s %s Adapter %s %s", "Vorlan", "Ethernet",
                                   adapter.Model.c_str(), "Firmware"));
    firmware->SerialNumber.set(text(adapter.SerialNumber));
    firmware->InstanceID.set(format_text("VLN CNA:OperationalFirmware:v%s %s UpdatedFirmware:v%s",
                                         version.c_str(), key.c_str(),
                                         adapter.FirmwareOnFlash.c_str()));
    firmware->VersionString.set(text(version));
    set_firmware_numbers(*firmware, version);
    firmware->Manufacturer.set(text(adapter.Manufacturer));
    firmware->Classifications.append(SOFTWARE_FIRMWARE);
    firmware->ClassificationDescriptions.append(String("CNA Firmware"));
    firmware->IsEntity.set(true);
    firmware->FirmwareOnFlash.set(text(adapter.FirmwareOnFlash));
    firmware->OptROMVersion.set(text(adapter.OptionROMVersion));
    append_identity(*firmware, IDENTITY_ASIC, key);
    setTargetOSTypes(*firmware);
    return firmware;
}

bool is_firmware_of(const VLNMPCA_SoftwareIdentity& software, const String& version,
                    const String& key) {
    return software.VersionString.value == version &&
           software.Classifications.value.find(SOFTWARE_FIRMWARE) == 0 &&
           software.IdentityInfoType.value.find(IDENTITY_ASIC) == 0 &&
           software.IdentityInfoValue.value[0] == key;
}

struct Flash_Part {
    Property<String> VLNMPCA_FlashImageSoftwareIdentity::*property;
    std::string NICAdapterAttributes::*attribute;
};

using Flash = VLNMPCA_FlashImageSoftwareIdentity;
using Attributes = NICAdapterAttributes;

constexpr Flash_Part FLASH_PARTS[] = {
    {&Flash::IPLFilename, &Attributes::IPLFilename},
    {&Flash::NCSIVersion, &Attributes::NCSIVersion},
    {&Flash::FCOEUniversalVersion, &Attributes::FCOEUniversalVersion},
    {&Flash::FCOE_X86_BIOSVersion, &Attributes::FCOE_X86_BIOSVersion},
    {&Flash::FCOE_EFIVersion, &Attributes::FCOE_EFIVersion},
    {&Flash::FCOE_FCODEVersion, &Attributes::FCOE_FCODEVersion},
    {&Flash::UEFI_BIOSVersion, &Attributes::UEFI_BIOSVersion},
    {&Flash::UEFI_NICVersion, &Attributes::UEFI_NICVersion},
    {&Flash::UEFI_FCODEVersion, &Attributes::UEFI_FCODEVersion},
    {&Flash::UEFI_ISCSIVersion, &Attributes::UEFI_ISCSIVersion},
    {&Flash::PCI_Express_LinkSpeed, &Attributes::PCIBusSpeed},
    {&Flash::PCI_Express_BusWidth, &Attributes::PCIBusWidth},
};

// Throws std::out_of_range for a firmware version with too few dots.
Ref<Flash> flash_instance(const NICAdapterAttributes& adapter, const String& key) {
    auto flash = make_instance<Flash>();
    flash->InstanceID.set(key);
    // Of the firmware that runs, not of the card: consoles match the two identities by it.
    flash->SerialNumber.set(text(adapter.OpertionalFirmwareVersion));
    for (const Flash_Part& part : FLASH_PARTS)
        (flash.get()->*part.property).set(text(adapter.*part.attribute));
    flash->Description.set("VLN CNA Flash Contents");
    const auto numbers = dotted_version(adapter.FirmwareVersion);
    flash->MajorVersion.set(numbers[0]);
    flash->MinorVersion.set(numbers[1]);
    flash->RevisionNumber.set(numbers[2]);
    flash->BuildNumber.set(numbers[3]);
    flash->ReleaseDate.set(Datetime::now());
    append_identity(*flash, "VORLAN:SERIAL_NUMBER", text(adapter.SerialNumber));
    append_identity(*flash, "VORLAN:IPL_FILENAME", text(adapter.IPLFilename));
    return flash;
}

} // namespace

const VLNMPCA_SoftwareIdentity* find_firmware(const Instance_Map<VLNMPCA_SoftwareIdentity>& store,
                                              const AdapterAttributes& adapter) {
    const String version = text(adapter.OpertionalFirmwareVersion);
    const String key = asic_name(adapter);
    return find_last(store, [&](const VLNMPCA_SoftwareIdentity& each) {
        return is_firmware_of(each, version, key);
    });
}

void Adapter_Map_Builder::findOrMakeFirmware(NIC_Port& port) {
    const NICAdapterAttributes& adapter = *port.function.attributes;
    port.firmware = find_firmware(_agent.m_VLNMPCA_SoftwareIdentity_map, adapter);
    if (port.firmware)
        return;
    port.firmware = CreateFirmwareIdentityInstance(adapter);
    if (!port.firmware) {
        VLN_LOG(VLN_CRIT, "CreateFirmwareIdentityInstance failed");
        return;
    }
    affect_by_install_service(_agent, _agent.m_VLNMPCA_InstallServiceAffectsFirmwareIdentity_map,
                              port.firmware);
    Profile_Maps profiles(_agent);
    profiles.createInstalledSoftware(port.firmware->ElementName.value, port.firmware, _system);
    profiles.createSoftwareConforms("Firmware , Software Inventory", PROFILE_SOFTWARE_INVENTORY,
                                    port.firmware);
}

const VLNMPCA_SoftwareIdentity*
Adapter_Map_Builder::CreateFirmwareIdentityInstance(const NICAdapterAttributes& adapter) {
    auto* firmware =
        insert_instance(_agent.m_VLNMPCA_SoftwareIdentity_map, firmware_instance(adapter));
    if (!firmware)
        return nullptr;
    const String key = asic_name(adapter);
    if (const auto* chip = find_by_key(_agent.m_VLNMPCA_Chip_map, &VLNMPCA_Chip::Tag, key))
        associate(_agent.m_VLNMPCA_FirmwareElementSoftwareIdentity_map, firmware, chip,
                  "Insert Failed (CNA): m_VLNMPCA_FirmwareElementSoftwareIdentity_map",
                  software_status({STATUS_CURRENT, STATUS_NEXT}));
    return firmware;
}

void Adapter_Map_Builder::joinFirmwareToPort(const NIC_Port& port) {
    if (port.firmware)
        associate(_agent.m_VLNMPCA_EthernetPortSoftwareIdentity_map, port.firmware,
                  port.ethernet_port, {},
                  software_status({STATUS_CURRENT, STATUS_NEXT, STATUS_ON_PORT}));
}

void Adapter_Map_Builder::joinFirmwareToController(const NIC_Port& port) {
    if (!port.firmware)
        return;
    const String text = format_text("Software Identity (Firmware) %s:%s",
                                    port.function.attributes->SerialNumber.c_str(),
                                    port.firmware->VersionString.value.c_str());
    associate_as(_agent.m_VLNMPCA_ElementSoftwareIdentity_map, text, port.firmware,
                 port.port_controller, {},
                 software_status({STATUS_CURRENT, STATUS_NEXT, STATUS_ON_PORT}));
}

// One image for each firmware version, whatever the number of cards that hold it.
void Adapter_Map_Builder::joinFlashImage(const NIC_Port& port) {
    const NICAdapterAttributes& adapter = *port.function.attributes;
    auto& images = _agent.m_VLNMPCA_FlashImageSoftwareIdentity_map;
    const String key = format_text("VLN CNA Flash Contents:%s", adapter.FirmwareVersion.c_str());
    const auto* image = find_by_key(images, &Flash::InstanceID, key);
    if (!image)
        image = insert_instance(images, flash_instance(adapter, key));
    if (image && port.new_port_controller)
        associate(_agent.m_VLNMPCA_MPCAPortFlashImageSoftwareIdentity_map, image,
                  port.port_controller, {}, software_status({STATUS_CURRENT, STATUS_NEXT}));
}

} // namespace cimple
