// Every file of the host that the provider reads or writes, named once.
//
// The names stand behind one root prefix, empty in the product. A build variant of the module links
// another host_root.cpp, so that it works in a folder of its own.
#ifndef FOUNDATION_HOST_PATHS_H
#define FOUNDATION_HOST_PATHS_H

#include <string>

namespace cimple {

enum class Host_File {
    TUNING,           // /etc/vorlan_mpca_provider.conf
    WEB_LAUNCH,       // /etc/vln_smis.conf
    LOG_SETTINGS,     // /etc/vorlan_mpca_provider.dmp
    LOG_SETTINGS_VAR, // the same on a host whose root file system is read-only
    FFDC_LOG,         // the log of a system that was never configured
    NIMA_LOG,         // written by the management library
    KERNEL_VERSION,   // /proc/version
    DISTRIBUTION,     // /etc/issue
    SYSTEM_LOG,       // /var/log/messages, where the drivers write
};

// The file's name below the root prefix. Nothing is created, neither the file nor its folder.
std::string host_path(Host_File file);

// A file that a client names, in the folder that the object manager works in: the name as it is. A
// simulated host has a working folder of its own, for names without a folder's root.
std::string working_file(const std::string& name);

// The prefix of all of the above, without a slash at its end.
const char* host_root();

} // namespace cimple

#endif // FOUNDATION_HOST_PATHS_H
