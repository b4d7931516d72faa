// The fault script, counts and records of calls.
#include "tests/simulator/simulated.h"

#include <cstdio>

namespace {

constexpr std::uint64_t second = 1000000;

// Statuses, missing values and counts are in every test of a failure on the road.
class Fault : public Simulated {
protected:
    AX_STATUS version() {
        char text[64];
        std::uint32_t size = sizeof text;
        return LOCAL(AX_GetVersion)(text, &size);
    }
};

TEST_F(Fault, ADelayPassesOnTheVirtualClockAndGoesWithAnotherFault) {
    start("two-port-cna.json");
    vlnsim_use_virtual_clock(100 * second);
    ASSERT_EQ(0, vlnsim_fault("AX_GetVersion", 1, VLNSIM_DELAY, 3 * second));
    ASSERT_EQ(0, vlnsim_fault("AX_GetVersion", 1, VLNSIM_STATUS, 190));
    EXPECT_EQ(190u, version());
    EXPECT_EQ(103 * second, vlnsim_now());
    EXPECT_EQ(1, vlnsim_fault("AX_Nothing", 1, VLNSIM_STATUS, 1));
    EXPECT_EQ(1, vlnsim_fault("LAX_GetVersion", 1, VLNSIM_STATUS, 1)) << "a symbol, no function";
}

TEST_F(Fault, ScenariosBringAScriptOfTheirOwn) {
    start("flaky.json");
    std::uint32_t table[8];
    std::uint32_t count = 8;
    EXPECT_EQ(7u, LOCAL(AX_GetAllLocalHBAInstances)(&count, table));
    EXPECT_EQ(0u, LOCAL(AX_GetAllLocalHBAInstances)(&count, table));
    EXPECT_EQ(nullptr, laxapi().find<void()>("LAX_GetSffData"));
    vlnsim_restart();
    LOCAL(AX_InitLib)();
    EXPECT_EQ(7u, LOCAL(AX_GetAllLocalHBAInstances)(&count, table)) << "a restart rearms it";
}

TEST_F(Fault, CallsAreRecordedAndTracedWithTheirArguments) {
    start("two-port-cna.json");
    std::FILE* stream = std::tmpfile();
    vlnsim_trace(stream);
    vlnsim_record_calls(1);
    version();
    std::uint32_t value = 0;
    LOCAL(AX_GetHBAFeature)(AX_WWN{{0, 0}}, 402, &value);
    char name[] = "nobody";
    HBA(HBA_OpenAdapter)(name);
    LOCAL(AX_GetHBAFeature)(wwn_of(0), 402, &value);
    vlnsim_record_calls(0);
    vlnsim_trace(nullptr);
    version();
    const std::vector<std::string> expected{"AX_GetVersion() = 0 text=\"10.2.261.13\"",
                                            "AX_GetHBAFeature(0000000000000000, 402) = 5",
                                            "HBA_OpenAdapter(\"nobody\") = 0",
                                            "AX_GetAllLocalHBAInstances() = 0 room=64 count=6",
                                            "AX_GetLocalHBAInfoV3(0) = 0",
                                            "AX_GetHBAFeature(100002564C000000, 402) = 0 value=1"};
    EXPECT_EQ(expected, recorded());
    std::rewind(stream);
    char line[256];
    std::vector<std::string> traced;
    while (std::fgets(line, sizeof line, stream))
        traced.emplace_back(line, std::string(line).size() - 1);
    std::fclose(stream);
    EXPECT_EQ(expected, traced);
}

} // namespace
