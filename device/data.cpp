#include "device/data.h"

#include "cimple/guard.h"
#include "cimple/thread.h"
#include "device/fcoe_adapter.h"
#include "device/iscsi_adapter.h"
#include "device/nic_adapter.h"
#include "device/scan_end.h"
#include "foundation/log.h"

#include <algorithm>
#include <cstdio>
#include <cstring>
#include <new>

namespace cimple {

namespace {

constexpr uint32 NIC_FUNCTIONS = AX_FEATURE_NIC_FUNCTION | AX_FEATURE_NIC_FUNCTION_TOO;
constexpr uint32 KNOWN_FUNCTIONS =
    NIC_FUNCTIONS | AX_FEATURE_ISCSI_FUNCTION | AX_FEATURE_FCOE_FUNCTION;

constexpr int MOST_SLEEPS = 2; // so there are three looks at a host without a NIC function
constexpr uint64 SLEEP_USEC = 1000000;

// More functions than any host has: a greater count is a library gone wrong.
constexpr uint32 MOST_INSTANCES = 4096;

// Adapters that keep failing, or vanish once seen, would have the scan start over without end,
// under the data lock. It is given this many passes.
constexpr int MOST_PASSES = 8;

} // namespace

// What the passes of one scan share.
struct VLN_Data::Scan {
    HBAIdentifier identifier{};
    uint32 count = 1; // room asked for; the library answers with what it has or needs
    uint32 room = 0;  // of the table
    std::unique_ptr<uint32[]> table;
    bool nicSeen = false;
    int sleeps = 0;
    int passes = 0;
    std::size_t earlierPasses = 0; // adapters that stood when this pass began

