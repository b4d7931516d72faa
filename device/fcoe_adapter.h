// The FCoE kind of adapter and port.
#ifndef DEVICE_FCOE_ADAPTER_H
#define DEVICE_FCOE_ADAPTER_H

#include "device/adapter.h"

namespace cimple {

class FCoEAdapter : public Adapter {
public:
    FCoEAdapter(const std::string& name, uint32 number, const HBAIdentifier& hbaIdentifier,
                const LocalHBAInfoV4& localHBAInfo);
    ~FCoEAdapter() noexcept(false) override;

    void rescanTargets() override;
    // The adapter's name in the HBA API, by which it is opened there.
    const std::string& getHbaAdapterName() const { return hbaAdapterName; }

private:
    std::string hbaAdapterName;
};

class FCoEPort : public Port {
public:
    FCoEPort(Adapter& owner, uint32 index, const HBAIdentifier& hbaIdentifier,
             const LocalHBAInfoV4& localHBAInfo);
    ~FCoEPort() noexcept(false) override;

    void rescanTargets(Adapter& owner) override;
    PortStatistics* getPortStatistics() override;
    const std::string& getNodeName() const { return nodeName; }

private:
    std::string nodeName; // 16 upper-case digits
};

} // namespace cimple

#endif // DEVICE_FCOE_ADAPTER_H
