// The neighbours and the routes of an iSCSI function's IP stack. A scenario may give what no
// adapter would take.
#include "simulator/ip_address.h"
#include "simulator/scenario.h"

#include <algorithm>

namespace vlnsim {
namespace {

constexpr std::uint64_t max_entries = 100000;

// Rows of a list, each of which stands for as many entries as it counts.
template <class Entry>
std::vector<Entry> read_entries(const Node& values, std::initializer_list<std::string_view> keys,
                                Entry (*read)(const Node& row), void (*count_on)(Entry& entry)) {
    std::vector<Entry> entries;
    for (const Node& row : values.items()) {
        row.expect_object(keys);
        Entry entry = read(row);
        const std::uint64_t count = row.number("count", 1, max_entries);
        for (std::uint64_t i = 0; i < count; ++i) {
            entries.push_back(entry);
            count_on(entry);
        }
    }
    return entries;
}

AX_ARPEntry read_arp_entry(const Node& row) {
    AX_ARPEntry entry{};
    if (const auto mac = row.member("mac")) {
        const Bytes bytes = mac->bytes(sizeof entry.mac);
        std::copy(bytes.begin(), bytes.end(), entry.mac);
    }
    read_address(row, "address", entry.address);
    return entry;
}

AX_RouteEntry read_route_entry(const Node& row) {
    AX_RouteEntry entry{};
    read_address(row, "destination", entry.destination);
    read_address(row, "subnetMask", entry.subnetMask);
    read_address(row, "gateway", entry.gateway);
    return entry;
}

void next_arp_entry(AX_ARPEntry& entry) {
    for (std::size_t i = sizeof entry.mac; i-- > 0 && ++entry.mac[i] == 0;) {
    }
    put_ipv4(ipv4_number(entry.address) + 1, entry.address);
}

// The network next to it.
void next_route_entry(AX_RouteEntry& entry) {
    put_ipv4(ipv4_number(entry.destination) + ~ipv4_number(entry.subnetMask) + 1,
             entry.destination);
}

} // namespace

std::vector<AX_ARPEntry> read_arp_table(const Node& values) {
    return read_entries(values, {"count", "mac", "address"}, read_arp_entry, next_arp_entry);
}

std::vector<AX_RouteEntry> read_route_table(const Node& values) {
    return read_entries(values, {"count", "destination", "subnetMask", "gateway"}, read_route_entry,
                        next_route_entry);
}

} // namespace vlnsim
