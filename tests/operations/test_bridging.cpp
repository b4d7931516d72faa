// Bridging: the parameters that no console sets, and what the library is told of each.
#include "operations/method_wrapper.h"
#include "tests/device/log_capture.h"
#include "tests/operations/fake_bound.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstring>

using namespace cimple;

namespace {

AX_CEE_Params record;
std::string told; // to the library: the call, and the words that it changes

template <class Record>
AX_STATUS tell(const char* call, const Record* words) {
    told = call;
    sint32 word = 0;
    for (std::size_t at = 0; at < sizeof *words; at += sizeof word) {
        std::memcpy(&word, reinterpret_cast<const char*>(words) + at, sizeof word);
        told += " " + std::to_string(word);
    }
    return AX_STATUS_OK;
}

bool logged(const std::vector<std::string>& log, const std::string& line) {
    return std::any_of(log.begin(), log.end(), [&](const std::string& each) {
        return each.find(line) != std::string::npos;
    });
}

TEST(Bridging_Operations, OneWordOfARecordIsChanged) {
    fake = {};
    fake.features = {{403, 1}, {440, 1}};
    record = {};
    record.configured.pfc.enabled = 1;
    record.lldp.txState = 1;
    const struct {
        const char* name;
        const char* value;
        AX_STATUS status;
        const char* told;
        const char* line;
    } rows[] = {
        {"DCBXMode", "1", 0, "dcbx -1 1", "Please reboot to activate the new setting."},
        {"dcbxstate", "1", 0, "dcbx 1 -1", "DCB parameter successfully set."},
        {"rxstate", "0", 0, "lldp -1 0 -1 -1 -1 -1", "DCB parameter successfully set."},
        {"pfcenable", "0", 0, "pfc 0 -1 -1 -1", "DCB parameter successfully set."},
        {"pfcpriority", "3, 4", 0, "pfc -1 -1 -1 24", "DCB parameter successfully set."},
        {"pfcpriority", " - ", 0, "pfc -1 -1 -1 0", "DCB parameter successfully set."},
        {"pfcpriority", "8", 4, "", "Entering"},
        {"pgwilling", "1", 4, "", "Invalid parameter name"},
        {"txsysname", "2", 4, "", "Entering"},
        {nullptr, "1", 4, "", "Entering"},
    };
    constexpr HBA_WWN NAME{};
    for (const auto& row : rows) {
        told.clear();
        log_capture::take();
        EXPECT_EQ(VLN_MethodWrapper::vlncimSetCEEParams(&NAME, row.name, row.value, true),
                  row.status);
        EXPECT_EQ(told, row.told);
        EXPECT_TRUE(logged(log_capture::take(), row.line)) << row.line;
    }
    EXPECT_EQ(VLN_MethodWrapper::SetPfcThrottle(nullptr, 2), 1u);
    EXPECT_TRUE(logged(log_capture::take(), "ERROR: Bad value for PFC Throttle!"));
}

} // namespace

AX_STATUS AX_CNA_GetCEE_Params(AX_WWN, AX_CEE_Params* params) {
    *params = record;
    return AX_STATUS_OK;
}
AX_STATUS AX_CNA_SetDcbxPortVars(AX_WWN, const AX_DcbxPortVars* vars) {
    return tell("dcbx", vars);
}
AX_STATUS AX_CNA_SetLldp(AX_WWN, const AX_Lldp* lldp) {
    return tell("lldp", lldp);
}
AX_STATUS AX_CNA_SetPFC(AX_WWN, const AX_PFC* pfc) {
    return tell("pfc", pfc);
}

// Not asked here.
#define NOT_ASKED(name, ...)                                                                       \
    AX_STATUS name(__VA_ARGS__) {                                                                  \
        return AX_STATUS_NOT_SUPPORTED;                                                            \
    }
NOT_ASKED(AX_CNA_GetPGPriorityBitmaps, AX_WWN, AX_PGPriorityBitmaps*)
NOT_ASKED(AX_CNA_SetPGPriorityBitmaps, AX_WWN, const AX_PGPriorityBitmaps*)
NOT_ASKED(AX_CNA_SetPGPriorityBitmapsExt, AX_WWN, const AX_PGPriorityBitmapsExt*)
NOT_ASKED(AX_CNA_SetPGBandwidth, AX_WWN, const AX_PGBandwidth*)
NOT_ASKED(AX_CNA_GetTLV, AX_WWN, AX_ApplicationTable*)
NOT_ASKED(AX_CNA_SetTLV, AX_WWN, const AX_ApplicationTable*)
NOT_ASKED(AX_SetAdapterAttribute, AX_WWN, uint32_t, const void*, uint32_t)
