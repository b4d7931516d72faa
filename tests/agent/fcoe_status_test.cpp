// FCoE ports and their statistics between refreshes.

#include "classes/VLNMPCA_FCPort.h"
#include "classes/VLNMPCA_FCPortStatistics.h"
#include "tests/agent/dynamic_fixture.h"

namespace cimple {

namespace {

class FCoE_Status_Test : public Dynamic_Test {
protected:
    void SetUp() override {
        Dynamic_Test::SetUp();
        begin(R"({"use": "nic"}, {"use": "fcoe"})");
        for (const auto& adapter : agent->m_pData->adapters)
            if (adapter->getAdapterType() == ADAPTER_FCOE)
                names.push_back(adapter->getPort(0)->getPortName());
        ASSERT_EQ(names.size(), 2u);
        // The first port's instances are gone: what has none is not asked for.
        port = drop_first(agent->m_VLNMPCA_FCPort_map);
        statistics = drop_first(agent->m_VLNMPCA_FCPortStatistics_map);
    }
    template <class T>
    static T* drop_first(Instance_Map<T>& store) {
        EXPECT_EQ(store.delete_instance(store[0]), 0);
        EXPECT_EQ(store.size(), 1u);
        return store[0];
    }
    void set_port(const char* name, const std::string& value) {
        set(names[1], "portAttributes", name, value);
    }
    void look(const Meta_Class& meta_class) {
        vlnsim_advance(10 * SECOND);
        EXPECT_EQ(count_instances(meta_class), 1);
    }
    void look_at_port() { look(VLNMPCA_FCPort::static_meta_class); }
    void look_at_statistics() { look(VLNMPCA_FCPortStatistics::static_meta_class); }

    std::vector<std::string> names;
    VLNMPCA_FCPort* port = nullptr;
    VLNMPCA_FCPortStatistics* statistics = nullptr;
};

} // namespace

// A value that can't be read ends its port: what comes after it stays as it was.
TEST_F(FCoE_Status_Test, AFailedReadingEndsThePort) {
    const struct {
        uint64 missing;
        const char* line;
    } rows[] = {
        {802, "ERROR: AX_GetttributeValue for PortState call failed (251)"},
        {774, "ERROR: AX_GetttributeValue for PortState call failed (251)"},
        {773, "ERROR: AX_GetttributeValue for PortType call failed (251)"},
        {779, "AX_GetttributeValue for PortSpeed call failed (251)"},
        {842, "AX_GetttributeValue for PhysicalPortSpeed call failed (251)"},
    };
    const auto values = [this] {
        return std::vector<bool>{!port->OperationalStatus.is_null(),
                                 !port->DetailedStatus.is_null(), !port->PortType.is_null(),
                                 !port->Speed.is_null(), !port->PhysicalPortSpeed.is_null()};
    };
    port->OperationalStatus.clear();
    port->DetailedStatus.clear();
    port->PortType.clear();
    port->Speed.clear();
    port->PhysicalPortSpeed.clear();
    for (std::size_t i = 0; i < std::size(rows); ++i) {
        vlnsim_clear_faults();
        vlnsim_fault("AX_GetAttributeValue", VLNSIM_EVERY, VLNSIM_MISSING, rows[i].missing);
        Log_Capture log;
        look_at_port();
        EXPECT_EQ(log.count(VLN_ERR, rows[i].line), 1) << rows[i].missing;
        std::vector<bool> expected(5, false);
        std::fill_n(expected.begin(), i, true);
        EXPECT_EQ(values(), expected) << rows[i].missing;
    }
    vlnsim_clear_faults();
    vlnsim_fault("AX_GetPortAttributes", VLNSIM_EVERY, VLNSIM_STATUS, 190);
    Log_Capture log;
    look_at_port();
    EXPECT_EQ(log.count(VLN_ERR, "AX_GetPortAttributes call failed (190)"), 1)
        << "the port without an instance is not asked";
    EXPECT_EQ(log.count(VLN_DBG, "Fetching Port Speeds."), 2);
}

TEST_F(FCoE_Status_Test, EveryCounterHasItsProperty) {
    const std::pair<const char*, const char*> plain[] = {
        {"1025", "PacketsTransmitted"},
        {"1032", "PacketsReceived"},
        {"1033", "LIPCount"},
        {"1036", "NOSCount"},
        {"1037", "ErrorFrames"},
        {"1038", "DumpedFrames"},
        {"1039", "LinkFailures"},
        {"1041", "LossOfSignalCounter"},
        {"1040", "LossOfSyncCounter"},
        {"1042", "PrimitiveSeqProtocolErrCount"},
        {"1044", "CRCErrors"},
        {"1043", "InvalidTransmissionWords"},
        {"1045", "TxSequences"},
        {"1028", "RxSequences"},
        {"1029", "ExCountOrig"},
        {"1026", "ExCountResp"},
        {"1027", "ActiveXRIs"},
        {"1048", "ActiveRPIs"},
        {"1047", "ElasticBufOverruns"},
        {"1058", "LinkTransitions"},
        {"1046", "PrimitiveSeqTimesouts"},
        {"1057", "ArbitrationTimeouts"},
    };
    for (const auto& [identifier, property] : plain)
        set(names[1], "statistics", identifier, identifier);
    set(names[1], "statistics", "1059", "77");
    set(names[1], "statistics", "1030", "1073741824");
    set(names[1], "statistics", "1031", "9000000000");
    look_at_statistics();
    for (const auto& [identifier, property] : plain)
        EXPECT_EQ(value_of(statistics, property), identifier) << property;
    EXPECT_EQ(statistics->BytesTransmitted.value, 4294967296u);
    EXPECT_EQ(statistics->BytesReceived.value, 36000000000u);
    EXPECT_EQ(statistics->StatisticTime.value.usec(), vlnsim_now());
    EXPECT_EQ(lines_of(statistics).size(), std::size(plain) + 2 + 3 + 2)
        << "beside the counters only name space, texts and time";
}

// Two counters are copied only when the library reports them; the others show their start value.
TEST_F(FCoE_Status_Test, CountersWithoutAReport) {
    set(names[1], "statistics", "1038", "5");
    look_at_statistics();
    EXPECT_TRUE(statistics->NOSCount.is_null());
    EXPECT_EQ(statistics->DumpedFrames.value, 5u);
    EXPECT_EQ(statistics->LIPCount.value, 4294967295u);
    EXPECT_FALSE(statistics->LIPCount.is_null());

    set(names[1], "statistics", "1038", "4294967295");
    set(names[1], "statistics", "1033", "6");
    look_at_statistics();
    EXPECT_EQ(statistics->DumpedFrames.value, 5u);
    EXPECT_EQ(statistics->LIPCount.value, 6u);

    vlnsim_fault("AX_GetPortStatistics", VLNSIM_EVERY, VLNSIM_STATUS, 190);
    set(names[1], "statistics", "1033", "7");
    const uint64 before = statistics->StatisticTime.value.usec();
    Log_Capture log;
    look_at_statistics();
    EXPECT_EQ(statistics->LIPCount.value, 6u);
    EXPECT_EQ(statistics->StatisticTime.value.usec(), before);
    EXPECT_EQ(log.count(VLN_ERR, "Error occurred while retrieving FCoEPort Statistics"), 1);
    EXPECT_EQ(log.count(VLN_ERR, "Error getting FCoE Port statistics"), 1);
    EXPECT_EQ(log.count(VLN_DBG, "PERF: GetFCoEPortStats: cleanExit"), 1);
}

} // namespace cimple