    // A zeroed table of `count` words. False without memory, or for a count that cannot be.
    bool makeTable();
    // Makes the count that the library told the number of instances.
    void takeCount();
};

bool VLN_Data::Scan::makeTable() {
    table.reset();
    if (count > MOST_INSTANCES) {
        VLN_LOG(VLN_ERR, "ERROR: AX_GetAllLocalHBAInstances reports %u instances", count);
        count = 1;
        return false;
    }
    table.reset(new (std::nothrow) uint32[count]());
    room = count;
    return table != nullptr;
}

void VLN_Data::Scan::takeCount() {
    if (count > room) {
        VLN_LOG(VLN_ERR, "ERROR: AX_GetAllLocalHBAInstances reports %u instances in %u words",
                count, room);
        count = room;
    }
    identifier.instanceCount = count;
}

VLN_Data::VLN_Data() {
    HBA_LoadLibrary();
    VLN_LOG(VLN_DBG, "Data Pointer Constructed.");
}

VLN_Data::~VLN_Data() {
    freeAllData();
    VLN_LOG(VLN_DBG, "Data Pointer deleted.");
}

void VLN_Data::freeAllData() {
    VLN_LOG(VLN_DBG, "freeAllData: Entry");
    for (std::unique_ptr<Adapter>& adapter : adapters) {
        VLN_LOG(VLN_DBG, "Freeing adapter: %s", adapter->getAdapterName().c_str());
        delete_guarded(adapter, "Error in freeAllData -- do nothing");
    }
    adapters.clear();
    hasFCAdapter = hasNICAdapter = hasFCoEAdapter = hasISCSIAdapter = false;
    adapterCount = 0;
    VLN_LOG(VLN_DBG, "freeAllData: cleanExit");
}

// The first pass only looks for an instance with the NIC function; the adapters are made by a pass
// after that. A NIC function that shows up in the last look comes too late, and that is meant.
void VLN_Data::buildAdapterData() {
    VLN_LOG(VLN_DBG, "buildAdapterData");
    ++scanNumber;
    freeAllData();
    Scan scan;
    while (adapterCount == 0 && !scan_is_to_end) {
        if (++scan.passes > MOST_PASSES) {
            keepLastPass(scan.earlierPasses);
            VLN_LOG(VLN_ERR, "ERROR: no end to the adapter scan, given up with %zu adapters",
                    adapters.size());
            return;
        }
        scan.earlierPasses = adapters.size();
        if (listInstances(scan))
            takeInstances(scan);
        scan.table.reset();
        if (scan.sleeps == MOST_SLEEPS)
            return;
        if (scan.nicSeen)
            continue;
        Time::sleep(SLEEP_USEC);
        ++scan.sleeps;
    }
}

// Each pass made the same adapters again.
void VLN_Data::keepLastPass(std::size_t earlierPasses) {
    adapters.erase(adapters.begin(), adapters.begin() + static_cast<std::ptrdiff_t>(earlierPasses));
    const auto has = [this](uint32 type) {
        return std::any_of(adapters.begin(), adapters.end(), [type](const auto& adapter) {
            return adapter->getAdapterType() == type;
        });
    };
    hasNICAdapter = has(ADAPTER_NIC);
    hasFCoEAdapter = has(ADAPTER_FCOE);
    hasISCSIAdapter = has(ADAPTER_ISCSI);
}

void VLN_Data::buildSANData() {
    VLN_LOG(VLN_DBG, "buildSANData");
    for (const std::unique_ptr<Adapter>& adapter : adapters) {
        const bool complete = run_guarded([&] {
            VLN_LOG(VLN_DBG, "Target Scan from adapter: %s", adapter->getAdapterName().c_str());
            adapter->rescanTargets();
        });
        if (!complete)
            VLN_LOG(VLN_ERR, "Issue with Target Rescan with Adapter- moving to the next adapter");
    }
}

// False if there is no memory for the table. A failing call leaves the number of instances as the
// pass before found it.
bool VLN_Data::listInstances(Scan& scan) {
    if (!scan.makeTable())
        return false;
    VLN_LOG(VLN_DBG, "Invoking AX_GetAllLocalHBAInstances.");
    AX_STATUS status = AX_GetAllLocalHBAInstances(&scan.count, scan.table.get());
    if (status == AX_STATUS_MORE_DATA) {
        if (!scan.makeTable())
            return false;
        status = AX_GetAllLocalHBAInstances(&scan.count, scan.table.get());
        if (status != AX_STATUS_OK) {
            VLN_LOG(VLN_CRIT, "ERROR: AX_GetAllLocalHBAInstances failed errorcode = %d", status);
        } else {
            scan.takeCount();
            VLN_LOG(VLN_DBG, "Number of Adapters detected = %d", scan.identifier.instanceCount);
        }
    } else if (status != AX_STATUS_OK) {
        VLN_LOG(VLN_CRIT, "ERROR: AX_GetAllLocalHBAInstances failed (2). status = %d", status);
    } else {
        scan.takeCount();
    }
    return true;
}

void VLN_Data::takeInstances(Scan& scan) {
    // The number of instances may be an earlier pass's, the table never is.
    const uint32 instances = std::min(scan.identifier.instanceCount, scan.room);
    for (uint32 index = 0; index < instances; ++index) {
        LocalHBAInfoV4 info{};
        if (!readRecord(scan, index, info) || !(info.SpecialFeatures & KNOWN_FUNCTIONS))
            continue;
        if (scan.nicSeen) {
            createAdapter(scan.identifier, index, info);
        } else if (info.SpecialFeatures & AX_FEATURE_NIC_FUNCTION) {
            scan.nicSeen = true;
            return;
        }
    }
}

bool VLN_Data::readRecord(Scan& scan, uint32 index, LocalHBAInfoV4& info) {
    scan.identifier.instance = scan.table[index];
    AX_STATUS status = AX_GetLocalHBAInfoV4(&scan.identifier, &info);
    if (status == AX_STATUS_OK)
        return true;
    if (status != AX_STATUS_NOT_ANSWERING)
        VLN_LOG(VLN_DBG, "ERROR: AX_GetLocalHBAInfoV4 failed for adapter %d. status = %d", index,
                status);

    LocalHBAInfoV3 older{};
    status = AX_GetLocalHBAInfoV3(&scan.identifier, &older);
    if (status == AX_STATUS_OK) {
        std::memcpy(&info, &older, sizeof older);
        return true;
    }
    if (status != AX_STATUS_NOT_ANSWERING)
        VLN_LOG(VLN_DBG, "ERROR: AX_GetLocalHBAInfoV3 failed for adapter %d. status = %d", index,
                status);
    return false;
}

void VLN_Data::createAdapter(const HBAIdentifier& identifier, uint32 index,
                             const LocalHBAInfoV4& info) {
    const bool complete = run_guarded([&] {
        const uint8* wwn = info.portWWN;
        VLN_LOG(VLN_DBG, "NIC/FCoE/iSCSI PortWWN : [%02X-%02X-%02X-%02X-%02X-%02X-%02X-%02X]",
                wwn[0], wwn[1], wwn[2], wwn[3], wwn[4], wwn[5], wwn[6], wwn[7]);
        adapters.push_back(makeAdapter(identifier, index, info));
        ++adapterCount;
    });
    if (!complete) {
        VLN_LOG(VLN_ERR, "Catch ALL error during creating adapter..., Skipping Adapter# %d", index);
        --adapterCount;
    }
}

// The order of the tests decides what a function of several kinds becomes.
std::unique_ptr<Adapter> VLN_Data::makeAdapter(const HBAIdentifier& identifier, uint32 index,
                                               const LocalHBAInfoV4& info) {
    char name[256];
    std::snprintf(name, sizeof name, "Vorlan %.*s-%02X", static_cast<int>(sizeof info.model),
                  info.model, info.subAdapterNumber);
    std::unique_ptr<Adapter> adapter;
    if (info.SpecialFeatures & NIC_FUNCTIONS) {
        VLN_LOG(VLN_DBG, "Got NIC adapter %d", index);
        adapter = std::make_unique<NICAdapter>(name, index, identifier, info);
        hasNICAdapter = true;
    } else if (info.SpecialFeatures & AX_FEATURE_ISCSI_FUNCTION) {
        VLN_LOG(VLN_DBG, "Got ISCSI adapter %d", index);
        adapter = std::make_unique<iSCSIAdapter>(name, index, identifier, info);
        hasISCSIAdapter = true;
    } else {
        VLN_LOG(VLN_DBG, "Got FCOE adapter %d", index);
        adapter = std::make_unique<FCoEAdapter>(name, index, identifier, info);
        hasFCoEAdapter = true;
    }
    return adapter;
}

} // namespace cimple
