// The parameters of a driver: the table that may be too small, and what is told of a failure.
#include "operations/method_wrapper.h"
#include "tests/device/log_capture.h"
#include "tests/operations/fake_bound.h"

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
