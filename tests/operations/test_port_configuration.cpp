// How adapters are split: what no service asks for, and records that claim more than they have room
// for.
#include "operations/method_wrapper.h"
#include "tests/device/log_capture.h"
#include "tests/operations/fake_bound.h"

#include <cstring>
#include <gtest/gtest.h>

using namespace cimple;

namespace {

constexpr HBA_WWN NAME{};
constexpr uint32 PROFILE_MANAGEMENT = 436, CHANGE_PERSONALITY = 422, SRIOV = 35;

AX_AdapterPortConfig told; // by AX_GetAdapterPortConfig
uint32 told_channels, told_personalities, told_capabilities;
AX_STATUS refusal; // of what no service asks for
std::string calls; // those that set something

class Port_Configuration : public testing::Test {
protected:
    Port_Configuration() {
        fake = {};
        fake.features = {{PROFILE_MANAGEMENT, 1}, {SRIOV, 1}};
        told = {};
        told.portCount = 1;
        told.ariFunctionCount4 = 64;
        told.pid = 1;
        told.port[0].functionCount = 1;
        told.port[0].function[0].protocol = AX_PROTOCOL_NIC;
        told.port[0].function[0].flags = AX_FUNCTION_NIC;
        told_channels = told_personalities = told_capabilities = 0;
        refusal = AX_STATUS_OK;
        calls.clear();
        log_capture::take();
    }
    AX_STATUS set(VLN_MethodWrapper::NPAR_Update npar) {
        AX_AdapterPortConfig config = told;
        ets = true;
        return VLN_MethodWrapper::SetAdpaterPortConfig(&NAME, &config, &ets, npar);
    }
    static bool logged(const char* line) {
        for (const std::string& each : log_capture::take())
            if (each.find(line) != std::string::npos)
                return true;
        return false;
    }
    bool ets = false;
};

// The last of the profiles for NICs alone that has ETS.
TEST_F(Port_Configuration, WithoutSriovAProfileIsChosen) {
    fake.features[SRIOV] = 0;
    told.pid = 0;
    EXPECT_EQ(set(VLN_MethodWrapper::NPAR_STAYS), 0u);
    EXPECT_EQ(calls, "config 5, ");
    told.pid = 6;
    EXPECT_EQ(set(VLN_MethodWrapper::NPAR_STAYS), 4u);
    EXPECT_TRUE(logged("NIC ETS Disabled profile cannot be configured on operating systems that "
                       "do not support SRIOV"));
}

TEST_F(Port_Configuration, WithoutARecordThereIsNothingToDo) {
    EXPECT_EQ(VLN_MethodWrapper::SetAdpaterPortConfig(&NAME, nullptr, &ets,
                                                      VLN_MethodWrapper::NPAR_STAYS),
              4u);
    EXPECT_EQ(VLN_MethodWrapper::GetAdpaterPortConfig(&NAME, nullptr), 4u);
    EXPECT_EQ(VLN_MethodWrapper::ListProfiles(&NAME, nullptr), 4u);
    told_capabilities = 16;
    EXPECT_EQ(VLN_MethodWrapper::OrriganValidateParams(told, true, 16), 0u);
    told.port[0].function[0].protocol = AX_PROTOCOL_FCOE;
    EXPECT_EQ(VLN_MethodWrapper::OrriganValidateParams(told, true, 0), 4u);
    EXPECT_TRUE(logged("RoCE Enabled: 0, MC Enabled = 0, NIC Only = 0"));
}

TEST_F(Port_Configuration, WhatNoServiceAsksFor) {
    EXPECT_EQ(VLN_MethodWrapper::FactoryDefaults(&NAME), 0u);
    EXPECT_EQ(calls, "defaults, ");
    EXPECT_EQ(VLN_MethodWrapper::ChangeAdapterPersonality(&NAME, 2), 251u)
        << "its profiles tell what the adapter is";
    fake.features = {};
    EXPECT_EQ(VLN_MethodWrapper::FactoryDefaults(&NAME), 251u);
    EXPECT_EQ(VLN_MethodWrapper::ChangeAdapterPersonality(&NAME, 2), 251u);
    fake.features = {{CHANGE_PERSONALITY, 1}};
    EXPECT_EQ(VLN_MethodWrapper::ChangeAdapterPersonality(&NAME, 2), 0u);
    EXPECT_EQ(calls, "defaults, personality 2, ");
    refusal = 190;
    EXPECT_EQ(VLN_MethodWrapper::ChangeAdapterPersonality(&NAME, 2), 190u);
    EXPECT_TRUE(logged("AX_ChangeAdapterPersonality error: 190"));
    fake.features = {{PROFILE_MANAGEMENT, 1}};
    EXPECT_EQ(VLN_MethodWrapper::FactoryDefaults(&NAME), 190u);
    EXPECT_TRUE(logged("AX_SetAdapterPortConfigDefaults error: 190"));
    fake.featureFailures = {{PROFILE_MANAGEMENT, 191}};
    EXPECT_EQ(VLN_MethodWrapper::ChangeAdapterPersonality(&NAME, 2), 191u);
}

TEST_F(Port_Configuration, MoreThanARecordHasRoomForIsRefused) {
    AX_AdapterPortConfig config;
    EXPECT_EQ(VLN_MethodWrapper::GetAdpaterPortConfig(&NAME, &config), 0u);
    told.port[0].functionCount = 17;
    EXPECT_EQ(VLN_MethodWrapper::GetAdpaterPortConfig(&NAME, &config), 1u);
    told.portCount = 5;
    EXPECT_EQ(VLN_MethodWrapper::GetAdpaterPortConfig(&NAME, &config), 1u);
    EXPECT_TRUE(logged("The management library reports 5 ports in a record for 4"));

    AX_ChannelMgmtPortInfo port;
    for (const auto& [count, status] : {std::pair{16u, 0u}, {17u, 1u}}) {
        told_channels = count;
        EXPECT_EQ(VLN_MethodWrapper::GetChannelMgmtPortInfo(&NAME, &port), status);
    }
    fake.features[CHANGE_PERSONALITY] = 1;
    AX_AdapterPersonalityInfo info;
    for (const auto& [count, status] : {std::pair{8u, 0u}, {9u, 1u}}) {
        told_personalities = count;
        EXPECT_EQ(VLN_MethodWrapper::GetAdapterPersonalities(&NAME, &info), status);
    }
}

} // namespace

