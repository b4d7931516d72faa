// Identifiers and library queries of the method wrapper.
#include "operations/method_wrapper.h"
#include "tests/device/log_capture.h"
#include "tests/operations/fake_bound.h"

#include <cstring>
#include <gtest/gtest.h>

using namespace cimple;

namespace {

using W = VLN_MethodWrapper;

const HBA_WWN NAME{{0x10, 0x00, 0x00, 0x90, 0xfa, 0xAB, 0xcd, 0xef}};

class Wrapper : public testing::Test {
protected:
    void SetUp() override {
        fake = Fake_Bound();
        log_capture::take();
    }
};

} // namespace

TEST_F(Wrapper, DeviceIdToColonForm) {
    const struct {
        const char* deviceId;
        const char* text;
    } cases[] = {
        {"10000090FAABCDEF", "10:00:00:90:FA:AB:CD:EF"},
        {"\"10000090FAABCDEF\"", "10:00:00:90:FA:AB:CD:EF"},
        {"10000090FAABCDEF_12", "10:00:00:90:FA:AB:CD:EF"},
        {"no hex digits at", "no: h:ex: d:ig:it:s :at"},
        {"1000", "10:00"},
        {"", ""},
        {"\"", ""},
    };
    for (const auto& c : cases) {
        char text[W::HBA_NAME_SIZE + 1];
        std::memset(text, '~', sizeof text);
        EXPECT_EQ(W::Id2HBAName(text, c.deviceId), 0U);
        EXPECT_STREQ(text, c.text);
        EXPECT_EQ(text[W::HBA_NAME_SIZE], '~');
    }
    char text[W::HBA_NAME_SIZE];
    log_capture::take();
    EXPECT_EQ(W::Id2HBAName(text, nullptr), 1U);
    EXPECT_EQ(W::Id2HBAName(nullptr, "10000090FAABCDEF"), 1U);
    EXPECT_EQ(
        log_capture::count(log_capture::take(), "3:Null pointer argument in one of the arguments"),
        2);
}

TEST_F(Wrapper, ColonFormToBinaryAndBack) {
    for (const char* text : {"10:00:00:90:fa:ab:cd:ef", "10 00 00 90 FA AB CD EF"}) {
        HBA_WWN name{};
        EXPECT_EQ(W::str2HBAName(&name, text), 0U) << text;
        EXPECT_EQ(std::memcmp(&name, &NAME, 8), 0) << text;
    }
    for (const char* text :
         {"", "10:00:00:90:fa:ab:cd:e", "10:00:00:90:fa:ab:cd:eff", "10:00:00:90:fa:ab:cd:ex",
          "10:00:00:90:fa:ab-cd:ef", "10::0:00:90:fa:ab:cd:ef", "0x:00:00:90:fa:ab:cd:ef"}) {
        HBA_WWN name{};
        log_capture::take();
        EXPECT_EQ(W::str2HBAName(&name, text), 1U) << text;
        EXPECT_EQ(log_capture::count(log_capture::take(), "3:INVALID HBA Name"), 1) << text;
    }
    HBA_WWN name{};
    EXPECT_EQ(W::str2HBAName(&name, nullptr), 1U);
    EXPECT_EQ(W::str2HBAName(nullptr, "10:00:00:90:fa:ab:cd:ef"), 1U);

    char text[W::HBA_NAME_SIZE];
    EXPECT_EQ(W::HBAName2Str(text, &NAME), 0U);
    EXPECT_STREQ(text, "10:00:00:90:FA:AB:CD:EF");
    EXPECT_EQ(W::HBAName2Str(nullptr, &NAME), 0U);
}

// Success is 1 here, unlike in all the others.
TEST_F(Wrapper, PlainHexadecimalToBinary) {
    HBA_WWN name{};
    EXPECT_EQ(W::string2HBAName(&name, "10000090FAabcdef"), 1U);
    EXPECT_EQ(std::memcmp(&name, &NAME, 8), 0);
    for (const char* text :
         {"", "10000090FAABCDE", "10000090FAABCDEF0", "10000090FAABCDEG", "-1000090FAABCDEF"}) {
        log_capture::take();
        EXPECT_EQ(W::string2HBAName(&name, text), 0U) << text;
        EXPECT_EQ(log_capture::take(), (std::vector<std::string>{"3:INVALID WWN"})) << text;
    }
    EXPECT_EQ(W::string2HBAName(&name, nullptr), 0U);
}

