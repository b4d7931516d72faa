// A port of an adapter: its name, its attributes, its counters and what it sees in the SAN.
//
// Ports are read and their statistics refreshed under the agent's data lock only; pointers that an
// accessor hands out are the port's and live no longer than it does.
#ifndef DEVICE_PORT_H
#define DEVICE_PORT_H

#include "cimple/types.h"
#include "device/cleanup.h"
#include "device/port_attributes.h"
#include "device/port_statistics.h"
#include "device/target.h"

#include <memory>
#include <string>
#include <vector>

namespace cimple {

class Adapter;
class Target_Mapping;

using Target_List = std::vector<std::unique_ptr<Target>>;

class Port {
public:
    virtual ~Port() noexcept(false);

    virtual PortAttributes* getPortAttributes() { return attributes.get(); }
    // Fetches the counters anew. Throws std::exception if they cannot be read; the former ones
    // stay. Null for a kind of port that counts elsewhere.
    virtual PortStatistics* getPortStatistics() = 0;
    virtual Adapter* getAdapter() { return adapter; }
    virtual Target_List& getTargets() { return targets; }
    virtual Target* getTarget(uint32 index); // throws std::exception beyond the end
    virtual uint32 getTargetCount() { return static_cast<uint32>(targets.size()); }
    // Finds anew what the port sees in the SAN; `owner` is its adapter. Throws std::exception if
    // the adapter cannot be opened: then the port has no targets.
    virtual void rescanTargets(Adapter& owner) = 0;

    const std::string& getPortName() const { return portName; } // 16 upper-case digits
    uint32 getPortIndex() const { return portIndex; }

protected:
    Port(Adapter& owner, uint32 index) : portIndex(index), adapter(&owner) {}
    Port(const Port&) = delete;
    Port& operator=(const Port&) = delete;

    // Deletes the targets; a failure is logged and passed over.
    void dropTargets() noexcept;

    // Makes a target of each unit of the mapping. A unit that fails is logged and left out.
    void makeTargets(Adapter& owner, const Target_Mapping& mapping);

    // Deletes the attributes and the statistics; a failure is logged and passed over.
    void releaseOwned(const Cleanup_Texts& texts) noexcept;

    // Replaces the statistics by fresh ones. On an exception the former ones stay, `failure` is
    // logged, and the exception passes on.
    template <class Statistics>
    PortStatistics* refreshStatistics(const char* failure) {
        try {
            statistics = std::make_unique<Statistics>(portName);
        } catch (...) {
            VLN_LOG(VLN_ERR, "%s", failure);
            throw;
        }
        return statistics.get();
    }

    std::string portName;
    uint32 portIndex;
    std::unique_ptr<PortAttributes> attributes;
    std::unique_ptr<PortStatistics> statistics;
    Target_List targets;
    Adapter* adapter;
};

} // namespace cimple

#endif // DEVICE_PORT_H
