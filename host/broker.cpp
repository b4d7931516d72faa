#include "host/broker.h"

#include "host/core.h"

namespace host {

CMPIBroker make_broker(Core& core) {
    // The interface has the tables writable; a provider that writes to them ends with a fault
    // there.
    return {&core, const_cast<CMPIBrokerFT*>(&broker_functions),
            const_cast<CMPIBrokerEncFT*>(&object_functions),
            const_cast<CMPIBrokerExtFT*>(&system_functions)};
}

Core* core_of_broker(const CMPIBroker* broker, const char* use) {
    if (broker && broker->bft == &broker_functions && broker->hdl)
        return static_cast<Core*>(broker->hdl);
    report(nullptr, FaultKind::bad_argument, std::string(use) + " with a broker that is not ours");
    return nullptr;
}

} // namespace host
