#include "services/ip_tables/provider.h"

#include "services/ip_tables/entries.h"
#include "services/ip_tables/kinds.h"
#include "services/method_call.h"

namespace cimple {

namespace {

sint32 refuse(sint32 status, const char* line) {
    VLN_LOG(VLN_ERR, "%s", line);
    return status;
}

void remove_from(Instance_Map_Base& store, const Instance* keys) {
    const sint32 index = store.find(keys);
    if (index >= 0)
        store.remove(static_cast<uint32>(index));
}

// ---- Create ----

// Shows an entry that the adapter has taken.
template <class Entry>
sint32 show_entry(ProviderAgent& agent, Ref<Entry> entry) {
    using Kind = Table_Kind<Entry>;
    auto& entries = agent.*Kind::entries;
    const Entry* shown = insert_instance(entries, std::move(entry), Kind::insert_failed);
    if (!shown)
        return CREATE_INSTANCE_FAILED;
    const auto* table =
        find_by_key(agent.*Kind::tables, &Kind::Table::MACAddress, shown->MACAddress.value);
    if (table && associate(agent.*Kind::links, table, shown))
        return CREATE_INSTANCE_OK;
    remove_from(entries, shown);
    return refuse(CREATE_INSTANCE_FAILED, table ? Kind::new_link_failed : Kind::no_table);
}

template <class Entry>
sint32 create_entry(ProviderAgent& agent, Entry* instance) {
    using Kind = Table_Kind<Entry>;
    if (!instance)
        return refuse(CREATE_INSTANCE_FAILED, Kind::no_instance);
    Entry_Request<typename Kind::Row> request;
    if (const char* wrong = read_request(agent, *instance, Purpose::CREATE, request))
        return refuse(CREATE_INSTANCE_INVALID_PARAMETER, wrong);
    auto entry = entry_of_row(request.row, 0, request.mac);
    if (!is_new(agent.*Kind::entries, *entry))
        return refuse(CREATE_INSTANCE_FAILED, Kind::insert_failed);
    if (Kind::add(&request.port, request.row) != AX_STATUS_OK)
        return CREATE_INSTANCE_FAILED;
    copy(instance, entry.get());
    return show_entry(agent, std::move(entry));
}

// ---- Delete ----

// The keys as the store has them, of a path that may write its addresses otherwise.
Ref<VLNMPCA_ARPEntry> stored_keys(const VLNMPCA_ARPEntry& path) {
    auto keys = make_instance<VLNMPCA_ARPEntry>();
    const auto shown_mac = [](const Property<String>& given) {
        const auto mac = parse_mac({given.value.c_str(), given.value.size()});
        return mac ? String(mac_digits(*mac).c_str()) : given.value;
    };
    const String& address = path.DesIPAddress.value;
    const auto bytes = parse_ipv4({address.c_str(), address.size()});
    keys->MACAddress.set(shown_mac(path.MACAddress));
    keys->DesMACAddress.set(shown_mac(path.DesMACAddress));
    keys->DesIPAddress.set(bytes ? String(ipv4_text(*bytes).c_str()) : address);
    return keys;
}

Ref<VLNMPCA_RouteEntry> stored_keys(const VLNMPCA_RouteEntry& path) {
    auto keys = make_instance<VLNMPCA_RouteEntry>();
    keys->InstanceID.set(path.InstanceID.value);
    return keys;
}

// Takes an entry that the adapter has deleted out of the stores.
template <class Entry>
sint32 hide_entry(ProviderAgent& agent, const Entry& entry) {
    using Kind = Table_Kind<Entry>;
    const auto* table =
        find_by_key(agent.*Kind::tables, &Kind::Table::MACAddress, entry.MACAddress.value);
    Ref<Instance> link;
    if (table)
        link = association_of((agent.*Kind::links).meta_class(), {table, &entry});
    const bool linked = link && (agent.*Kind::links).find(link.get()) >= 0;
    if (linked)
        remove_from(agent.*Kind::links, link.get());
    remove_from(agent.*Kind::entries, &entry);
    return linked ? DELETE_INSTANCE_OK : refuse(DELETE_INSTANCE_FAILED, Kind::no_link);
}

template <class Entry>
sint32 delete_entry(ProviderAgent& agent, const Entry* instance) {
    using Kind = Table_Kind<Entry>;
    const Entry* found =
        instance ? (agent.*Kind::entries).lookup(stored_keys(*instance).get()) : nullptr;
    if (!found)
        return refuse(DELETE_INSTANCE_NOT_FOUND, "Instance Not found ");
    Entry_Request<typename Kind::Row> request;
    if (const char* wrong = read_request(agent, *found, Purpose::DELETE, request))
        return refuse(DELETE_INSTANCE_NOT_FOUND, wrong);
    if (Kind::remove(&request.port, request.row) != AX_STATUS_OK)
        return DELETE_INSTANCE_FAILED;
    return hide_entry(agent, *found);
}

} // namespace

template <class Entry>
sint32 Table_Entry_Provider<Entry>::create_instance(Entry* instance) {
    return answer_change(CREATE_INSTANCE_FAILED,
                         [&](ProviderAgent& agent) { return create_entry(agent, instance); });
}

template <class Entry>
sint32 Table_Entry_Provider<Entry>::delete_instance(const Entry* instance) {
    return answer_change(DELETE_INSTANCE_FAILED,
                         [&](ProviderAgent& agent) { return delete_entry(agent, instance); });
}

template struct Table_Entry_Provider<VLNMPCA_ARPEntry>;
template struct Table_Entry_Provider<VLNMPCA_RouteEntry>;

} // namespace cimple
