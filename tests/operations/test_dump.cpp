// Dumps: what no service asks for, and lists that cannot be right.
#include "operations/method_wrapper.h"
#include "tests/device/log_capture.h"
#include "tests/operations/fake_bound.h"

#include <cstring>
#include <gtest/gtest.h>

using namespace cimple;

namespace {

AX_STATUS answer = AX_STATUS_OK;
uint32 told_capacity, told_count; // of the event log

bool logged(const std::string& line) {
    for (const std::string& each : log_capture::take())
        if (each.find(line) != std::string::npos)
            return true;
    return false;
}

constexpr HBA_WWN NAME{};

TEST(Dump_Operations, EachRefusalOfADirectoryHasItsWords) {
    const struct {
        AX_STATUS status;
        const char* line;
    } rows[] = {
        {27, "The specified directory [' / vmfs / volumes / %s'] cannot be opened"},
        {160, "The configuration file could not be opened"},
        {178, "The configuration file could not be opened"},
        {5, "with error code : 5"},
    };
    for (const auto& row : rows) {
        answer = row.status;
        log_capture::take();
        EXPECT_EQ(VLN_MethodWrapper::vlncimSetDumpDirectory(&NAME, "%s"), row.status);
        EXPECT_TRUE(logged(row.line)) << row.line;
    }
    answer = AX_STATUS_OK;
    EXPECT_EQ(VLN_MethodWrapper::vlncimSetDumpDirectory(&NAME, "d"), AX_STATUS_OK);
    EXPECT_EQ(VLN_MethodWrapper::vlncimSetDumpDirectory(&NAME, nullptr), 4u);
    EXPECT_EQ(VLN_MethodWrapper::vlncimGetCoreDump(&NAME, nullptr), 4u);
}

// The library's own room is no measure for the buffer's.
TEST(Dump_Operations, MoreModulesThanThereIsRoomForAreNone) {
    for (const auto& [capacity, count] : {std::pair{32u, 33u}, {2u, 3u}, {1000u, 1000u}}) {
        told_capacity = capacity;
        told_count = count;
        log_capture::take();
        VLN_EventLogSettings settings;
        EXPECT_EQ(VLN_MethodWrapper::GetExtFATAdvancedData(&NAME, &settings), 1u);
        EXPECT_TRUE(logged("call failed, with error code : 0, Invalid number")) << count;
        EXPECT_TRUE(settings.modules.empty());
    }
    told_capacity = told_count = 32;
    VLN_EventLogSettings settings;
    EXPECT_EQ(VLN_MethodWrapper::GetExtFATAdvancedData(&NAME, &settings), 0u);
    EXPECT_EQ(settings.modules.size(), 32u);
}

TEST(Dump_Operations, AModuleAModeAndALevelAreNeeded) {
    answer = AX_STATUS_OK;
    const AX_EventLogMode good{1, 255, 0, 0}, too_high{1, 256, 0, 0};
    const auto set = [](const char* module, uint32 modes, const AX_EventLogMode& values) {
        return VLN_MethodWrapper::SetExtFATAdvancedData(&NAME, module, modes, values);
    };
    EXPECT_EQ(set("m", 15, good), 0u);
    EXPECT_EQ(set("m", 16, good), 1u);
    EXPECT_EQ(set("m", 0, good), 1u);
    EXPECT_EQ(set("m", 1, too_high), 1u);
    EXPECT_EQ(set("", 1, good), 1u);
    EXPECT_EQ(set(nullptr, 1, good), 1u);
}

} // namespace

AX_STATUS AX_SetDumpDirectory(AX_WWN, const char*) {
    return answer;
}
AX_STATUS AX_Get_DX_EventLogConfigDataAll(AX_WWN, AX_EventLogConfig* config) {
    config->capacity = told_capacity;
    config->moduleCount = told_count;
    return AX_STATUS_OK;
}
AX_STATUS AX_Set_DX_EventLogConfigDataModule(AX_WWN, const char*, uint32_t, uint32_t, uint32_t,
                                             uint32_t) {
    return answer;
}

// Not asked here.
#define NOT_ASKED(name, ...)                                                                       \
    AX_STATUS name(__VA_ARGS__) {                                                                  \
        return AX_STATUS_NOT_SUPPORTED;                                                            \
    }
NOT_ASKED(AX_Set_DX_EventLogTraceLevel, AX_WWN, uint32_t, uint32_t, uint32_t, uint32_t, uint32_t)
NOT_ASKED(AX_Set_DX_DefaultLoggingConfig, AX_WWN)
NOT_ASKED(AX_SetDebugTraces, uint32_t, uint32_t)
NOT_ASKED(AX_GenerateDump, uint32_t, uint32_t, AX_WWN)
NOT_ASKED(AX_GenerateEfdDump, AX_WWN, int32_t, uint32_t)
NOT_ASKED(AX_GenerateCoreDump, AX_WWN, const char*)
NOT_ASKED(AX_RetrieveFATDump, void)
NOT_ASKED(AX_RetrieveFATDump2, AX_WWN)
NOT_ASKED(AX_GetDumpDirectoryA, AX_WWN, char*, uint32_t)
NOT_ASKED(AX_GetDumpRetentionCount, AX_WWN, uint32_t*)
NOT_ASKED(AX_SetDumpRetentionCount, AX_WWN, uint32_t)
NOT_ASKED(AX_GetDumpFileNames, AX_WWN, AX_DumpFileList*)
NOT_ASKED(AX_DeleteDumpFiles, AX_WWN)
NOT_ASKED(AX_ListDeadNicPorts, AX_DeadNicPortList*)
