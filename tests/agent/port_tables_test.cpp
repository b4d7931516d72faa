// The codes and masks of ports as a client sees them.
#include "agent/fcoe/fc_port_tables.h"
#include "agent/state_tables.h"
#include "classes/VLNMPCA_FCPort.h"

#include <gtest/gtest.h>

namespace cimple {

namespace {

// The values that a mask comes to.
template <class Mask>
std::string values_of(void (*append)(Property<Array<uint16>>&, Mask), std::decay_t<Mask> mask) {
    const Ref<VLNMPCA_FCPort> port(create<VLNMPCA_FCPort>(true));
    append(port->SupportedCOS, mask);
    EXPECT_FALSE(port->SupportedCOS.is_null());
    std::string texts;
    for (uint16 value : port->SupportedCOS.value)
        texts += std::to_string(value) + " ";
    return texts;
}

// The byte of the mask and the bit in it, as the standard numbers them.
Fc4_Types bit(std::size_t byte, unsigned number) {
    Fc4_Types mask{};
    mask[byte] = static_cast<uint8>(1U << number);
    return mask;
}

} // namespace

TEST(Port_Tables, Speeds) {
    constexpr uint64 G = 1000000000;
    const std::pair<uint32, uint64> codes[] = {{1, G},      {2, 2 * G}, {4, 10 * G}, {8, 4 * G},
                                               {16, 8 * G}, {0, 0},     {3, 0},      {32, 0}};
    for (const auto& [code, speed] : codes)
        EXPECT_EQ(speed_of_code(code), speed) << code;
    const std::pair<uint32, uint64> masks[] = {{31, 10 * G}, {27, 8 * G}, {11, 4 * G}, {3, 2 * G},
                                               {1, G},       {32, 0},     {36, 10 * G}};
    for (const auto& [mask, speed] : masks)
        EXPECT_EQ(max_speed_of_mask(mask), speed) << mask;
}

TEST(Port_Tables, ServiceClassesAndFc4Types) {
    const std::pair<uint32, const char*> classes[] = {
        {0, "0 "}, {8, "3 "}, {1 | 2 | 4 | 8 | 16 | 64, "7 1 2 3 4 5 "}, {32 | 128, "0 "}};
    for (const auto& [mask, values] : classes)
        EXPECT_EQ(values_of(append_service_classes, mask), values);
    const std::pair<Fc4_Types, const char*> types[] = {
        {{}, "0 "},           {bit(2, 0), "8 "}, // SCSI-FCP
        {bit(3, 5), "5 "},                       // IP
        {bit(7, 0), "32 "},                      // Fibre Channel services
        {bit(15, 0), "96 "},                     // FC-AV
        {bit(6, 0), "1 "},                       // type 40, which CIM does not know
        {bit(28, 7), "255 "},                    // the last of a vendor's
        {bit(24, 7), "1 "},                      // just below a vendor's
        {bit(31, 0), "255 "},                    // the first of a vendor's
    };
    for (const auto& [mask, values] : types)
        EXPECT_EQ(values_of(append_fc4_types, mask), values);
    Fc4_Types all;
    all.fill(0xFF);
    const std::string values = values_of(append_fc4_types, all);
    EXPECT_TRUE(values.starts_with("1 ") && values.ends_with(" 255 ")) << values;
    EXPECT_EQ(std::count(values.begin(), values.end(), ' '),
              static_cast<std::ptrdiff_t>(std::size(fc4Types) + 2))
        << "each value once";
}

} // namespace cimple
