// The iSCSI kind of adapter and port.
#ifndef DEVICE_ISCSI_ADAPTER_H
#define DEVICE_ISCSI_ADAPTER_H

#include "device/adapter.h"

namespace cimple {

class iSCSIAdapter : public Adapter {
public:
    iSCSIAdapter(const std::string& name, uint32 number, const HBAIdentifier& hbaIdentifier,
                 const LocalHBAInfoV4& localHBAInfo);
    ~iSCSIAdapter() noexcept(false) override;

    void rescanTargets() override;
    // The adapter's name in the HBA API, by which it is opened there.
    const std::string& getHbaAdapterName() const { return hbaAdapterName; }

private:
    std::string hbaAdapterName;
};

class iSCSIPort : public Port {
public:
    iSCSIPort(Adapter& owner, uint32 index, const HBAIdentifier& hbaIdentifier,
              const LocalHBAInfoV4& localHBAInfo);
    ~iSCSIPort() noexcept(false) override;

    void rescanTargets(Adapter& owner) override;
    PortStatistics* getPortStatistics() override;
    const std::string& getNodeName() const { return nodeName; }

private:
    std::string nodeName; // 16 upper-case digits
};

} // namespace cimple

#endif // DEVICE_ISCSI_ADAPTER_H
