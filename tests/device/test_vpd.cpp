// Reading the FRU data out of vital product data, and the text look-ups.

#include "device/vpd.h"
#include "foundation/field_text.h"
#include "tests/device/log_capture.h"

#include <gtest/gtest.h>

#include <cstring>
#include <functional>

namespace {

// The library: entries of a tag, a length byte and the value, closed by a zero.
struct Fake_Vpd {
    std::string bytes;
    AX_STATUS status = AX_STATUS_OK;
    AX_WWN asked{};
    uint32_t version = 0;
    uint32_t size = 0;
    int steps = 0;
    std::function<void*(char* cursor, char* tag, char* value)> onStep;

    void entry(const char* tag, const std::string& value) {
        bytes += tag;
        bytes += static_cast<char>(value.size());
        bytes += value;
    }
} fake_vpd;

} // namespace

AX_STATUS AX_GetVPDV2(AX_WWN wwn, uint32_t version, void* buffer, uint32_t* size) {
    fake_vpd.asked = wwn;
    fake_vpd.version = version;
    fake_vpd.size = *size;
    std::memcpy(buffer, fake_vpd.bytes.data(), std::min<std::size_t>(fake_vpd.bytes.size(), *size));
    return fake_vpd.status;
}

AX_STATUS AX_GetVPD(AX_WWN wwn, void* buffer, uint32_t* size) {
    return AX_GetVPDV2(wwn, 0, buffer, size);
}

void* AX_GetNextVpdEntry(void* cursor, char* tag, uint32_t tagSize, char* value,
                         uint32_t valueSize) {
    ++fake_vpd.steps;
    auto* at = static_cast<char*>(cursor);
    if (fake_vpd.onStep)
        return fake_vpd.onStep(at, tag, value);
    if (*at == 0)
        return nullptr;
    const std::size_t length = static_cast<uint8_t>(at[2]);
    std::memset(tag, 0, tagSize);
    std::memset(value, 0, valueSize);
    std::memcpy(tag, at, 2);
    std::memcpy(value, at + 3, length);
    return at + 3 + length;
}

AX_STATUS AX_IsLocalHBA(AX_WWN, uint32_t*) {
    return AX_STATUS_ERROR; // nobody asks
}

