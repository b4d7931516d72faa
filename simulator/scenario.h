// From a scenario's text to a host. docs/simulator.md tells the keys.
#ifndef VLNSIM_SCENARIO_H
#define VLNSIM_SCENARIO_H

#include "simulator/host_model.h"
#include "simulator/identifiers.h"
#include "simulator/source_reader.h"

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
AX_iSCSI_InitiatorProperties read_initiator(const Node& values);
AX_Ini_NetworkProperties read_network(const Node& values);
AX_PCIRegisters read_pci(const Node& values);
AX_SffData read_sff(const Node& values);

std::vector<Target> read_targets(const Node& values);

Fault read_fault(const Node& values);

} // namespace vlnsim

#endif // VLNSIM_SCENARIO_H
