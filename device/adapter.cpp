#include "device/adapter.h"

#include "cimple/guard.h"
#include "foundation/log.h"

namespace cimple {

Adapter::Adapter(const std::string& name, uint32 number, uint32 type)
    : adapterName(name), adapterNumber(number), adapterType(type) {
    VLN_LOG(VLN_DBG, "Adapter( adapterName[%s], adapterNumber[%d], adapterType[%d] )", name.c_str(),
            number, type);
}

Adapter::~Adapter() noexcept(false) {
    VLN_LOG(VLN_DBG, "~Adapter");
}

Port* Adapter::getPort(uint32 index) {
    if (index >= ports.size())
        throw std::out_of_range("vector::_M_range_check");
    return ports[index].get();
}

void Adapter::rescanPorts() {
    for (const std::unique_ptr<Port>& port : ports) {
        if (!run_guarded([&] { port->rescanTargets(*this); }))
            VLN_LOG(VLN_ERR, "Issue with Target Rescan - moving to the next Port");
    }
}

void Adapter::portFailed(uint32 index) noexcept {
    VLN_LOG(VLN_ERR, "Failed to fetch information for port: [%d] on adapter: [%s]", index,
            adapterName.c_str());
}

void Adapter::releaseOwned(const Cleanup_Texts& texts) noexcept {
    VLN_LOG(VLN_DBG, "%s", texts.entry);
    delete_guarded(attributes, texts.attributes);
    delete_guarded(statistics, texts.statistics);
    bool intact = true;
    for (std::unique_ptr<Port>& port : ports) {
        // Behind a port that failed to go away nothing is trusted: the others are abandoned.
        if (!intact) {
            static_cast<void>(port.release());
            continue;
        }
        VLN_LOG(VLN_DBG, "Freeing Port: %s", port->getPortName().c_str());
        intact = delete_guarded(port, texts.ports);
    }
}

} // namespace cimple
