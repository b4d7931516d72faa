#include "services/ip_tables/instances.h"

#include "agent/text.h"
#include "classes/VLNMPCA_EthernetPort.h"
#include "services/ip_tables/entries.h"
#include "services/ip_tables/kinds.h"

namespace cimple {

namespace {

// What a discovery answers by itself; all else is the library's status.
enum Discovery_Status : uint32 { DISCOVERED = 0, NO_TABLE = 1, NO_PORT = 5 };

Ref<VLNMPCA_ARPTable> table_instance(const String& mac, const VLNMPCA_ARPTable*) {
    auto table = make_instance<VLNMPCA_ARPTable>();
    table->InstanceID.set(format_text("VLN: MPCA iSCSI ARP Table%s", mac.c_str()));
    table->MACAddress.set(mac);
    return table;
}

Ref<VLNMPCA_RouteTable> table_instance(const String& mac, const VLNMPCA_RouteTable*) {
    auto table = make_instance<VLNMPCA_RouteTable>();
    table->InstanceID.set("VLN: MPCA iSCSI Route Table");
    table->MACAddress.set(mac);
    return table;
}

// The table and its tie to the port; null with a line.
template <class Kind>
const typename Kind::Table* create_table(ProviderAgent& agent, const VLNMPCA_EthernetPort& port) {
    using Table = typename Kind::Table;
    const String& mac = port.PermanentAddress.value;
    const Table* table = insert_instance(agent.*Kind::tables,
                                         table_instance(mac, static_cast<const Table*>(nullptr)));
    if (!table) {
        VLN_LOG(VLN_ERR, "CIM %s Table creation Failed for port:%s", Kind::word, mac.c_str());
        return nullptr;
    }
    if (associate(agent.*Kind::uses, table, &port))
        return table;
    VLN_LOG(VLN_ERR, "createUseOf%sTable failed", Kind::word);
    return nullptr;
}

bool name_of(const VLNMPCA_EthernetPort& port, HBA_WWN& name) {
    const String& mac = port.PermanentAddress.value;
    if (parse_mac({mac.c_str(), mac.size()}) &&
        nameOfDeviceId(port.DeviceID.value.c_str(), name, "convertMACToWWN::", VLN_ERR))
        return true;
    VLN_LOG(VLN_ERR, "Invalid mac address used");
    return false;
}

// The entries of a table, with the ties to it. A row that cannot be shown is left out.
template <class Entry>
void create_entries(ProviderAgent& agent, const Instance& table, const String& mac,
                    const std::vector<typename Table_Kind<Entry>::Row>& rows) {
    using Kind = Table_Kind<Entry>;
    VLN_LOG(VLN_INFO, "Number of %s entries detected %d\n", Kind::word,
            static_cast<int>(rows.size()));
    std::vector<Ref<Entry>> entries;
    entries.reserve(rows.size());
    for (std::size_t i = 0; i < rows.size(); ++i)
        if (auto entry = entry_of_row(rows[i], i, mac))
            entries.push_back(std::move(entry));
    tell_apart(entries);
    for (auto& each : entries)
        if (const auto* entry =
                insert_instance(agent.*Kind::entries, std::move(each), Kind::entry_failed))
            associate(agent.*Kind::links, &table, entry, Kind::link_failed);
}

template <class Entry>
uint32 discover(ProviderAgent& agent, const VLNMPCA_EthernetPort& port) {
    using Kind = Table_Kind<Entry>;
    const auto* table = create_table<Kind>(agent, port);
    if (!table)
        return NO_TABLE;
    HBA_WWN name{};
    if (!name_of(port, name))
        return NO_PORT;
    std::vector<typename Kind::Row> rows;
    if (const AX_STATUS status = Kind::read(&name, &rows))
        return status;
    create_entries<Entry>(agent, *table, port.PermanentAddress.value, rows);
    return DISCOVERED;
}

} // namespace

uint32 create_ip_tables(const Map_Scope& scope) {
    const auto& port = *static_cast<const VLNMPCA_EthernetPort*>(scope.element);
    const char* id = port.DeviceID.value.c_str();
    if (discover<VLNMPCA_ARPEntry>(scope.agent, port) != DISCOVERED)
        VLN_LOG(VLN_ERR, "ARP entry discovery failed for port: %s\n", id);
    if (discover<VLNMPCA_RouteEntry>(scope.agent, port) != DISCOVERED)
        VLN_LOG(VLN_ERR, "Route Table discovery failed for port %s\n", id);
    return MAP_OK;
}

} // namespace cimple
