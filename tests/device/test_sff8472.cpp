// Transceiver memory, byte by byte as the standard lays it out.

#include "device/sff8472.h"

#include <gtest/gtest.h>

#include <cstring>

namespace cimple {

namespace {

using T = SFF_Transceiver;

template <std::size_t N>
void put(uint8 (&page)[256], std::size_t at, const uint8 (&bytes)[N]) {
    std::memcpy(page + at, bytes, N);
}

void put_text(AX_SffData& data, std::size_t at, const char* text) {
    std::memcpy(data.pageA0 + at, text, std::strlen(text));
}

// An optical module: SFP, LC connector, 850 nm, diagnostics calibrated inside.
AX_SffData optical_module() {
    AX_SffData data{};
    put(data.pageA0, 0, {0x03, 0x04, 0x07});
    put_text(data, 20, "VORLAN          ");
    put(data.pageA0, 37, {0x00, 0x17, 0x6A});
    put_text(data, 40, "VLN-SR-10       ");
    put_text(data, 56, "B2  ");
    put(data.pageA0, 60, {0x03, 0x52});
    put_text(data, 68, "SN42            ");
    put_text(data, 84, "140315A ");
    data.pageA0[92] = 0x68;
    return data;
}

T parsed(const AX_SffData& data) {
    T transceiver;
    EXPECT_TRUE(parse_sff8472(data, transceiver));
    return transceiver;
}

} // namespace

TEST(Sff8472, IdentityOfAModule) {
    const T module = parsed(optical_module());
    EXPECT_EQ(module.identifier, 3);
    EXPECT_EQ(module.extIdentifier, 4);
    EXPECT_EQ(module.connector, 7);
    EXPECT_EQ(module.waveLength, 850);
    EXPECT_EQ(module.vendor, "VORLAN");
    EXPECT_EQ(module.oui, "00-17-6A");
    EXPECT_EQ(module.partNumber, "VLN-SR-10");
    EXPECT_EQ(module.revision, "B2");
    EXPECT_EQ(module.serialNumber, "SN42");
    EXPECT_EQ(module.dateCode, "140315A");
}

TEST(Sff8472, WhatIsNotThereIsNotRead) {
    AX_SffData data{};
    T module;
    EXPECT_FALSE(parse_sff8472(data, module));

    data = optical_module();
    data.pageA0[8] = 0x04; // a passive cable
    data.pageA0[92] = 0;   // without diagnostics
    put_text(data, 20, "\xFF\x01odd");
    put(data.pageA2, 96, {0x20, 0x00});
    module = parsed(data);
    EXPECT_FALSE(module.waveLength);
    EXPECT_FALSE(module.hasDiagnostics);
    EXPECT_FALSE(module.value[T::TEMPERATURE][T::MEASURED]);
    EXPECT_EQ(module.vendor.substr(0, 5), "??odd");
}

struct Expected {
    T::Quantity quantity;
    T::Level level;
    double value;
};

void expect_values(const T& module, std::initializer_list<Expected> rows) {
    EXPECT_TRUE(module.hasDiagnostics);
    for (const Expected& row : rows) {
        const auto& value = module.value[row.quantity][row.level];
        ASSERT_TRUE(value) << row.quantity << "." << row.level;
        EXPECT_NEAR(static_cast<double>(*value), row.value, 1e-4) << row.quantity << row.level;
    }
}

TEST(Sff8472, InternallyCalibratedValues) {
    AX_SffData data = optical_module();
    put(data.pageA2, 0, {0x4B, 0x00, 0xFB, 0x00, 0x46, 0x00, 0x00, 0x00}); // 75, -5, 70, 0 degrees
    put(data.pageA2, 8, {0x8C, 0xA0, 0x75, 0x30, 0x88, 0xB8, 0x79, 0x18});
    put(data.pageA2, 16, {0x1D, 0x4C, 0x07, 0xD0, 0x19, 0x64, 0x0B, 0xB8});
    put(data.pageA2, 24, {0x1F, 0x07, 0x05, 0xDC, 0x18, 0xA6, 0x07, 0x64});
    put(data.pageA2, 32, {0x27, 0x10, 0x00, 0x64, 0x1F, 0x07, 0x00, 0x9E});
    put(data.pageA2, 96, {0x1F, 0x80, 0x80, 0xE8, 0x0F, 0xA0, 0x13, 0x88, 0x09, 0xC4});
    data.pageA2[110] = 0x82;
    const T module = parsed(data);
    EXPECT_EQ(module.status, 0x82);
    expect_values(module, {{T::TEMPERATURE, T::HIGH_ALARM, 75.0},
                           {T::TEMPERATURE, T::LOW_ALARM, -5.0},
                           {T::TEMPERATURE, T::HIGH_WARNING, 70.0},
                           {T::TEMPERATURE, T::LOW_WARNING, 0.0},
                           {T::TEMPERATURE, T::MEASURED, 31.5},
                           {T::VOLTAGE, T::HIGH_ALARM, 3.6},
                           {T::VOLTAGE, T::LOW_ALARM, 3.0},
                           {T::VOLTAGE, T::MEASURED, 3.3},
                           {T::BIAS, T::HIGH_ALARM, 15.0},
                           {T::BIAS, T::LOW_WARNING, 6.0},
                           {T::BIAS, T::MEASURED, 8.0},
                           {T::TX_POWER, T::HIGH_WARNING, 0.631},
                           {T::TX_POWER, T::MEASURED, 0.5},
                           {T::RX_POWER, T::HIGH_ALARM, 1.0},
                           {T::RX_POWER, T::LOW_ALARM, 0.01},
                           {T::RX_POWER, T::MEASURED, 0.25}});
}

TEST(Sff8472, ExternallyCalibratedValues) {
    AX_SffData data = optical_module();
    data.pageA0[92] = 0x58;
    put(data.pageA2, 64, {0x3A, 0x83, 0x12, 0x6F}); // received power: 0.001 x x + 2 x + 10
    put(data.pageA2, 68, {0x40, 0x00, 0x00, 0x00});
    put(data.pageA2, 72, {0x41, 0x20, 0x00, 0x00});
    put(data.pageA2, 76, {0x02, 0x00, 0x00, 0x64}); // bias: 2 x + 100
    put(data.pageA2, 80, {0x01, 0x80, 0xFF, 0x9C}); // sent power: 1.5 x - 100
    put(data.pageA2, 84, {0x01, 0x00, 0x01, 0x80}); // temperature: x + 1.5 degrees
    put(data.pageA2, 88, {0x00, 0x80, 0x00, 0x00}); // voltage: half
    put(data.pageA2, 96, {0xFE, 0x00, 0x80, 0xE8, 0x0F, 0xA0, 0x13, 0x88, 0x03, 0xE8});
    put(data.pageA2, 16, {0x10, 0x00});
    const T module = parsed(data);
    expect_values(module, {{T::TEMPERATURE, T::MEASURED, -0.5},
                           {T::VOLTAGE, T::MEASURED, 1.65},
                           {T::BIAS, T::MEASURED, 16.2},
                           {T::BIAS, T::HIGH_ALARM, 16.584},
                           {T::TX_POWER, T::MEASURED, 0.74},
                           {T::RX_POWER, T::MEASURED, 0.301},
                           {T::RX_POWER, T::LOW_ALARM, 0.001}});

    put(data.pageA2, 56, {0x7F, 0xC0, 0x00, 0x00}); // no number
    EXPECT_FALSE(parsed(data).value[T::RX_POWER][T::MEASURED]);
    EXPECT_TRUE(parsed(data).value[T::TX_POWER][T::MEASURED]);
}

} // namespace cimple
