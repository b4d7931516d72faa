// The FCoE kind of adapter and port.
#ifndef DEVICE_FCOE_ADAPTER_H
#define DEVICE_FCOE_ADAPTER_H

#include "device/storage_adapter.h"

namespace cimple {

class FCoEAdapter : public Storage_Adapter {
public:
    FCoEAdapter(const std::string& name, uint32 number, const HBAIdentifier& hbaIdentifier,
                const LocalHBAInfoV4& localHBAInfo);
    ~FCoEAdapter() noexcept(false) override;

    void rescanTargets() override;
};

class FCoEPort : public Storage_Port {
public:
    FCoEPort(Adapter& owner, uint32 index, const HBAIdentifier& hbaIdentifier,
             const LocalHBAInfoV4& localHBAInfo);
    ~FCoEPort() noexcept(false) override;

    void rescanTargets(Adapter& owner) override;
    PortStatistics* getPortStatistics() override;
};

} // namespace cimple

#endif // DEVICE_FCOE_ADAPTER_H
