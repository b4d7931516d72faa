// The name and the network interfaces of the simulated host, as its kernel would tell them.
#include "simulator/call.h"
#include "simulator/identifiers.h"
#include "simulator/simulator.h"

#include <sys/socket.h>

namespace {

using namespace vlnsim;

constexpr std::uint32_t state_up = 2;

std::string text_of(const Function& function, std::uint16_t identifier) {
    const auto it = function.port_attributes.find(identifier);
    return it == function.port_attributes.end() ? "" : it->second.text();
}

std::uint32_t number_of(const Function& function, std::uint16_t identifier) {
    const auto it = function.port_attributes.find(identifier);
    return it == function.port_attributes.end() ? 0 : it->second.number();
}

void describe(const Function& function, vlnsim_interface& interface) {
    interface = {};
    interface.up = number_of(function, port_functional_state) == state_up;
    const std::string address = text_of(function, port_ipv4_address);
    if (text_of(function, port_ip_type) == "IPv6")
        interface.family = AF_INET6;
    else if (!address.empty())
        interface.family = AF_INET;
    copy_text(address, interface.address, sizeof interface.address);
    copy_text(text_of(function, port_subnet_mask), interface.mask, sizeof interface.mask);
}

} // namespace

int vlnsim_host_name(char* name, size_t size) {
    Simulator& simulator = Simulator::instance();
    std::lock_guard lock(simulator.mutex);
    simulator.choose_scenario();
    const std::string own = simulator.host.server.hostName;
    if (!name || own.empty() || own.size() >= size)
        return -1;
    copy_text(own, name, size);
    return 0;
}

int vlnsim_resolve_host(const char* name, char* address, size_t size) {
    Simulator& simulator = Simulator::instance();
    std::lock_guard lock(simulator.mutex);
    simulator.choose_scenario();
    const Host& host = simulator.host;
    if (!name || !address || host.server.hostName != std::string(name) || host.address.empty())
        return 1;
    copy_text(host.address, address, size);
    return 0;
}

int vlnsim_find_interface(const char* name, struct vlnsim_interface* found) {
    if (!name || !*name || !found)
        return 1;
    Simulator& simulator = Simulator::instance();
    std::lock_guard lock(simulator.mutex);
    simulator.choose_scenario();
    for (const Function& function : simulator.host.functions)
        if (text_of(function, port_ip_endpoint_name) == name) {
            describe(function, *found);
            return 0;
        }
    return 1;
}
