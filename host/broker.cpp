#include "host/broker.h"

#include "host/core.h"

namespace host {

// The interface has the tables writable; a provider that writes to them ends with a fault there.
ProviderBroker::ProviderBroker(Core& made_by, std::string name)
    : cmpi{this, const_cast<CMPIBrokerFT*>(&broker_functions),
           const_cast<CMPIBrokerEncFT*>(&object_functions),
           const_cast<CMPIBrokerExtFT*>(&system_functions)},
      core(made_by), class_name(std::move(name)) {}

Core* core_of_broker(const CMPIBroker* broker, const char* use) {
    if (broker && broker->bft == &broker_functions && broker->hdl) {
        const auto& mine = *static_cast<const ProviderBroker*>(broker->hdl);
        if (!mine.is_dead)
            return &mine.core;
        report(&mine.core, FaultKind::dead_broker,
               std::string(use) + " with the broker of " + mine.class_name +
                   ", which was cleaned up");
        return nullptr;
    }
    report(nullptr, FaultKind::bad_argument, std::string(use) + " with a broker that is not ours");
    return nullptr;
}

} // namespace host
