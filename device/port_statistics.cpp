#include "device/port_statistics.h"

#include "device/library/attribute_buffer.h"
#include "foundation/log.h"

#include <algorithm>
#include <cstring>
#include <exception>
#include <iterator>

namespace cimple {

namespace {

// The identifiers in the order of the counters.
constexpr uint16 MEMBER_ORDER[PortStatistics::NUM_COUNTERS] = {
    1025, 1030, 1032, 1031, 1033, 1036, 1037, 1038, 1039, 1040, 1041, 1042, 1043,
    1044, 1045, 1028, 1029, 1026, 1027, 1048, 1047, 1058, 1046, 1057, 1059};

// The same in the order in which the library is asked.
constexpr uint16 FETCH_ORDER[PortStatistics::NUM_COUNTERS + 1] = {
    1025, 1026, 1027, 1028, 1029, 1030, 1031, 1032, 1033, 1036, 1037, 1038, 1039,
    1040, 1041, 1042, 1043, 1044, 1045, 1046, 1047, 1048, 1057, 1058, 1059, 0};

std::size_t place_of(uint16 identifier) {
    return static_cast<std::size_t>(
        std::find(std::begin(MEMBER_ORDER), std::end(MEMBER_ORDER), identifier) -
        std::begin(MEMBER_ORDER));
}

constexpr uint64 NO_VALUE = ~uint64{0};

uint64 read_counter(Attribute_Buffer& buffer, uint16 identifier) {
    AX_STATUS status = AX_STATUS_OK;
    std::size_t reported = 0;
    std::size_t room = 0;
    const uint8* value = buffer.find(identifier, status, reported, room);
    uint64 counter = NO_VALUE;
    if (value && status == AX_STATUS_OK && room >= sizeof counter)
        std::memcpy(&counter, value, sizeof counter);
    return counter;
}

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
    for (const uint16* identifier = FETCH_ORDER; *identifier != 0; ++identifier) {
        const uint64 counter = read_counter(buffer, *identifier);
        if (counter != NO_VALUE)
            m_counters[place_of(*identifier)] = counter;
    }
}

uint64 PortStatistics::counter(uint16 identifier) const {
    const std::size_t place = place_of(identifier);
    return place < NUM_COUNTERS ? m_counters[place] : NOT_REPORTED;
}

} // namespace cimple
