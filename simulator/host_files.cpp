#include "simulator/host_files.h"

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

namespace {

bool host_has(const std::string& file) {
    std::error_code error;
    return fs::exists(vlnsim_host_root() + file, error);
}

} // namespace

void write_files(const Host& host, bool first) {
    if (!host.system_log.empty() && !(first && host_has(system_log)))
        append_lines(system_log, host.system_log);
    for (const Host::File& file : host.files)
        if (!host_has(file.path))
            append_lines(file.path.c_str(), file.lines);
}

} // namespace vlnsim
