// From a scenario's text to a host. docs/simulator.md tells the keys.
#ifndef VLNSIM_SCENARIO_H
#define VLNSIM_SCENARIO_H

#include "simulator/host_model.h"
#include "simulator/identifiers.h"
#include "simulator/source_reader.h"

#include <functional>
#include <string>

namespace vlnsim {

// Throws Scenario_Error. name is the file's name, for messages and as the place that included files
// are looked for from.
Host read_scenario(const std::string& text, const std::string& name);

// The text of a file; throws Scenario_Error.
std::string read_file(const std::string& path);

// ---- Stretches of the reading, a file each.

// A function from the values that hold for it: those of its card, its port and its own, merged.
Function read_function(const Node& values);
// The keys that read_function knows; they may stand at a card, a port or a function.
std::span<const std::string_view> function_keys();

// One value of a table by identifier, for read_function and for changes at run time. kind is what
// the table says; an identifier that is in no table takes the kind of the value.
Attribute read_attribute(const Node& value, const Identifier* identifier);
Feature read_feature(const Node& value);
// The identifier that a key of a table names; a key that names none is an error at value.
std::uint32_t read_identifier(const Node& value, std::string_view key,
                              std::span<const Identifier> table);

std::vector<std::pair<std::string, Bytes>> read_vpd(const Node& values);
Bytes read_vpd_value(const Node& value); // of one entry
AX_iSCSI_InitiatorProperties read_initiator(const Node& values);
// Options that are not given stay as they are.
void read_login_options(const Node& values, AX_iSCSI_LoginOptions& options);
std::uint32_t read_authentication(const Node& values); // AX_ISCSI_AUTH_
// The same with names and secrets.
AX_iSCSI_Authentication read_account(const Node& values);
AX_iSCSI_PortStatistics read_iscsi_statistics(const Node& values);
// False for a text that is neither an IPv4 nor an IPv6 address.
bool parse_address(const std::string& text, AX_IPAddress& address);
// The address of a member, if it is there.
void read_address(const Node& values, std::string_view key, AX_IPAddress& address);
AX_Ini_NetworkProperties read_network(const Node& values);
std::vector<AX_ARPEntry> read_arp_table(const Node& values);
std::vector<AX_RouteEntry> read_route_table(const Node& values);
AX_PCIRegisters read_pci(const Node& values);
AX_SffData read_sff(const Node& values);

std::vector<Target> read_targets(const Node& values);

// A peripheral device type by number or name, of "type" or of the place in "types"; else a disk.
std::uint8_t read_device_type(const Node& values, std::uint64_t lun);
bool has_capacity(std::uint8_t type);
// Keys of a unit, which at a target hold for all its units, and those of the object alone.
std::vector<std::string_view> joined_keys(std::span<const std::string_view> unit_keys,
                                          std::initializer_list<std::string_view> own);
// Calls add for each logical unit of a target. "luns" is a count, a unit, or a list of units, each
// of which may stand for several; values are those of the row over the target's.
using Add_Unit = std::function<void(const Node& row, const Node& values, std::uint64_t lun)>;
void read_unit_rows(const Node& target_values, std::span<const std::string_view> unit_keys,
                    const Add_Unit& add);

Driver_Parameters read_driver_parameters(const Node& values);
// Changes the value of a parameter: a number, or {"current": now, "kept": after the next start}. A
// name that there is none of is an error at value.
void set_driver_parameter(std::optional<Driver_Parameters>& parameters, const std::string& name,
                          const Node& value);

// Of a function that has its name.
Unit_Priorities read_unit_priorities(const Node& values, const Function& function);
// "initiator:target:unit:option", by which a state has a unit's priority.
std::string unit_priority_name(const AX_OASLun& unit);
// Gives the unit of that name priority, with a number as its state, or takes it away, with null.
void set_unit_priority(Function& function, const std::string& name, const Node& value);

Dumps read_dumps(const Node& values);
Fip read_fip(const Node& values);
// The function's names have been read, and are the factory's unless the values tell others.
void read_name_management(const Node& values, Function& function);
std::vector<Virtual_Port> read_virtual_ports(const Node& values);

Diagnostics read_diagnostics(const Node& values);
// One of its numbers; a name that none has is an error at value.
void set_diagnostic(Diagnostics& diagnostics, const std::string& name, const Node& value);
std::vector<std::pair<std::string_view, std::uint32_t>> list_diagnostics(Diagnostics diagnostics);
void read_bridging(const Node& values, Function& function);
AX_QoS read_qos(const Node& values);
// The virtual functions of a function; its names and its PCI registers have been read.
std::vector<Virtual_Function> read_virtual_functions(const Node& values, const Function& function);

// How an adapter is split, how its links are, and how that is managed: the profile and the
// multichannel type that the function names have been read.
void read_channel_values(const Node& values, Function& function);

// The targets that an iSCSI function sees; its initiator and network records have been read.
std::vector<iSCSI_Target> read_iscsi_targets(const Node& values, const Function& function);
iSCSI_Network read_iscsi_network(const Node& values);
Name_Servers read_name_servers(const Node& values);

Fault read_fault(const Node& values);

} // namespace vlnsim

#endif // VLNSIM_SCENARIO_H
