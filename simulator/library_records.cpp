// What is read and set record by record: vital product data, PCI registers, transceiver, beacon,
// and the properties of an iSCSI function.
#include "simulator/call.h"

#include <algorithm>
#include <cstring>

namespace vlnsim::library {
namespace {

constexpr std::uint32_t vpd_version = 1;
constexpr std::size_t vpd_tag_length = 2;

// A copy of an optional record of the function.
template <class Record>
AX_STATUS answer_copy(Call& call, AX_WWN wwn, Record* destination,
                      std::optional<Record> Function::*record) {
    if (call.null(destination, "destination"))
        return AX_STATUS_INVALID_ARGUMENT;
    const Function* function = call.function(wwn);
    if (!function)
        return AX_STATUS_ILLEGAL_WWN;
    if (!(function->*record))
        return AX_STATUS_NOT_SUPPORTED;
    std::memcpy(destination, &*(function->*record), sizeof(Record));
    return AX_STATUS_OK;
}

// The reverse, for a function that has such a record.
template <class Record>
AX_STATUS answer_set(Call& call, AX_WWN wwn, const Record* source,
                     std::optional<Record> Function::*record) {
    if (call.null(source, "source"))
        return AX_STATUS_INVALID_ARGUMENT;
    Function* function = call.function(wwn);
    if (!function)
        return AX_STATUS_ILLEGAL_WWN;
    if (!(function->*record))
        return AX_STATUS_NOT_SUPPORTED;
    std::memcpy(&*(function->*record), source, sizeof(Record));
    return AX_STATUS_OK;
}

// An entry is two tag bytes, the length in one byte, the value; a zero byte ends the list.
AX_STATUS answer_vpd(Call& call, AX_WWN wwn, void* buffer, uint32_t* size,
                     std::vector<std::pair<std::string, Bytes>> Function::*entries) {
    if (call.null(buffer, "buffer") || call.null(size, "size"))
        return AX_STATUS_INVALID_ARGUMENT;
    const Function* function = call.function(wwn);
    if (!function)
        return AX_STATUS_ILLEGAL_WWN;
    if ((function->*entries).empty())
        return AX_STATUS_NOT_SUPPORTED;
    Bytes bytes;
    for (const auto& [tag, value] : function->*entries) {
        bytes.insert(bytes.end(), tag.begin(), tag.end());
        bytes.push_back(static_cast<std::uint8_t>(value.size()));
        bytes.insert(bytes.end(), value.begin(), value.end());
    }
    bytes.push_back(0);
    auto needed = static_cast<std::uint32_t>(bytes.size());
    if (call.too_small(*size, needed)) {
        *size = needed;
        return AX_STATUS_BUFFER_TOO_SMALL;
    }
    std::memcpy(buffer, bytes.data(), bytes.size());
    soil(buffer, bytes.size(), *size);
    *size = needed;
    call.out("size", *size);
    return AX_STATUS_OK;
}

// Cut to the room, with zeros behind.
void copy_filled(const std::uint8_t* bytes, std::size_t length, char* destination,
                 std::size_t room) {
    const std::size_t copied = std::min(length, room);
    std::memcpy(destination, bytes, copied);
    std::memset(destination + copied, 0, room - copied);
}

} // namespace

AX_STATUS AX_GetVPD(AX_WWN wwn, void* buffer, uint32_t* size) {
    return answer<AX_STATUS>(
        Entry::AX_GetVPD,
        [&](Call& call) { return answer_vpd(call, wwn, buffer, size, &Function::pci_vpd); }, wwn);
}

AX_STATUS AX_GetVPDV2(AX_WWN wwn, uint32_t version, void* buffer, uint32_t* size) {
    return answer<AX_STATUS>(
        Entry::AX_GetVPDV2,
        [&](Call& call) -> AX_STATUS {
            if (version != vpd_version) {
                call.violation("unknown version " + std::to_string(version));
                return AX_STATUS_INVALID_ARGUMENT;
            }
            return answer_vpd(call, wwn, buffer, size, &Function::fru_vpd);
        },
        wwn, version);
}

void* AX_GetNextVpdEntry(void* cursor, char* tag, uint32_t tagSize, char* value,
                         uint32_t valueSize) {
    return answer<void*>(
        Entry::AX_GetNextVpdEntry,
        [&](Call& call) -> void* {
            if (call.null(cursor, "cursor") || call.null(tag, "tag") || call.null(value, "value"))
                return nullptr;
            auto* at = static_cast<std::uint8_t*>(cursor);
            if (call.forced_status || *at == 0)
                return nullptr;
            const std::size_t length = at[vpd_tag_length];
            std::uint8_t* bytes = at + vpd_tag_length + 1;
            copy_filled(at, vpd_tag_length, tag, tagSize);
            copy_filled(bytes, length, value, valueSize);
            return bytes + length;
        },
        tagSize, valueSize);
}

AX_STATUS AX_GetSffData(AX_WWN wwn, AX_SffData* data) {
    return answer<AX_STATUS>(
        Entry::AX_GetSffData,
        [&](Call& call) { return answer_copy(call, wwn, data, &Function::sff); }, wwn);
}

AX_STATUS AX_DiagReadPCIRegistersV2(AX_WWN wwn, AX_PCIRegisters* registers) {
    return answer<AX_STATUS>(
        Entry::AX_DiagReadPCIRegistersV2,
        [&](Call& call) { return answer_copy(call, wwn, registers, &Function::pci); }, wwn);
}

AX_STATUS AX_DiagBeacon(AX_WWN wwn, uint32_t state) {
    return answer<AX_STATUS>(
        Entry::AX_DiagBeacon,
        [&](Call& call) -> AX_STATUS {
            if (state != AX_BEACON_OFF && state != AX_BEACON_ON) {
                call.violation("unknown beacon state " + std::to_string(state));
                return AX_STATUS_INVALID_ARGUMENT;
            }
            const std::uint32_t wanted = state;
            return answer_set(call, wwn, &wanted, &Function::beacon);
        },
        wwn, state);
}

AX_STATUS AX_DiagBeaconState(AX_WWN wwn, uint32_t* state) {
    return answer<AX_STATUS>(
        Entry::AX_DiagBeaconState,
        [&](Call& call) { return answer_copy(call, wwn, state, &Function::beacon); }, wwn);
}

AX_STATUS AX_iSCSI_GetInitiatorProperties(AX_WWN wwn, AX_iSCSI_InitiatorProperties* properties) {
    return answer<AX_STATUS>(
        Entry::AX_iSCSI_GetInitiatorProperties,
        [&](Call& call) { return answer_copy(call, wwn, properties, &Function::initiator); }, wwn);
}

AX_STATUS AX_iSCSI_SetInitiatorProperties(AX_WWN wwn,
                                          const AX_iSCSI_InitiatorProperties* properties) {
    return answer<AX_STATUS>(
        Entry::AX_iSCSI_SetInitiatorProperties,
        [&](Call& call) { return answer_set(call, wwn, properties, &Function::initiator); }, wwn);
}

AX_STATUS AX_Ini_GetNetworkProperties(AX_WWN wwn, AX_Ini_NetworkProperties* properties) {
    return answer<AX_STATUS>(
        Entry::AX_Ini_GetNetworkProperties,
        [&](Call& call) { return answer_copy(call, wwn, properties, &Function::network); }, wwn);
}

} // namespace vlnsim::library
