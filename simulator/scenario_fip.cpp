// What an FCoE port looks for, and the forwarders that it has found.
#include "simulator/call.h"
#include "simulator/scenario.h"

#include <algorithm>
#include <cstring>

namespace vlnsim {
namespace {

constexpr std::uint64_t max_forwarders = 4096;
constexpr std::uint64_t max_vlan = 0xFFFF; // beyond what is one, for hosts that are mistaken

AX_NAME read_name(const Node& values, std::string_view key) {
    AX_NAME name{};
    if (const auto node = values.member(key))
        put_name(node->wwn(), name.byte);
    return name;
}

template <std::size_t size>
void read_bytes(const Node& values, std::string_view key, std::uint8_t (&bytes)[size]) {
    if (const auto node = values.member(key))
        std::memcpy(bytes, node->bytes(size).data(), size);
}

AX_Fcf read_forwarder(const Node& values) {
    AX_Fcf entry{};
    entry.entryID = values.number32("entry", 0);
    entry.activeFCFs = values.number32("activeFCFs", 1);
    entry.state = values.number32("state", 1);
    entry.priority = values.number32("priority", 128);
    entry.fabricName = read_name(values, "fabric");
    entry.switchName = read_name(values, "switch");
    read_bytes(values, "mac", entry.mac);
    constexpr std::uint8_t usual_map[] = {0x0E, 0xFC, 0x00};
    std::memcpy(entry.fcMap, usual_map, sizeof entry.fcMap);
    read_bytes(values, "fcMap", entry.fcMap);
    entry.period = values.number32("period", 8000);
    std::size_t listed = 0;
    if (const auto vlans = values.member("vlans"))
        for (const Node& vlan : vlans->items()) {
            if (listed == AX_FCF_VLANS)
                vlan.fail("more than " + std::to_string(AX_FCF_VLANS) + " VLANs");
            entry.vlanID[listed++] = static_cast<std::uint16_t>(vlan.number(max_vlan));
        }
    entry.vlanCount = static_cast<std::uint16_t>(values.number("vlanCount", listed, max_vlan));
    return entry;
}

std::vector<AX_Fcf> read_forwarders(const Node& values) {
    std::vector<AX_Fcf> entries;
    for (const Node& row : values.items()) {
        row.expect_object({"count", "entry", "activeFCFs", "state", "priority", "fabric", "switch",
                           "mac", "fcMap", "vlans", "vlanCount", "period"});
        const std::uint64_t count = row.number("count", 1, max_forwarders);
        for (std::uint64_t i = 0; i < count; ++i) {
            const Scope scope = row.scope().with("forwarder", entries.size());
            entries.push_back(read_forwarder(Node(row.value(), scope)));
        }
    }
    return entries;
}

} // namespace

Fip read_fip(const Node& values) {
    values.expect_object({"fabric", "switch", "vlan", "fcMap", "cinVlan", "forwarders"});
    Fip fip;
    fip.connect.fabricName = read_name(values, "fabric");
    fip.connect.switchName = read_name(values, "switch");
    constexpr std::uint8_t usual_map[] = {0x0E, 0xFC, 0x00};
    std::memcpy(fip.connect.fcMap, usual_map, sizeof fip.connect.fcMap);
    read_bytes(values, "fcMap", fip.connect.fcMap);
    if (const auto vlan = values.member("vlan")) {
        fip.connect.vlanID = static_cast<std::uint16_t>(vlan->number(max_vlan));
        fip.connect.flags = AX_FCF_VLAN_VALID;
    }
    fip.params.cinVlanID = values.number32("cinVlan", 0);
    if (const auto forwarders = values.member("forwarders"))
        fip.forwarders = read_forwarders(*forwarders);
    return fip;
}

} // namespace vlnsim
