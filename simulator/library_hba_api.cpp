// The SNIA HBA API: adapters by name and handle, target mappings, SCSI commands.
#include "simulator/identifiers.h"
#include "simulator/scsi.h"

#include <algorithm>
#include <cstring>

namespace vlnsim::library {
namespace {

Function* function_of(Call& call, HBA_HANDLE handle) {
    const auto it = call.sim.handles.find(handle);
    Function* function =
        it == call.sim.handles.end() ? nullptr : call.sim.find_hba_adapter(it->second);
    if (!function)
        call.violation("unknown handle " + std::to_string(handle));
    return function;
}

// A handle that was not in use for long, so that a stale one is found out. Handles of a vendor
// library have 16 bits: the common library keeps its own number in the others.
HBA_HANDLE free_handle(Simulator& simulator) {
    constexpr HBA_HANDLE last = 0xFFFF;
    for (HBA_HANDLE tries = 0; tries < last; ++tries) {
        const HBA_HANDLE handle = simulator.next_handle;
        simulator.next_handle = handle == last ? 1 : handle + 1;
        if (!simulator.handles.count(handle))
            return handle;
    }
    return HBA_HANDLE_INVALID;
}

std::string text_of(const Attribute_Map& map, std::uint16_t identifier) {
    const auto it = map.find(identifier);
    return it == map.end() ? "" : it->second.text();
}

std::uint32_t number_of(const Attribute_Map& map, std::uint16_t identifier) {
    const auto it = map.find(identifier);
    return it == map.end() ? 0 : it->second.number();
}

void copy_types(const Attribute_Map& map, std::uint16_t identifier, HBA_FC4TYPES& types) {
    const auto it = map.find(identifier);
    if (it != map.end())
        std::memcpy(types.bits, it->second.bytes.data(),
                    std::min(sizeof types.bits, it->second.bytes.size()));
}

void fill_adapter(const Function& function, HBA_ADAPTERATTRIBUTES& record) {
    const Attribute_Map& map = function.adapter_attributes;
    std::memset(&record, 0, sizeof record);
    const auto text = [&](std::uint16_t identifier, auto& field) {
        copy_text(text_of(map, identifier), field, sizeof field);
    };
    text(adapter_manufacturer, record.Manufacturer);
    text(adapter_serial_number, record.SerialNumber);
    text(adapter_model, record.Model);
    text(adapter_model_description, record.ModelDescription);
    text(adapter_node_symbolic_name, record.NodeSymbolicName);
    text(adapter_hardware_version, record.HardwareVersion);
    text(adapter_driver_version, record.DriverVersion);
    text(adapter_option_rom_version, record.OptionROMVersion);
    text(adapter_firmware_version, record.FirmwareVersion);
    text(adapter_driver_name, record.DriverName);
    put_name(function.wwnn, record.NodeWWN.wwn);
    record.VendorSpecificID = number_of(map, adapter_vendor_specific_id);
    record.NumberOfPorts = function.hba_ports;
}

void fill_port(const Function& function, HBA_PORTATTRIBUTES& record) {
    const Attribute_Map& map = function.port_attributes;
    std::memset(&record, 0, sizeof record);
    put_name(function.wwnn, record.NodeWWN.wwn);
    put_name(function.wwpn, record.PortWWN.wwn);
    put_name(function.fabric, record.FabricName.wwn);
    record.PortFcId = number_of(map, port_fc_id);
    record.PortType = number_of(map, port_type);
    record.PortState = number_of(map, port_functional_state);
    record.PortSupportedClassofService = number_of(map, port_class_of_service);
    copy_types(map, port_supported_fc4_types, record.PortSupportedFc4Types);
    copy_types(map, port_active_fc4_types, record.PortActiveFc4Types);
    copy_text(text_of(map, port_symbolic_name), record.PortSymbolicName,
              sizeof record.PortSymbolicName);
    copy_text(text_of(map, port_os_device_name), record.OSDeviceName, sizeof record.OSDeviceName);
    record.PortSupportedSpeed = number_of(map, port_supported_speed);
    record.PortSpeed = number_of(map, port_speed);
    record.PortMaxFrameSize = number_of(map, port_max_frame_size);
    record.NumberofDiscoveredPorts = number_of(map, port_discovered_ports);
}

void fill_entry(const Target& target, const Unit& unit, HBA_FCPSCSIENTRY& entry) {
    std::memset(&entry, 0, sizeof entry);
    copy_text(unit.os_device_name, entry.ScsiId.OSDeviceName, sizeof entry.ScsiId.OSDeviceName);
    entry.ScsiId.ScsiBusNumber = target.bus;
    entry.ScsiId.ScsiTargetNumber = target.number;
    entry.ScsiId.ScsiOSLun = unit.os_lun;
    entry.FcpId.FcId = target.fc_id;
    put_name(target.node_wwn, entry.FcpId.NodeWWN.wwn);
    put_name(target.port_wwn, entry.FcpId.PortWWN.wwn);
    entry.FcpId.FcpLun = static_cast<HBA_UINT64>(unit.fcp_lun);
}

// What the mapping lists at the call with that number, in its order.
std::vector<HBA_FCPSCSIENTRY> mapping_entries(const Function& function, std::uint32_t call_number) {
    std::vector<HBA_FCPSCSIENTRY> entries;
    for (const Target& target : function.targets)
        for (const Unit& unit : target.units)
            if (unit.from_call <= call_number)
                fill_entry(target, unit, entries.emplace_back());
    if (function.mapping_by_unit)
        std::stable_sort(entries.begin(), entries.end(), [](const auto& a, const auto& b) {
            return a.ScsiId.ScsiOSLun < b.ScsiId.ScsiOSLun;
        });
    return entries;
}

HBA_STATUS answer_mapping(Call& call, Function& function, HBA_FCPTARGETMAPPING& mapping) {
    if (function.stale)
        return HBA_STATUS_ERROR_STALE_DATA;
    const std::uint32_t room = mapping.NumberOfEntries;
    const auto entries = mapping_entries(function, ++function.mapping_calls);
    auto needed = static_cast<std::uint32_t>(entries.size());
    const bool too_small = call.too_small(room, needed);
    call.out("room", room);
    std::copy_n(entries.begin(), std::min<std::size_t>(room, entries.size()), mapping.entry);
    mapping.NumberOfEntries = needed;
    call.out("entries", needed);
    return too_small ? HBA_STATUS_ERROR_MORE_DATA : HBA_STATUS_OK;
}

HBA_STATUS answer_command(Call& call, HBA_HANDLE handle, HBA_WWN port, HBA_UINT64 lun,
                          std::optional<Scsi_Command> command, const Scsi_Buffers& buffers) {
    Function* function = function_of(call, handle);
    return function ? answer_scsi(call, function->targets, get_name(port.wwn),
                                  static_cast<std::uint64_t>(lun), command, buffers)
                    : HBA_STATUS_ERROR_INVALID_HANDLE;
}

} // namespace

HBA_STATUS HBA_LoadLibrary() {
    return answer<HBA_STATUS>(Entry::HBA_LoadLibrary, [](Call& call) -> HBA_STATUS {
        call.sim.hba_loaded = true;
        return HBA_STATUS_OK;
    });
}

HBA_UINT32 HBA_GetNumberOfAdapters() {
    return answer<HBA_UINT32>(Entry::HBA_GetNumberOfAdapters, [](Call& call) -> HBA_UINT32 {
        return static_cast<HBA_UINT32>(call.sim.hba_adapters().size());
    });
}

HBA_STATUS HBA_GetAdapterName(HBA_UINT32 adapterindex, char* adaptername) {
    constexpr std::size_t room = 256; // what the interface asks callers for
    return answer<HBA_STATUS>(
        Entry::HBA_GetAdapterName,
        [&](Call& call) -> HBA_STATUS {
            if (call.null(adaptername, "adaptername"))
                return HBA_STATUS_ERROR_ARG;
            const auto adapters = call.sim.hba_adapters();
            if (adapterindex >= adapters.size())
                return HBA_STATUS_ERROR_ILLEGAL_INDEX;
            copy_text(*adapters[adapterindex]->hba_name, adaptername, room);
            call.out("adaptername", adaptername);
            return HBA_STATUS_OK;
        },
        adapterindex);
}

HBA_HANDLE HBA_OpenAdapter(char* adaptername) {
    return answer<HBA_HANDLE>(
        Entry::HBA_OpenAdapter,
        [&](Call& call) -> HBA_HANDLE {
            if (call.null(adaptername, "adaptername") || !call.sim.find_hba_adapter(adaptername))
                return HBA_HANDLE_INVALID;
            const HBA_HANDLE handle = free_handle(call.sim);
            if (handle != HBA_HANDLE_INVALID)
                call.sim.handles[handle] = adaptername;
            return handle;
        },
        static_cast<const char*>(adaptername));
}

void HBA_CloseAdapter(HBA_HANDLE handle) {
    answer<int>(
        Entry::HBA_CloseAdapter,
        [&](Call& call) {
            if (call.sim.handles.erase(handle) == 0)
                call.violation("unknown handle " + std::to_string(handle));
            return 0;
        },
        handle);
}

HBA_STATUS HBA_GetAdapterAttributes(HBA_HANDLE handle, HBA_ADAPTERATTRIBUTES* hbaattributes) {
    return answer<HBA_STATUS>(
        Entry::HBA_GetAdapterAttributes,
        [&](Call& call) -> HBA_STATUS {
            const Function* function = function_of(call, handle);
            if (!function)
                return HBA_STATUS_ERROR_INVALID_HANDLE;
            if (call.null(hbaattributes, "hbaattributes"))
                return HBA_STATUS_ERROR_ARG;
            fill_adapter(*function, *hbaattributes);
            return HBA_STATUS_OK;
        },
        handle);
}

HBA_STATUS HBA_GetAdapterPortAttributes(HBA_HANDLE handle, HBA_UINT32 portindex,
                                        HBA_PORTATTRIBUTES* portattributes) {
    return answer<HBA_STATUS>(
        Entry::HBA_GetAdapterPortAttributes,
        [&](Call& call) -> HBA_STATUS {
            const Function* function = function_of(call, handle);
            if (!function)
                return HBA_STATUS_ERROR_INVALID_HANDLE;
            if (call.null(portattributes, "portattributes"))
                return HBA_STATUS_ERROR_ARG;
            if (portindex >= function->hba_ports)
                return HBA_STATUS_ERROR_ILLEGAL_INDEX;
            fill_port(*function, *portattributes);
            return HBA_STATUS_OK;
        },
        handle, portindex);
}

void HBA_RefreshInformation(HBA_HANDLE handle) {
    answer<int>(
        Entry::HBA_RefreshInformation,
        [&](Call& call) {
            Function* function = function_of(call, handle);
            if (function && function->stale)
                --function->stale;
            return 0;
        },
        handle);
}

HBA_STATUS HBA_GetFcpTargetMapping(HBA_HANDLE handle, HBA_FCPTARGETMAPPING* pmapping) {
    return answer<HBA_STATUS>(
        Entry::HBA_GetFcpTargetMapping,
        [&](Call& call) -> HBA_STATUS {
            Function* function = function_of(call, handle);
            if (!function)
                return HBA_STATUS_ERROR_INVALID_HANDLE;
            if (call.null(pmapping, "pmapping"))
                return HBA_STATUS_ERROR_ARG;
            return answer_mapping(call, *function, *pmapping);
        },
        handle);
}

HBA_STATUS HBA_SendScsiInquiry(HBA_HANDLE handle, HBA_WWN PortWWN, HBA_UINT64 fcLUN, HBA_UINT8 EVPD,
                               HBA_UINT32 PageCode, void* pRspBuffer, HBA_UINT32 RspBufferSize,
                               void* pSenseBuffer, HBA_UINT32 SenseBufferSize) {
    return answer<HBA_STATUS>(
        Entry::HBA_SendScsiInquiry,
        [&](Call& call) {
            return answer_command(call, handle, PortWWN, fcLUN, inquiry_command(EVPD, PageCode),
                                  {pRspBuffer, RspBufferSize, pSenseBuffer, SenseBufferSize});
        },
        handle, PortWWN, fcLUN, EVPD, PageCode, RspBufferSize, SenseBufferSize);
}

HBA_STATUS HBA_SendReadCapacity(HBA_HANDLE handle, HBA_WWN portWWN, HBA_UINT64 fcLUN,
                                void* pRspBuffer, HBA_UINT32 RspBufferSize, void* pSenseBuffer,
                                HBA_UINT32 SenseBufferSize) {
    return answer<HBA_STATUS>(
        Entry::HBA_SendReadCapacity,
        [&](Call& call) {
            return answer_command(call, handle, portWWN, fcLUN, Scsi_Command::read_capacity,
                                  {pRspBuffer, RspBufferSize, pSenseBuffer, SenseBufferSize});
        },
        handle, portWWN, fcLUN, RspBufferSize, SenseBufferSize);
}

} // namespace vlnsim::library
