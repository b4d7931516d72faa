#include "tests/foundation/foundation_fixture.h"

#include "foundation/common.h"

#include <algorithm>
#include <cerrno>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <sys/statvfs.h>

namespace cimple {

const char* host_root() {
    return "host";
}

namespace {

constexpr Time::Clock STANDING_CLOCK = {[] { return uint64{1700000000000000ULL}; }, [](uint64) {}};

int writable_root(const char*, struct statvfs* out) {
    *out = {};
    return 0;
}

} // namespace

void Foundation_Test::SetUp() {
    namespace fs = std::filesystem;
    fs::remove_all(host_root());
    for (const char* folder : {"/etc", "/proc", "/var/log", "/opt/ibm/platform/log"})
        fs::create_directories(std::string(host_root()) + folder);
    Time::replace_clock(&STANDING_CLOCK);
    VLN_Common::replace_statvfs(writable_root);
    CLogger::instance().reset();
}

void Foundation_Test::TearDown() {
    CLogger::instance().reset();
    VLN_Common::replace_statvfs(nullptr);
    Time::replace_clock(nullptr);
}

std::string Foundation_Test::read(const std::string& path) {
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), {}};
}

void Foundation_Test::write(const std::string& path, const std::string& text) {
    std::ofstream(path, std::ios::binary) << text;
}

bool Foundation_Test::exists(Host_File file) {
    return std::filesystem::exists(host_path(file));
}

int Log_Capture::count(sint32 level, const std::string& text) const {
    const std::lock_guard guard(_lock);
    return static_cast<int>(std::count(lines.begin(), lines.end(), std::make_pair(level, text)));
}

} // namespace cimple
