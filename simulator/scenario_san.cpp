// Targets and logical units, given one by one or in rows, and the SCSI data that they answer with:
// standard inquiry, unit serial number (page 0x80) and device identification (page 0x83) of SPC,
// and the READ CAPACITY(10) data of SBC.
#include "simulator/scenario.h"

#include <algorithm>
#include <cstring>

namespace vlnsim {
namespace {

constexpr std::uint64_t max_targets = 1024;
constexpr std::uint8_t page_serial = 0x80;
constexpr std::uint8_t page_identity = 0x83;
constexpr std::size_t max_identifier = 247; // of a descriptor, within a response of 255 bytes

// Keys of a unit; at a target they hold for all its units.
constexpr std::string_view unit_keys[] = {
    "type",      "types",      "vendor",          "product",  "revision",
    "serial",    "identifier", "osDeviceName",    "lastLBA",  "blockLength",
    "responses", "silent",     "checkConditions", "fromCall", "reported"};

// A field of an inquiry: cut or filled with blanks.
void put_padded(const std::string& text, std::size_t width, Bytes& bytes) {
    for (std::size_t i = 0; i < width; ++i)
        bytes.push_back(i < text.size() ? static_cast<std::uint8_t>(text[i]) : ' ');
}

void put_big_endian(std::uint32_t number, Bytes& bytes) {
    for (int shift = 24; shift >= 0; shift -= 8)
        bytes.push_back(static_cast<std::uint8_t>(number >> shift));
}

template <class Range>
void append(const Range& range, Bytes& bytes) {
    for (const auto element : range)
        bytes.push_back(static_cast<std::uint8_t>(element));
}

Bytes inquiry_data(const Node& values, std::uint8_t type) {
    constexpr std::uint8_t version_spc3 = 5;
    constexpr std::uint8_t response_format = 2;
    constexpr std::uint8_t additional_length = 31;
    Bytes bytes{type, 0, version_spc3, response_format, additional_length, 0, 0, 0};
    put_padded(values.wild_text("vendor", "VORLAN"), 8, bytes);
    put_padded(values.wild_text("product", "SIMULATED UNIT"), 16, bytes);
    put_padded(values.wild_text("revision", "1.00"), 4, bytes);
    return bytes;
}

Bytes serial_data(const Node& values, std::uint8_t type, std::uint64_t target, std::uint64_t lun) {
    const std::string serial =
        values.wild_text("serial", "T" + std::to_string(target) + "L" + std::to_string(lun));
    if (serial.size() > 251)
        values.member("serial")->fail("longer than 251 bytes");
    Bytes bytes{type, page_serial, 0, static_cast<std::uint8_t>(serial.size())};
    append(serial, bytes);
    return bytes;
}

Bytes identity_data(const Node& values, std::uint8_t type, std::uint64_t target,
                    std::uint64_t lun) {
    std::uint8_t identifier_type = 3; // NAA, here of the form "IEEE registered extended"
    Bytes identifier{0x60, 0x25, 0x64, 0xC0, 0, 0, 0, 0};
    put_big_endian(static_cast<std::uint32_t>(target), identifier);
    put_big_endian(static_cast<std::uint32_t>(lun), identifier);
    if (const auto node = values.member("identifier")) {
        node->expect_object({"type", "bytes"});
        identifier_type = static_cast<std::uint8_t>(node->number("type", identifier_type, 15));
        if (const auto bytes = node->member("bytes"))
            identifier = bytes->bytes();
        if (identifier.size() > max_identifier)
            node->fail("longer than " + std::to_string(max_identifier) + " bytes");
    }
    constexpr std::uint8_t binary_code_set = 1;
    const auto length = static_cast<std::uint8_t>(identifier.size());
    Bytes bytes{type,
                page_identity,
                0,
                static_cast<std::uint8_t>(length + 4),
                binary_code_set,
                identifier_type,
                0,
                length};
    append(identifier, bytes);
    return bytes;
}

Bytes capacity_data(const Node& values) {
    Bytes bytes;
    put_big_endian(values.number32("lastLBA", 0x001FFFFF), bytes);
    put_big_endian(values.number32("blockLength", 512), bytes);
    return bytes;
}

// Responses that are given byte for byte, whatever they mean; false takes the response away.
void override_responses(const Node& values, Unit& unit) {
    const auto responses = values.member("responses");
    if (!responses)
        return;
    responses->expect_object({"inquiry", "serialPage", "identityPage", "capacity"});
    const auto page = [&](std::string_view key, std::optional<Bytes>& bytes) {
        const auto node = responses->member(key);
        if (!node)
            return;
        if (node->is(Value::Kind::boolean) && !node->boolean())
            bytes.reset();
        else
            bytes = node->bytes();
    };
    if (const auto inquiry = responses->member("inquiry"))
        unit.inquiry = inquiry->bytes();
    page("serialPage", unit.serial_page);
    page("identityPage", unit.identity_page);
    page("capacity", unit.capacity);
}

// Peripheral addressing below 256, flat space addressing above, as SAM has it.
std::uint64_t encoded_lun(std::uint64_t lun) {
    std::uint8_t bytes[8]{};
    bytes[0] = static_cast<std::uint8_t>(lun < 256 ? 0 : 0x40 | lun >> 8);
    bytes[1] = static_cast<std::uint8_t>(lun);
    std::uint64_t image = 0;
    std::memcpy(&image, bytes, sizeof bytes);
    return image;
}

Unit read_unit(const Node& values, std::uint64_t target, std::uint64_t lun) {
    Unit unit;
    const std::uint8_t type = read_device_type(values, lun);
    unit.fcp_lun = encoded_lun(lun);
    unit.os_lun = static_cast<std::uint32_t>(lun);
    unit.os_device_name = values.wild_text("osDeviceName", "");
    if (unit.os_device_name.size() > 255)
        values.member("osDeviceName")->fail("longer than 255 bytes");
    unit.inquiry = inquiry_data(values, type);
    unit.serial_page = serial_data(values, type, target, lun);
    unit.identity_page = identity_data(values, type, target, lun);
    if (has_capacity(type))
        unit.capacity = capacity_data(values);
    unit.check_conditions = values.number32("checkConditions", 0);
    unit.silent = values.boolean("silent", false);
    unit.from_call = values.number32("fromCall", 1);
    unit.reported = values.boolean("reported", true);
    override_responses(values, unit);
    return unit;
}

void add_unit(const Node& source, Unit unit, Target& target) {
    for (const Unit& other : target.units)
        if (other.os_lun == unit.os_lun)
            source.fail("logical unit " + std::to_string(unit.os_lun) + " is there already");
    target.units.push_back(std::move(unit));
}

Target read_target(const Node& values, std::uint64_t number) {
    constexpr std::uint64_t first_wwn = 0x502564C000000000;
    Target target;
    const auto wwpn = values.member("wwpn");
    target.port_wwn = wwpn ? wwpn->wwn() : first_wwn + number;
    const auto wwnn = values.member("wwnn");
    target.node_wwn = wwnn ? wwnn->wwn() : target.port_wwn;
    target.fc_id =
        values.number32("fcId", 0x010000 + (static_cast<std::uint32_t>(number + 1) << 8));
    target.bus = values.number32("bus", 0);
    target.number = values.number32("number", static_cast<std::uint32_t>(number));
    read_unit_rows(values, unit_keys, [&](const Node& row, const Node& unit, std::uint64_t lun) {
        add_unit(row, read_unit(unit, number, lun), target);
    });
    return target;
}

} // namespace

std::vector<Target> read_targets(const Node& values) {
    std::vector<Target> targets;
    std::uint64_t number = 0;
    for (const Node& row : values.items_or_self()) {
        row.expect_object(
            joined_keys(unit_keys, {"count", "luns", "wwpn", "wwnn", "fcId", "bus", "number"}));
        const std::uint64_t count = row.number("count", 1, max_targets);
        for (std::uint64_t i = 0; i < count; ++i, ++number) {
            const Scope scope = row.scope().with("target", number);
            Target target = read_target(Node(row.value(), scope), number);
            for (const Target& other : targets)
                if (other.port_wwn == target.port_wwn)
                    row.fail("\"wwpn\" is that of another target; {target} makes it its own");
            targets.push_back(std::move(target));
        }
    }
    return targets;
}

} // namespace vlnsim
