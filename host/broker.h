// The broker that a provider gets: three function tables over a core. Each provider has one of its
// own, which is dead once the provider was cleaned up; it stays where it is, so that a use of it is
// seen.
#ifndef HOST_BROKER_H
#define HOST_BROKER_H

#include "cmpi/cmpi.h"

#include <atomic>
#include <string>

namespace host {

class Core;

// Level 1.00: all instance, association and method operations; no queries. hdl is this.
struct ProviderBroker {
    ProviderBroker(Core& core, std::string class_name);

    CMPIBroker cmpi;
    Core& core;
    const std::string class_name;
    std::atomic<bool> is_dead{false};
};

// The core behind a broker pointer that a provider handed in; null after a fault was recorded.
Core* core_of_broker(const CMPIBroker* broker, const char* use);

extern const CMPIBrokerFT broker_functions;
extern const CMPIBrokerEncFT object_functions;
extern const CMPIBrokerExtFT system_functions;

} // namespace host

#endif // HOST_BROKER_H