TEST_F(Wrapper, OnlyALocalAdapterIsValid) {
    const struct {
        AX_STATUS status;
        uint32 isLocal, result;
    } cases[] = {{0, 1, 0}, {0, 0, 1}, {1, 1, 1}};
    for (const auto& c : cases) {
        fake.isLocalStatus = c.status;
        fake.isLocal = c.isLocal;
        EXPECT_EQ(W::Validatewwpn(&NAME), c.result);
        EXPECT_EQ(log_capture::count(log_capture::take(), "3:HBA IS NOT LOCAL"),
                  static_cast<int>(c.result));
    }
}

TEST_F(Wrapper, AddressTexts) {
    VLN_IpInfo address;
    std::memset(&address, 0xff, sizeof address);
    EXPECT_EQ(W::ipAddr2IpInfo("192.168.1.20", &address), 0U);
    const uint8 v4[16] = {192, 168, 1, 20};
    EXPECT_EQ(std::memcmp(address.address, v4, 16), 0);
    EXPECT_EQ(W::ipAddr2IpInfo("fe80::1", &address), 0U);
    const uint8 v6[16] = {0xfe, 0x80, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 1};
    EXPECT_EQ(std::memcmp(address.address, v6, 16), 0);
    log_capture::take();
    EXPECT_EQ(W::ipAddr2IpInfo("", &address), 1U);
    const auto lines = log_capture::take();
    EXPECT_EQ(lines.back(), "3:VLN_HostAddrStrToIPAddr returned false");
    EXPECT_EQ(lines[lines.size() - 2].rfind("1:getaddrinfo fails with ", 0), 0U);
    const uint8 zeros[16] = {};
    EXPECT_EQ(std::memcmp(address.address, zeros, 16), 0);
    EXPECT_EQ(W::ipAddr2IpInfo(nullptr, &address), 1U);
    EXPECT_EQ(W::ipAddr2IpInfo("10.0.0.1", nullptr), 1U);
}

TEST_F(Wrapper, VersionGrowsItsBufferOnce) {
    const std::string longText(99, 'v');
    int calls = 0;
    fake.version = [&](char* text, uint32_t* size) -> AX_STATUS {
        ++calls;
        if (*size < longText.size() + 1) {
            *size = static_cast<uint32_t>(longText.size() + 1);
            return AX_STATUS_BUFFER_TOO_SMALL;
        }
        std::strcpy(text, longText.c_str());
        return AX_STATUS_OK;
    };
    std::string text;
    EXPECT_EQ(W::GetLibraryVersion("AXAPI", &text), 0U);
    EXPECT_EQ(text, longText);
    EXPECT_EQ(calls, 2);
    EXPECT_EQ(log_capture::count(log_capture::take(), "5:LIBVersion: " + longText), 1);
    // The NIMA version is asked for with the same 64 bytes again, and no third time.
    EXPECT_EQ(W::GetNIMALibVersion(&text), AX_STATUS_BUFFER_TOO_SMALL);
    EXPECT_EQ(calls, 4);
    EXPECT_EQ(log_capture::count(log_capture::take(),
                                 "5:ERROR: Failed to get NIMALibVersion, returned with code 255"),
              1);
    EXPECT_EQ(W::GetLibraryVersion("AXAPI", nullptr), AX_STATUS_INVALID_ARGUMENT);
    EXPECT_EQ(log_capture::count(log_capture::take(), "5:Invalid Output pointer"), 1);
}

// A library that reports sizes beyond all bounds gets no such memory and no read past the buffer.
TEST_F(Wrapper, VersionWithHostileSizes) {
    const struct {
        AX_STATUS first, second;
        uint32 size;
        AX_STATUS result;
        std::size_t length;
    } cases[] = {
        {AX_STATUS_BUFFER_TOO_SMALL, 0, 0x80000000U, 1, 0},
        {AX_STATUS_BUFFER_TOO_SMALL, 0, 0xFFFFFFFFU, 1, 0},
        {AX_STATUS_BUFFER_TOO_SMALL, 0, 0, 0, 0}, // room for nothing, and no crash
        {AX_STATUS_BUFFER_TOO_SMALL, AX_STATUS_BUFFER_TOO_SMALL, 128, AX_STATUS_BUFFER_TOO_SMALL,
         128},
        {0, 0, 0x80000000U, 1, 0}, // more than there was room for
        {0, 0, 64, 0, 64},         // full to the last byte, no end mark
        {7, 0, 64, 7, 64},         // copied on failure too
    };
    for (const auto& c : cases) {
        int calls = 0;
        fake.version = [&](char* text, uint32_t* size) {
            std::memset(text, 'v', *size);
            *size = c.size;
            return calls++ == 0 ? c.first : c.second;
        };
        std::string text = "old";
        EXPECT_EQ(W::GetLibraryVersion(nullptr, &text), c.result) << c.size;
        EXPECT_EQ(text.size(), c.length) << c.size;
    }
}

