// The library files: which are there, what they export, and what holds before they are initialised.
#include "tests/simulator/simulated.h"

#include <cstdlib>
#include <thread>

namespace {

TEST_F(Simulated, ABareNameFindsTheLibrariesThatTheHostHas) {
    ASSERT_EQ(0, vlnsim_load_scenario_text(
                     R"({"libraries": {"local": {"present": false}, "hba": {"present": false}}})",
                     "t", nullptr, 0));
    EXPECT_FALSE(vlnsim_library_present(VLNSIM_LOCAL));
    EXPECT_TRUE(vlnsim_library_present(VLNSIM_FALLBACK));
    ASSERT_EQ(0, vlnsim_open_libraries(nullptr, 0));
    EXPECT_FALSE(Opened_Library("liblaxapi.so"));
    EXPECT_TRUE(Opened_Library("libaxapi.so"));
    vlnsim_close_libraries();
    EXPECT_FALSE(Opened_Library("libaxapi.so"));
}

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

TEST_F(Simulated, AFailedInitialisationLeavesTheLibraryUnusable) {
    start_text(R"({"libraries": {"initialisation": 3}})");
    EXPECT_EQ(3u, LOCAL(AX_InitLib)());
    EXPECT_EQ(1u, LOCAL(AX_SetDebugTraces)(0, 0));
    // Below zero is no failure.
    start_text(R"({"libraries": {"initialisation": "0xFFFFFFFF"}})");
    EXPECT_EQ(0u, LOCAL(AX_SetDebugTraces)(0, 0));
}

TEST_F(Simulated, VersionsTellTheSizeThatTheyNeed) {
    start_text(R"({"libraries": {"versions": {"axapi": "10.2.261.13", "nima": ""}}})");
    char text[64] = "untouched";
    std::uint32_t size = 11;
    EXPECT_EQ(255u, LOCAL(AX_GetVersion)(text, &size));
    EXPECT_EQ(12u, size);
    EXPECT_STREQ("untouched", text);
    EXPECT_EQ(0u, LOCAL(AX_GetVersion)(text, &size));
    EXPECT_STREQ("10.2.261.13", text);
    size = sizeof text;
    EXPECT_EQ(0u, LOCAL(AX_NimaVersion)(text, &size));
    EXPECT_STREQ("", text);
    EXPECT_EQ(1u, size);
}

TEST_F(Simulated, StatusTextsAreCutToTheirBufferAndEmptyForUnknownNumbers) {
    start_text("{}");
    char text[8];
    EXPECT_EQ(0u, LOCAL(AX_StatusString)(251, text, sizeof text));
    EXPECT_STREQ("Feature", text);
    EXPECT_EQ(0u, LOCAL(AX_StatusString)(4711, text, sizeof text));
    EXPECT_STREQ("", text);
}

TEST_F(Simulated, FunctionsWithoutAModelSayThatTheyAreNotSupported) {
    start_text(small_scenario);
    EXPECT_EQ(251u, LOCAL(AX_ResetHBA)(wwn_of(0)));
    EXPECT_EQ(1ul, vlnsim_calls("AX_ResetHBA"));
    ASSERT_EQ(0, vlnsim_fault("AX_ResetHBA", 1, VLNSIM_STATUS, 247));
    EXPECT_EQ(247u, LOCAL(AX_ResetHBA)(wwn_of(0)));
}

TEST_F(Simulated, ConcurrentCallersAreCountedAndServed) {
    start("two-port-cna.json");
    constexpr unsigned threads = 4, calls = 500;
    const AX_WWN wwn = wwn_of(0);
    const auto feature = laxapi().find<decltype(AX_GetHBAFeature)>("LAX_GetHBAFeature");
    std::vector<std::thread> callers;
    for (unsigned i = 0; i < threads; ++i)
        callers.emplace_back([&] {
            std::uint32_t value = 0;
            for (unsigned n = 0; n < calls; ++n)
                if (feature(wwn, 402, &value) != 0 || value != 1)
                    ADD_FAILURE() << "call " << n;
        });
    for (std::thread& caller : callers)
        caller.join();
    EXPECT_EQ(1ul * threads * calls, vlnsim_calls("AX_GetHBAFeature"));
}

std::string output_of(const std::string& scenario) {
    const std::string command =
        "LD_LIBRARY_PATH=" VLN_SIMULATOR_DIR " VLNSIM_SCENARIO=" + scenario +
        " " VLN_SIMULATOR_CHILD " 2>&1";
    std::string text;
    std::FILE* pipe = popen(command.c_str(), "r");
    char line[256];
    while (pipe && std::fgets(line, sizeof line, pipe))
        text += line;
    if (pipe)
        pclose(pipe);
    return text;
}

TEST_F(Simulated, AChildProcessFindsItsScenarioInTheEnvironment) {
    EXPECT_EQ("status 0, 6 adapters\n", output_of(VLN_SCENARIOS "/two-port-cna.json"));
    EXPECT_EQ("status 0, 0 adapters\n", output_of(""));
    EXPECT_EQ("nowhere.json:1: cannot be read\nstatus 1, 0 adapters\n", output_of("nowhere.json"));
}

} // namespace
