// VLN_Common: what the provider asks of its host.
#include "foundation/common.h"

#include "foundation/host_paths.h"
#include "foundation/log.h"

#include <atomic>
#include <fstream>
#include <memory>
#include <new>
#include <sys/statvfs.h>

namespace cimple {

namespace {

struct Read_Only_Test {
    std::atomic<VLN_Common::Statvfs> query{::statvfs};
    std::atomic<bool> done{false};
    std::atomic<bool> read_only{false};
};
constinit Read_Only_Test read_only_test;

bool read_distribution(std::string& distribution) {
    std::ifstream file(host_path(Host_File::DISTRIBUTION), std::ios::in | std::ios::ate);
    const std::streamoff length = file.is_open() ? std::streamoff(file.tellg()) : -1;
    if (length < 0 || !file.good()) {
        VLN_LOG(VLN_DBG, "Unable to open the /etc/issue file to get OSDistribution Name");
        return false;
    }
    const auto size = static_cast<std::size_t>(length);
    // A folder of that name claims to be as long as a file can be.
    constexpr std::streamoff LONGEST = 1 << 20;
    std::unique_ptr<char[]> text(length > LONGEST ? nullptr : new (std::nothrow) char[size + 1]);
    if (!text) {
        VLN_LOG(VLN_ERR, "Unable to allocate the memory to store OSDistributionName");
        return false;
    }
    file.seekg(0);
    file.read(text.get(), static_cast<std::streamsize>(size));
    distribution.assign(text.get(), static_cast<std::size_t>(file.gcount()));
    return true;
}

} // namespace

void VLN_Common::replace_statvfs(Statvfs query) {
    read_only_test.query = query ? query : static_cast<Statvfs>(::statvfs);
    read_only_test.done = false;
    read_only_test.read_only = false;
}

bool VLN_Common::IsReadOnlyFS() {
    VLN_LOG(VLN_DBG, " Inside IsReadOnlyFS()");
    if (!read_only_test.done) {
        struct statvfs status {};
        const std::string root = std::string(host_root()) + "/";
        if (read_only_test.query.load()(root.c_str(), &status) == 0) {
            read_only_test.read_only = (status.f_flag & ST_RDONLY) != 0;
            read_only_test.done = true;
        }
    }
    return read_only_test.read_only;
}

sint32 VLN_Common::getOSInformation(std::string& name, std::string& distribution) {
    name = distribution = "Unknown";
    VLN_LOG(VLN_DBG, "Inside  getOSInformation");
    VLN_LOG(VLN_DBG, "Under _LINUX -- getting the os name and version");
    std::ifstream version(host_path(Host_File::KERNEL_VERSION));
    if (!version.is_open())
        return VLN_GENERAL_ERROR;
    char line[256 + 1] = "";
    version.getline(line, sizeof line);
    name = line;

    VLN_LOG(VLN_DBG, "Under _LINUX -- Getting the OS Distribution Name");
    return read_distribution(distribution) ? 0 : VLN_GENERAL_ERROR;
}

} // namespace cimple
