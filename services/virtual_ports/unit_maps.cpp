#include "services/virtual_ports/unit_maps.h"

#include "agent/associations.h"
#include "agent/fcoe/fc_port_maps.h"
#include "agent/text.h"
#include "classes/VLNMPCA_SCSIProtocolInitiatorEndpoint.h"
#include "classes/VLNMPCA_VirtualFCPort.h"
#include "classes/VLNMPCA_VirtualSCSIInitiatorTargetLogicalUnitPath.h"
#include "classes/VLNMPCA_VirtualSCSIProtocolTargetEndpoint.h"
#include "classes/VLNMPCA_VirtualStorageVolume.h"
#include "device/scan_end.h"
#include "foundation/common.h"
#include "foundation/utf8.h"

#include <algorithm>
#include <limits>
#include <string_view>
#include <unordered_map>

namespace cimple {

namespace {

constexpr uint16 CONNECTION_TYPE_FC = 18;    // as the initiator's endpoint has it
constexpr uint16 IF_TYPE_FIBRE_CHANNEL = 56; // IANAifType
constexpr uint16 ROLE_TARGET = 3;            // CIM_SCSIProtocolEndpoint.Role

constexpr char TARGET_CLASS[] = "VLNHBA_VirtualSCSIProtocolTargetEndpoint"; // consoles know it so

// What thousands of units say alike, in one piece of memory.
struct Shared_Texts {
    const String class_name{VLNMPCA_VirtualStorageVolume::static_meta_class.name};
    const String capacity_unit{"Byte"};
    const String device_name_label{"OS Device Name"};

