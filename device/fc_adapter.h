// The native Fibre Channel kind of adapter and port, read through the HBA API.
//
// The scan makes none: the management library lists converged functions only. The kind is whole all
// the same, for a scan that finds FC adapters has nothing else to add.
#ifndef DEVICE_FC_ADAPTER_H
#define DEVICE_FC_ADAPTER_H

#include "device/adapter.h"

namespace cimple {

class FCAdapter : public Adapter {
public:
    // `name` is the adapter's name in the HBA API.
    FCAdapter(const std::string& name, uint32 number);
    ~FCAdapter() noexcept(false) override;

    void rescanTargets() override;
};

class FCPort : public Port {
public:
    FCPort(Adapter& owner, uint32 index);
    ~FCPort() noexcept(false) override;

    void rescanTargets(Adapter& owner) override;
    PortStatistics* getPortStatistics() override;
    const std::string& getNodeName() const { return nodeName; }

private:
    std::string nodeName; // 16 upper-case digits
};

} // namespace cimple

#endif // DEVICE_FC_ADAPTER_H
