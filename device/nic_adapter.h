// The Ethernet kind of adapter and port.
#ifndef DEVICE_NIC_ADAPTER_H
#define DEVICE_NIC_ADAPTER_H

#include "device/adapter.h"

namespace cimple {

class NICAdapter : public Adapter {
public:
    NICAdapter(const std::string& name, uint32 number, const HBAIdentifier& hbaIdentifier,
               const LocalHBAInfoV4& localHBAInfo);
    ~NICAdapter() noexcept(false) override;

    void rescanTargets() override;
};

class NICPort : public Port {
public:
    NICPort(Adapter& owner, uint32 index, const HBAIdentifier& hbaIdentifier,
            const LocalHBAInfoV4& localHBAInfo);
    ~NICPort() noexcept(false) override;

    void rescanTargets(Adapter& owner) override;
    // Always null: Ethernet counters come from the Ethernet statistics.
    PortStatistics* getPortStatistics() override { return statistics.get(); }
};

} // namespace cimple

#endif // DEVICE_NIC_ADAPTER_H
