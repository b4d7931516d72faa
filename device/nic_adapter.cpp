#include "device/nic_adapter.h"

namespace cimple {

namespace {

constexpr Cleanup_Texts ADAPTER_TEXTS = {"~NICAdapter", "NIC Adapter attribute cleanup error",
                                         "NIC Adapter statistics cleanup error",
                                         "Port cleanup error"};
constexpr Cleanup_Texts PORT_TEXTS = {"~NICPort", "Port Attribute delete error!!!",
                                      "Port Statistics delete error !!!", nullptr};

} // namespace

NICAdapter::NICAdapter(const std::string& name, uint32 number, const HBAIdentifier& hbaIdentifier,
                       const LocalHBAInfoV4& localHBAInfo)
    : Adapter(name, number, ADAPTER_NIC) {
    auto read = std::make_unique<NICAdapterAttributes>(hbaIdentifier, localHBAInfo);
    const uint32 count = read->numberOfPorts;
    attributes = std::move(read);
    statistics = std::make_unique<NICAdapterStatistics>(*this);
    makePorts<NICPort>(count, hbaIdentifier, localHBAInfo);
}

NICAdapter::~NICAdapter() noexcept(false) {
    releaseOwned(ADAPTER_TEXTS);
}

void NICAdapter::rescanTargets() {
    VLN_LOG(VLN_DBG, "NICAdapter::rescanTargets");
    VLN_LOG(VLN_DBG, "Target Scanning for NICAdapter not supported");
}

NICPort::NICPort(Adapter& owner, uint32 index, const HBAIdentifier& hbaIdentifier,
                 const LocalHBAInfoV4& localHBAInfo)
    : Port(owner, index) {
    auto read = std::make_unique<NICPortAttributes>(owner, index, hbaIdentifier, localHBAInfo);
    portName = read->PortName;
    attributes = std::move(read);
}

NICPort::~NICPort() noexcept(false) {
    releaseOwned(PORT_TEXTS);
}

void NICPort::rescanTargets(Adapter&) {
    VLN_LOG(VLN_DBG, "NICPort::rescanTargets");
    VLN_LOG(VLN_DBG, "Nothing to do...");
}

} // namespace cimple
