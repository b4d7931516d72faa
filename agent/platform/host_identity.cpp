#include "agent/platform/host_identity.h"

#include <cerrno>
#include <cstdio>
#include <vector>

#include <netdb.h>
#include <sys/socket.h>
#include <unistd.h>

namespace cimple {

namespace {

std::string dotted(const unsigned char* bytes) {
    char text[16];
    std::snprintf(text, sizeof text, "%d.%d.%d.%d", bytes[0], bytes[1], bytes[2], bytes[3]);
    return text;
}

// gethostbyname in its reentrant form: the plain one shares its answer with the whole process.
bool resolve(const char* name, std::string& canonical_name, std::string& address) {
    std::vector<char> buffer(1024);
    hostent entry{};
    hostent* result = nullptr;
    int resolver_error = 0;
    while (gethostbyname_r(name, &entry, buffer.data(), buffer.size(), &result, &resolver_error) ==
           ERANGE)
        buffer.resize(buffer.size() * 2);
    if (!result || result->h_addrtype != AF_INET || !result->h_addr_list[0])
        return false;
    canonical_name = result->h_name;
    address = dotted(reinterpret_cast<const unsigned char*>(result->h_addr_list[0]));
    return true;
}

constexpr Host_Queries system_queries = {&::gethostname, &resolve};

} // namespace

const Host_Queries& host_queries() {
    return system_queries;
}

} // namespace cimple
