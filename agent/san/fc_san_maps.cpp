#include "agent/san/fc_san_maps.h"

#include "agent/associations.h"
#include "agent/san/logical_unit_maps.h"
#include "agent/text.h"
#include "classes/CIM_ComputerSystem.h"
#include "classes/VLNMPCA_SCSIProtocolEndpoint.h"
#include "classes/VLNMPCA_SCSIProtocolInitiatorEndpoint.h"
#include "device/scan_end.h"
#include "foundation/utf8.h"

#include <string_view>
#include <unordered_map>

namespace cimple {

namespace {

constexpr uint16 CONNECTION_TYPE_FC = 18;    // as the initiator's endpoint has it
constexpr uint16 IF_TYPE_FIBRE_CHANNEL = 56; // IANAifType
constexpr uint16 ROLE_TARGET = 3;            // CIM_SCSIProtocolEndpoint.Role

// The key of the port's own endpoint, which the adapter pass makes.
Ref<VLNMPCA_SCSIProtocolInitiatorEndpoint> initiator_key(const String& port_name,
                                                         const CIM_ComputerSystem& system) {
    auto key = make_instance<VLNMPCA_SCSIProtocolInitiatorEndpoint>();
    name_in_system(*key, system);
    key->Name.set(format_text("Initiator:%s", port_name.c_str()));
    return key;
}

String description_of(const Target& unit) {
    return format_text("%.8s %.16s Revision %.4s", unit.vendor.c_str(), unit.product.c_str(),
                       unit.revision.c_str());
}

String inquiry_of(const Target& unit) {
    return format_text("%.8s %.16s Revision %.4s Serial Number %.40s", unit.vendor.c_str(),
                       unit.product.c_str(), unit.revision.c_str(), unit.serialNumber.c_str());
}

// One line for a unit, however many of its texts are none.
void warn_of_wild_bytes(const Target& unit) {
    if (!are_utf8({unit.vendor, unit.product, unit.revision, unit.serialNumber, unit.osDeviceName}))
        VLN_LOG(VLN_ERR, "Texts of unit %u of target %s are no UTF-8: bytes were replaced",
                unit.scsiOSLun, unit.portWWN.c_str());
}

Ref<VLNMPCA_SCSIProtocolEndpoint> endpoint_instance(const Target& first_unit, const String& key,
                                                    const CIM_ComputerSystem& system) {
    auto endpoint = make_instance<VLNMPCA_SCSIProtocolEndpoint>();
    const String name = text(first_unit.portWWN);
    name_in_system(*endpoint, system);
    endpoint->Name.set(name);
    endpoint->ElementName.set(format_text("Target:%s", name.c_str()));
    endpoint->Description.set(inquiry_of(first_unit));
    endpoint->InstanceID.set(key);
    endpoint->ConnectionType.set(CONNECTION_TYPE_FC);
    endpoint->ProtocolIFType.set(IF_TYPE_FIBRE_CHANNEL);
    endpoint->Role.set(ROLE_TARGET);
    endpoint->OtherIdentifyingInfo.append(text(first_unit.osDeviceName));
    endpoint->IdentifyingDescriptions.append(String("OS Device Name"));
    endpoint->FCID.set(first_unit.fcId);
    endpoint->SCSIBusNumber.set(first_unit.scsiBusNumber);
    endpoint->SCSITargetNumber.set(first_unit.scsiTargetNumber);
    endpoint->TargetWWPN.set(name);
    endpoint->TargetWWNN.set(text(first_unit.nodeWWN));
    return endpoint;
}

Logical_Unit logical_unit(const Target& unit, const String& initiator_port) {
    Logical_Unit device;
    device.peripheral_type = unit.deviceType;
    device.number = unit.scsiOSLun;
    device.device_id = format_text("%s_%s_%u_%s", initiator_port.c_str(), unit.portWWN.c_str(),
                                   unit.scsiOSLun, descriptorText(unit.descriptor).c_str());
    device.name = logical_unit_name(unit.deviceType, unit.scsiOSLun);
    device.description = description_of(unit);
    device.os_device_name = text(unit.osDeviceName);
    device.inquiry = inquiry_of(unit);
    if (unit.blockLength != 0) {
        device.block_size = unit.blockLength;
        device.number_of_blocks = unit.lastLBA + 1;
        device.capacity = device.block_size * device.number_of_blocks;
    }
    if (unit.descriptor.identifierLength != 0)
        device.identifier_type = unit.descriptor.identifierType;
    return device;
}

} // namespace

struct FC_SAN_Maps::FC_Initiator {
    String port_name;    // 16 digits
    const Instance* end; // of the paths; null for a port that the adapter pass left out
};

std::vector<SCSI_Target> group_units(Port& port) {
    std::vector<SCSI_Target> targets;
    std::unordered_map<std::string_view, std::size_t> places;
    for (const auto& unit : port.getTargets()) {
        const auto [place, fresh] = places.try_emplace(unit->portWWN, targets.size());
        if (fresh)
            targets.emplace_back();
        targets[place->second].push_back(unit.get());
    }
    return targets;
}

FC_SAN_Maps::FC_SAN_Maps(ProviderAgent& agent)
    : _agent(agent), _system(agent.m_CIM_ComputerSystem_map[0]) {}

FC_SAN_Maps::FC_Initiator FC_SAN_Maps::findInitiator(Port& port) const {
    const String name = text(port.getPortName());
    const auto key = initiator_key(name, *_system);
    return {name, _agent.m_VLNMPCA_SCSIProtocolInitiatorEndpoint_map.lookup(key.get())};
}

void FC_SAN_Maps::createTargets(Port& port) {
    VLN_LOG(VLN_DBG, "Creating classes for port %d.", static_cast<int>(port.getPortIndex()));
    if (!_system) {
        VLN_LOG(VLN_ERR, "No computer system instance for the targets of port %s",
                port.getPortName().c_str());
        return;
    }
    VLN_LOG(VLN_DBG, "Checking Number of target instance.");
    const FC_Initiator initiator = findInitiator(port);
    const auto targets = group_units(port);
    Logical_Unit_Maps units(_agent, _system);
    for (std::size_t i = 0; i < targets.size() && !scan_is_to_end; ++i) {
        VLN_LOG(VLN_DBG, "Creating classes for target %d of %d.", static_cast<int>(i + 1),
                static_cast<int>(targets.size()));
        const Target& first = *targets[i].front();
        const Unit_Path path = {
            Unit_Transport::FC, initiator.end, createTarget(initiator, first),
            format_text("%s:%s", initiator.port_name.c_str(), first.portWWN.c_str())};
        for (const Target* unit : targets[i])
            createUnit(units, path, initiator, *unit);
    }
}

const VLNMPCA_SCSIProtocolEndpoint* FC_SAN_Maps::createTarget(const FC_Initiator& initiator,
                                                              const Target& first_unit) {
    auto& store = _agent.m_VLNMPCA_SCSIProtocolEndpoint_map;
    const String key = format_text("%s:%s:%s", _system->Name.value.c_str(),
                                   initiator.port_name.c_str(), first_unit.portWWN.c_str());
    const auto endpoint = endpoint_instance(first_unit, key, *_system);
    if (const auto* known = store.lookup(endpoint.get()))
        return known;
    if (!insert_instance(store, endpoint))
        return nullptr;
    associate_as(_agent.m_VLNMPCA_LocalHostedAccessPoint_map,
                 format_text("Local Hosted Access Point %s", key.c_str()), _system, endpoint.get());
    return endpoint.get(); // which the store keeps alive
}

void FC_SAN_Maps::createUnit(Logical_Unit_Maps& units, const Unit_Path& path,
                             const FC_Initiator& initiator, const Target& unit) {
    VLN_LOG(VLN_DBG, "Target %d is of type %d.", static_cast<int>(unit.scsiOSLun),
            static_cast<int>(unit.deviceType));
    warn_of_wild_bytes(unit);
    const Logical_Unit device = logical_unit(unit, initiator.port_name);
    units.joinPath(path, device, units.findOrMake(device));
}

} // namespace cimple
