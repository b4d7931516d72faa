// The SAN behind the played HBA API: units in a table, and commands whose outcomes a test scripts.
#ifndef TESTS_DEVICE_FAKE_SAN_H
#define TESTS_DEVICE_FAKE_SAN_H

#include "device/library/axapi.h"

#include <array>
#include <cstdint>
#include <deque>
#include <functional>
#include <string>
#include <vector>

enum Fake_Command { INQUIRY, SERIAL_PAGE, IDENTITY_PAGE, READ_CAPACITY, FAKE_COMMANDS };

struct Fake_Unit {
    HBA_FCPSCSIENTRY entry{};
    std::array<std::string, FAKE_COMMANDS> responses;
    std::array<std::deque<HBA_STATUS>, FAKE_COMMANDS>
        status; // of the coming commands; then success
    std::string sense;
};

struct Fake_San {
    std::deque<Fake_Unit> units;
    std::deque<HBA_STATUS> mappingStatus; // of the coming calls; then by the room that there is
    // Has the last word on the count that a mapping call reports.
    std::function<void(HBA_UINT32& entries)> onMapping;
    std::vector<HBA_UINT32> rooms;      // that the mapping calls offered
    std::vector<Fake_Command> commands; // as sent

    Fake_Unit& add(uint64_t lun);
};

extern Fake_San fake_san;

// A unit's answers as a disk gives them.
std::string standard_inquiry(uint8_t type, const char* vendor, const char* product,
                             const char* revision);
std::string identity_page(uint8_t length, const std::string& identifier);

#endif // TESTS_DEVICE_FAKE_SAN_H
