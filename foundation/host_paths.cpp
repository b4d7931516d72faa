#include "foundation/host_paths.h"

namespace cimple {

namespace {

const char* name_of(Host_File file) {
    switch (file) {
    case Host_File::TUNING:
        return "/etc/vorlan_mpca_provider.conf";
    case Host_File::WEB_LAUNCH:
        return "/etc/vln_smis.conf";
    case Host_File::LOG_SETTINGS:
        return "/etc/vorlan_mpca_provider.dmp";
    case Host_File::LOG_SETTINGS_VAR:
        return "/var/log/vorlan_mpca_provider.dmp";
    case Host_File::FFDC_LOG:
        return "/opt/ibm/platform/log/vorlan_mpca_provider_ffdc.log";
    case Host_File::NIMA_LOG:
        return "/tmp/nima2d.log";
    case Host_File::KERNEL_VERSION:
        return "/proc/version";
    case Host_File::DISTRIBUTION:
        return "/etc/issue";
    case Host_File::SYSTEM_LOG:
        return "/var/log/messages";
    }
    return "";
}

} // namespace

std::string host_path(Host_File file) {
    return std::string(host_root()) + name_of(file);
}

std::string working_file(const std::string& name) {
    const std::string root = host_root();
    return root.empty() || name.starts_with('/') ? name : root + "/" + name;
}

} // namespace cimple
