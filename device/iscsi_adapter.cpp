#include "device/iscsi_adapter.h"

#include "device/library/hba_api.h"

namespace cimple {

namespace {

constexpr Cleanup_Texts ADAPTER_TEXTS = {"~iSCSIAdapter", "iSCSIAdapter _AdapterAttributes error",
                                         "iSCSIAdapter _AdapterStatistics error",
                                         "iSCSIAdapter Port cleanup error"};
constexpr Cleanup_Texts PORT_TEXTS = {"~iSCSIPort", "Port Attribute delete error!!!",
                                      "Port Statistics delete error!!!", nullptr};

} // namespace

iSCSIAdapter::iSCSIAdapter(const std::string& name, uint32 number,
                           const HBAIdentifier& hbaIdentifier, const LocalHBAInfoV4& localHBAInfo)
    : Storage_Adapter(name, number, ADAPTER_ISCSI) {
    HBA_Name_Buffer hbaName;
    if (readHbaAdapterName(number, hbaName) != HBA_STATUS_OK)
        VLN_LOG(VLN_DBG, "AdapterName:%s:adapterNumber%d", hbaName.text, number);
    hbaAdapterName = hbaName.text;

    auto read = std::make_unique<iSCSIAdapterAttributes>(hbaIdentifier, localHBAInfo);
    const uint32 count = read->numberOfPorts;
    attributes = std::move(read);
    statistics = std::make_unique<iSCSIAdapterStatistics>(*this);
    makePorts<iSCSIPort>(count, hbaIdentifier, localHBAInfo);
}

iSCSIAdapter::~iSCSIAdapter() noexcept(false) {
    releaseOwned(ADAPTER_TEXTS);
}

void iSCSIAdapter::rescanTargets() {
    VLN_LOG(VLN_DBG, "iSCSIAdapter::rescanTargets");
    rescanPorts();
}

iSCSIPort::iSCSIPort(Adapter& owner, uint32 index, const HBAIdentifier& hbaIdentifier,
                     const LocalHBAInfoV4& localHBAInfo)
    : Storage_Port(
          owner, index,
          std::make_unique<iSCSIPortAttributes>(owner, index, hbaIdentifier, localHBAInfo)) {}

iSCSIPort::~iSCSIPort() noexcept(false) {
    releaseOwned(PORT_TEXTS);
}

// The targets of an iSCSI port are no part of the model: the iSCSI operations ask for them.
void iSCSIPort::rescanTargets(Adapter&) {
    VLN_LOG(VLN_DBG, "iSCSI::rescanTargets");
    VLN_LOG(VLN_DBG, "Nothing to do...");
}

PortStatistics* iSCSIPort::getPortStatistics() {
    return refreshStatistics<iSCSIPortStatistics>(
        "iSCSI Port statistics error occurred,retain the old statistics !!!");
}

} // namespace cimple
