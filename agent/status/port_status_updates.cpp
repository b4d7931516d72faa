// Update routines of Ethernet ports, port controllers and cards.

#include "agent/ethernet/ethernet_port.h"
#include "agent/hardware/port_identity.h"
#include "agent/provider_agent.h"
#include "agent/state_tables.h"
#include "agent/status/dynamic_status.h"
#include "agent/store_search.h"
#include "cimple/guard.h"
#include "classes/VLNMPCA_Card.h"
#include "classes/VLNMPCA_EthernetPort.h"
#include "classes/VLNMPCA_PortController.h"
#include "device/library/attribute_buffer.h"
#include "device/library/identifiers.h"

#include <cstring>

namespace cimple {

namespace {

// The first Ethernet port that bears the identity.
const VLNMPCA_EthernetPort* find_port(const ProviderAgent& agent, const char* description,
                                      const String& identity) {
    return find_first(agent.m_VLNMPCA_EthernetPort_map, [&](const VLNMPCA_EthernetPort& port) {
        const String* found = port_identity(port, description);
        return found && *found == identity;
    });
}

// ---- Ethernet ports ----

// What the last scan read of a NIC or iSCSI port; null for one that the device model does not know.
const EthernetPortFacts* find_facts(VLN_Data& data, const String& name) {
    for (const auto& adapter : data.adapters)
        for (const auto& port : adapter->getPorts())
            if (name == port->getPortName().c_str())
                if (const auto* facts =
                        dynamic_cast<const EthernetPortFacts*>(port->getPortAttributes()))
                    return facts;
    return nullptr;
}

// The row of a port as the last scan saw it. One that does not tell its physical state counts as
// not read: it keeps what the refresh showed. False for a port that the device model does not know.
bool find_states(VLN_Data& data, const String& name, Dynamic_Port_Row& row) {
    const EthernetPortFacts* facts = find_facts(data, name);
    if (!facts)
        return false;
    row.functional_state = facts->FunctionalPortState;
    row.physical_state = facts->PhysicalPortState;
    row.scan_number = facts->tellsPhysicalPortState ? data.scanNumber : 0;
    return true;
}

// A port whose name is no port's, or is too long for a row, is never polled.
std::unique_ptr<Dynamic_Port_Status> port_status(ProviderAgent& agent) {
    auto status = std::make_unique<Dynamic_Port_Status>();
    const auto& ports = agent.m_VLNMPCA_EthernetPort_map;
    status->rows.reserve(ports.size());
    for (uint32 i = 0; i < ports.size(); ++i) {
        const String& name = ports[i]->DeviceID.value;
        Dynamic_Port_Row row{};
        if (name.size() > Dynamic_Port_Row::NAME_LENGTH || !find_states(*agent.m_pData, name, row))
            continue;
        std::memcpy(row.name, name.c_str(), name.size());
        status->rows.push_back(row);
    }
    return status;
}

void start_thread(ProviderAgent& agent) {
    if (agent.m_VLNMPCA_EthernetPort_map.size() == 0) {
        VLN_LOG(VLN_DBG, "No Logical Port available to fetch the dynamic properties");
        return;
    }
    try {
        auto status = port_status(agent);
        Auto_Mutex lock(agent.m_DynamicPortStatusMutex);
        agent.m_pDynamicPortStatus = std::move(status);
    } catch (const std::bad_alloc&) {
        VLN_LOG(VLN_ERR, "ERROR: GetPortAttributes: Unable to allocate buffer");
        throw;
    }
    VLN_LOG(VLN_DBG, "PERF: Creating DynamicDataFetch_Handler Thread.");
    if (agent.m_DynamicPortThread.start(DynamicDataFetch_Handler, &agent) != 0) {
        VLN_LOG(VLN_ERR, "PERF: Thread DynamicDataFetch_Handler Creation failed");
        return;
    }
    Auto_Mutex lock(agent.m_DynamicPortStatusMutex);
    agent.m_DynamicPortThreadInitialized = true;
}

bool is_thread_running(ProviderAgent& agent) {
    Auto_Mutex lock(agent.m_DynamicPortStatusMutex);
    return agent.m_DynamicPortThreadInitialized;
}

void show_status(VLN_Data& data, VLNMPCA_EthernetPort& port, const Dynamic_Port_Row& row) {
    replace_port_state(&port, find_port_state(portStateMap, row.functional_state));
    VLN_LOG(VLN_DBG, "Updating port speeds.");
    port.DetailedStatus.set(static_cast<uint16>(row.functional_state));
    port.EnabledState.set(enabled_state(row.physical_state));
    if (row.physical_state == PHYSICAL_STATE_UP) {
        if (const EthernetPortFacts* facts = find_facts(data, port.DeviceID.value))
            set_port_speeds(port, *facts);
    } else {
        port.Speed.set(0);
        port.PhysicalPortSpeed.set(0);
        port.FunctionalPortSpeed.set("Not Available");
    }
}

// What a refresh has read since the last poll is newer.
void show_port_status(ProviderAgent& agent) {
    VLN_Data& data = *agent.m_pData;
    auto& ports = agent.m_VLNMPCA_EthernetPort_map;
    Auto_Mutex lock(agent.m_DynamicPortStatusMutex);
    if (!agent.m_pDynamicPortStatus)
        return; // the thread has ended meanwhile
    for (uint32 i = 0; i < ports.size(); ++i)
        for (const Dynamic_Port_Row& row : agent.m_pDynamicPortStatus->rows)
            if (row.scan_number == data.scanNumber && ports[i]->DeviceID.value == row.name)
                change(ports, i, [&](VLNMPCA_EthernetPort& port) { show_status(data, port, row); });
}

// So that the next enumeration does not show an older state again.
void replace_row(ProviderAgent& agent, const Dynamic_Port_Row& row) {
    Auto_Mutex lock(agent.m_DynamicPortStatusMutex);
    if (agent.m_pDynamicPortStatus)
        for (Dynamic_Port_Row& known : agent.m_pDynamicPortStatus->rows)
            if (std::strcmp(known.name, row.name) == 0)
                known = row;
}

void read_port_status(ProviderAgent& agent, const String& name) {
    Dynamic_Port_Row row{};
    if (name.size() > Dynamic_Port_Row::NAME_LENGTH)
        return;
    std::memcpy(row.name, name.c_str(), name.size());
    read_states(row);
    row.scan_number = agent.m_pData->scanNumber;
    replace_row(agent, row);
    auto& ports = agent.m_VLNMPCA_EthernetPort_map;
    for (uint32 i = 0; i < ports.size(); ++i)
        if (ports[i]->DeviceID.value == name)
            change(ports, i,
                   [&](VLNMPCA_EthernetPort& port) { show_status(*agent.m_pData, port, row); });
}

// ---- Port controllers and cards ----

void update_phy_link_down_reason(ProviderAgent& agent, uint32 controller,
                                 Attribute_Buffer& buffer) {
    auto& controllers = agent.m_VLNMPCA_PortController_map;
    const auto* port =
        find_port(agent, IDENTITY_PHYSICAL_PORT, controllers[controller]->DeviceID.value);
    uint32 reason = 0;
    if (port && fetchStatus(port->DeviceID.value.c_str(), buffer, "ERROR: AX_GetPortAttributes") &&
        getStatusNumber(buffer, AX_PA_PHY_LINK_DOWN_REASON,
                        "ERROR: AX_GetttributeValue for _PhyLinkDownReason", reason))
        change(controllers, controller,
               [reason](VLNMPCA_PortController& shown) { shown.PhyLinkDownReason.set(reason); });
}

// The serial number by which functions know their card: what the card's own data say of it may be
// another one.
void update_board_temperature(ProviderAgent& agent, uint32 card) {
    auto& cards = agent.m_VLNMPCA_Card_map;
    if (const auto* port = find_port(agent, IDENTITY_SERIAL, cards[card]->VLNSerialNumber.value))
        change(cards, card, [port](VLNMPCA_Card& shown) {
            readBoardTemperature(port->DeviceID.value.c_str(), shown);
        });
}

} // namespace

void UpdateEthernetPortStatus(ProviderAgent& agent) {
    if (update_due(agent, UPDATE_ETHERNET_PORT))
        UpdateDynamicEthernetPortStatus(agent);
}

void UpdateDynamicEthernetPortStatus(ProviderAgent& agent) {
    VLN_LOG(VLN_DBG, "PERF: UpdateDynamicEthernetPortStatus: Entry");
    if (!agent.m_bIsAdapterMapsReady) {
        VLN_LOG(VLN_DBG, "Returning from m_bIsAdapterMapsReady condn");
        return;
    }
    if (!is_thread_running(agent)) {
        VLN_LOG(VLN_DBG, "Returning from m_DynamicPortThreadInitialized false condn");
        start_thread(agent);
        return;
    }
    VLN_LOG(VLN_DBG, "Returning from m_DynamicPortThreadInitialized true condn");
    if (!run_guarded([&] { show_port_status(agent); }))
        VLN_LOG(VLN_ERR, "Error getting Nic Port status");
}

void readEthernetPortStatus(ProviderAgent& agent, const String& name) {
    if (!run_guarded([&] { read_port_status(agent, name); }))
        VLN_LOG(VLN_DBG, "Error occurred while retrieving NicPort status...");
}

void UpdatePhyLinkDownReason(ProviderAgent& agent) {
    if (!update_due(agent, UPDATE_PHY_LINK_DOWN_REASON))
        return;
    Attribute_Buffer buffer(AX_PORT_ATTRIBUTES_SIZE);
    const auto& controllers = agent.m_VLNMPCA_PortController_map;
    for (uint32 i = 0; i < controllers.size(); ++i)
        update_phy_link_down_reason(agent, i, buffer);
    VLN_LOG(VLN_DBG, "UpdatePhyLinkDownReason(): Successful");
}

void readBoardTemperature(const char* port_name, VLNMPCA_Card& card) {
    AX_WWN wwn{};
    if (!wwnOfName(port_name, wwn, VLN_DBG))
        return;
    const bool complete = run_guarded([&] {
        Attribute_Buffer buffer = fetchAdapterAttributes(wwn);
        // The bytes above the first are the temperature's thresholds.
        uint8 celsius = 0;
        if (getStatusNumber(buffer, AX_HA_BOARD_TEMPERATURE,
                            "ERROR: AX_GetttributeValue for _BoardTemperature", celsius))
            card.BoardTemperature.set(celsius);
    });
    if (!complete)
        VLN_LOG(VLN_ERR, "Error Updating Borad Temperature");
}

void UpdateBoardTemp(ProviderAgent& agent) {
    if (!update_due(agent, UPDATE_BOARD_TEMPERATURE))
        return;
    const auto& cards = agent.m_VLNMPCA_Card_map;
    for (uint32 i = 0; i < cards.size(); ++i)
        update_board_temperature(agent, i);
    VLN_LOG(VLN_DBG, "UpdateBoardTemp(): Successful");
}

} // namespace cimple
