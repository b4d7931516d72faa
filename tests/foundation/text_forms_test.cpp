#include "tests/foundation/foundation_fixture.h"

#include "foundation/address_text.h"
#include "foundation/common.h"

#include <cstring>
#include <hbaapi.h>

namespace cimple {

constexpr uint8 BYTES[16] = {0x10, 0x00, 0xAB, 0xCD, 0xEF, 0x01, 0x02, 0xFF,
                             0x00, 0x11, 0x22, 0x33, 0x44, 0x55, 0x66, 0x77};

class Text_Forms_Test : public Foundation_Test {
protected:
    std::string text;
};

TEST_F(Text_Forms_Test, BytesToText) {
    EXPECT_EQ(VLN_Common::wwnToString(&text, BYTES), 0);
    EXPECT_EQ(text, "1000ABCDEF0102FF");
    EXPECT_EQ(VLN_Common::wwn16ToString(&text, BYTES), 0);
    EXPECT_EQ(text, "1000ABCDEF0102FF0011223344556677");
    EXPECT_EQ(VLN_Common::formatMacWithDashes(&text, BYTES + 2), 0);
    EXPECT_EQ(text, "ab-cd-ef-01-02-ff");
    EXPECT_EQ(VLN_Common::macToText(BYTES, &text), 0);
    EXPECT_EQ(text, "10-00-ab-cd-ef-01");
    text = "tag ";
    VLN_Common::hexRangeToString(&text, BYTES, 2, 5);
    VLN_Common::hexRangeToString(&text, BYTES, 5, 5);
    VLN_Common::hexRangeToString(&text, BYTES, 5, 2);
    VLN_Common::hexRangeToString(&text, nullptr, 0, 2);
    VLN_Common::hexRangeToString(nullptr, BYTES, 0, 2);
    EXPECT_EQ(text, "tag ABCDEF");
    uint8 swapped[4];
    VLN_Common::byteSwapCopy(BYTES, swapped, sizeof swapped);
    EXPECT_EQ(std::memcmp(swapped, "\xCD\xAB\x00\x10", 4), 0);
    // Without a destination nothing is done.
    EXPECT_EQ(VLN_Common::wwnToString(nullptr, BYTES), 0);
    EXPECT_EQ(VLN_Common::wwn16ToString(nullptr, BYTES), 0);
    EXPECT_EQ(VLN_Common::macToText(BYTES, nullptr), 0);
    EXPECT_EQ(VLN_Common::descriptorToString(nullptr, BYTES, 8), 0);
    EXPECT_EQ(VLN_Common::bytesToSeparatedText(nullptr, nullptr, ",", 0, 0), 0);
    EXPECT_EQ(VLN_Common::formatMacWithDashes(nullptr, BYTES), 32769);
}

TEST_F(Text_Forms_Test, Descriptors) {
    const std::pair<uint32, const char*> cases[] = {{16, "1000ABCDEF0102FF0011223344556677"},
                                                    {12, "1000ABCDEF0102FF00112233"},
                                                    {8, "1000ABCDEF0102FF"},
                                                    {20, ""},
                                                    {0, ""}};
    Log_Capture capture;
    for (const auto& [length, expected] : cases) {
        text = "before";
        EXPECT_EQ(VLN_Common::descriptorToString(&text, BYTES, length), 0);
        EXPECT_EQ(text, expected) << length;
    }
    EXPECT_EQ(capture.lines.size(), 2U);
    EXPECT_TRUE(capture.has(VLN_ERR, "INVALID Descriptor"));
}

TEST_F(Text_Forms_Test, SeparatedBytesStopBeforeTheEnd) {
    const sint8 bytes[] = {1, -128, 0, 127};
    char room[16];
    std::memset(room, '#', sizeof room);
    EXPECT_EQ(VLN_Common::bytesToSeparatedText(bytes, room, ".", 4, 15), 0);
    EXPECT_STREQ(room, "1.-128.0.127");
    std::memset(room, '#', sizeof room);
    EXPECT_EQ(VLN_Common::bytesToSeparatedText(bytes, room, ".", 4, 12), 1);
    EXPECT_STREQ(room, "1.-128.0");
    EXPECT_EQ(room[12], '\0');
    EXPECT_EQ(room[13], '#') << "nothing behind dst[max]";
}

TEST_F(Text_Forms_Test, TextToWwn) {
    uint8 bytes[8] = {};
    EXPECT_EQ(VLN_Common::stringToWwn(bytes, "1000abcdEF0102ff"), 0);
    EXPECT_EQ(std::memcmp(bytes, BYTES, 8), 0);
    uint8 word[8] = {9};
    EXPECT_EQ(VLN_Common::stringToWwnWord(word, "1000ABCDEF0102FF"), 1);
    EXPECT_EQ(std::memcmp(word, BYTES, 8), 0);
    Log_Capture capture;
    for (const char* bad :
         {static_cast<const char*>(nullptr), "", "1000ABCDEF0102F", "1000ABCDEF0102FFF",
          "1000ABCDEF0102Fg", "0x00ABCDEF0102FF", " 000ABCDEF0102FF",
          "\xff\xff\xff\xff\xff\xff\xff\xff"
          "\xff\xff\xff\xff\xff\xff\xff\xff"}) {
        EXPECT_EQ(VLN_Common::stringToWwn(bytes, bad), 32769);
        EXPECT_EQ(VLN_Common::stringToWwnWord(word, bad), 0);
    }
    EXPECT_EQ(std::memcmp(word, BYTES, 8), 0) << "a failure leaves the word alone";
    EXPECT_EQ(capture.lines.size(), 16U);
}

TEST_F(Text_Forms_Test, MacToNaa) {
    EXPECT_EQ(VLN_Common::macToNaa(&text, "00-11-22-aa-bb-cc"), 0);
    EXPECT_EQ(text, "00:11:22:aa:bb:cc:00:00");
    for (const char* bad : {static_cast<const char*>(nullptr), "", "00-11-22-aa-bb-c",
                            "00-11-22-aa-bb-ccc", "00:11-22-aa-bb-cc", "00-11-22-aa-bb.cc"})
        EXPECT_EQ(VLN_Common::macToNaa(&text, bad), 32769) << (bad ? bad : "null");
    EXPECT_EQ(text, "00:11:22:aa:bb:cc:00:00");
}

TEST_F(Text_Forms_Test, AddressesAreTakenWholeOrNotAtAll) {
    const auto ipv4 = [](std::string_view given) {
        const auto address = parse_ipv4(given);
        return address ? ipv4_text(*address) : "";
    };
    const auto mac = [](std::string_view given) {
        const auto address = parse_mac(given);
        return address ? mac_digits(*address) : "";
    };
    EXPECT_EQ(ipv4("0.0.0.0"), "0.0.0.0");
    EXPECT_EQ(ipv4("255.010.9.001"), "255.10.9.1");
    for (const char* bad : {"", "300.1.1.1", "1.2.3", "1.2.3.4x", "1.2.3.4.", "1.2.3.4.5",
                            " 1.2.3.4", "1.2.3.4 ", "1..3.4", "1.2.3.-4", "+1.2.3.4", "1.2.3.0x4",
                            "1.2.3.0004", "1.2.3.256", "1,2,3,4", "::1"})
        EXPECT_EQ(ipv4(bad), "") << bad;
    EXPECT_EQ(ipv4({"1.2.3.4\0", 8}), "");
    for (const char* good : {"02564cABcd00", "02-56-4c-ab-cd-00", "02:56:4C:AB:CD:00"})
        EXPECT_EQ(mac(good), "02564cabcd00") << good;
    for (const char* bad : {"", "02564cabcd0", "02564cabcd000", "02564cabcdxx", "02-56-4c-ab-cd:00",
                            "02 56 4c ab cd 00", "2:56:4c:ab:cd:000", "0x564cabcd00",
                            "02.56.4c.ab.cd.00", "-2564cabcd00"})
        EXPECT_EQ(mac(bad), "") << bad;
}

TEST_F(Text_Forms_Test, FirmwareVersions) {
    const std::string none = "0 0 0 0 ";
    const std::pair<const char*, std::string> cases[] = {
        {"3.02a0", "3 0 2 0 a"},
        {"3.02a0r7", "3 0 2 0 a"}, // a test release is not told apart
        {"3.02a0rx", "3 0 2 0 a"},
        {"9.87Z6 and words", "9 8 7 6 Z"},
        {"3.2a0", none},
        {"3.2a00", none},
        {"x.02a0", none},
        {"3,02a0", none},
        {"3.x2a0", none},
        {"3.0200", none},
        {"3.02ax", none},
        {"3.02\xE4\x30", none},
        {"", none},
        {nullptr, none},
    };
    for (const auto& [given, expected] : cases) {
        VLN_FirmwareVersion version;
        EXPECT_EQ(VLN_Common::parseVersion(given, version), expected == none ? 32769 : 0);
        std::string parts;
        for (uint16 number : {version.major, version.minor, version.revision, version.build})
            parts += std::to_string(number) + " ";
        EXPECT_EQ(parts + version.releaseType + version.testRevision, expected);
    }
}

TEST_F(Text_Forms_Test, VersionOfFourNumbers) {
    uint16 numbers[4] = {9, 9, 9, 9};
    Log_Capture capture;
    EXPECT_EQ(VLN_Common::versionFourNumbers("10.2.261.13.99", numbers), 0);
    EXPECT_TRUE(capture.has(VLN_DBG, "10, 2, 261, 13"));
    EXPECT_EQ(VLN_Common::versionFourNumbers("4..x", numbers), 0);
    EXPECT_TRUE(capture.has(VLN_DBG, "4, 0, 0, 0"));
    const std::string endless(500, '1');
    EXPECT_EQ(VLN_Common::versionFourNumbers(endless.c_str(), numbers), 0);
    EXPECT_EQ(VLN_Common::versionFourNumbers(nullptr, numbers), 32769);
}

TEST_F(Text_Forms_Test, Tokens) {
    char line[] = ",,one,;two;";
    char* place = nullptr;
    EXPECT_STREQ(VLN_Common::nextToken(line, ",;", &place), "one");
    EXPECT_STREQ(VLN_Common::nextToken(nullptr, ",;", &place), "two");
    EXPECT_EQ(VLN_Common::nextToken(nullptr, ",;", &place), nullptr);
    EXPECT_EQ(VLN_Common::nextToken(nullptr, ",;", &place), nullptr);
}

// The fields of a record need not be terminated.
TEST_F(Text_Forms_Test, AdapterAttributes) {
    HBA_ADAPTERATTRIBUTES record{};
    std::memset(record.Manufacturer, 'm', sizeof record.Manufacturer);
    std::memcpy(record.NodeWWN.wwn, BYTES, 8);
    std::strcpy(record.DriverName, "vfcd");
    EXPECT_EQ(VLN_Common::adapterAttributesText(&record, &text), 0);
    EXPECT_EQ(text, "Manufacturer: " + std::string(64, 'm') +
                        "NodeWWN: 1000ABCDEF0102FFModelDescription: NodeSymbolicName: "
                        "HardwareVersion: DriverVersion: FirmwareVersion: DriverName: vfcd");
}

TEST_F(Text_Forms_Test, DebugLines) {
    Log_Capture capture;
    const Array<uint16> numbers{1, 65535};
    VLN_Common::traceInt("count", -3);
    VLN_Common::traceString("name", nullptr);
    VLN_Common::traceUint16Array("states", numbers);
    VLN_Common::traceInstance("nobody", nullptr);
    for (const char* line : {"count: -3", "name: ", "states: 1,65535", "nobody: "})
        EXPECT_TRUE(capture.has(VLN_DBG, line)) << line;
}

} // namespace cimple
