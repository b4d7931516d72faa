// The library files: which are there, what they export, and what holds before they are initialised.
#include "tests/simulator/simulated.h"

namespace {

TEST_F(Simulated, EachFileExportsItsOwnNames) {
    start_text(R"({"libraries": {"fallback": {"extra": ["LAX_Ini_GetARPTable"],
                                              "missing": ["AX_GetVPD"]}}})");
    const Opened_Library fallback("libaxapi.so");
    const struct {
        const char* symbol;
        bool local, fallback, hba;
    } rows[] = {
        {"LAX_GetHBAFeature", true, false, false},   {"AX_GetHBAFeature", false, true, false},
        {"AX_GetLocalHBAInfoV4", true, true, false}, {"LAX_GetLocalHBAInfoV4", false, false, false},
        {"LAX_Ini_GetARPTable", true, true, false},  {"LAX_Ini_GetRouteTable", true, false, false},
        {"HBA_OpenAdapter", false, true, true},      {"VlnGetBoardNumber", true, true, false},
        {"AX_GetVPD", false, false, false},          {"LAX_GetVPD", true, false, false},
        {"AX_Nothing", false, false, false},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(row.local, laxapi().find<void()>(row.symbol) != nullptr) << row.symbol;
        EXPECT_EQ(row.fallback, fallback.find<void()>(row.symbol) != nullptr) << row.symbol;
        EXPECT_EQ(row.hba, hbaapi().find<void()>(row.symbol) != nullptr) << row.symbol;
    }
}

TEST_F(Simulated, AnAbsentSymbolIsNotFoundUntilTheScriptIsCleared) {
    start_text(small_scenario);
    vlnsim_clear_calls();
    ASSERT_EQ(0, vlnsim_fault("AX_GetVPDV2", VLNSIM_EVERY, VLNSIM_ABSENT, 0));
    ASSERT_EQ(0, vlnsim_fault("LAX_GetVPD", VLNSIM_EVERY, VLNSIM_ABSENT, 0));
    EXPECT_EQ(nullptr, laxapi().find<void()>("LAX_GetVPDV2"));
    EXPECT_EQ(nullptr, laxapi().find<void()>("LAX_GetVPD"));
    EXPECT_NE(nullptr, Opened_Library("libaxapi.so").find<void()>("AX_GetVPD"));
    vlnsim_clear_faults();
    EXPECT_NE(nullptr, laxapi().find<void()>("LAX_GetVPDV2"));
    EXPECT_EQ(2ul, vlnsim_lookups("LAX_GetVPDV2"));
    EXPECT_EQ(4ul, vlnsim_lookups(nullptr));
}

TEST_F(Simulated, NothingAnswersBeforeTheLibraryIsInitialised) {
    start_text(small_scenario);
    vlnsim_restart();
    std::uint32_t count = 77;
    EXPECT_EQ(1u, LOCAL(AX_GetAllLocalHBAInstances)(&count, nullptr));
    EXPECT_EQ(77u, count);
    EXPECT_EQ(0u, LOCAL(AX_GetNumberOfLocalAdapters)());
    EXPECT_EQ(0u, HBA(HBA_GetNumberOfAdapters)());
    EXPECT_EQ((std::vector<std::string>{"AX_GetAllLocalHBAInstances: called before AX_InitLib",
                                        "AX_GetNumberOfLocalAdapters: called before AX_InitLib",
                                        "HBA_GetNumberOfAdapters: called before HBA_LoadLibrary"}),
              violations());
    EXPECT_EQ(0u, LOCAL(AX_InitLib)());
    EXPECT_EQ(1u, LOCAL(AX_GetNumberOfLocalAdapters)());
    EXPECT_EQ(0u, LOCAL(AX_ExitLib)());
    EXPECT_EQ(0u, LOCAL(AX_GetNumberOfLocalAdapters)());
}

} // namespace