TEST_F(Wrapper, CnaType) {
    const struct {
        std::map<uint32_t, uint32_t> features;
        std::map<uint32_t, AX_STATUS> failures;
        AX_STATUS status;
        bool nic, iscsi, fcoe, roce;
        std::size_t queries;
    } cases[] = {
        {{}, {}, 0, true, false, false, false, 5},
        {{{403, 1}}, {}, 0, false, false, true, false, 5},
        {{{412, 5}}, {}, 0, false, false, true, false, 5},
        {{{401, 1}, {439, 1}}, {}, 0, false, true, false, true, 5},
        {{{413, 1}, {403, 1}}, {}, 0, false, true, true, false, 5},
        {{{439, 1}}, {{403, 190}}, 190, false, false, false, false, 1},
        {{{403, 1}}, {{413, 7}}, 7, false, false, true, false, 4},
    };
    for (const auto& c : cases) {
        fake.features = c.features;
        fake.featureFailures = c.failures;
        fake.featureQueries.clear();
        bool nic = false, iscsi = true, fcoe = true, roce = true;
        EXPECT_EQ(W::GetCNAType(&NAME, nic, iscsi, fcoe, roce), c.status);
        EXPECT_EQ(std::tie(nic, iscsi, fcoe, roce), std::tie(c.nic, c.iscsi, c.fcoe, c.roce));
        const std::vector<uint32_t> order{403, 412, 401, 413, 439};
        EXPECT_EQ(
            fake.featureQueries,
            std::vector<uint32_t>(order.begin(), order.begin() + static_cast<long>(c.queries)));
    }
}

TEST_F(Wrapper, FeatureList) {
    fake.featureList = [](AX_WWN wwn, uint8_t* list) -> AX_STATUS {
        EXPECT_EQ(std::memcmp(wwn.word, NAME.wwn, 8), 0);
        std::memset(list, 1, AX_FEATURE_LIST_SIZE);
        list[480] = 9;
        return AX_STATUS_OK;
    };
    std::vector<uint8> list(AX_FEATURE_LIST_SIZE);
    EXPECT_EQ(W::GetHBAFeatureList(&NAME, list.data()), 0U);
    auto lines = log_capture::take();
    EXPECT_EQ(lines.size(), 1U + 16 + 1);
    EXPECT_EQ(lines[16], "5:VLN_MethodWrapper::Features: 480->9");
    EXPECT_EQ(lines.back(), "5:VLN_MethodWrapper::Exiting GetHBAFeatureList");

    fake.featureList = [](AX_WWN, uint8_t*) { return AX_STATUS{3}; };
    fake.statusText = "no luck";
    EXPECT_EQ(W::GetHBAFeatureList(&NAME, list.data()), 3U);
    lines = log_capture::take();
    EXPECT_EQ(
        log_capture::count(lines, "3:Failed to get the HBA List, exited with the error code 3"), 1);
    EXPECT_EQ(log_capture::count(lines, "5:Status: <3>:no luck"), 1);

    EXPECT_EQ(W::GetHBAFeatureList(&NAME, nullptr), AX_STATUS_INVALID_ARGUMENT);
    EXPECT_EQ(log_capture::count(log_capture::take(), "5:Invalid output pointer"), 1);
}

TEST_F(Wrapper, StatusText) {
    W::logStatus(5);
    const std::string endless(300, 't');
    fake.statusText = endless.c_str();
    W::logStatus(247);
    EXPECT_EQ(
        log_capture::take(),
        (std::vector<std::string>{"5:Status: <5>", "5:Status: <247>:" + std::string(255, 't')}));
}
