// The counters of a port, a snapshot made by the constructor.
#ifndef DEVICE_PORT_STATISTICS_H
#define DEVICE_PORT_STATISTICS_H

#include "cimple/types.h"

#include <array>
#include <string>

namespace cimple {

// The library numbers its counters; the map builders know what each number means.
class PortStatistics {
public:
    static constexpr uint64 NOT_REPORTED = 0x00000000FFFFFFFFULL;
    static constexpr std::size_t NUM_COUNTERS = 25;

    virtual ~PortStatistics() noexcept(false) = default;

    // The counter of a statistic identifier (1025 to 1059); NOT_REPORTED if the library does not
    // report it or does not know it.
    uint64 counter(uint16 identifier) const;

protected:
    // Reads the counters of the port with this name. Throws std::exception if the library refuses.
    explicit PortStatistics(const std::string& portName);

private:
    std::array<uint64, NUM_COUNTERS> m_counters;
};

class FCPortStatistics : public PortStatistics {
public:
    explicit FCPortStatistics(const std::string& portName) : PortStatistics(portName) {}
};

class NICPortStatistics : public PortStatistics {
public:
    explicit NICPortStatistics(const std::string& portName) : PortStatistics(portName) {}
};

class iSCSIPortStatistics : public PortStatistics {
public:
    explicit iSCSIPortStatistics(const std::string& portName) : PortStatistics(portName) {}
};

class FCoEPortStatistics : public PortStatistics {
public:
    explicit FCoEPortStatistics(const std::string& portName) : PortStatistics(portName) {}
};

} // namespace cimple

#endif // DEVICE_PORT_STATISTICS_H
