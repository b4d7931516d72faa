// The broker that a provider gets: three function tables over a core.
#ifndef HOST_BROKER_H
#define HOST_BROKER_H

#include "cmpi/cmpi.h"

namespace host {

class Core;

// Level 1.00: all instance, association and method operations; no queries. hdl is the core.
CMPIBroker make_broker(Core& core);

// The core behind a broker pointer that a provider handed in; null after a fault was recorded.
Core* core_of_broker(const CMPIBroker* broker, const char* use);

extern const CMPIBrokerFT broker_functions;
extern const CMPIBrokerEncFT object_functions;
extern const CMPIBrokerExtFT system_functions;

} // namespace host

#endif // HOST_BROKER_H
