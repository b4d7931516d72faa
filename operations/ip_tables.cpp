// The IP stack that an iSCSI port has on its adapter: neighbours, routes, settings.
#include "operations/operation_frame.h"

namespace cimple {

namespace {

constexpr uint32 FIRST_ENTRIES = 64; // a port in a storage network has a few

template <class Table, class Entry, class Get>
AX_STATUS read_table(const char* operation, Get get, const HBA_WWN* port,
                     std::vector<Entry>* entries) {
    Reply reply;
    const AX_STATUS status =
        reply.fetch({offsetof(Table, entry), sizeof(Entry), FIRST_ENTRIES},
                    {"Unable to allocate the memory for the table", AX_STATUS_NO_MEMORY},
                    counted<Table>([&](Table* table) { return get(wwnOf(port), table); }));
    if (status != AX_STATUS_OK) {
        VLN_OPERATION_FAILED(status, "%s exited with the error code %d", operation, status);
        return status;
    }
    const auto* first = static_cast<const Table*>(reply.data())->entry;
    entries->assign(first, first + reply.count());
    return status;
}

template <class Call>
AX_STATUS write(const char* operation, Call call) {
    const AX_STATUS status = call();
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "%s exited with the error code %d", operation, status);
    return status;
}

} // namespace

AX_STATUS VLN_MethodWrapper::discoverARPTable(const HBA_WWN* port,
                                              std::vector<AX_ARPEntry>* entries) {
    Operation_Frame frame("VLN_MethodWrapper::discoverARPTable");
    if (!frame.given(port, "Invalid iSCSI port passed\n", VLN_ERR) || !frame.given(entries))
        return frame.status();
    return read_table<AX_ARPTable>("discoverARPTable", LAX_Ini_GetARPTable, port, entries);
}

AX_STATUS VLN_MethodWrapper::discoverRoute(const HBA_WWN* port,
                                           std::vector<AX_RouteEntry>* entries) {
    Operation_Frame frame("VLN_MethodWrapper::discoverRoute");
    if (!frame.given(port, "Invalid iSCSI port passed\n", VLN_ERR) || !frame.given(entries))
        return frame.status();
    return read_table<AX_RouteTable>("discoverRoute", LAX_Ini_GetRouteTable, port, entries);
}

AX_STATUS VLN_MethodWrapper::AddARPTableEntry(const HBA_WWN* port, const AX_ARPEntry& entry) {
    Operation_Frame frame("VLN_MethodWrapper::AddARPTableEntry");
    return write("AddARPTableEntry", [&] { return LAX_Ini_AddARPTableEntry(wwnOf(port), &entry); });
}

AX_STATUS VLN_MethodWrapper::DeleteARPTableEntry(const HBA_WWN* port, const AX_ARPEntry& entry) {
    Operation_Frame frame("VLN_MethodWrapper::DeleteARPTableEntry");
    return write("DeleteARPTableEntry",
                 [&] { return LAX_Ini_DeleteARPTableEntry(wwnOf(port), &entry); });
}

AX_STATUS VLN_MethodWrapper::AddRouteTableEntry(const HBA_WWN* port, const AX_RouteEntry& entry) {
    Operation_Frame frame("VLN_MethodWrapper::AddRouteTableEntry");
    return write("AddRouteTableEntry",
                 [&] { return LAX_Ini_AddRouteTableEntry(wwnOf(port), &entry); });
}

AX_STATUS VLN_MethodWrapper::DeleteRouteTableEntry(const HBA_WWN* port,
                                                   const AX_RouteEntry& entry) {
    Operation_Frame frame("VLN_MethodWrapper::DeleteRouteTableEntry");
    return write("DeleteRouteTableEntry",
                 [&] { return LAX_Ini_DeleteRouteTableEntry(wwnOf(port), &entry); });
}

AX_STATUS VLN_MethodWrapper::SetNetworkSettings(const HBA_WWN* port,
                                                const AX_Ini_NetworkProperties& settings) {
    Operation_Frame frame("VLN_MethodWrapper::SetNetworkSettings");
    return write("SetNetworkSettings",
                 [&] { return AX_Ini_SetNetworkProperties(wwnOf(port), &settings); });
}

} // namespace cimple
