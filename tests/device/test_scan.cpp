#include "tests/device/model_fixture.h"

#include "device/fcoe_adapter.h"
#include "device/iscsi_adapter.h"
#include "device/nic_adapter.h"

#include <cstring>

namespace cimple {

class Scan_Test : public Model_Test {
protected:
    VLN_Data data;

    int listings() { return fake_library.calls["AX_GetAllLocalHBAInstances"]; }
};

TEST_F(Scan_Test, FunctionsBecomeAdaptersOfTheirKinds) {
    fake_library.add(1, ISCSI, "Front");
    fake_library.add(2, NIC | ISCSI);
    fake_library.add(3, 0x400 | FCOE);
    fake_library.add(4, ISCSI | FCOE);
    fake_library.add(0xAB, FCOE);
    fake_library.add(6, ~0x41CU); // nothing that is known
    data.buildAdapterData();

    const struct {
        uint32 type, number;
        const char* name;
    } expected[] = {{ADAPTER_ISCSI, 0, "Vorlan Front-01"},
                    {ADAPTER_NIC, 1, "Vorlan VT1234-02"},
                    {ADAPTER_NIC, 2, "Vorlan VT1234-03"},
                    {ADAPTER_ISCSI, 3, "Vorlan VT1234-04"},
                    {ADAPTER_FCOE, 4, "Vorlan VT1234-AB"}};
    ASSERT_EQ(data.adapters.size(), std::size(expected));
    for (std::size_t i = 0; i < std::size(expected); ++i) {
        Adapter& adapter = *data.adapters[i];
        EXPECT_EQ(adapter.getAdapterType(), expected[i].type) << i;
        EXPECT_EQ(adapter.getAdapterNumber(), expected[i].number) << i;
        EXPECT_EQ(adapter.getAdapterName(), expected[i].name) << i;
        ASSERT_EQ(adapter.getPortCount(), 1U) << i;
        EXPECT_EQ(adapter.getPort(0)->getAdapter(), &adapter);
        EXPECT_THROW(adapter.getPort(1), std::out_of_range);
    }
    EXPECT_EQ(data.adapterCount, 5);
    EXPECT_TRUE(data.hasNICAdapter && data.hasISCSIAdapter && data.hasFCoEAdapter);
    EXPECT_FALSE(data.hasFCAdapter);
    EXPECT_EQ(data.adapters[1]->getPort(0)->getPortName(), "10000090FA000002");

    // One pass finds the NIC function (at the second record), the next makes the adapters; the
    // first listing is repeated for its table of one word.
    EXPECT_EQ(listings(), 3);
    EXPECT_EQ(fake_library.calls["AX_GetLocalHBAInfoV4"], 2 + 6);
    EXPECT_EQ(fake_library.calls["AX_GetHBAAttributes"], 5);
    EXPECT_TRUE(sleeps.empty());

    data.freeAllData();
    EXPECT_TRUE(data.adapters.empty());
    EXPECT_FALSE(data.hasNICAdapter || data.hasISCSIAdapter || data.hasFCoEAdapter);
    data.buildAdapterData();
    data.buildAdapterData();
    EXPECT_EQ(data.adapters.size(), 5U) << "a rebuild replaces what was there";
}

TEST_F(Scan_Test, NicFunctionThatComesLate) {
    for (int look : {2, 3}) {
        SCOPED_TRACE(look);
        SetUp();
        fake_library.add(1, FCOE);
        fake_library.onListing = [look](int call) {
            if (call == look)
                fake_library.instances[0].info.SpecialFeatures = NIC;
        };
        data.buildAdapterData();
        EXPECT_EQ(data.adapters.size(), look == 2 ? 1U : 0U) << "the last look is too late";
        EXPECT_EQ(sleeps.size(), look == 2 ? 1U : 2U);
    }
}

TEST_F(Scan_Test, OlderRecordAndInstancesThatDoNotAnswer) {
    fake_library.add(1, NIC);
    fake_library.add(2, FCOE).v4 = {190};
    Fake_Instance& silent = fake_library.add(3, FCOE);
    silent.v4 = silent.v3 = {190};
    Fake_Instance& failing = fake_library.add(4, FCOE);
    failing.v4 = {5};
    failing.v3 = {6};
    std::memset(fake_library.instances[1].info.reserved248, 0xFF, 36); // not in the older record
    data.buildAdapterData();
    ASSERT_EQ(data.adapters.size(), 2U);
    EXPECT_EQ(data.adapters[1]->getAdapterName(), "Vorlan VT1234-02");
    EXPECT_EQ(data.adapters[1]->getAdapterNumber(), 1U);
    const auto lines = log_capture::take();
    int errors = 0;
    for (const std::string& line : lines)
        errors += line.find("ERROR: AX_GetLocalHBAInfo") != std::string::npos;
    EXPECT_EQ(errors, 2);
    EXPECT_EQ(
        log_capture::count(lines, "5:ERROR: AX_GetLocalHBAInfoV4 failed for adapter 3. status = 5"),
        1);
    EXPECT_EQ(
        log_capture::count(lines, "5:ERROR: AX_GetLocalHBAInfoV3 failed for adapter 3. status = 6"),
        1);
}

TEST_F(Scan_Test, OneFailingAdapterAmongTwoMakesThePassRunAgain) {
    fake_library.add(1, NIC);
    fake_library.add(2, NIC).adapterStatus = {1};
    data.buildAdapterData();
    ASSERT_EQ(data.adapters.size(), 3U) << "the first adapter is there twice";
    EXPECT_EQ(data.adapters[0]->getAdapterNumber(), 0U);
    EXPECT_EQ(data.adapters[1]->getAdapterNumber(), 0U);
    EXPECT_EQ(data.adapters[2]->getAdapterNumber(), 1U);
    EXPECT_EQ(data.adapterCount, 2);
    EXPECT_TRUE(sleeps.empty());
    EXPECT_EQ(logged("3:Catch ALL error during creating adapter..., Skipping Adapter# 1"), 1);
}

TEST_F(Scan_Test, SingleFailingAdapterEndsTheScan) {
    fake_library.add(1, NIC).adapterStatus = {1};
    data.buildAdapterData();
    EXPECT_TRUE(data.adapters.empty());
    EXPECT_EQ(data.adapterCount, -1);
    EXPECT_FALSE(data.hasNICAdapter);
    EXPECT_TRUE(sleeps.empty());
}

// Neither adapters that go on failing nor adapters that vanish may hold the scan, and with it the
// data lock, for good.
TEST_F(Scan_Test, ScanWithoutEndIsGivenUp) {
    fake_library.add(1, NIC);
    fake_library.add(2, NIC).adapterStatus.assign(1000, 1);
    data.buildAdapterData();
    ASSERT_EQ(data.adapters.size(), 1U) << "what the passes made stands once";
    EXPECT_EQ(data.adapters[0]->getAdapterNumber(), 0U);
    EXPECT_TRUE(data.hasNICAdapter);
    EXPECT_EQ(logged("3:ERROR: no end to the adapter scan, given up with 1 adapters"), 1);

    SetUp();
    fake_library.add(1, NIC);
    fake_library.onListing = [](int call) {
        if (call == 2)
            fake_library.instances.clear();
    };
    data.buildAdapterData();
    EXPECT_TRUE(data.adapters.empty());
    EXPECT_FALSE(data.hasNICAdapter);
    EXPECT_LT(listings(), 20);
}

TEST_F(Scan_Test, PortThatFailsIsLeftOut) {
    fake_library.add(1, NIC).portStatus = {7};
    fake_library.add(2, NIC);
    data.buildAdapterData();
    ASSERT_EQ(data.adapters.size(), 2U);
    EXPECT_EQ(data.adapters[0]->getPortCount(), 0U);
    EXPECT_EQ(data.adapters[1]->getPortCount(), 1U);
    const auto lines = log_capture::take();
    EXPECT_EQ(log_capture::count(lines, "3:AX_GetPortAttributes call failed (7)\n"), 1);
    EXPECT_EQ(log_capture::count(lines, "3:Failed to fetch information for port: [0] on adapter: "
                                        "[Vorlan VT1234-01]"),
              1);
}

TEST_F(Scan_Test, FailingListings) {
    fake_library.add(1, NIC);
    fake_library.add(2, NIC);
    fake_library.listings = {{1, 0}, {7, 2}, {9, 2}};
    data.buildAdapterData();
    EXPECT_EQ(data.adapters.size(), 0U) << "the third look is too late";
    auto lines = log_capture::take();
    EXPECT_EQ(
        log_capture::count(lines, "1:ERROR: AX_GetAllLocalHBAInstances failed (2). status = 1"), 1);
    EXPECT_EQ(log_capture::count(lines, "1:ERROR: AX_GetAllLocalHBAInstances failed errorcode = 9"),
              1);
}

// A failing listing goes on with the number of instances of the pass before; the table that it left
// alone bounds the walk.
TEST_F(Scan_Test, FailingListingAfterAGoodOne) {
    for (uint8 i = 0; i < 20; ++i)
        fake_library.add(i, FCOE);
    fake_library.listings = {{7, 20}};
    fake_library.onListing = [](int call) {
        if (call == 2)
            fake_library.listings = {{0, 20}, {1, 2}, {1, 2}}; // then a table of two words
    };
    data.buildAdapterData();
    EXPECT_EQ(fake_library.askedRecords.size(), 20U + 20U + 2U);
}

} // namespace cimple
