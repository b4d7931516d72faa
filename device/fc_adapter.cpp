#include "device/fc_adapter.h"

#include "device/library/hba_api.h"
#include "device/target_mapping.h"

namespace cimple {

namespace {

constexpr Cleanup_Texts ADAPTER_TEXTS = {"~FCAdapter", "Adapter attribute delete failed",
                                         "Adapter statistics delete failed",
                                         "Error in port freeing"};
constexpr Cleanup_Texts PORT_TEXTS = {"~FCPort", "FC Port attribute deletion failed!!!",
                                      "FC Port statistics deletion failed!!!", nullptr};

} // namespace

FCAdapter::FCAdapter(const std::string& name, uint32 number) : Adapter(name, number, ADAPTER_FC) {
    auto read = std::make_unique<FCAdapterAttributes>(*this);
    const uint32 count = boundedHbaCount(read->numberOfPorts, "ports");
    driverType = read->DriverType;
    attributes = std::move(read);
    statistics = std::make_unique<FCAdapterStatistics>(*this);
    makePorts<FCPort>(count);
}

FCAdapter::~FCAdapter() noexcept(false) {
    releaseOwned(ADAPTER_TEXTS);
}

void FCAdapter::rescanTargets() {
    VLN_LOG(VLN_DBG, "FCAdapter::rescanTargets");
    rescanPorts();
}

FCPort::FCPort(Adapter& owner, uint32 index) : Port(owner, index) {
    auto read = std::make_unique<FCPortAttributes>(owner, index);
    portName = read->PortWWN;
    nodeName = read->NodeWWN;
    attributes = std::move(read);
}

FCPort::~FCPort() noexcept(false) {
    releaseOwned(PORT_TEXTS);
}

// Comes to no target, whatever the API lists: a Target reads its unit through an FCoE adapter only.
void FCPort::rescanTargets(Adapter& owner) {
    VLN_LOG(VLN_DBG, "FCPort::rescanTargets");
    dropTargets();
    HBA_Adapter hba(owner.getAdapterName());
    makeTargets(owner, Target_Mapping(hba.handle()));
}

PortStatistics* FCPort::getPortStatistics() {
    return refreshStatistics<FCPortStatistics>(
        "FC Port statistics error occurred,retain the old statistics !!!");
}

} // namespace cimple
