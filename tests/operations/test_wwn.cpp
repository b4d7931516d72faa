// World Wide Names: the search for duplicates, over lists that no careful library gives.
#include "cimple/thread.h"
#include "operations/method_wrapper.h"
#include "tests/device/log_capture.h"
#include "tests/operations/fake_bound.h"

#include <cstring>
#include <gtest/gtest.h>

using namespace cimple;

namespace {

std::vector<uint8_t> adapters;     // the last byte of each name, by index; 0: does not answer
std::vector<uint8_t> asked;        // adapters for their virtual ports
std::vector<uint32_t> told_counts; // of each call for a list; the last one goes on

HBA_WWN name_of(uint8_t last) {
    return {{0x20, 0, 0, 0, 0, 0, 0, last}};
}

} // namespace

void cimple::Time::sleep(uint64, const bool&) {}

uint32_t AX_GetNumberOfLocalAdapters(void) {
    return static_cast<uint32_t>(adapters.size());
}
AX_STATUS AX_GetLocalHBAInfo(uint32_t index, AX_LocalHBAInfo* info) {
    info->portWWN[7] = adapters.at(index);
    return adapters[index] ? AX_STATUS_OK : AX_STATUS_ERROR;
}
// Fills all the room that it is told of: entry i has the name of i + 1.
AX_STATUS AX_VPList(AX_WWN wwn, AX_VPortList* list) {
    asked.push_back(static_cast<uint8_t>(wwn.word[1] >> 24));
    AX_VPort* entry = list->entry;
    for (uint32_t i = 0; i < list->count; ++i) {
        const HBA_WWN name = name_of(static_cast<uint8_t>(i + 1));
        std::memcpy((entry + i)->wwpn.byte, name.wwn, sizeof name.wwn);
    }
    const uint32_t room = list->count;
    list->count = told_counts.front();
    if (told_counts.size() > 1) {
        told_counts.erase(told_counts.begin());
        return AX_STATUS_MORE_DATA;
    }
    return list->count > 0 || room ? AX_STATUS_OK : AX_STATUS_ERROR;
}
AX_STATUS AX_ValidateWwn(AX_WWN) {
    return AX_STATUS_OK;
}
AX_STATUS AX_GetWWNCapability(AX_WWN, uint32_t*) {
    return AX_STATUS_ERROR;
}
AX_STATUS AX_ReadWWN(AX_WWN, uint32_t, AX_NAME*, AX_NAME*, uint32_t*) {
    return AX_STATUS_ERROR;
}
AX_STATUS AX_ChangeWWN(AX_WWN, AX_WWN, AX_WWN, uint32_t, uint32_t*) {
    throw 1;
}
AX_STATUS AX_RestoreWWN(AX_WWN, uint32_t, uint32_t*) {
    throw 1;
}

namespace {

TEST(Wwn_Operations, EntriesAreSearchedAsFarAsThereAreAny) {
    const struct {
        const char* what;
        std::vector<uint32_t> counts;
        uint8_t wanted;
        bool found;
    } rows[] = {
        {"one entry", {1}, 1, true},
        {"no entry, though one is written", {0}, 1, false},
        {"more entries told than there is room for", {1023}, 1, true},
        {"and none beyond the room", {1023}, 2, false},
        {"too many to be searched", {1024}, 1, false},
        {"three, with a second call", {3, 3}, 3, true},
        {"the second call tells more than it had room for", {3, 900}, 3, true},
        {"and none beyond that room", {3, 900}, 4, false},
        {"the whole of what is searched", {1023, 1023}, 200, true},
        {"a list of no sane size", {0xFFFFFFFF, 1}, 1, false},
    };
    const HBA_WWN other = name_of(255);
    for (const auto& row : rows) {
        adapters = {9};
        const HBA_WWN wanted = name_of(row.wanted);
        told_counts = row.counts;
        EXPECT_EQ(VLN_MethodWrapper::FindDuplicateWWN(&wanted, &other) != 0, row.found) << row.what;
        told_counts = row.counts;
        EXPECT_EQ(VLN_MethodWrapper::FindDuplicateWWN(&other, &wanted) != 0, row.found) << row.what;
    }
}

TEST(Wwn_Operations, EachAdapterThatAnswersIsAskedOnce) {
    adapters = {5, 0, 6, 5, 6, 7};
    asked.clear();
    told_counts = {0};
    const HBA_WWN name = name_of(1);
    EXPECT_EQ(VLN_MethodWrapper::FindDuplicateWWN(&name, &name), VLN_MethodWrapper::WWN_UNIQUE);
    EXPECT_EQ(asked, (std::vector<uint8_t>{5, 6, 7}));
}

TEST(Wwn_Operations, WhatTheLibraryThrowsIsAFailure) {
    const HBA_WWN name = name_of(1);
    uint32 activation = 0;
    bool stop = false;
    log_capture::take();
    EXPECT_EQ(VLN_MethodWrapper::ChangeWWN(&name, &name, &name, 0, &activation, stop), 1u);
    EXPECT_EQ(VLN_MethodWrapper::RestoreWWN(&name, 0, &activation, stop), 1u);
    std::string log;
    for (const std::string& line : log_capture::take())
        log += line + "\n";
    EXPECT_NE(log.find("Error in AX_ChangeWWN"), std::string::npos);
    EXPECT_NE(log.find("Error in RestoreWWN"), std::string::npos);
}

} // namespace
