// A change of a driver's parameter that no service asks for: what is wrong with it, and what it
// asks of the library.
#include "operations/method_wrapper.h"
#include "tests/device/log_capture.h"
#include "tests/operations/fake_bound.h"

#include <algorithm>
#include <cstring>
#include <gtest/gtest.h>

using namespace cimple;

namespace {

constexpr const char* PORT = "100002564C000001";

std::vector<std::string> changes; // asked of the library, "text control"

using Lines = std::vector<std::string>;

} // namespace

AX_STATUS AX_GetDriverParams(AX_WWN, AX_DriverParam*, uint32_t*) {
    return AX_STATUS_NOT_SUPPORTED;
}

AX_STATUS AX_GetDriverParamsGlobal(AX_WWN, AX_DriverParam*, uint32_t*) {
    return AX_STATUS_NOT_SUPPORTED;
}

AX_STATUS AX_SetDriverParam(AX_WWN, const char* text, uint32_t control) {
    changes.push_back(std::string(text) + " " + std::to_string(control));
    return AX_STATUS_OK;
}

AX_STATUS AX_SetOASLunState(AX_WWN, AX_WWN, AX_WWN, uint32_t, uint32_t, uint32_t) {
    return AX_STATUS_OK;
}

AX_STATUS AX_GetOASLunList(AX_WWN, uint32_t, AX_OASLunList*) {
    return AX_STATUS_NOT_SUPPORTED;
}

TEST(Driver_Parameters, ABadNameCostsNoCall) {
    std::vector<AX_DriverParam> parameters;
    for (const char* name : {"", "10000256", "100002564C00000G"})
        EXPECT_EQ(VLN_MethodWrapper::FCoEGetDriverParam(name, false, &parameters), AX_STATUS_ERROR)
            << name;
}

TEST(Driver_Parameters, AChangeIsCheckedAndPutTogether) {
    const std::string long_name(254, 'n');
    const struct {
        uint32 scope, duration;
        const char *name, *value;
        const char* line;   // of level 3, or none
        const char* change; // asked of the library, or none
    } rows[] = {
        {2, 0, "p", "1", "3:INVALID CW1", nullptr},
        {0, 2, "p", "1", "3:INVALID CW2", nullptr},
        {0, 0, nullptr, "1", "3:Null pointer assignment in argument pDriverParam", nullptr},
        {0, 0, "p", nullptr, "3:Null pointer assignment in argument pVal", nullptr},
        {0, 0, long_name.c_str(), "1", "3:The driver parameter's name and value are too long",
         nullptr},
        {0, 0, "p", "1", nullptr, "p=1 0"},
        {0, 1, "p", "-1", nullptr, "p=-1 1"},
        {1, 0, "", "2", nullptr, "=2 2"},
        {1, 1, long_name.c_str() + 1, "3", nullptr, "=3 3"},
    };
    const HBA_WWN port{};
    fake = Fake_Bound();
    for (const auto& row : rows) {
        changes.clear();
        log_capture::take();
        EXPECT_EQ(VLN_MethodWrapper::vlncimSetDriverParam(PORT, &port, row.scope, row.duration,
                                                          row.name, row.value),
                  row.line ? AX_STATUS_ERROR : AX_STATUS_OK);
        const Lines all = log_capture::take();
        EXPECT_EQ(std::count(all.begin(), all.end(), row.line ? row.line : ""), row.line ? 1 : 0);
        ASSERT_EQ(changes.size(), row.change ? 1u : 0u) << row.line;
        EXPECT_TRUE(changes.empty() || changes[0].ends_with(row.change)) << row.change;
    }
    fake.isLocal = 0;
    changes.clear();
    EXPECT_EQ(VLN_MethodWrapper::vlncimSetDriverParam(PORT, &port, 0, 0, "p", "1"), 1u);
    EXPECT_TRUE(changes.empty());
}
