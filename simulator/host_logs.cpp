#include "simulator/host_logs.h"

#include "simulator/vlnsim.h"

#include <filesystem>
#include <fstream>

namespace vlnsim {

namespace fs = std::filesystem;

bool append_lines(const char* file, const std::vector<std::string>& lines) {
    const std::string root = vlnsim_host_root();
    if (root.empty())
        return false;
    const fs::path path = root + file;
    std::error_code error;
    fs::create_directories(path.parent_path(), error);
    std::ofstream log(path, std::ios::app | std::ios::binary);
    for (const std::string& line : lines)
        log << line << '\n';
    return log.flush().good();
}

void log_start(const Host& host, bool first) {
    std::error_code error;
    if (!host.system_log.empty() &&
        !(first && fs::exists(vlnsim_host_root() + std::string(system_log), error)))
        append_lines(system_log, host.system_log);
}

} // namespace vlnsim
