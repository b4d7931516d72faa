#include "device/port_statistics.h"

#include "device/library/attribute_buffer.h"
#include "foundation/log.h"

#include <algorithm>
#include <exception>
#include <iterator>

namespace cimple {

namespace {

// In the order in which the library is asked, which is that of their numbers.
constexpr uint16 COUNTERS[PortStatistics::NUM_COUNTERS] = {
    AX_PS_PACKETS_TRANSMITTED,
    AX_PS_EXCHANGES_RESPONDED,
    AX_PS_ACTIVE_XRIS,
    AX_PS_RX_SEQUENCES,
    AX_PS_EXCHANGES_ORIGINATED,
    AX_PS_WORDS_TRANSMITTED,
    AX_PS_WORDS_RECEIVED,
    AX_PS_PACKETS_RECEIVED,
    AX_PS_LIPS,
    AX_PS_NOS,
    AX_PS_ERROR_FRAMES,
    AX_PS_DUMPED_FRAMES,
    AX_PS_LINK_FAILURES,
    AX_PS_LOSSES_OF_SYNC,
    AX_PS_LOSSES_OF_SIGNAL,
    AX_PS_PRIMITIVE_SEQUENCE_ERRORS,
    AX_PS_INVALID_WORDS,
    AX_PS_CRC_ERRORS,
    AX_PS_TX_SEQUENCES,
    AX_PS_PRIMITIVE_SEQUENCE_TIMEOUTS,
    AX_PS_ELASTIC_BUFFER_OVERRUNS,
    AX_PS_ACTIVE_RPIS,
    AX_PS_ARBITRATION_TIMEOUTS,
    AX_PS_LINK_TRANSITIONS,
    AX_PS_COUNTER_1059,
};

constexpr uint64 NO_VALUE = ~uint64{0};

} // namespace

PortStatistics::PortStatistics(const std::string& portName) {
    m_counters.fill(NOT_REPORTED);
    const AX_WWN wwn = wwnOfPort(portName);
    Attribute_Buffer buffer(AX_PORT_STATISTICS_SIZE);
    const AX_STATUS status = AX_GetPortStatistics(wwn, buffer.data(), buffer.size());
    if (status != AX_STATUS_OK) {
        VLN_LOG(VLN_ERR, "ERROR: AX_GetPortStatistics call failed (%d)", status);
        throw std::exception();
    }
    for (std::size_t i = 0; i < NUM_COUNTERS; ++i) {
        uint64 counter = NO_VALUE;
        AX_STATUS ignored = AX_STATUS_OK;
        if (buffer.read(COUNTERS[i], &counter, sizeof counter, ignored) && counter != NO_VALUE)
            m_counters[i] = counter;
    }
}

uint64 PortStatistics::counter(uint16 identifier) const {
    const auto* place = std::find(std::begin(COUNTERS), std::end(COUNTERS), identifier);
    return place == std::end(COUNTERS) ? NOT_REPORTED
                                       : m_counters[static_cast<std::size_t>(place - COUNTERS)];
}

} // namespace cimple
