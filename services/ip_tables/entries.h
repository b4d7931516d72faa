// Entries of ARP and route tables: as the library has them, as instances, and as clients write
// them.
//
// MAC addresses are shown as bare digits, as the ports show theirs, and taken in every form that
// is shown anywhere. m_DataMutex is held wherever the agent is handed in.
#ifndef VLN_SERVICES_IP_TABLES_ENTRIES_H
#define VLN_SERVICES_IP_TABLES_ENTRIES_H

#include "agent/associations.h"
#include "agent/provider_agent.h"
#include "classes/VLNMPCA_ARPEntry.h"
#include "classes/VLNMPCA_RouteEntry.h"
#include "foundation/address_text.h"

#include <vector>

namespace cimple {

// The library's name of the port that has the address: an iSCSI port, if there is one. False
// without such a port.
bool convertMACToWWN(const ProviderAgent& agent, const MAC_Bytes& mac, HBA_WWN& name);

// IPv4 alone: the stacks of the ports know no routes and neighbours of another kind.
void put_ipv4(const IPv4_Bytes& bytes, AX_IPAddress& address);

// ---- Rows of the library ----

// Null for a row with an address that no entry can show, with a line that tells its place. mac is
// that of the table.
Ref<VLNMPCA_ARPEntry> entry_of_row(const AX_ARPEntry& row, std::size_t place, const String& mac);
Ref<VLNMPCA_RouteEntry> entry_of_row(const AX_RouteEntry& row, std::size_t place,
                                     const String& mac);

// The key of a route is one text, which names the port and the destination. Those of a port that
// share a destination have mask and gateway in their keys as well. ARP entries have keys enough.
void tell_apart(std::vector<Ref<VLNMPCA_RouteEntry>>& of_one_port);
inline void tell_apart(std::vector<Ref<VLNMPCA_ARPEntry>>&) {}

// Whether the store has no such entry; then the key of this one tells it apart from all there.
bool is_new(const Instance_Map<VLNMPCA_ARPEntry>& store, VLNMPCA_ARPEntry& entry);
bool is_new(const Instance_Map<VLNMPCA_RouteEntry>& store, VLNMPCA_RouteEntry& entry);

// ---- What a client's or a store's instance says ----

template <class Row>
struct Entry_Request {
    HBA_WWN port{};
    String mac; // of the port, as its table shows it
    Row row{};
};

enum class Purpose : uint8 { CREATE, DELETE };

// Null, or the line of the first property that is no address, or not one of a port.
const char* read_request(const ProviderAgent& agent, const VLNMPCA_ARPEntry& instance,
                         Purpose purpose, Entry_Request<AX_ARPEntry>& request);
const char* read_request(const ProviderAgent& agent, const VLNMPCA_RouteEntry& instance,
                         Purpose purpose, Entry_Request<AX_RouteEntry>& request);

} // namespace cimple

#endif // VLN_SERVICES_IP_TABLES_ENTRIES_H
