// The fault script, counts and records of calls.
#include "tests/simulator/simulated.h"

#include <cstdio>

namespace {

constexpr std::uint64_t second = 1000000;

class Fault : public Simulated {
protected:
    void SetUp() override {
        Simulated::SetUp();
        start("two-port-cna.json");
        vlnsim_clear_calls();
    }
    AX_STATUS feature(std::uint32_t identifier = 402) {
        std::uint32_t value = 0;
        return LOCAL(AX_GetHBAFeature)(AX_WWN{{0, 0}}, identifier, &value);
    }
    // The statuses of so many version calls.
    std::vector<AX_STATUS> versions(int calls) {
        std::vector<AX_STATUS> statuses;
        for (int i = 0; i < calls; ++i) {
            char text[64];
            std::uint32_t size = sizeof text;
            statuses.push_back(LOCAL(AX_GetVersion)(text, &size));
        }
        return statuses;
    }
};

TEST_F(Fault, AStatusMeetsTheNthCallOrEveryCall) {
    ASSERT_EQ(0, vlnsim_fault("AX_GetVersion", 2, VLNSIM_STATUS, 190));
    ASSERT_EQ(0, vlnsim_fault("AX_GetVersion", 3, VLNSIM_STATUS, 7));
    EXPECT_EQ((std::vector<AX_STATUS>{0, 190, 7, 0, 0}), versions(5));
    ASSERT_EQ(0, vlnsim_fault("*", VLNSIM_EVERY, VLNSIM_STATUS, 1));
    EXPECT_EQ((std::vector<AX_STATUS>{1, 1}), versions(2));
    EXPECT_EQ(1u, LOCAL(AX_SetDebugTraces)(0, 0));
    vlnsim_clear_faults();
    EXPECT_EQ((std::vector<AX_STATUS>{0}), versions(1));
    EXPECT_EQ(8ul, vlnsim_calls("AX_GetVersion"));
    EXPECT_EQ(1, vlnsim_fault("AX_Nothing", 1, VLNSIM_STATUS, 1));
    EXPECT_EQ(1, vlnsim_fault("LAX_GetVersion", 1, VLNSIM_STATUS, 1)) << "a symbol, no function";
}

TEST_F(Fault, AValueMayBeMissing) {
    std::vector<std::uint8_t> buffer(AX_ADAPTER_ATTRIBUTES_SIZE);
    std::uint32_t size = AX_ADAPTER_ATTRIBUTES_SIZE;
    ASSERT_EQ(0u, LOCAL(AX_GetHBAAttributes)(wwn_of(0), buffer.data(), &size));
    ASSERT_EQ(0, vlnsim_fault("AX_GetAttributeValue", VLNSIM_EVERY, VLNSIM_MISSING, 515));
    EXPECT_EQ("status 251", attribute_text(buffer, 515));
    EXPECT_EQ("VMC-2210", attribute_text(buffer, 516));
    vlnsim_clear_faults();
    ASSERT_EQ(0, vlnsim_fault("AX_GetAttributeValue", 1, VLNSIM_STATUS, 190));
    EXPECT_EQ("status 190", attribute_text(buffer, 515));
    EXPECT_EQ("VR10420117", attribute_text(buffer, 515));
}

TEST_F(Fault, ADelayPassesOnTheVirtualClockAndGoesWithAnotherFault) {
    vlnsim_use_virtual_clock(100 * second);
    ASSERT_EQ(0, vlnsim_fault("AX_GetVersion", 1, VLNSIM_DELAY, 3 * second));
    ASSERT_EQ(0, vlnsim_fault("AX_GetVersion", 1, VLNSIM_STATUS, 190));
    EXPECT_EQ((std::vector<AX_STATUS>{190}), versions(1));
    EXPECT_EQ(103 * second, vlnsim_now());
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

TEST_F(Fault, CallsAreCountedByFunction) {
    versions(3);
    feature();
    EXPECT_EQ(3ul, vlnsim_calls("AX_GetVersion"));
    EXPECT_EQ(0ul, vlnsim_calls("AX_NimaVersion"));
    EXPECT_EQ(4ul, vlnsim_calls(nullptr));
    std::string listed;
    vlnsim_each_call(
        [](void* context, const char* function, unsigned long count) {
            *static_cast<std::string*>(context) += function + (" " + std::to_string(count) + "\n");
        },
        &listed);
    EXPECT_EQ("AX_GetHBAFeature 1\nAX_GetVersion 3\n", listed);
    vlnsim_clear_calls();
    EXPECT_EQ(0ul, vlnsim_calls(nullptr));
}

TEST_F(Fault, CallsAreRecordedAndTracedWithTheirArguments) {
    std::FILE* stream = std::tmpfile();
    vlnsim_trace(stream);
    vlnsim_record_calls(1);
    versions(1);
    feature();
    char name[] = "nobody";
    HBA(HBA_OpenAdapter)(name);
    std::uint32_t value = 0;
    LOCAL(AX_GetHBAFeature)(wwn_of(0), 402, &value);
    vlnsim_record_calls(0);
    vlnsim_trace(nullptr);
    versions(1);
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
