// The parameters of a driver: the table that may be too small, what is told of a failure, and what
// a change asks of the library.
#include "operations/method_wrapper.h"
#include "tests/device/log_capture.h"
#include "tests/operations/fake_bound.h"

#include <algorithm>
#include <cstring>
#include <gtest/gtest.h>

using namespace cimple;

namespace {

constexpr const char* PORT = "100002564C000001";

struct Answer {
    AX_STATUS status;
    uint32 count; // told
};

std::vector<Answer> answers;
std::vector<uint32> rooms; // of the calls
bool asked_global;
std::vector<std::string> changes; // asked of the library, "text control"

AX_STATUS answer(AX_DriverParam* table, uint32_t* count) {
    rooms.push_back(*count);
    if (rooms.size() > answers.size())
        return AX_STATUS_ERROR;
    const Answer& now = answers[rooms.size() - 1];
    for (uint32 i = 0; now.status == AX_STATUS_OK && i < now.count && i < *count; ++i)
        table[i].current = i;
    *count = now.count;
    return now.status;
}

class Driver_Parameters : public testing::Test {
protected:
    void SetUp() override {
        fake = Fake_Bound();
        log_capture::take();
        rooms.clear();
        changes.clear();
    }
    AX_STATUS get(bool global, std::vector<Answer> wanted) {
        answers = std::move(wanted);
        rooms.clear();
        return VLN_MethodWrapper::FCoEGetDriverParam(PORT, global, &parameters);
    }

    std::vector<AX_DriverParam> parameters;
};

using Lines = std::vector<std::string>;

// Without those of the name's conversion.
Lines lines() {
    Lines all = log_capture::take();
    std::erase_if(all,
                  [](const std::string& line) { return line.find("river") == std::string::npos; });
    return all;
}

} // namespace

AX_STATUS AX_GetDriverParams(AX_WWN, AX_DriverParam* table, uint32_t* count) {
    asked_global = false;
    return answer(table, count);
}

AX_STATUS AX_GetDriverParamsGlobal(AX_WWN, AX_DriverParam* table, uint32_t* count) {
    asked_global = true;
    return answer(table, count);
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

TEST_F(Driver_Parameters, WhatIsTold) {
    EXPECT_EQ(get(true, {{AX_STATUS_OK, 2}}), AX_STATUS_OK);
    EXPECT_EQ(lines(),
              (Lines{"5:Entering VLN_MethodWrapper::FCoEGetDriverParam()",
                     "5:AX_GetDriverParamsGlobal: status=0", "5:number of driver parameters 2",
                     "5:Exiting VLN_MethodWrapper::FCoEGetDriverParam()"}));
    EXPECT_EQ(get(true, {{190, 0}}), 190u);
    EXPECT_EQ(lines(),
              (Lines{"5:Entering VLN_MethodWrapper::FCoEGetDriverParam()",
                     "5:AX_GetDriverParamsGlobal: status=190",
                     "3:ERROR: vlncimGetDriverParamsGlobal: AX_GetDriverParamsGlobal call failed "
                     "(b) (190)"}));
    EXPECT_EQ(get(true, {{7, 53}, {190, 0}}), 190u);
    EXPECT_EQ(lines(),
              (Lines{"5:Entering VLN_MethodWrapper::FCoEGetDriverParam()",
                     "5:AX_GetDriverParamsGlobal: status=7",
                     "3:ERROR: vlncimGetDriverParamsGlobal: AX_GetDriverParamsGlobal call failed "
                     "(a) (190)"}));
    EXPECT_EQ(get(false, {{190, 0}}), 190u);
    EXPECT_EQ(lines()[1], "5:AX_GetDriverParams: status=190");
}

TEST_F(Driver_Parameters, ABadNameCostsNoCall) {
    for (const char* name : {"", "10000256", "100002564C00000G"})
        EXPECT_EQ(VLN_MethodWrapper::FCoEGetDriverParam(name, false, &parameters), AX_STATUS_ERROR)
            << name;
    EXPECT_TRUE(rooms.empty());
}

TEST_F(Driver_Parameters, AChangeIsCheckedAndPutTogether) {
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
