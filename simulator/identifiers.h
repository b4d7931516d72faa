// The library's numbers for attributes, statistics and features, and the names that scenarios use
// for them: an attribute is named after what it tells, in the spelling of the library's own labels.
#ifndef VLNSIM_IDENTIFIERS_H
#define VLNSIM_IDENTIFIERS_H

#include <cstdint>
#include <span>
#include <string_view>

namespace vlnsim {

enum class Attribute_Kind { number, wide, text, bytes }; // wide: a number of 64 bits

struct Identifier {
    std::uint16_t number;
    Attribute_Kind kind;
    std::string_view name;
};

std::span<const Identifier> adapter_attribute_identifiers();
std::span<const Identifier> port_attribute_identifiers();
std::span<const Identifier> statistic_identifiers();
std::span<const Identifier> feature_identifiers();

// By name or by number; null when there is none.
const Identifier* find_identifier(std::span<const Identifier> table, std::string_view name);
const Identifier* find_identifier(std::span<const Identifier> table, std::uint32_t number);

// Attributes that the simulator itself reads or changes.
enum : std::uint16_t {
    adapter_manufacturer = 514,
    adapter_serial_number = 515,
    adapter_model = 516,
    adapter_model_description = 517,
    adapter_node_symbolic_name = 519,
    adapter_hardware_version = 520,
    adapter_option_rom_version = 521,
    adapter_firmware_version = 522,
    adapter_vendor_specific_id = 523,
    adapter_driver_name = 525,
    adapter_ieee_address = 531,
    adapter_driver_version = 533,
    adapter_port_number = 559,
    adapter_pci_function = 560,
    adapter_sub_adapter = 586,
    port_symbolic_name = 771,
    port_fc_id = 772,
    port_type = 773,
    port_functional_state = 774,
    port_class_of_service = 775,
    port_supported_fc4_types = 776,
    port_active_fc4_types = 777,
    port_supported_speed = 778,
    port_speed = 779,
    port_max_frame_size = 780,
    port_os_device_name = 781,
    port_discovered_ports = 782,
    port_physical_state = 802,
    port_permanent_mac = 804,
    port_ip_endpoint_name = 810,
    port_ip_type = 811,
    port_ipv4_address = 812,
    port_subnet_mask = 813,
    port_current_mac = 817,
    port_pfc_throttle = 823,
    feature_tessel = 201,
    port_first = 768 // adapter attributes have smaller numbers
};

} // namespace vlnsim

#endif // VLNSIM_IDENTIFIERS_H