AX_STATUS AX_GetAdapterPortConfig(AX_WWN, AX_AdapterPortConfig* config) {
    *config = told;
    return AX_STATUS_OK;
}
AX_STATUS AX_SetAdapterPortConfig(AX_WWN, const AX_AdapterPortConfig* config) {
    calls += "config " + std::to_string(config->pid) + ", ";
    return AX_STATUS_OK;
}
AX_STATUS AX_SetAdapterPortConfigDefaults(AX_WWN) {
    calls += "defaults, ";
    return refusal;
}
AX_STATUS AX_SetAriFuncs(AX_WWN, uint32_t count) {
    calls += "functions " + std::to_string(count) + ", ";
    return AX_STATUS_OK;
}
AX_STATUS AX_ListProfiles(AX_WWN, AX_ProfileList* list) {
    constexpr AX_Profile PROFILES[] = {{1, 2, {}, "NIC"},
                                       {4, 1, {}, "RoCE"},
                                       {5, 3, {}, "NIC and RoCE"},
                                       {6, 2, {}, "nic - ets disabled"}};
    list->count = std::size(PROFILES);
    std::copy(std::begin(PROFILES), std::end(PROFILES), list->profile);
    return AX_STATUS_OK;
}
AX_STATUS AX_GetChannelMgmtCNAInfo(AX_WWN, AX_ChannelMgmtCNAInfo* info) {
    info->capabilities = told_capabilities;
    return AX_STATUS_OK;
}
AX_STATUS AX_GetChannelMgmtPortInfo(AX_WWN, AX_ChannelMgmtPortInfo* info) {
    info->count = told_channels;
    return AX_STATUS_OK;
}
AX_STATUS AX_GetAdapterPersonalityInfo(AX_WWN, AX_AdapterPersonalityInfo* info) {
    info->availableCount = told_personalities;
    return AX_STATUS_OK;
}
AX_STATUS AX_ChangeAdapterPersonality(AX_WWN, uint32_t personality) {
    calls += "personality " + std::to_string(personality) + ", ";
    return refusal;
}

// Not asked here.
AX_STATUS AX_SetChannelMgmtCNAInfo(AX_WWN, const AX_ChannelMgmtCNAInfo*) {
    return AX_STATUS_NOT_SUPPORTED;
}
AX_STATUS AX_SetChannelMgmtPortInfo(AX_WWN, const AX_ChannelMgmtPortInfo*) {
    return AX_STATUS_NOT_SUPPORTED;
}
AX_STATUS AX_SetAdapterAttribute(AX_WWN, uint32_t, const void*, uint32_t) {
    return AX_STATUS_NOT_SUPPORTED;
}
