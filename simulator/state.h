// What has changed of a host since its scenario was read, as JSON that one process leaves for the
// next. docs/simulator.md tells the form.
#ifndef VLNSIM_STATE_H
#define VLNSIM_STATE_H

#include "simulator/host_model.h"
#include "simulator/source_reader.h"

#include <string>

namespace vlnsim {

// Bytes as two digits each, which mean the same to both word sizes.
std::string hexadecimal(const void* data, std::size_t size);

// What differs between the running host and the one that its scenario describes. scenario is that
// one's name, which the state remembers.
std::string state_text(const Host& now, const Host& described, const std::string& scenario);

// Lays a state over the host that its scenario describes. Throws Scenario_Error; the host may then
// be half changed. name is the state's file.
void apply_state(Host& host, const std::string& text, const std::string& name,
                 const std::string& scenario);

// Changes one value of a table of the function, null to take it away; throws Scenario_Error.
void set_value(Function& function, const std::string& table, const std::string& name,
               const Node& value);

} // namespace vlnsim

#endif // VLNSIM_STATE_H
