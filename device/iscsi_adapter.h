// The iSCSI kind of adapter and port.
#ifndef DEVICE_ISCSI_ADAPTER_H
#define DEVICE_ISCSI_ADAPTER_H

#include "device/storage_adapter.h"

namespace cimple {

class iSCSIAdapter : public Storage_Adapter {
public:
    iSCSIAdapter(const std::string& name, uint32 number, const HBAIdentifier& hbaIdentifier,
                 const LocalHBAInfoV4& localHBAInfo);
    ~iSCSIAdapter() noexcept(false) override;

    void rescanTargets() override;
};

class iSCSIPort : public Storage_Port {
public:
    iSCSIPort(Adapter& owner, uint32 index, const HBAIdentifier& hbaIdentifier,
              const LocalHBAInfoV4& localHBAInfo);
    ~iSCSIPort() noexcept(false) override;

    void rescanTargets(Adapter& owner) override;
    PortStatistics* getPortStatistics() override;
};

} // namespace cimple

#endif // DEVICE_ISCSI_ADAPTER_H
