// Dynamic status: the few properties that change too fast for a refresh.
//
// Two mechanisms: update routines, which the active enumerations call, and one background thread,
// which polls the state of the logical ports into a table (dynamic_port_status.h) of its own.
//
// An update routine changes the instances of its store in place. It runs with both adapter gates,
// m_DataMutex and the class's update mutex held. A routine whose last run is too recent costs no
// library call. Its failures end in the log; only want of memory is thrown.
#ifndef VLN_AGENT_STATUS_DYNAMIC_STATUS_H
#define VLN_AGENT_STATUS_DYNAMIC_STATUS_H

#include "cimple/types.h"

namespace cimple {

class Port;
class ProviderAgent;
class String;
struct VLNMPCA_Card;
struct VLNMPCA_FCPortStatistics;

enum Dynamic_Update : uint8 {
    UPDATE_ETHERNET_PORT,
    UPDATE_FC_PORT,
    UPDATE_FC_PORT_STATISTICS,
    UPDATE_PHY_LINK_DOWN_REASON,
    UPDATE_BOARD_TEMPERATURE,
    UPDATE_DRIVER_PARAMETERS,
    NUM_DYNAMIC_UPDATES
};

// The common beginning of every routine: logs its entry, if it has one, and, when its last run is
// at least its limit ago, notes the present as its last run and answers true.
bool update_due(ProviderAgent& agent, Dynamic_Update update);

void UpdateEthernetPortStatus(ProviderAgent& agent);
void UpdateFCoEPortStatus(ProviderAgent& agent);
void GetFCoEPortStats(ProviderAgent& agent);
void UpdatePhyLinkDownReason(ProviderAgent& agent);
void UpdateBoardTemp(ProviderAgent& agent);
void UpdateDriverParameters(ProviderAgent& agent); // driver_parameter_maps.cpp

// The state of the Ethernet port of that name as the library has it now, with m_DataMutex held.
// What was polled before is forgotten. A failure is told in the log and leaves the port as it is.
void readEthernetPortStatus(ProviderAgent& agent, const String& name);

// The temperature of a card as one of its ports, of the name of 16 digits, tells it now. A failure
// is told in the log and leaves the card as it is.
void readBoardTemperature(const char* port_name, VLNMPCA_Card& card);

// The counters of an FCoE port as the library has them now. A failure is told in the log and leaves
// the statistics as they are.
void readFCoEPortStatistics(Port& port, VLNMPCA_FCPortStatistics& statistics);

// What UpdateEthernetPortStatus does when it is due. The first call that finds an Ethernet port
// makes the table and starts the thread; the later ones show what the table holds.
void UpdateDynamicEthernetPortStatus(ProviderAgent& agent);

// The thread: polls each port of the table every two minutes until m_bStopDynamicThread is raised.
void* DynamicDataFetch_Handler(void* agent);

} // namespace cimple

#endif // VLN_AGENT_STATUS_DYNAMIC_STATUS_H
