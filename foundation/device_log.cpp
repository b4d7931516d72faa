#include "foundation/device_log.h"

#include "foundation/log.h"

namespace cimple {

sint32 DeviceLog::Handlelog(std::string line) {
    if (line.empty())
        return 0;
    VLN_LOG(VLN_DBG, "Handlelog ---  Prior to Inserting into DeviceLog Vector");
    if (m_lines.size() >= capacity)
        return 1;
    m_lines.push_back(std::move(line));
    return 0;
}

void DeviceLog::clear() {
    std::vector<std::string>().swap(m_lines);
}

} // namespace cimple
