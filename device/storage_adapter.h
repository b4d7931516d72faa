// What the iSCSI and the FCoE kind of adapter and port have in common.
#ifndef DEVICE_STORAGE_ADAPTER_H
#define DEVICE_STORAGE_ADAPTER_H

#include "device/adapter.h"

namespace cimple {

class Storage_Adapter : public Adapter {
public:
    // The adapter's name in the HBA API, by which it is opened there.
    const std::string& getHbaAdapterName() const { return hbaAdapterName; }

protected:
    using Adapter::Adapter;
    std::string hbaAdapterName;
};

class Storage_Port : public Port {
public:
    const std::string& getNodeName() const { return nodeName; }

protected:
    Storage_Port(Adapter& owner, uint32 index, std::unique_ptr<StoragePortAttributes> read)
        : Port(owner, index), nodeName(read->NodeWWN) {
        portName = read->PortWWN;
        attributes = std::move(read);
    }
    std::string nodeName; // 16 upper-case digits
};

} // namespace cimple

#endif // DEVICE_STORAGE_ADAPTER_H
