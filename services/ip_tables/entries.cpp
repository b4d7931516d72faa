#include "services/ip_tables/entries.h"

#include "agent/store_search.h"
#include "agent/text.h"
#include "classes/VLNMPCA_EthernetPort.h"
#include "device/library/attribute_buffer.h"

#include <algorithm>
#include <map>

namespace cimple {

namespace {

std::optional<MAC_Bytes> mac_of(const Property<String>& property) {
    return parse_mac({property.value.c_str(), property.value.size()});
}

bool read_ipv4(const Property<String>& property, AX_IPAddress& address) {
    const auto bytes = parse_ipv4({property.value.c_str(), property.value.size()});
    if (bytes)
        put_ipv4(*bytes, address);
    return bytes.has_value();
}

// False for no address at all: a neighbour that has not answered.
bool MAC2String(const uint8 (&mac)[6], String& text) {
    MAC_Bytes bytes;
    std::copy(std::begin(mac), std::end(mac), bytes.begin());
    text = mac_digits(bytes).c_str();
    return bytes != MAC_Bytes{};
}

bool ipAddr2String(const AX_IPAddress& address, String& text) {
    text = addressText(address).c_str();
    return !(address.flags & AX_IP_FLAG_V6);
}

void skip(const char* step, std::size_t place) {
    VLN_LOG(VLN_ERR, "%s failed for i = %u: Skipping this entry\n", step,
            static_cast<unsigned>(place));
}

} // namespace

// From the last one: iSCSI ports stand behind those of the other functions of their connectors.
bool convertMACToWWN(const ProviderAgent& agent, const MAC_Bytes& mac, HBA_WWN& name) {
    const auto* port =
        find_last(agent.m_VLNMPCA_EthernetPort_map, [&](const VLNMPCA_EthernetPort& each) {
            return mac_of(each.PermanentAddress) == mac;
        });
    return port && nameOfDeviceId(port->DeviceID.value.c_str(), name, "convertMACToWWN::", VLN_ERR);
}

void put_ipv4(const IPv4_Bytes& bytes, AX_IPAddress& address) {
    address = {};
    std::copy(bytes.begin(), bytes.end(), address.address);
}

// ---- Rows ----

Ref<VLNMPCA_ARPEntry> entry_of_row(const AX_ARPEntry& row, std::size_t place, const String& mac) {
    String destination, address;
    if (!MAC2String(row.mac, destination)) {
        skip("MAC2String", place);
        return {};
    }
    if (!ipAddr2String(row.address, address)) {
        skip("ipAddr2String", place);
        return {};
    }
    auto entry = make_instance<VLNMPCA_ARPEntry>();
    entry->InstanceID.set(
        format_text("VLN: MPCA iSCSI ARP Entry:%s:%s", mac.c_str(), address.c_str()));
    entry->MACAddress.set(mac);
    entry->DesMACAddress.set(destination);
    entry->DesIPAddress.set(address);
    return entry;
}

Ref<VLNMPCA_RouteEntry> entry_of_row(const AX_RouteEntry& row, std::size_t place,
                                     const String& mac) {
    String destination, mask, gateway;
    if (!ipAddr2String(row.destination, destination) || !ipAddr2String(row.subnetMask, mask) ||
        !ipAddr2String(row.gateway, gateway)) {
        skip("ipAddr2String", place);
        return {};
    }
    auto entry = make_instance<VLNMPCA_RouteEntry>();
    entry->InstanceID.set(
        format_text("VLN: MPCA iSCSI Route Entry%s:%s", mac.c_str(), destination.c_str()));
    entry->MACAddress.set(mac);
    entry->Destination.set(destination);
    entry->SubnetMask.set(mask);
    entry->Gateway.set(gateway);
    return entry;
}

// ---- Keys ----

namespace {

void lengthen_key(VLNMPCA_RouteEntry& entry) {
    entry.InstanceID.value +=
        format_text(":%s:%s", entry.SubnetMask.value.c_str(), entry.Gateway.value.c_str());
}

} // namespace

void tell_apart(std::vector<Ref<VLNMPCA_RouteEntry>>& of_one_port) {
    std::map<std::string, unsigned> routes; // to a destination
    for (const auto& entry : of_one_port)
        ++routes[entry->Destination.value.c_str()];
    for (auto& entry : of_one_port)
        if (routes[entry->Destination.value.c_str()] > 1)
            lengthen_key(*entry);
}

bool is_new(const Instance_Map<VLNMPCA_ARPEntry>& store, VLNMPCA_ARPEntry& entry) {
    return store.find(&entry) < 0;
}

bool is_new(const Instance_Map<VLNMPCA_RouteEntry>& store, VLNMPCA_RouteEntry& entry) {
    const auto shares_destination = [&](const VLNMPCA_RouteEntry& each) {
        return each.MACAddress.value == entry.MACAddress.value &&
               each.Destination.value == entry.Destination.value;
    };
    const auto is_same = [&](const VLNMPCA_RouteEntry& each) {
        return shares_destination(each) && each.SubnetMask.value == entry.SubnetMask.value &&
               each.Gateway.value == entry.Gateway.value;
    };
    if (find_first(store, is_same))
        return false;
    if (find_first(store, shares_destination))
        lengthen_key(entry);
    return true;
}

// ---- Requests ----

const char* read_request(const ProviderAgent& agent, const VLNMPCA_ARPEntry& instance,
                         Purpose purpose, Entry_Request<AX_ARPEntry>& request) {
    const bool create = purpose == Purpose::CREATE;
    const auto mac = mac_of(instance.MACAddress);
    if (!mac || !convertMACToWWN(agent, *mac, request.port))
        return create ? "Invalid MAC addr specified" : "Invalid MAC addr specified ";
    const auto destination = mac_of(instance.DesMACAddress);
    if (!destination || *destination == MAC_Bytes{})
        return "Invalid destination MAC addr specified";
    if (!read_ipv4(instance.DesIPAddress, request.row.address))
        return create ? "VLNMPCA_ARPTable::Invalid IP Adrress passed"
                      : "VLNMPCA_ARPEntry::Invalid IP Adrress passed";
    std::copy(destination->begin(), destination->end(), request.row.mac);
    request.mac = mac_digits(*mac).c_str();
    return nullptr;
}

const char* read_request(const ProviderAgent& agent, const VLNMPCA_RouteEntry& instance, Purpose,
                         Entry_Request<AX_RouteEntry>& request) {
    const auto mac = mac_of(instance.MACAddress);
    if (!mac)
        return "VLNMPCA_RouteEntry_Provider::convertMACToWWN failed";
    if (!convertMACToWWN(agent, *mac, request.port))
        return "VLNMPCA_ARPTable::Invalid MAC Adrress passed";
    if (!read_ipv4(instance.Destination, request.row.destination))
        return "VLNMPCA_ARPTable::Invalid destination IP Adrress passed";
    if (!read_ipv4(instance.SubnetMask, request.row.subnetMask))
        return "VLNMPCA_ARPTable::Invalid SubNet Mask passed";
    if (!read_ipv4(instance.Gateway, request.row.gateway))
        return "VLNMPCA_ARPTable::Invalid Gateway passed";
    request.mac = mac_digits(*mac).c_str();
    return nullptr;
}

} // namespace cimple
