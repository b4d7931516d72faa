// An adapter of the device model: one instance of the management library, which is not one card. A
// converged card shows up as several adapters of different kinds.
//
// Adapters are read under the agent's data lock only; pointers and references that an accessor
// hands out live no longer than the adapter does, and that is until the next scan.
#ifndef DEVICE_ADAPTER_H
#define DEVICE_ADAPTER_H

#include "cimple/guard.h"
#include "cimple/types.h"
#include "device/adapter_attributes.h"
#include "device/adapter_statistics.h"
#include "device/cleanup.h"
#include "device/port.h"

#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

namespace cimple {

enum Adapter_Type : uint32 {
    ADAPTER_FC = 1,
    ADAPTER_NIC = 2,
    ADAPTER_ISCSI = 3,
    ADAPTER_FCOE = 4,
};

using Port_List = std::vector<std::unique_ptr<Port>>;

class Adapter {
public:
    virtual ~Adapter() noexcept(false);

    virtual const std::string& getAdapterName() { return adapterName; } // "Vorlan <model>-<hex>"
    virtual const uint32& getAdapterNumber() { return adapterNumber; }
    virtual const uint32& getDriverType() { return driverType; }
    virtual AdapterAttributes* getAdapterAttributes() { return attributes.get(); }
    virtual AdapterStatistics* getAdapterStatistics() { return statistics.get(); }
    virtual uint32 getPortCount() { return static_cast<uint32>(ports.size()); }
    virtual Port_List& getPorts() { return ports; }
    virtual Port* getPort(uint32 index); // throws std::out_of_range beyond the end
    // Finds anew what the ports see in the SAN. A port that fails is logged and passed over.
    virtual void rescanTargets() = 0;

    uint32 getAdapterType() const { return adapterType; }

protected:
    Adapter(const std::string& name, uint32 number, uint32 type);
    Adapter(const Adapter&) = delete;
    Adapter& operator=(const Adapter&) = delete;

    // Makes the ports 0 to count - 1. One that cannot be made is logged and left out.
    template <class Port_Class, class... Arguments>
    void makePorts(uint32 count, const Arguments&... arguments);

    // The rescan of a kind of adapter whose ports may see targets.
    void rescanPorts();

    // Deletes what the adapter owns, each piece under a guard of its own.
    void releaseOwned(const Cleanup_Texts& texts) noexcept;

    std::unique_ptr<AdapterAttributes> attributes;
    std::unique_ptr<AdapterStatistics> statistics;
    Port_List ports;
    std::string adapterName;
    uint32 adapterNumber; // index of the instance in the enumeration that made it
    uint32 driverType = 0;
    uint32 adapterType;

private:
    void portFailed(uint32 index) noexcept;
};

template <class Port_Class, class... Arguments>
void Adapter::makePorts(uint32 count, const Arguments&... arguments) {
    for (uint32 index = 0; index < count; ++index) {
        const auto make_port = [&] {
            ports.push_back(std::make_unique<Port_Class>(*this, index, arguments...));
        };
        if (!run_guarded(make_port))
            portFailed(index);
    }
}

} // namespace cimple

#endif // DEVICE_ADAPTER_H
