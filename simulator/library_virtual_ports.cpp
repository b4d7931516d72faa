// The virtual ports that functions carry, what these see, and the virtual machines that use them.
#include "simulator/scsi.h"

#include <algorithm>
#include <cstring>

namespace vlnsim::library {
namespace {

std::uint64_t number_of(AX_WWN wwn) {
    AX_NAME name;
    std::memcpy(&name, &wwn, sizeof name);
    return get_name(name.byte);
}

// Null, with a violation, for one that the function does not carry.
Virtual_Port* find_port(Call& call, AX_WWN wwn, AX_WWN vport) {
    Function* function = call.function(wwn);
    if (!function)
        return nullptr;
    for (Virtual_Port& port : function->virtual_ports)
        if (get_name(port.names.wwpn.byte) == number_of(vport))
            return &port;
    call.violation("unknown virtual port " + shown(vport));
    return nullptr;
}

AX_VPortTarget entry_of(const Target& target, const Unit& unit) {
    AX_VPortTarget entry{};
    put_name(target.port_wwn, entry.wwpn.byte);
    put_name(target.node_wwn, entry.wwnn.byte);
    entry.fcId = target.fc_id;
    entry.scsiBusNumber = target.bus;
    entry.scsiTargetNumber = target.number;
    entry.scsiOSLun = unit.os_lun;
    entry.fcpLun = unit.fcp_lun;
    copy_text(unit.os_device_name, entry.osDeviceName, sizeof entry.osDeviceName);
    return entry;
}

const Virtual_Machine* find_machine(const Host& host, const std::string& id) {
    for (const Function& function : host.functions)
        for (const Virtual_Port& port : function.virtual_ports)
            if (port.machine && port.machine->id == id)
                return &*port.machine;
    return nullptr;
}

} // namespace

AX_STATUS AX_VPList(AX_WWN wwn, AX_VPortList* list) {
    return answer<AX_STATUS>(
        Entry::AX_VPList,
        [&](Call& call) -> AX_STATUS {
            if (call.null(list, "list"))
                return AX_STATUS_INVALID_ARGUMENT;
            const Function* function = call.function(wwn);
            if (!function)
                return AX_STATUS_ILLEGAL_WWN;
            const auto& ports = function->virtual_ports;
            if (call.list_too_small(list->count, ports.size()))
                return AX_STATUS_MORE_DATA;
            std::transform(ports.begin(), ports.end(), list->entry,
                           [](const Virtual_Port& port) { return port.names; });
            return AX_STATUS_OK;
        },
        wwn);
}

AX_STATUS AX_VPGetAttributes(AX_WWN wwn, AX_WWN vport, AX_VPortAttributes* attributes) {
    return answer<AX_STATUS>(
        Entry::AX_VPGetAttributes,
        [&](Call& call) -> AX_STATUS {
            if (call.null(attributes, "attributes"))
                return AX_STATUS_INVALID_ARGUMENT;
            const Virtual_Port* port = find_port(call, wwn, vport);
            if (!port)
                return AX_STATUS_ILLEGAL_WWN;
            *attributes = port->attributes;
            return AX_STATUS_OK;
        },
        wwn, vport);
}

AX_STATUS AX_VPListTargets(AX_WWN wwn, AX_WWN vport, AX_VPortTargetList* list) {
    return answer<AX_STATUS>(
        Entry::AX_VPListTargets,
        [&](Call& call) -> AX_STATUS {
            if (call.null(list, "list"))
                return AX_STATUS_INVALID_ARGUMENT;
            const Virtual_Port* port = find_port(call, wwn, vport);
            if (!port)
                return AX_STATUS_ILLEGAL_WWN;
            std::vector<AX_VPortTarget> entries;
            for (const Target& target : port->targets)
                for (const Unit& unit : target.units)
                    entries.push_back(entry_of(target, unit));
            if (call.list_too_small(list->count, entries.size()))
                return AX_STATUS_MORE_DATA;
            std::copy(entries.begin(), entries.end(), list->entry);
            return AX_STATUS_OK;
        },
        wwn, vport);
}

// The statuses of SCSI commands are those of the HBA API.

AX_STATUS AX_VpScsiInquiry(AX_WWN wwn, AX_WWN vport, AX_WWN target, uint64_t fcpLun, uint32_t evpd,
                           uint32_t page, void* response, uint32_t responseSize, void* sense,
                           uint32_t senseSize) {
    return answer<AX_STATUS>(
        Entry::AX_VpScsiInquiry,
        [&](Call& call) -> AX_STATUS {
            Virtual_Port* port = find_port(call, wwn, vport);
            return port ? answer_scsi(call, port->targets, number_of(target), fcpLun,
                                      inquiry_command(evpd, page),
                                      {response, responseSize, sense, senseSize})
                        : AX_STATUS_ILLEGAL_WWN;
        },
        wwn, vport, target, fcpLun, evpd, page, responseSize, senseSize);
}

AX_STATUS AX_VpScsiReadCapacity(AX_WWN wwn, AX_WWN vport, AX_WWN target, uint64_t fcpLun,
                                void* response, uint32_t responseSize, void* sense,
                                uint32_t senseSize) {
    return answer<AX_STATUS>(
        Entry::AX_VpScsiReadCapacity,
        [&](Call& call) -> AX_STATUS {
            Virtual_Port* port = find_port(call, wwn, vport);
            return port ? answer_scsi(call, port->targets, number_of(target), fcpLun,
                                      Scsi_Command::read_capacity,
                                      {response, responseSize, sense, senseSize})
                        : AX_STATUS_ILLEGAL_WWN;
        },
        wwn, vport, target, fcpLun, responseSize, senseSize);
}

AX_STATUS AX_VpScsiReportLUNs(AX_WWN wwn, AX_WWN vport, AX_WWN target, void* response,
                              uint32_t responseSize, void* sense, uint32_t senseSize) {
    return answer<AX_STATUS>(
        Entry::AX_VpScsiReportLUNs,
        [&](Call& call) -> AX_STATUS {
            const Virtual_Port* port = find_port(call, wwn, vport);
            return port ? report_luns(call, port->targets, number_of(target),
                                      {response, responseSize, sense, senseSize})
                        : AX_STATUS_ILLEGAL_WWN;
        },
        wwn, vport, target, responseSize, senseSize);
}

AX_STATUS AX_GetVMFromVPort(AX_WWN wwn, AX_WWN vport, AX_VM* vm) {
    return answer<AX_STATUS>(
        Entry::AX_GetVMFromVPort,
        [&](Call& call) -> AX_STATUS {
            if (call.null(vm, "vm"))
                return AX_STATUS_INVALID_ARGUMENT;
            const Virtual_Port* port = find_port(call, wwn, vport);
            if (!port)
                return AX_STATUS_ILLEGAL_WWN;
            if (!port->machine)
                return AX_STATUS_NOT_SUPPORTED;
            copy_text(port->machine->id, vm->id, sizeof vm->id);
            return AX_STATUS_OK;
        },
        wwn, vport);
}

AX_STATUS AX_GetVMInfo(const AX_VM* vm, AX_VMInfo* info) {
    return answer<AX_STATUS>(Entry::AX_GetVMInfo, [&](Call& call) -> AX_STATUS {
        if (call.null(vm, "vm") || call.null(info, "info"))
            return AX_STATUS_INVALID_ARGUMENT;
        const Virtual_Machine* machine =
            find_machine(call.host, {vm->id, strnlen(vm->id, sizeof vm->id)});
        if (!machine) {
            call.violation("unknown virtual machine");
            return AX_STATUS_INVALID_ARGUMENT;
        }
        copy_text(machine->name, info->name, sizeof info->name);
        copy_text(machine->operating_system, info->operatingSystem, sizeof info->operatingSystem);
        return AX_STATUS_OK;
    });
}

} // namespace vlnsim::library
