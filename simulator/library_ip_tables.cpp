// The IP stack of an iSCSI function: its settings, its neighbours and its routes. What an adapter
// would refuse is refused here.
#include "simulator/call.h"
#include "simulator/ip_address.h"

#include <algorithm>
#include <cstring>

namespace vlnsim::library {
namespace {

constexpr std::uint32_t max_vlan = 4094;
constexpr std::uint32_t max_priority = 7;

template <class Body>
AX_STATUS with_stack(Call& call, AX_WWN wwn, Body body) {
    Function* function = call.function(wwn);
    if (!function)
        return AX_STATUS_ILLEGAL_WWN;
    return function->network ? body(*function) : AX_STATUS_NOT_SUPPORTED;
}

// ---- What an adapter takes ----

// The mask of a network: ones, then zeros.
bool is_mask(const AX_IPAddress& mask) {
    const std::uint32_t host = ~ipv4_number(mask);
    return !is_ipv6(mask) && (host & (host + 1)) == 0;
}

// The address of one host: neither of none, nor of a group, nor of all.
bool is_host(const AX_IPAddress& address) {
    constexpr std::uint8_t first_group = 224;
    return !is_ipv6(address) && address.address[0] != 0 && address.address[0] < first_group;
}

bool in_network(const AX_IPAddress& address, const AX_Ini_NetworkProperties& network) {
    const std::uint32_t mask = ipv4_number(network.subnetMask);
    return (ipv4_number(address) & mask) == (ipv4_number(network.address) & mask);
}

bool is_neighbour(const AX_ARPEntry& entry) {
    const bool group = entry.mac[0] & 1;
    const bool none = std::all_of(std::begin(entry.mac), std::end(entry.mac),
                                  [](std::uint8_t byte) { return byte == 0; });
    return !group && !none && is_host(entry.address);
}

bool is_route(const AX_RouteEntry& entry) {
    return !is_ipv6(entry.destination) && is_mask(entry.subnetMask) && is_host(entry.gateway) &&
           (ipv4_number(entry.destination) & ~ipv4_number(entry.subnetMask)) == 0;
}

AX_STATUS accepts(const Function&, const AX_ARPEntry& entry) {
    return is_neighbour(entry) ? AX_STATUS_OK : AX_STATUS_INVALID_ARGUMENT;
}

AX_STATUS accepts(const Function& function, const AX_RouteEntry& entry) {
    if (!is_route(entry))
        return AX_STATUS_INVALID_ARGUMENT;
    return in_network(entry.gateway, *function.network) ? AX_STATUS_OK : ip_gateway_unreachable;
}

bool accepts_settings(const AX_Ini_NetworkProperties& settings) {
    if (settings.vlanEnabled > 1 || settings.vlanID > max_vlan ||
        settings.priority > max_priority || (settings.vlanEnabled && settings.vlanID == 0))
        return false;
    if (settings.addressOrigin == AX_ADDRESS_ORIGIN_DHCP || is_ipv6(settings.address))
        return true;
    return settings.addressOrigin == AX_ADDRESS_ORIGIN_STATIC && is_host(settings.address) &&
           is_mask(settings.subnetMask) &&
           (ipv4_number(settings.gateway) == 0 || in_network(settings.gateway, settings));
}

// ---- Entries ----

// An address has one neighbour; which MAC address it has makes no difference.
bool is_taken(const AX_ARPEntry& one, const AX_ARPEntry& other) {
    return ipv4_number(one.address) == ipv4_number(other.address);
}

bool is_taken(const AX_RouteEntry& one, const AX_RouteEntry& other) {
    return std::memcmp(&one, &other, sizeof one) == 0;
}

bool is_same(const AX_ARPEntry& one, const AX_ARPEntry& other) {
    return is_taken(one, other) && std::memcmp(one.mac, other.mac, sizeof one.mac) == 0;
}

bool is_same(const AX_RouteEntry& one, const AX_RouteEntry& other) {
    return is_taken(one, other);
}

template <class Table, class Entries>
AX_STATUS answer_table(Call& call, AX_WWN wwn, Table* table, Entries Function::*entries) {
    if (call.null(table, "table"))
        return AX_STATUS_INVALID_ARGUMENT;
    return with_stack(call, wwn, [&](const Function& function) -> AX_STATUS {
        const Entries& rows = function.*entries;
        const std::uint32_t room = table->count;
        if (call.list_too_small(table->count, rows.size()))
            return AX_STATUS_MORE_DATA;
        std::copy(rows.begin(), rows.end(), table->entry);
        soil(table->entry, rows.size() * sizeof *table->entry, room * sizeof *table->entry);
        return AX_STATUS_OK;
    });
}

template <class Entry, class Entries>
AX_STATUS add_entry(Call& call, AX_WWN wwn, const Entry* entry, Entries Function::*entries) {
    if (call.null(entry, "entry"))
        return AX_STATUS_INVALID_ARGUMENT;
    return with_stack(call, wwn, [&](Function& function) -> AX_STATUS {
        if (const AX_STATUS status = accepts(function, *entry))
            return status;
        Entries& rows = function.*entries;
        for (const Entry& row : rows)
            if (is_taken(row, *entry))
                return ip_entry_exists;
        rows.push_back(*entry);
        return AX_STATUS_OK;
    });
}

template <class Entry, class Entries>
AX_STATUS delete_entry(Call& call, AX_WWN wwn, const Entry* entry, Entries Function::*entries) {
    if (call.null(entry, "entry"))
        return AX_STATUS_INVALID_ARGUMENT;
    return with_stack(call, wwn, [&](Function& function) -> AX_STATUS {
        const auto same = [&](const Entry& row) { return is_same(row, *entry); };
        return std::erase_if(function.*entries, same) ? AX_STATUS_OK : ip_no_such_entry;
    });
}

} // namespace

AX_STATUS AX_Ini_SetNetworkProperties(AX_WWN wwn, const AX_Ini_NetworkProperties* properties) {
    return answer<AX_STATUS>(
        Entry::AX_Ini_SetNetworkProperties,
        [&](Call& call) -> AX_STATUS {
            if (call.null(properties, "properties"))
                return AX_STATUS_INVALID_ARGUMENT;
            return with_stack(call, wwn, [&](Function& function) -> AX_STATUS {
                if (!accepts_settings(*properties))
                    return AX_STATUS_INVALID_ARGUMENT;
                const std::uint8_t link = function.network->linkUp; // is not to be set
                function.network = *properties;
                function.network->linkUp = link;
                return AX_STATUS_OK;
            });
        },
        wwn);
}

AX_STATUS LAX_Ini_GetARPTable(AX_WWN wwn, AX_ARPTable* table) {
    return answer<AX_STATUS>(
        Entry::LAX_Ini_GetARPTable,
        [&](Call& call) { return answer_table(call, wwn, table, &Function::arp_table); }, wwn);
}

AX_STATUS LAX_Ini_AddARPTableEntry(AX_WWN wwn, const AX_ARPEntry* entry) {
    return answer<AX_STATUS>(
        Entry::LAX_Ini_AddARPTableEntry,
        [&](Call& call) { return add_entry(call, wwn, entry, &Function::arp_table); }, wwn);
}

AX_STATUS LAX_Ini_DeleteARPTableEntry(AX_WWN wwn, const AX_ARPEntry* entry) {
    return answer<AX_STATUS>(
        Entry::LAX_Ini_DeleteARPTableEntry,
        [&](Call& call) { return delete_entry(call, wwn, entry, &Function::arp_table); }, wwn);
}

AX_STATUS LAX_Ini_GetRouteTable(AX_WWN wwn, AX_RouteTable* table) {
    return answer<AX_STATUS>(
        Entry::LAX_Ini_GetRouteTable,
        [&](Call& call) { return answer_table(call, wwn, table, &Function::route_table); }, wwn);
}

AX_STATUS LAX_Ini_AddRouteTableEntry(AX_WWN wwn, const AX_RouteEntry* entry) {
    return answer<AX_STATUS>(
        Entry::LAX_Ini_AddRouteTableEntry,
        [&](Call& call) { return add_entry(call, wwn, entry, &Function::route_table); }, wwn);
}

AX_STATUS LAX_Ini_DeleteRouteTableEntry(AX_WWN wwn, const AX_RouteEntry* entry) {
    return answer<AX_STATUS>(
        Entry::LAX_Ini_DeleteRouteTableEntry,
        [&](Call& call) { return delete_entry(call, wwn, entry, &Function::route_table); }, wwn);
}

} // namespace vlnsim::library
