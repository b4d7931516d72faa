// What the functions of one physical port have in common.
#ifndef VLNSIM_PHYSICAL_PORT_H
#define VLNSIM_PHYSICAL_PORT_H

#include "simulator/host_model.h"

namespace vlnsim {

// Whether an adapter offers a feature; one that can't be asked does not.
bool offers(const Function& function, std::uint32_t feature);

// Sets a port attribute of all functions on the function's port that have it.
void set_on_port(Host& host, const Function& function, std::uint16_t identifier,
                 const Attribute& attribute);

// AX_SetAdapterAttribute of the line rates: the number of a rate, not the bits that are read.
AX_STATUS set_line_rate(Host& host, const Function& function, const Bytes& value);

} // namespace vlnsim

#endif // VLNSIM_PHYSICAL_PORT_H