namespace cimple {

class Vpd_Test : public testing::Test {
protected:
    void SetUp() override {
        fake_vpd = Fake_Vpd{};
        log_capture::take();
    }
    AX_STATUS read(const char* deviceId = "10000090FA000003") {
        record = {};
        return VLN_Vpd().GetFRUVPD(deviceId, &record);
    }
    FRUVPD record{};
};

TEST_F(Vpd_Test, TagsGoToTheirFields) {
    fake_vpd.entry("MN", "Vorlan");
    fake_vpd.entry("ZZ", "nobody's");
    fake_vpd.entry("PA", "Converged Adapter");
    fake_vpd.entry("PN", "VT-1");
    fake_vpd.entry("SN", "SER1");
    fake_vpd.entry("UU",
                   std::string("\x0F\x4A\0\0\x7D\x3E\xFF\x52\x9A\x01\x02\x56\x4C\0\0\x01", 16));
    fake_vpd.entry("FN", "0123456789ABCDEF more");
    fake_vpd.entry("DM", "1214");
    fake_vpd.entry("CF", "\x50");
    fake_vpd.entry("RI", "\xFE");
    fake_vpd.entry("FW", "V:10.2.261.13-very-long,x,D:03152014");
    ASSERT_EQ(read(), AX_STATUS_OK);
    const uint8_t wwn[8] = {0x10, 0, 0, 0x90, 0xFA, 0, 0, 3};
    EXPECT_EQ(std::memcmp(&fake_vpd.asked, &wwn, sizeof wwn), 0);
    EXPECT_EQ(fake_vpd.version, 1u);
    EXPECT_EQ(fake_vpd.size, 1536u);
    EXPECT_EQ(fake_vpd.steps, 12);
    EXPECT_STREQ(record.manufacturer, "Vorlan");
    EXPECT_STREQ(record.productName, "Converged Adapter");
    EXPECT_STREQ(record.partNumber, "VT-1");
    EXPECT_STREQ(record.serialNumber, "SER1");
    EXPECT_STREQ(record.uuid, "0f4a00007d3eff529a0102564c000001");
    EXPECT_EQ(fieldText(record.fruNumber), "0123456789ABCDEF"); // no room for its end
    EXPECT_STREQ(record.date, "1214");
    EXPECT_EQ(record.cardFunction, 0x50u);
    EXPECT_EQ(record.revisionId, 0xFEu);
    EXPECT_STREQ(record.firmware, "V:10.2.261.13-very-long,x,D:03152014");
    EXPECT_EQ(fieldText(record.firmwareVersion), "10.2.261.13-very");
    EXPECT_STREQ(record.firmwareDate, "03152014");
    EXPECT_EQ(log_capture::count(log_capture::take(), "5:VLN_Vpd::GetFRUVPD"), 1);
}

TEST_F(Vpd_Test, FirmwareWithoutPartsIsTheWholeTextOnly) {
    fake_vpd.entry("FW", std::string(60, 'f'));
    ASSERT_EQ(read(), AX_STATUS_OK);
    EXPECT_EQ(fieldText(record.firmware), std::string(40, 'f'));
    EXPECT_STREQ(record.firmwareVersion, "");
    EXPECT_STREQ(record.firmwareDate, "");
}

TEST_F(Vpd_Test, FailuresAnswerTheirStatus) {
    EXPECT_EQ(read(nullptr), 4u);
    EXPECT_EQ(VLN_Vpd().GetFRUVPD("10000090FA000003", nullptr), 4u);
    EXPECT_EQ(read("10000090FA00000"), 1u);
    EXPECT_EQ(read("1000-090FA000003"), 1u);
    EXPECT_EQ(read(""), 1u);
    fake_vpd.status = 190;
    EXPECT_EQ(read(), 190u);
    const auto lines = log_capture::take();
    EXPECT_EQ(log_capture::count(lines, "5:Invalid Parameter"), 2);
    EXPECT_EQ(log_capture::count(lines, "5:str2HBAName failed"), 3);
    EXPECT_EQ(log_capture::count(lines, "5:ERROR: AX_GetVPDV2 call failed : 190"), 1);
    EXPECT_EQ(fake_vpd.steps, 0);
}

// A library may tell of the end together with the last entry.
TEST_F(Vpd_Test, AnEntryCountsThatComesWithTheEnd) {
    fake_vpd.onStep = [](char* cursor, char* tag, char* value) -> void* {
        std::strcpy(tag, fake_vpd.steps == 1 ? "SN" : "PN");
        std::strcpy(value, "told");
        return fake_vpd.steps == 1 ? cursor + 7 : nullptr;
    };
    ASSERT_EQ(read(), AX_STATUS_OK);
    EXPECT_STREQ(record.serialNumber, "told");
    EXPECT_STREQ(record.partNumber, "told");
}

// The walk ends whatever the library answers, and stays in the buffer.
TEST_F(Vpd_Test, CursorsAreNotBelieved) {
    const struct {
        std::ptrdiff_t step;
        int steps;
    } rows[] = {{0, 1}, {-3, 1}, {1000000, 1}, {1, 1536}, {259, 6}};
    for (const auto& row : rows) {
        fake_vpd.steps = 0;
        fake_vpd.onStep = [&](char* cursor, char* tag, char* value) -> void* {
            std::memset(tag, 'S', 4);
            std::memset(value, 'v', 256);
            return cursor + row.step;
        };
        EXPECT_EQ(read(), AX_STATUS_OK);
        EXPECT_EQ(fake_vpd.steps, row.steps) << row.step;
    }
    // An entry that claims more than the buffer holds.
    fake_vpd = Fake_Vpd{};
    while (fake_vpd.bytes.size() < 1530)
        fake_vpd.entry("SN", "x");
    fake_vpd.bytes.resize(1533);
    fake_vpd.bytes += "PN\xFF";
    EXPECT_EQ(read(), AX_STATUS_OK);
    EXPECT_STREQ(record.serialNumber, "x");
    EXPECT_STREQ(record.partNumber, "");
}

TEST(Vpd_Texts, KnownValuesHaveTexts) {
    std::string text = "untouched";
    EXPECT_EQ(VLN_Vpd::GetCardFunctionText(65, text), 32768u);
    EXPECT_EQ(VLN_Vpd::GetClassificationText(0, text), 32768u);
    EXPECT_EQ(text, "untouched");
    for (const auto& [value, expected] : std::initializer_list<std::pair<uint32, const char*>>{
             {0, "Reserved"}, {16, "Infiniband"}, {80, "Fibre Channel"}, {96, "iSCSI"}}) {
        EXPECT_EQ(VLN_Vpd::GetCardFunctionText(value, text), 0u);
        EXPECT_EQ(text, expected);
    }
    EXPECT_EQ(VLN_Vpd::GetClassificationText(11, text), 0u);
    EXPECT_EQ(text, "BIOD/Fcode");
}

} // namespace cimple
