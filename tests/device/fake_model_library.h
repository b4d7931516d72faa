// The management library and the HBA API as the device model's tests play them: instances and
// adapters in tables that a test fills and spoils. It counts what is called.
#ifndef TESTS_DEVICE_FAKE_MODEL_LIBRARY_H
#define TESTS_DEVICE_FAKE_MODEL_LIBRARY_H

#include "device/library/axapi.h"

#include <array>
#include <cstdint>
#include <deque>
#include <functional>
#include <map>
#include <string>
#include <vector>

// Values by identifier, as bytes.
using Values = std::map<uint16_t, std::string>;

std::string number(uint32_t value);
std::string counter(uint64_t value);

struct Fake_Instance {
    LocalHBAInfoV4 info{};
    std::deque<AX_STATUS> v4, v3;           // of the coming calls; then success
    std::deque<AX_STATUS> adapterStatus;    // AX_GetHBAAttributes
    std::deque<AX_STATUS> portStatus;       // AX_GetPortAttributes
    std::deque<AX_STATUS> statisticsStatus; // AX_GetPortStatistics
    Values adapterValues, portValues, statistics;
    AX_STATUS driverTypeStatus = 0, initiatorStatus = 0, networkStatus = 0;
    AX_iSCSI_InitiatorProperties initiator{};
    AX_Ini_NetworkProperties network{};
};

struct Fake_Hba {
    std::string name;
    HBA_STATUS nameStatus = HBA_STATUS_OK;
    bool opens = true;
    std::deque<HBA_STATUS> attributesStatus, portStatus;
    HBA_ADAPTERATTRIBUTES attributes{};
    std::vector<HBA_PORTATTRIBUTES> ports;
};

// How the library answers one AX_GetAllLocalHBAInstances instead of by the table.
struct Fake_Listing {
    AX_STATUS status;
    uint32_t count;
};

struct Fake_Model_Library {
    std::deque<Fake_Instance> instances;
    std::deque<Fake_Hba> hbas;
    uint32_t hbaCount = UINT32_MAX; // as reported; by default the true one
    std::deque<Fake_Listing> listings;
    std::function<void(int)> onListing; // with the number of the call, from 1
    // Has the last word on a value that was found.
    std::function<void*(void* buffer, uint16_t identifier, void* value, uint16_t* length)> onValue;
    std::map<std::string, int> calls;
    std::vector<uint32_t> askedRecords;
    int openHandles = 0;

    // An instance with a name made of `low`, the functions, a model and values that succeed.
    Fake_Instance& add(uint8_t low, uint32_t features, const char* model = "VT1234");
    Fake_Hba& addHba(const char* name, uint8_t low);
};

extern Fake_Model_Library fake_library;

#endif // TESTS_DEVICE_FAKE_MODEL_LIBRARY_H
