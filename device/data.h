// The device model: the provider's picture of the adapters in the host.
//
// It is rebuilt from nothing at every refresh. It takes no lock: all operations are called, and all
// that they hand out is used, with the agent's data lock held.
#ifndef DEVICE_DATA_H
#define DEVICE_DATA_H

#include "device/adapter.h"

#include <memory>
#include <vector>

namespace cimple {

class VLN_Data {
public:
    VLN_Data();
    ~VLN_Data();
    VLN_Data(const VLN_Data&) = delete;
    VLN_Data& operator=(const VLN_Data&) = delete;

    // Scans the host. No adapters at all is no error, but takes two seconds: a driver that is still
    // starting gets the time to show its first NIC function.
    void buildAdapterData();
    // Finds anew what the adapters see in the SAN: SCSI traffic, which may take long. An adapter
    // that fails is logged and passed over.
    void buildSANData();
    // Leaves the object empty and reusable.
    void freeAllData();

    std::vector<std::unique_ptr<Adapter>> adapters; // in order of creation
    bool hasFCAdapter = false;
    bool hasNICAdapter = false;
    bool hasFCoEAdapter = false;
    bool hasISCSIAdapter = false;
    // Counts a failing adapter down without having counted it up, so it may be less than the list
    // holds, or negative. That is meant: only 0 makes the scan go on.
    sint32 adapterCount = 0;
    // Of the scan that this picture is from, or is to be from: the first is 1.
    uint32 scanNumber = 0;

private:
    struct Scan;
    void keepLastPass(std::size_t earlierPasses);
    bool listInstances(Scan& scan);
    void takeInstances(Scan& scan);
    bool readRecord(Scan& scan, uint32 index, LocalHBAInfoV4& info);
    void createAdapter(const HBAIdentifier& identifier, uint32 index, const LocalHBAInfoV4& info);
    std::unique_ptr<Adapter> makeAdapter(const HBAIdentifier& identifier, uint32 index,
                                         const LocalHBAInfoV4& info);
};

} // namespace cimple

#endif // DEVICE_DATA_H
