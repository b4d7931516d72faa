// Bandwidth limits and virtual functions of a NIC.
#include "simulator/scenario.h"

#include <algorithm>

namespace vlnsim {
namespace {

constexpr std::uint64_t max_virtual_functions = 256; // of a function
constexpr std::uint32_t default_first_function = 8;

// Names and addresses that differ from the function's own, and from each other.
std::uint64_t default_name(const Function& function, std::uint64_t index) {
    return function.wwpn + ((index + 1) << 48);
}

Bytes default_mac(const Function& function, std::uint64_t index) {
    Bytes mac(8);
    put_name(function.mac_address(), mac.data());
    mac.erase(mac.begin(), mac.begin() + 2);
    mac[0] |= 4;
    mac[1] = static_cast<std::uint8_t>(index);
    return mac;
}

Virtual_Function read_virtual_function(const Node& values, const Function& function,
                                       std::uint64_t index) {
    const AX_PCIRegisters pci = function.pci.value_or(AX_PCIRegisters{});
    const auto identifier = [&](std::string_view key, std::uint16_t otherwise) {
        return static_cast<std::uint16_t>(values.number(key, otherwise, 0xFFFF));
    };
    Virtual_Function virtual_function;
    const auto name = values.member("wwpn");
    virtual_function.name = name ? name->wwn() : default_name(function, index);
    AX_VirtualFunctionProperties& properties = virtual_function.properties;
    properties.busNumber = values.number32("busNumber", pci.busNumber);
    properties.deviceNumber = values.number32("deviceNumber", pci.deviceNumber);
    properties.functionNumber = values.number32(
        "functionNumber", default_first_function + static_cast<std::uint32_t>(index));
    properties.vendorID = identifier("vendorID", pci.vendorID);
    properties.deviceID = identifier("deviceID", pci.deviceID);
    properties.subVendorID = identifier("subVendorID", pci.subVendorID);
    properties.subsystemID = identifier("subsystemID", pci.subsystemID);
    properties.revisionID = values.number32("revisionID", pci.revisionID);
    properties.vlanID = values.number32("vlan", 0);
    properties.linkStatus = values.number32("linkStatus", 1);
    const auto address = values.member("mac");
    const Bytes mac =
        address ? address->bytes(sizeof properties.mac) : default_mac(function, index);
    std::copy(mac.begin(), mac.end(), properties.mac);
    const std::string rate = values.wild_text("transmitRate", "10 Gbps");
    if (rate.size() > sizeof properties.transmitRate)
        values.member("transmitRate")
            ->fail("longer than " + std::to_string(sizeof properties.transmitRate) + " bytes");
    rate.copy(properties.transmitRate, sizeof properties.transmitRate);
    return virtual_function;
}

} // namespace

AX_QoS read_qos(const Node& values) {
    values.expect_object({"maxBytesPerSecond", "maxIOsPerSecond"});
    AX_QoS qos{};
    qos.maxBytesPerSecond = values.number32("maxBytesPerSecond", 0);
    qos.maxIOsPerSecond = values.number32("maxIOsPerSecond", 0);
    return qos;
}

std::vector<Virtual_Function> read_virtual_functions(const Node& values, const Function& function) {
    std::vector<Virtual_Function> functions;
    for (const Node& row : values.items_or_self()) {
        row.expect_object({"count", "wwpn", "mac", "busNumber", "deviceNumber", "functionNumber",
                           "vendorID", "deviceID", "subVendorID", "subsystemID", "revisionID",
                           "vlan", "linkStatus", "transmitRate"});
        const std::uint64_t count = row.number("count", 1, max_virtual_functions);
        for (std::uint64_t i = 0; i < count; ++i) {
            const std::uint64_t index = functions.size();
            if (index == max_virtual_functions)
                row.fail("more than " + std::to_string(max_virtual_functions) +
                         " virtual functions");
            const Scope scope = row.scope().with("vf", index);
            functions.push_back(read_virtual_function(Node(row.value(), scope), function, index));
        }
    }
    return functions;
}

} // namespace vlnsim
