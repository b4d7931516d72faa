#include "simulator/scsi.h"

#include <algorithm>
#include <cstring>

namespace vlnsim {
namespace {

constexpr std::uint32_t page_serial = 0x80;
constexpr std::uint32_t page_identity = 0x83;

// Sense data in fixed format, SPC.
struct Sense {
    std::uint8_t key;
    std::uint8_t code; // additional sense code
};
constexpr Sense unit_attention{6, 0x29};
constexpr Sense invalid_command{5, 0x20};
constexpr Sense invalid_field{5, 0x24};

HBA_STATUS check_condition(Sense sense, const Scsi_Buffers& buffers) {
    constexpr std::size_t length = 18;
    const std::uint8_t bytes[length] = {0x70,       0, sense.key, 0, 0, 0,         0,
                                        length - 8, 0, 0,         0, 0, sense.code};
    std::memcpy(buffers.sense, bytes, std::min<std::size_t>(buffers.sense_size, length));
    return HBA_STATUS_SCSI_CHECK_CONDITION;
}

HBA_STATUS respond(const Bytes& response, const Scsi_Buffers& buffers) {
    std::copy_n(response.data(), std::min<std::size_t>(buffers.response_size, response.size()),
                static_cast<std::uint8_t*>(buffers.response));
    return HBA_STATUS_OK;
}

template <class Targets>
auto find_target(Targets& targets, std::uint64_t port_wwn) -> decltype(&targets.front()) {
    for (auto& target : targets)
        if (target.port_wwn == port_wwn)
            return &target;
    return nullptr;
}

Unit* find_unit(Target& target, std::uint64_t fcp_lun) {
    for (Unit& unit : target.units)
        if (unit.fcp_lun == fcp_lun)
            return &unit;
    return nullptr;
}

const Bytes* response_of(const Unit& unit, Scsi_Command command) {
    const auto there = [](const std::optional<Bytes>& bytes) { return bytes ? &*bytes : nullptr; };
    switch (command) {
    case Scsi_Command::serial_page:
        return there(unit.serial_page);
    case Scsi_Command::identity_page:
        return there(unit.identity_page);
    case Scsi_Command::read_capacity:
        return there(unit.capacity);
    case Scsi_Command::inquiry:
        break;
    }
    return &unit.inquiry;
}

HBA_STATUS answer_unit(Unit& unit, std::optional<Scsi_Command> command,
                       const Scsi_Buffers& buffers) {
    if (unit.silent)
        return HBA_STATUS_ERROR;
    if (!command)
        return check_condition(invalid_field, buffers);
    std::uint32_t& given = unit.checks_given[static_cast<std::size_t>(*command)];
    if (given < unit.check_conditions) {
        ++given;
        return check_condition(unit_attention, buffers);
    }
    given = 0;
    const Bytes* response = response_of(unit, *command);
    return response ? respond(*response, buffers)
                    : check_condition(*command == Scsi_Command::read_capacity ? invalid_command
                                                                              : invalid_field,
                                      buffers);
}

bool lack_buffers(Call& call, const Scsi_Buffers& buffers) {
    return call.null(buffers.response, "response") || call.null(buffers.sense, "sense");
}

HBA_STATUS unknown(Call& call, HBA_STATUS status) {
    call.violation("unknown target or logical unit");
    return status;
}

} // namespace

std::optional<Scsi_Command> inquiry_command(std::uint32_t evpd, std::uint32_t page) {
    if (evpd == 0 && page == 0)
        return Scsi_Command::inquiry;
    if (evpd == 1 && page == page_serial)
        return Scsi_Command::serial_page;
    if (evpd == 1 && page == page_identity)
        return Scsi_Command::identity_page;
    return std::nullopt;
}

HBA_STATUS answer_scsi(Call& call, std::vector<Target>& targets, std::uint64_t port_wwn,
                       std::uint64_t fcp_lun, std::optional<Scsi_Command> command,
                       const Scsi_Buffers& buffers) {
    if (lack_buffers(call, buffers))
        return HBA_STATUS_ERROR_ARG;
    Target* target = find_target(targets, port_wwn);
    if (!target)
        return unknown(call, HBA_STATUS_ERROR_ILLEGAL_WWN);
    Unit* unit = find_unit(*target, fcp_lun);
    return unit ? answer_unit(*unit, command, buffers)
                : unknown(call, HBA_STATUS_ERROR_INVALID_LUN);
}

HBA_STATUS report_luns(Call& call, const std::vector<Target>& targets, std::uint64_t port_wwn,
                       const Scsi_Buffers& buffers) {
    if (lack_buffers(call, buffers))
        return HBA_STATUS_ERROR_ARG;
    const Target* target = find_target(targets, port_wwn);
    if (!target)
        return unknown(call, HBA_STATUS_ERROR_ILLEGAL_WWN);
    constexpr std::size_t head = 8; // the list's length in bytes, most significant first
    Bytes response(head);
    for (const Unit& unit : target->units) {
        if (!unit.reported)
            continue;
        response.resize(response.size() + sizeof unit.fcp_lun);
        std::memcpy(response.data() + response.size() - sizeof unit.fcp_lun, &unit.fcp_lun,
                    sizeof unit.fcp_lun);
    }
    const std::size_t length = response.size() - head;
    for (std::size_t i = 0; i < 4; ++i)
        response[i] = static_cast<std::uint8_t>(length >> (24 - 8 * i));
    return respond(response, buffers);
}

} // namespace vlnsim
