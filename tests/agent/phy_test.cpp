// Reading a PHY when there is nothing to read, or nowhere to read it to.
#include "agent/associations.h"
#include "operations/method_wrapper.h"
#include "services/phy/ten_g_base_t.h"
#include "tests/agent/agent_fixture.h"

namespace cimple {

namespace {

using PHY_Test = Agent_Test;

TEST_F(PHY_Test, EachFailureHasItsStatus) {
    const Loaded_Agent agent;
    const HBA_WWN name{};
    const auto phy = make_instance<VLNMPCA_PHYPhysicalComponent>();
    Phy_Settings settings;
    uint32 nvp = 7;
    EXPECT_EQ(VLNMPCA_TenGBaseT::GetCableNVP("no name", nvp), 32768u);
    EXPECT_EQ(VLNMPCA_TenGBaseT::GetCableNVP(nullptr, nvp), 32768u);
    EXPECT_EQ(VLNMPCA_TenGBaseT::GetCableNVP("100002564C000000", nvp), 32769u);
    EXPECT_EQ(nvp, 7u);
    EXPECT_EQ(VLNMPCA_TenGBaseT::GetPHYPortAttributeValues(nullptr, phy.get(), &settings), 32969u);
    EXPECT_EQ(VLNMPCA_TenGBaseT::GetPHYPortAttributeValues(&name, nullptr, &settings), 32969u);
    EXPECT_EQ(VLNMPCA_TenGBaseT::GetPHYPortAttributeValues(&name, phy.get(), nullptr), 32969u);
    EXPECT_EQ(VLNMPCA_TenGBaseT::GetPHYPortAttributeValues(&name, phy.get(), &settings), 32769u);
    EXPECT_EQ(VLNMPCA_TenGBaseT::GetPHYPortStatistics(&name, nullptr), 32969u);
    EXPECT_EQ(VLNMPCA_TenGBaseT::GetPHYPortStatistics(&name, phy.get()), 32769u);
}

TEST_F(PHY_Test, WhatIsBeyondItsRangeIsNotSet) {
    const HBA_WWN name{};
    const Agent_Log log;
    EXPECT_EQ(VLN_MethodWrapper::SetCableNVP(&name, 0), 1u);
    EXPECT_EQ(VLN_MethodWrapper::SetCableNVP(&name, 101), 1u);
    EXPECT_EQ(VLN_MethodWrapper::SetLineRateAdvertised(&name, 4), 1u);
    EXPECT_EQ(log.count(VLN_ERR, "Invalid CableNVP value, Vaild value b/n 1 - 100"), 2);
    EXPECT_EQ(log.count(VLN_ERR, "Invalid Line Rate Passed"), 1);
}

} // namespace

} // namespace cimple
