// The units that a target tells a virtual port of: lists of lengths that no careful target tells,
// and check conditions.
#include "operations/method_wrapper.h"
#include "tests/device/log_capture.h"
#include "tests/operations/fake_bound.h"

#include <algorithm>
#include <cstring>
#include <gtest/gtest.h>

using namespace cimple;

namespace {

constexpr AX_STATUS CHECK = AX_STATUS_CHECK_CONDITION;

struct Answer {
    uint32 length; // of the list in bytes, as it is told
    AX_STATUS status = AX_STATUS_OK;
};
std::vector<Answer> answers;                               // of each call; the last one goes on
std::vector<uint32> sizes;                                 // that the calls had room for
const uint8 LUNS[][2] = {{0, 7}, {0x41, 0x2C}, {0x40, 0}}; // of SAM: 7, flat space 300 and 0

} // namespace

AX_STATUS AX_VpScsiReportLUNs(AX_WWN, AX_WWN, AX_WWN, void* response, uint32_t size, void*,
                              uint32_t) {
    sizes.push_back(size);
    const Answer answer = answers.front();
    if (answers.size() > 1)
        answers.erase(answers.begin());
    auto* bytes = static_cast<uint8*>(response);
    for (int i = 0; i < 4; ++i)
        bytes[i] = static_cast<uint8>(answer.length >> (24 - 8 * i));
    for (uint32 i = 0; 8 * i + 16 <= size && i < std::size(LUNS); ++i)
        std::memcpy(bytes + 8 + 8 * i, LUNS[i], sizeof LUNS[i]);
    return answer.status;
}
AX_STATUS AX_VPGetAttributes(AX_WWN, AX_WWN, AX_VPortAttributes*) {
    return AX_STATUS_ERROR;
}
AX_STATUS AX_VPListTargets(AX_WWN, AX_WWN, AX_VPortTargetList*) {
    return AX_STATUS_ERROR;
}
AX_STATUS AX_VpScsiInquiry(AX_WWN, AX_WWN, AX_WWN, uint64_t, uint32_t, uint32_t, void*, uint32_t,
                           void*, uint32_t) {
    return AX_STATUS_ERROR;
}
AX_STATUS AX_VpScsiReadCapacity(AX_WWN, AX_WWN, AX_WWN, uint64_t, void*, uint32_t, void*,
                                uint32_t) {
    return AX_STATUS_ERROR;
}
AX_STATUS AX_GetVMFromVPort(AX_WWN, AX_WWN, AX_VM*) {
    return AX_STATUS_ERROR;
}
AX_STATUS AX_GetVMInfo(const AX_VM*, AX_VMInfo*) {
    return AX_STATUS_ERROR;
}

TEST(Virtual_Ports, AListOfUnitsIsReadAsFarAsItIsOne) {
    const struct {
        const char* what;
        std::vector<Answer> answers;
        AX_STATUS status;
        std::size_t luns;
        std::vector<uint32> sizes;
    } rows[] = {
        {"none", {{0}}, AX_STATUS_OK, 0, {520}},
        {"three", {{24}}, AX_STATUS_OK, 3, {520}},
        {"a piece of a fourth", {{31}}, AX_STATUS_OK, 3, {520}},
        {"all that there is room for", {{512}}, AX_STATUS_OK, 64, {520}},
        {"one more", {{520}}, AX_STATUS_OK, 65, {520, 528}},
        {"more each time", {{520}, {528}}, AX_STATUS_MORE_DATA, 0, {520, 528}},
        {"fewer the second time", {{800}, {8}}, AX_STATUS_OK, 1, {520, 808}},
        {"what nobody has", {{0xFFFFFFFF}}, AX_STATUS_ERROR, 0, {520}},
        {"two attentions", {{24, CHECK}, {24, CHECK}, {24}}, AX_STATUS_OK, 3, {520, 520, 520}},
        {"attention for ever", {{24, CHECK}}, CHECK, 0, {520, 520, 520}},
        {"no answer", {{24, 190}}, 190, 0, {520}},
    };
    const HBA_WWN name{};
    for (const auto& row : rows) {
        answers = row.answers;
        sizes.clear();
        std::vector<uint32> luns = {1};
        EXPECT_EQ(VLN_MethodWrapper::ListVPortLuns(&name, &name, AX_NAME{}, &luns), row.status)
            << row.what;
        EXPECT_EQ(luns.size(), row.luns) << row.what;
        EXPECT_EQ(sizes, row.sizes) << row.what;
        if (luns.size() == 3) {
            EXPECT_EQ(luns, (std::vector<uint32>{7, 300, 0})) << row.what;
        }
    }
    log_capture::take();
}
