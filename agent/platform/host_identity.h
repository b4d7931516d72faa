// What the provider asks the host's resolver about itself. The module for simulation is linked with
// another source of it.
#ifndef VLN_AGENT_PLATFORM_HOST_IDENTITY_H
#define VLN_AGENT_PLATFORM_HOST_IDENTITY_H

#include <cstddef>
#include <string>

namespace cimple {

struct Host_Queries {
    // As gethostname(2).
    int (*host_name)(char* name, std::size_t size);
    // Canonical name and first IPv4 address, in dotted form, of a host; false if it can't be
    // resolved.
    bool (*resolve)(const char* name, std::string& canonical_name, std::string& address);
};

const Host_Queries& host_queries();

} // namespace cimple

#endif // VLN_AGENT_PLATFORM_HOST_IDENTITY_H
