// Lines of a driver's log, kept for the console.
#ifndef FOUNDATION_DEVICE_LOG_H
#define FOUNDATION_DEVICE_LOG_H

#include "cimple/types.h"

#include <string>
#include <vector>

namespace cimple {

class DeviceLog {
public:
    explicit DeviceLog(uint32 maximum = 1024) : capacity(maximum) {}

    // 1 if the log is full, else 0. An empty line is passed over.
    sint32 Handlelog(std::string line);
    void clear();

    uint32 maximum() const { return capacity; }
    const std::vector<std::string>& lines() const { return m_lines; }

private:
    uint32 capacity;
    std::vector<std::string> m_lines;
};

} // namespace cimple

#endif // FOUNDATION_DEVICE_LOG_H
