// Values that a library tells of beside the buffer that it was given, and texts of its addresses.
#include "device/library/attribute_buffer.h"
#include "device/library/bound_functions.h"
#include "device/library/runtime_loader.h"

#include <cstring>
#include <gtest/gtest.h>

namespace cimple {

namespace {

std::ptrdiff_t offset; // of every value, in its buffer

void* value(void* buffer, uint16_t, uint16_t* length, AX_STATUS* status) {
    *length = 0xFFFF;
    *status = AX_STATUS_OK;
    return reinterpret_cast<void*>(reinterpret_cast<std::uintptr_t>(buffer) +
                                   static_cast<std::uintptr_t>(offset));
}

constexpr Loader_Calls ONE_FUNCTION = {
    [](const char*, int) -> void* { return &offset; },
    [](void*, const char* name) -> void* {
        return std::strstr(name, "AX_GetAttributeValue") ? reinterpret_cast<void*>(value) : nullptr;
    },
    [](void*) { return 0; },
    [] {
        static char none[] = "";
        return none;
    },
};

TEST(Attribute_Buffer, ValuesBesideItAreRefusedAndThoseAtItsEndAreCut) {
    VLN_Runtime_Loader::setCalls(&ONE_FUNCTION);
    loadRuntimeLibraries();
    constexpr uint32 SIZE = 64;
    Attribute_Buffer buffer(SIZE);
    std::memset(buffer.data(), 'v', SIZE);
    const struct {
        std::ptrdiff_t offset;
        bool text, number; // whether it is taken
        std::size_t length;
    } rows[] = {{0, true, true, SIZE},      {SIZE - 4, true, true, 4},
                {SIZE - 3, true, false, 3}, // a number that does not fit is none
                {SIZE, false, false, 0},    {-1, false, false, 0},
                {1 << 20, false, false, 0}};
    for (const auto& row : rows) {
        offset = row.offset;
        Attribute_Text text;
        uint32 number = 7;
        EXPECT_EQ(getAttributeText(ADAPTER_FAMILY, text, buffer, 1, "") == AX_STATUS_OK, row.text);
        EXPECT_EQ(std::string(text), std::string(row.length, 'v')) << row.offset;
        EXPECT_EQ(getAttributeNumber(ADAPTER_FAMILY, buffer, 1, "", &number) == AX_STATUS_OK,
                  row.number);
        EXPECT_EQ(number, row.number ? 0x76767676U : 7U) << row.offset;
        std::string bytes(SIZE + 16, '.');
        AX_STATUS status = AX_STATUS_OK;
        buffer.readUpTo(1, bytes.data(), bytes.size(), status);
        EXPECT_EQ(bytes, std::string(row.length, 'v') + std::string(SIZE + 16 - row.length, '.'));
    }
    unloadRuntimeLibraries();
    VLN_Runtime_Loader::setCalls(nullptr);
}

TEST(Attribute_Buffer, AddressTexts) {
    const std::pair<AX_IPAddress, const char*> cases[] = {
        {{{255, 255, 255, 0, 9, 9}, 0, 0xFFFE}, "255.255.255.0"},
        {{{}, 0, 1}, ":::"},
        {{{0xFE, 0x80, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 1}, 0, 1}, "fe80::1:"},
        {{{0x20, 0x01, 0x0D, 0xB8, 0, 1, 0, 0, 0, 0, 0, 0, 0, 0, 0x10, 0}, 0, 1}, "201:db8:1::10:"},
        {{{1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12, 13, 14, 15, 16}, 0, 1},
         "12:34:56:78:9a:bc:de:f10:"}};
    for (const auto& [address, text] : cases)
        EXPECT_EQ(addressText(address), text);
}

} // namespace

} // namespace cimple
