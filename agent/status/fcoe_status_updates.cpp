// Update routines of FCoE ports and their statistics.

#include "agent/hardware/port_name.h"
#include "agent/provider_agent.h"
#include "agent/state_tables.h"
#include "agent/status/dynamic_status.h"
#include "agent/store_search.h"
#include "agent/text.h"
#include "cimple/guard.h"
#include "classes/VLNMPCA_FCPort.h"
#include "classes/VLNMPCA_FCPortStatistics.h"
#include "device/library/attribute_buffer.h"

#include <optional>

namespace cimple {

namespace {

// Calls update(port) for each port of the FCoE adapters.
template <class Update>
void for_each_fcoe_port(ProviderAgent& agent, Update update) {
    for (const auto& adapter : agent.m_pData->adapters) {
        if (adapter->getAdapterType() != ADAPTER_FCOE) {
            VLN_LOG(VLN_DBG, "Skippping Adapter [%s] since it is not an FCoE Adapter",
                    adapter->getAdapterName().c_str());
            continue;
        }
        for (const auto& port : adapter->getPorts())
            update(*port);
    }
}

// ---- Ports ----

std::optional<Attribute_Buffer> fetch_attributes(const std::string& name) {
    std::optional<Attribute_Buffer> buffer;
    try {
        buffer.emplace(AX_PORT_ATTRIBUTES_SIZE);
    } catch (const std::bad_alloc&) {
        VLN_LOG(VLN_ERR, "ERROR: vlncimGetPortAttributes: Unable to allocate buffer");
        return buffer;
    }
    if (!fetchStatus(name.c_str(), *buffer, "AX_GetPortAttributes"))
        buffer.reset();
    return buffer;
}

// The properties in turn, up to the first that can't be read.
void read_port(Attribute_Buffer& buffer, VLNMPCA_FCPort& port) {
    constexpr char STATE[] = "ERROR: AX_GetttributeValue for PortState";
    uint32 number = 0;
    uint8 detail = 0;
    if (!getStatusNumber(buffer, AX_PA_PHYSICAL_PORT_STATE, STATE, number))
        return;
    replace_port_state(&port, find_fcoe_port_state(number));
    if (!getStatusNumber(buffer, AX_PA_FUNCTIONAL_PORT_STATE, STATE, detail))
        return;
    port.DetailedStatus.set(detail);
    if (!getStatusNumber(buffer, AX_PA_PORT_TYPE, "ERROR: AX_GetttributeValue for PortType",
                         number))
        return;
    const Port_Type& type = find_port_type(number);
    port.PortType.set(type.port_type);
    port.OtherPortType.set(type.name);
    if (!getStatusNumber(buffer, AX_PA_PORT_SPEED, "AX_GetttributeValue for PortSpeed", number))
        return;
    port.Speed.set(speed_of_code(number));
    if (!getStatusNumber(buffer, AX_PA_PHYSICAL_PORT_SPEED,
                         "AX_GetttributeValue for PhysicalPortSpeed", number))
        return;
    port.PhysicalPortSpeed.set(speed_of_code(number));
    Attribute_Text speed;
    if (getAttributeText(PORT_FAMILY, speed, buffer, AX_PA_FUNCTIONAL_PORT_SPEED,
                         "FunctionalPortSpeed") == AX_STATUS_OK)
        port.FunctionalPortSpeed.set(text(speed));
}

void update_port(ProviderAgent& agent, const std::string& name) {
    VLN_LOG(VLN_DBG, "Fetching Port Speeds.");
    auto& ports = agent.m_VLNMPCA_FCPort_map;
    const auto* port = find_in_system(agent, ports, &VLNMPCA_FCPort::DeviceID, text(name));
    if (!port)
        return;
    if (auto buffer = fetch_attributes(name))
        change(ports, port, [&](VLNMPCA_FCPort& shown) { read_port(*buffer, shown); });
}

// ---- Statistics ----

enum class Counter_Rule : uint8 {
    PLAIN,         // one that the library does not report shows as its start value
    WORDS,         // the library counts words of four bytes
    REPORTED_ONLY, // the property stays as it is without a report
};

struct Counter_Row {
    uint16 identifier;
    Property<uint64> VLNMPCA_FCPortStatistics::*property;
    Counter_Rule rule = Counter_Rule::PLAIN;
};

using S = VLNMPCA_FCPortStatistics;

// Every counter that has a property; 1059 has none.
constexpr Counter_Row COUNTERS[] = {
    {AX_PS_WORDS_TRANSMITTED, &S::BytesTransmitted, Counter_Rule::WORDS},
    {AX_PS_WORDS_RECEIVED, &S::BytesReceived, Counter_Rule::WORDS},
    {AX_PS_PACKETS_TRANSMITTED, &S::PacketsTransmitted},
    {AX_PS_PACKETS_RECEIVED, &S::PacketsReceived},
    {AX_PS_LIPS, &S::LIPCount},
    {AX_PS_NOS, &S::NOSCount, Counter_Rule::REPORTED_ONLY},
    {AX_PS_ERROR_FRAMES, &S::ErrorFrames},
    {AX_PS_DUMPED_FRAMES, &S::DumpedFrames, Counter_Rule::REPORTED_ONLY},
    {AX_PS_LINK_FAILURES, &S::LinkFailures},
    {AX_PS_LOSSES_OF_SIGNAL, &S::LossOfSignalCounter},
    {AX_PS_LOSSES_OF_SYNC, &S::LossOfSyncCounter},
    {AX_PS_PRIMITIVE_SEQUENCE_ERRORS, &S::PrimitiveSeqProtocolErrCount},
    {AX_PS_CRC_ERRORS, &S::CRCErrors},
    {AX_PS_INVALID_WORDS, &S::InvalidTransmissionWords},
    {AX_PS_TX_SEQUENCES, &S::TxSequences},
    {AX_PS_RX_SEQUENCES, &S::RxSequences},
    {AX_PS_EXCHANGES_ORIGINATED, &S::ExCountOrig},
    {AX_PS_EXCHANGES_RESPONDED, &S::ExCountResp},
    {AX_PS_ACTIVE_XRIS, &S::ActiveXRIs},
    {AX_PS_ACTIVE_RPIS, &S::ActiveRPIs},
    {AX_PS_ELASTIC_BUFFER_OVERRUNS, &S::ElasticBufOverruns},
    {AX_PS_LINK_TRANSITIONS, &S::LinkTransitions},
    {AX_PS_PRIMITIVE_SEQUENCE_TIMEOUTS, &S::PrimitiveSeqTimesouts},
    {AX_PS_ARBITRATION_TIMEOUTS, &S::ArbitrationTimeouts},
};

void copy_counters(const PortStatistics& counters, VLNMPCA_FCPortStatistics& statistics) {
    for (const Counter_Row& row : COUNTERS) {
        const uint64 count = counters.counter(row.identifier);
        if (row.rule == Counter_Rule::REPORTED_ONLY && count >= PortStatistics::NOT_REPORTED)
            continue;
        (statistics.*row.property).set(row.rule == Counter_Rule::WORDS ? count * 4 : count);
    }
}

void update_statistics(ProviderAgent& agent, Port& port) {
    auto& store = agent.m_VLNMPCA_FCPortStatistics_map;
    const auto* statistics = find_by_key(store, &VLNMPCA_FCPortStatistics::InstanceID,
                                         fc_statistics_name(text(port.getPortName())));
    if (statistics)
        change(store, statistics,
               [&](VLNMPCA_FCPortStatistics& shown) { readFCoEPortStatistics(port, shown); });
}

} // namespace

void readFCoEPortStatistics(Port& port, VLNMPCA_FCPortStatistics& statistics) {
    const bool complete = run_guarded([&] {
        if (const PortStatistics* counters = port.getPortStatistics()) {
            statistics.StatisticTime.set(Datetime::now());
            copy_counters(*counters, statistics);
        }
    });
    if (!complete) {
        VLN_LOG(VLN_ERR, "Error occurred while retrieving FCoEPort Statistics");
        VLN_LOG(VLN_ERR, "Error getting FCoE Port statistics");
    }
}

void UpdateFCoEPortStatus(ProviderAgent& agent) {
    if (!update_due(agent, UPDATE_FC_PORT))
        return;
    VLN_LOG(VLN_DBG, "PERF: update driver map");
    for_each_fcoe_port(agent, [&agent](const Port& port) {
        if (!run_guarded([&] { update_port(agent, port.getPortName()); })) {
            VLN_LOG(VLN_ERR, "Error occurred while retrieving FCoEPort status...");
            VLN_LOG(VLN_ERR, "Error getting FCoE Port status");
        }
    });
}

void GetFCoEPortStats(ProviderAgent& agent) {
    if (!update_due(agent, UPDATE_FC_PORT_STATISTICS))
        return;
    VLN_LOG(VLN_DBG, "GetFCoEPortStats(): Update");
    for_each_fcoe_port(agent, [&agent](Port& port) { update_statistics(agent, port); });
    VLN_LOG(VLN_DBG, "PERF: GetFCoEPortStats: cleanExit");
}

} // namespace cimple