    static const Shared_Texts& get() {
        static const Shared_Texts texts;
        return texts;
    }
};

String name_text(const AX_NAME& name) {
    return text(VLN_Common::wwnText(name.byte));
}

// The units of each target, in the order of their first ones.
using Units = std::vector<const AX_VPortTarget*>;
std::vector<Units> group_by_target(const std::vector<AX_VPortTarget>& listed) {
    std::vector<Units> targets;
    std::unordered_map<std::string_view, std::size_t> places;
    for (const AX_VPortTarget& unit : listed) {
        const std::string_view name(reinterpret_cast<const char*>(unit.wwpn.byte),
                                    sizeof unit.wwpn.byte);
        const auto [place, fresh] = places.try_emplace(name, targets.size());
        if (fresh)
            targets.emplace_back();
        targets[place->second].push_back(&unit);
    }
    return targets;
}

// The numbers of the units that a target tells of, ascending; nothing when it does not tell.
using Lun_List = std::optional<std::vector<uint32>>;

Lun_List read_luns(const Virtual_Port& port, const AX_NAME& target) {
    std::vector<uint32> luns;
    if (VLN_MethodWrapper::ListVPortLuns(&port.carrier_name, &port.name, target, &luns) !=
        AX_STATUS_OK)
        return std::nullopt;
    std::sort(luns.begin(), luns.end());
    luns.erase(std::unique(luns.begin(), luns.end()), luns.end());
    return luns;
}

// Whether the virtual machine of the port sees the unit; nothing when that cannot be told.
std::optional<bool> GetVMVisibility(const String& sub_device, uint32 os_lun, const Lun_List& luns) {
    VLN_LOG(VLN_DBG, "SubDeviceID: %s", sub_device.c_str());
    VLN_LOG(VLN_DBG, "OS Lun ID: %d", static_cast<int>(os_lun));
    if (!luns) {
        VLN_LOG(VLN_WARN, "Cannot Determine VM Visibility.");
        return std::nullopt;
    }
    const auto found = std::lower_bound(luns->begin(), luns->end(), os_lun);
    const bool is_visible = found != luns->end() && *found == os_lun;
    if (log_wanted(VLN_DBG))
        for (auto each = luns->begin(); each != found + (is_visible ? 1 : 0); ++each)
            VLN_LOG(VLN_DBG, "LunList Lun ID: %d", static_cast<int>(*each));
    return is_visible;
}

Ref<VLNMPCA_VirtualSCSIProtocolTargetEndpoint>
target_instance(const CIM_ComputerSystem& system, const AX_VPortTarget& unit, const String& key) {
    auto endpoint = make_instance<VLNMPCA_VirtualSCSIProtocolTargetEndpoint>();
    const String name = name_text(unit.wwpn);
    name_in_system(*endpoint, system);
    endpoint->CreationClassName.set(TARGET_CLASS);
    endpoint->Name.set(key);
    endpoint->ElementName.set(format_text("Target:%s", name.c_str()));
    endpoint->ConnectionType.set(CONNECTION_TYPE_FC);
    endpoint->ProtocolIFType.set(IF_TYPE_FIBRE_CHANNEL);
    endpoint->Role.set(ROLE_TARGET);
    endpoint->OtherIdentifyingInfo.append(field_text(unit.osDeviceName));
    endpoint->IdentifyingDescriptions.append(Shared_Texts::get().device_name_label);
    endpoint->FCID.set(unit.fcId);
    endpoint->SCSIBusNumber.set(unit.scsiBusNumber);
    endpoint->SCSITargetNumber.set(unit.scsiTargetNumber);
    endpoint->TargetWWPN.set(name);
    endpoint->TargetWWNN.set(name_text(unit.wwnn));
    return endpoint;
}

void describe(VLNMPCA_VirtualStorageVolume& volume, const VLN_VPortUnit& told) {
    volume.DeviceType.set(static_cast<uint16>(told.deviceType));
    volume.VendorID.set(text(told.vendor));
    volume.ProductID.set(text(told.product));
    volume.ProductVer.set(text(told.revision));
    volume.CapacityUnit.set(Shared_Texts::get().capacity_unit);
    if (told.blockLength == 0)
        return;
    const uint64 blocks = told.lastLBA + 1;
    volume.BlockSize.set(told.blockLength);
    volume.NumberOfBlocks.set(blocks);
    volume.LargeNumberOfBlocks.set(blocks);
    volume.Capacity.set(told.blockLength * blocks);
}

Ref<VLNMPCA_VirtualStorageVolume> volume_instance(const CIM_ComputerSystem& system,
                                                  const AX_VPortTarget& unit,
                                                  const VLN_VPortUnit& told,
                                                  const String& device_id) {
    auto volume = make_instance<VLNMPCA_VirtualStorageVolume>();
    volume->SystemCreationClassName.set(system.CreationClassName.value);
    volume->SystemName.set(system.Name.value);
    volume->CreationClassName.set(Shared_Texts::get().class_name);
    volume->DeviceID.set(device_id);
    const auto number = static_cast<int>(unit.scsiOSLun);
    volume->Description.set(format_text("LUN Number: %d", number));
    volume->ElementName.set(format_text("Storage Volume:%d", number));
    volume->OtherIdentifyingInfo.append(field_text(unit.osDeviceName));
    volume->IdentifyingDescriptions.append(Shared_Texts::get().device_name_label);
    describe(*volume, told);
    return volume;
}

// One line for a unit, however many of its texts are none.
void warn_of_wild_bytes(const AX_VPortTarget& unit, const VLN_VPortUnit& told,
                        const String& device_id) {
    if (!are_utf8({told.vendor, told.product, told.revision, fieldText(unit.osDeviceName)}))
        VLN_LOG(VLN_ERR, "Texts of unit %s are no UTF-8: bytes were replaced", device_id.c_str());
}

} // namespace

// A target of a virtual port, while its units are made.
struct Virtual_Unit_Maps::Seen_Target {
    const Virtual_Port& port;
    const Initiator& initiator; // in their stores
    const VLNMPCA_VirtualSCSIProtocolTargetEndpoint& shown;
    String key;
    Lun_List luns;
};

void Virtual_Unit_Maps::CreateVPortTargets(const Virtual_Port& port) {
    VLN_LOG(VLN_DBG, "Creating VPort Targets for FCPort: %s, Virtual FC Port: %s",
            port.carrier.c_str(), port.id.c_str());
    const Initiator* initiator = createInitiator(port);
    std::vector<AX_VPortTarget> listed;
    if (!initiator || VLN_MethodWrapper::ListVPortTargets(&port.carrier_name, &port.name,
                                                          &listed) != AX_STATUS_OK)
        return;
    for (const Units& units : group_by_target(listed))
        createTarget(port, *initiator, units);
}

const VLNMPCA_SCSIProtocolInitiatorEndpoint*
Virtual_Unit_Maps::createInitiator(const Virtual_Port& port) {
    const auto* initiator = insert_instance(_agent.m_VLNMPCA_SCSIProtocolInitiatorEndpoint_map,
                                            initiator_endpoint_instance(port.id, _system));
    if (!initiator)
        return nullptr;
    VLN_LOG(VLN_DBG, "Created Initiator for: %s", port.id.c_str());
    associate(_agent.m_VLNMPCA_VirtualDeviceSAPImplementation_map, port.shown, initiator);
    return initiator;
}

void Virtual_Unit_Maps::createTarget(const Virtual_Port& port, const Initiator& initiator,
                                     const Units& units) {
    const AX_VPortTarget& first = *units.front();
    const String key = format_text("%s:%s:%s", port.carrier.c_str(), port.id.c_str(),
                                   name_text(first.wwpn).c_str());
    const auto* shown = insert_instance(_agent.m_VLNMPCA_VirtualSCSIProtocolTargetEndpoint_map,
                                        target_instance(_system, first, key));
    if (!shown)
        return;
    associate(_agent.m_VLNMPCA_VirtualLocalHostedAccessPoint_map, &_system, shown);
    const Lun_List luns = read_luns(port, first.wwpn);
    const Seen_Target target{port, initiator, *shown, key, luns};
    for (const AX_VPortTarget* unit : units)
        if (!scan_is_to_end)
            createUnit(target, *unit);
}

void Virtual_Unit_Maps::createUnit(const Seen_Target& target, const AX_VPortTarget& unit) {
    const Virtual_Port& port = target.port;
    VLN_VPortUnit told;
    if (VLN_MethodWrapper::VPortLunAttr(&port.carrier_name, &port.name, unit, &told) !=
        AX_STATUS_OK)
        return;
    const String device_id =
        format_text("%s:%u", target.key.c_str(), static_cast<unsigned>(unit.scsiOSLun));
    warn_of_wild_bytes(unit, told, device_id);
    auto volume = volume_instance(_system, unit, told, device_id);
    if (const auto is_visible = GetVMVisibility(device_id, unit.scsiOSLun, target.luns))
        volume->VMVisibility.set(*is_visible);
    const auto* shown = insert_instance(_agent.m_VLNMPCA_VirtualStorageVolume_map, volume);
    if (!shown)
        return;
    associate(_agent.m_VLNMPCA_VirtualStorageVolumeSystemDevice_map, &_system, shown);
    associate(_agent.m_VLNMPCA_VirtualSCSIInitiatorTargetLogicalUnitPath_map,
              {&target.initiator, &target.shown, shown}, {}, [&](Instance& joined) {
                  auto& path = *cast<VLNMPCA_VirtualSCSIInitiatorTargetLogicalUnitPath>(&joined);
                  if (unit.osDeviceName[0] != '\0')
                      path.OSDeviceName.set(field_text(unit.osDeviceName));
                  if (unit.scsiOSLun <= std::numeric_limits<uint16>::max())
                      path.LogicalUnitNumber.set(static_cast<uint16>(unit.scsiOSLun));
              });
}

} // namespace cimple
