#include "tests/device/fake_san.h"

#include "tests/device/fake_model_library.h"

#include <algorithm>
#include <cstring>

Fake_San fake_san;

namespace {

constexpr uint8_t UNIT_NODE[8] = {0x50, 0x06, 0x01, 0x60, 0xC6, 0xE0, 0x1A, 0x2B};
constexpr uint8_t UNIT_PORT[8] = {0x50, 0x06, 0x01, 0x64, 0x46, 0xE0, 0x1A, 0x2B};

HBA_STATUS answer(Fake_Command command, HBA_WWN portWWN, HBA_UINT64 lun, void* response,
                  HBA_UINT32 size, void* sense, HBA_UINT32 senseSize) {
    fake_san.commands.push_back(command);
    const auto unit =
        std::find_if(fake_san.units.begin(), fake_san.units.end(), [&](const Fake_Unit& u) {
            return u.entry.FcpId.FcpLun == lun &&
                   std::memcmp(&u.entry.FcpId.PortWWN, &portWWN, sizeof portWWN) == 0;
        });
    if (unit == fake_san.units.end())
        return HBA_STATUS_ERROR_ILLEGAL_WWN;
    std::deque<HBA_STATUS>& script = unit->status[command];
    HBA_STATUS status = HBA_STATUS_OK;
    if (!script.empty()) {
        status = script.front();
        script.pop_front();
    }
    const std::string& bytes = unit->responses[command];
    std::memcpy(response, bytes.data(), std::min<std::size_t>(bytes.size(), size));
    std::memcpy(sense, unit->sense.data(), std::min<std::size_t>(unit->sense.size(), senseSize));
    return status;
}

void put(std::string& bytes, std::size_t offset, const std::string& value) {
    bytes.replace(offset, value.size(), value);
}

} // namespace

Fake_Unit& Fake_San::add(uint64_t lun) {
    Fake_Unit& unit = units.emplace_back();
    std::memcpy(unit.entry.FcpId.NodeWWN.wwn, UNIT_NODE, sizeof UNIT_NODE);
    std::memcpy(unit.entry.FcpId.PortWWN.wwn, UNIT_PORT, sizeof UNIT_PORT);
    unit.entry.FcpId.FcpLun = static_cast<HBA_UINT64>(lun);
    return unit;
}

std::string standard_inquiry(uint8_t type, const char* vendor, const char* product,
                             const char* revision) {
    std::string bytes(36, ' ');
    bytes[0] = static_cast<char>(type);
    put(bytes, 8, vendor);
    put(bytes, 16, product);
    put(bytes, 32, revision);
    return bytes;
}

std::string identity_page(uint8_t length, const std::string& identifier) {
    std::string bytes = {'\x60', '\x83', '\0', static_cast<char>(length + 4),
                         '\x01', '\xF3', '\0', static_cast<char>(length)};
    return bytes + identifier;
}

HBA_STATUS HBA_GetFcpTargetMapping(HBA_HANDLE, HBA_FCPTARGETMAPPING* mapping) {
    const HBA_UINT32 room = mapping->NumberOfEntries;
    fake_san.rooms.push_back(room);
    const auto have = static_cast<HBA_UINT32>(fake_san.units.size());
    HBA_STATUS status = have <= room ? HBA_STATUS_OK : HBA_STATUS_ERROR_MORE_DATA;
    if (!fake_san.mappingStatus.empty()) {
        status = fake_san.mappingStatus.front();
        fake_san.mappingStatus.pop_front();
    }
    for (HBA_UINT32 i = 0; status == HBA_STATUS_OK && i < std::min(have, room); ++i)
        mapping->entry[i] = fake_san.units[i].entry;
    mapping->NumberOfEntries = have;
    if (fake_san.onMapping)
        fake_san.onMapping(mapping->NumberOfEntries);
    return status;
}

HBA_STATUS HBA_SendScsiInquiry(HBA_HANDLE, HBA_WWN portWWN, HBA_UINT64 lun, HBA_UINT8 evpd,
                               HBA_UINT32 page, void* response, HBA_UINT32 size, void* sense,
                               HBA_UINT32 senseSize) {
    const Fake_Command command = evpd == 0      ? INQUIRY
                                 : page == 0x80 ? SERIAL_PAGE
                                 : page == 0x83 ? IDENTITY_PAGE
                                                : FAKE_COMMANDS;
    return command == FAKE_COMMANDS
               ? HBA_STATUS_ERROR_ARG
               : answer(command, portWWN, lun, response, size, sense, senseSize);
}

HBA_STATUS HBA_SendReadCapacity(HBA_HANDLE, HBA_WWN portWWN, HBA_UINT64 lun, void* response,
                                HBA_UINT32 size, void* sense, HBA_UINT32 senseSize) {
    return answer(READ_CAPACITY, portWWN, lun, response, size, sense, senseSize);
}
