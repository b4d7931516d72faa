// The two kinds of tables, which are read and changed in the same steps.
#ifndef VLN_SERVICES_IP_TABLES_KINDS_H
#define VLN_SERVICES_IP_TABLES_KINDS_H

#include "agent/provider_agent.h"
#include "classes/VLNMPCA_ARPEntry.h"
#include "classes/VLNMPCA_ARPTable.h"
#include "classes/VLNMPCA_RouteEntry.h"
#include "classes/VLNMPCA_RouteTable.h"
#include "operations/method_wrapper.h"

namespace cimple {

// By the class of the entries: the stores, the calls of the library, and its lines of the log.
template <class Entry>
struct Table_Kind;

template <>
struct Table_Kind<VLNMPCA_ARPEntry> {
    using Table = VLNMPCA_ARPTable;
    using Row = AX_ARPEntry;

    static constexpr auto tables = &Instance_Stores::m_VLNMPCA_ARPTable_map;
    static constexpr auto uses = &Instance_Stores::m_VLNMPCA_UseOfARPTable_map;
    static constexpr auto entries = &Instance_Stores::m_VLNMPCA_ARPEntry_map;
    static constexpr auto links = &Instance_Stores::m_VLNMPCA_CollectedARP_map;

    static constexpr auto read = VLN_MethodWrapper::discoverARPTable;
    static constexpr auto add = VLN_MethodWrapper::AddARPTableEntry;
    static constexpr auto remove = VLN_MethodWrapper::DeleteARPTableEntry;

    static constexpr char word[] = "ARP";
    static constexpr char entry_failed[] = "CIM ARP Entry creation failed";
    static constexpr char link_failed[] = "Associating ARP TAble to it's entry failed";
    static constexpr char no_instance[] =
        "Invalid(NULL)) VLNMPCA_ARPEntry_Provider instance passed";
    static constexpr char insert_failed[] = "Insert Failed : m_VLNMPCA_ARPEntry";
    static constexpr char no_table[] = "table could not be located\n";
    static constexpr char new_link_failed[] = "collected ARP entry creation failed\n";
    static constexpr char no_link[] = "VLNMPCA_ARPEntry:: Invalid Collected ARP";
};

template <>
struct Table_Kind<VLNMPCA_RouteEntry> {
    using Table = VLNMPCA_RouteTable;
    using Row = AX_RouteEntry;

    static constexpr auto tables = &Instance_Stores::m_VLNMPCA_RouteTable_map;
    static constexpr auto uses = &Instance_Stores::m_VLNMPCA_UseOfRouteTable_map;
    static constexpr auto entries = &Instance_Stores::m_VLNMPCA_RouteEntry_map;
    static constexpr auto links = &Instance_Stores::m_VLNMPCA_CollectedRoute_map;

    static constexpr auto read = VLN_MethodWrapper::discoverRoute;
    static constexpr auto add = VLN_MethodWrapper::AddRouteTableEntry;
    static constexpr auto remove = VLN_MethodWrapper::DeleteRouteTableEntry;

    static constexpr char word[] = "Route";
    static constexpr char entry_failed[] = "creating Route entry failed\n";
    static constexpr char link_failed[] = "Associating Route Table to it's entry failed";
    static constexpr char no_instance[] =
        "Invalid(NULL)) VLNMPCA_RouteEntry_Provider instance passed";
    static constexpr char insert_failed[] = "Insert Failed : m_VLNMPCA_RouteEntry";
    static constexpr char no_table[] = "table for the port can not be located\n";
    static constexpr char new_link_failed[] = "Collected Route creation failed\n";
    static constexpr char no_link[] = "VLNMPCA_ARPEntry:: Invalid Collected Route";
};

} // namespace cimple

#endif // VLN_SERVICES_IP_TABLES_KINDS_H
