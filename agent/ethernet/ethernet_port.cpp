#include "agent/ethernet/ethernet_port.h"

#include "agent/hardware/port_identity.h"
#include "agent/hardware/port_name.h"

namespace cimple {

void append_port_identities(VLNMPCA_EthernetPort& port, const AdapterAttributes& adapter) {
    append_port_identity(port, IDENTITY_ASIC, asic_name(adapter));
    append_port_identity(port, IDENTITY_PHYSICAL_PORT, physical_port_name(adapter));
    append_port_identity(port, IDENTITY_SERIAL, text(adapter.SerialNumber));
}

} // namespace cimple
