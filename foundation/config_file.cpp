#include "foundation/config_file.h"

#include "cimple/guard.h"
#include "foundation/file_handle.h"
#include "foundation/log.h"

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <memory>
#include <sys/stat.h>

namespace cimple {

namespace {

constexpr const char* CACHE_TIMEOUT_KEY = "VLN_PROVIDER_CACHE_TIMEOUT";
constexpr const char* REFRESH_ADAPTER_KEY = "VLN_PROVIDER_REFRESH_ADAPTERDATA";
constexpr const char* REFRESH_SAN_KEY = "VLN_PROVIDER_REFRESH_SANDATA";

constexpr const char* BANNER_RULE = "##################################################\n";
constexpr const char* BANNER_TITLE = "# Vorlan HBA CIM Provider Configuration Settings #\n";

// The next line without its end, cut to `longest` characters. False at the end of the file.
bool read_line(std::FILE* stream, std::size_t longest, std::string& line) {
    line.clear();
    int c = std::fgetc(stream);
    if (c == EOF)
        return false;
    for (; c != EOF && c != '\n'; c = std::fgetc(stream))
        if (line.size() < longest)
            line += static_cast<char>(c);
    return true;
}

std::string trim(const std::string& text) {
    static constexpr const char* BLANKS = " \t\r\v\f";
    const std::size_t first = text.find_first_not_of(BLANKS);
    if (first == std::string::npos)
        return {};
    return text.substr(first, text.find_last_not_of(BLANKS) - first + 1);
}

bool take_flag(const std::string& value, bool& flag) {
    if (value != "TRUE" && value != "FALSE")
        return false;
    flag = value == "TRUE";
    return true;
}

bool is_timeout(long value) {
    return value >= static_cast<long>(VlnConfigFile::MIN_CACHE_TIMEOUT) &&
           value <= static_cast<long>(VlnConfigFile::MAX_CACHE_TIMEOUT);
}

bool take_timeout(const std::string& value, uint32& timeout) {
    const long number = std::strtol(value.c_str(), nullptr, 10);
    if (!is_timeout(number))
        return false;
    timeout = static_cast<uint32>(number);
    return true;
}

const char* flag_word(bool flag) {
    return flag ? "TRUE" : "FALSE";
}

} // namespace

// A key counts as seen once it had a good value; the first good value wins.
struct VlnConfigFile::Keys_Seen {
    bool cache_timeout = false;
    bool refresh_adapter = false;
    bool refresh_san = false;
};

VlnConfigFile::~VlnConfigFile() {
    run_guarded([this] { save(); }); // out of memory at the end: the file stays as it was
}

void VlnConfigFile::load(const char* file) {
    if (!file)
        return;
    Auto_Mutex guard(lock);
    path = file;
    struct stat status;
    if (stat(file, &status) != 0)
        return;
    File_Handle stream(std::fopen(file, "re"));
    if (!stream) {
        VLN_LOG(VLN_ERR, "Unable to open provider config setting file - %s", file);
        return;
    }
    Keys_Seen seen;
    std::string line;
    while (read_line(stream.get(), 1024, line))
        take_line(trim(line), seen);
}

void VlnConfigFile::take_line(const std::string& line, Keys_Seen& seen) {
    const std::size_t sign = line.find('=');
    if (line.empty() || line[0] == '#' || sign == std::string::npos)
        return;
    const std::string key = trim(line.substr(0, sign));
    const std::string value = trim(line.substr(sign + 1));
    if (!seen.cache_timeout && key == CACHE_TIMEOUT_KEY)
        seen.cache_timeout = take_timeout(value, cache_timeout);
    else if (!seen.refresh_adapter && key == REFRESH_ADAPTER_KEY)
        seen.refresh_adapter = take_flag(value, refresh_adapter_data);
    else if (!seen.refresh_san && key == REFRESH_SAN_KEY)
        seen.refresh_san = take_flag(value, refresh_san_data);
}

void VlnConfigFile::save() {
    Auto_Mutex guard(lock);
    if (path.empty())
        return;
    File_Handle stream(std::fopen(path.c_str(), "we"));
    if (!stream) {
        VLN_LOG(VLN_ERR, "Unable to open provider config setting file - %s", path.c_str());
        return;
    }
    std::fprintf(stream.get(), "%s%s%s", BANNER_RULE, BANNER_TITLE, BANNER_RULE);
    std::fprintf(stream.get(), "%s = %u\n", CACHE_TIMEOUT_KEY, cache_timeout);
    std::fprintf(stream.get(), "%s = %s\n", REFRESH_ADAPTER_KEY, flag_word(refresh_adapter_data));
    std::fprintf(stream.get(), "%s = %s\n", REFRESH_SAN_KEY, flag_word(refresh_san_data));
}

uint32 VlnConfigFile::get_cache_timeout() const {
    Auto_Mutex guard(lock);
    return cache_timeout;
}

bool VlnConfigFile::get_refresh_adapter() const {
    Auto_Mutex guard(lock);
    return refresh_adapter_data;
}

bool VlnConfigFile::get_refresh_san() const {
    Auto_Mutex guard(lock);
    return refresh_san_data;
}

sint32 VlnConfigFile::set_cache_timeout(sint32 value) {
    if (!is_timeout(value))
        return -1;
    Auto_Mutex guard(lock);
    cache_timeout = static_cast<uint32>(value);
    return 0;
}

sint32 VlnConfigFile::set_refresh_adapter(sint32 value) {
    if (value != 0 && value != 1)
        return -1;
    Auto_Mutex guard(lock);
    refresh_adapter_data = value == 1;
    return 0;
}

sint32 VlnConfigFile::set_refresh_san(sint32 value) {
    if (value != 0 && value != 1)
        return -1;
    Auto_Mutex guard(lock);
    refresh_san_data = value == 1;
    return 0;
}

std::string readWebLaunchURL(const char* path) {
    File_Handle stream(path ? std::fopen(path, "re") : nullptr);
    if (!stream) {
        VLN_LOG(VLN_INFO, "WebLaunch config file '%s' not found.", path ? path : "");
        return {};
    }
    std::string line;
    while (read_line(stream.get(), 256, line)) {
        const std::size_t start = line.find_first_not_of(" \t\r");
        if (start != std::string::npos && line[start] != '#')
            return line.substr(start, line.find_last_not_of('\r') + 1 - start);
    }
    return {};
}

} // namespace cimple
