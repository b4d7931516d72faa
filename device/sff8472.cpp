#include "device/sff8472.h"

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <cstring>

namespace cimple {

namespace {

using T = SFF_Transceiver;

// Page A0, the identity.
constexpr std::size_t A0_IDENTIFIER = 0;
constexpr std::size_t A0_EXT_IDENTIFIER = 1;
constexpr std::size_t A0_CONNECTOR = 2;
constexpr std::size_t A0_CABLE_TECHNOLOGY = 8;
constexpr std::size_t A0_OUI = 37;
constexpr std::size_t A0_WAVE_LENGTH = 60;
constexpr std::size_t A0_DIAGNOSTIC_TYPE = 92;

constexpr uint8 CABLE_BITS = 0x0C; // active or passive: the wavelength's bytes mean something else
constexpr uint8 DIAGNOSTICS_IMPLEMENTED = 0x40;
constexpr uint8 EXTERNALLY_CALIBRATED = 0x10;

struct Text_Field {
    std::size_t offset;
    std::size_t size;
    std::string T::*field;
};

constexpr Text_Field TEXTS[] = {
    {20, 16, &T::vendor},       {40, 16, &T::partNumber}, {56, 4, &T::revision},
    {68, 16, &T::serialNumber}, {84, 8, &T::dateCode},
};

// Page A2, the diagnostics: from byte 0 four thresholds of two bytes for each quantity, from byte
// 96 a reading for each.
constexpr std::size_t A2_CALIBRATION = 56;
constexpr std::size_t A2_READINGS = 96;
constexpr std::size_t A2_STATUS = 110;
constexpr std::size_t RX_COEFFICIENTS = 5; // of four bytes, the highest power first
constexpr std::size_t A2_SLOPES = A2_CALIBRATION + 4 * RX_COEFFICIENTS;

// What one count is worth, and where slope and offset stand.
struct Scale {
    double unit;
    std::size_t calibration;
};

constexpr std::size_t BY_POLYNOMIAL = 0;
constexpr Scale SCALES[T::QUANTITIES] = {
    {1.0 / 256, A2_SLOPES + 8}, {0.0001, A2_SLOPES + 12}, {0.002, A2_SLOPES},
    {0.0001, A2_SLOPES + 4},    {0.0001, BY_POLYNOMIAL},
};

uint16 word(const uint8* bytes) {
    return static_cast<uint16>(bytes[0] << 8 | bytes[1]);
}

sint16 signed_word(const uint8* bytes) {
    return static_cast<sint16>(word(bytes));
}

real32 real(const uint8* bytes) {
    const uint32 bits = static_cast<uint32>(word(bytes)) << 16 | word(bytes + 2);
    real32 value;
    std::memcpy(&value, &bits, sizeof value);
    return value;
}

// Padded with blanks; what is no ASCII text would not pass as a string of CIM.
std::string padded_text(const uint8* bytes, std::size_t size) {
    std::string text;
    for (std::size_t i = 0; i < size && bytes[i] != 0; ++i)
        text += bytes[i] >= ' ' && bytes[i] <= '~' ? static_cast<char>(bytes[i]) : '?';
    text.erase(text.find_last_not_of(' ') + 1);
    return text;
}

// A count of the module's converter, calibrated by the module's own coefficients. Thresholds are
// counts of the same converter.
double calibrated(const uint8* page, uint8 quantity, double count) {
    const std::size_t at = SCALES[quantity].calibration;
    if (at != BY_POLYNOMIAL)
        return count * word(page + at) / 256 + signed_word(page + at + 2);
    double sum = 0;
    for (std::size_t i = 0; i < RX_COEFFICIENTS; ++i)
        sum = sum * count + static_cast<double>(real(page + A2_CALIBRATION + 4 * i));
    return sum;
}

std::optional<real32> reading(const uint8* page, uint8 quantity, std::size_t at, bool externally) {
    double count = quantity == T::TEMPERATURE ? signed_word(page + at) : word(page + at);
    if (externally)
        count = calibrated(page, quantity, count);
    const auto value = static_cast<real32>(count * SCALES[quantity].unit);
    return std::isfinite(value) ? std::optional(value) : std::nullopt;
}

void read_diagnostics(const uint8* page, bool externally, T& transceiver) {
    transceiver.hasDiagnostics = true;
    transceiver.status = page[A2_STATUS];
    for (uint8 quantity = 0; quantity < T::QUANTITIES; ++quantity) {
        auto& levels = transceiver.value[quantity];
        for (std::size_t level = 0; level < T::MEASURED; ++level)
            levels[level] = reading(page, quantity, 8 * quantity + 2 * level, externally);
        levels[T::MEASURED] = reading(page, quantity, A2_READINGS + 2 * quantity, externally);
    }
}

void read_identity(const uint8* page, T& transceiver) {
    transceiver.identifier = page[A0_IDENTIFIER];
    transceiver.extIdentifier = page[A0_EXT_IDENTIFIER];
    transceiver.connector = page[A0_CONNECTOR];
    if (!(page[A0_CABLE_TECHNOLOGY] & CABLE_BITS))
        transceiver.waveLength = word(page + A0_WAVE_LENGTH);
    for (const Text_Field& row : TEXTS)
        transceiver.*row.field = padded_text(page + row.offset, row.size);
    char oui[9];
    const uint8* bytes = page + A0_OUI;
    std::snprintf(oui, sizeof oui, "%02X-%02X-%02X", bytes[0], bytes[1], bytes[2]);
    transceiver.oui = oui;
}

} // namespace

bool parse_sff8472(const AX_SffData& data, SFF_Transceiver& transceiver) {
    transceiver = {};
    const uint8* identity = data.pageA0;
    if (std::all_of(identity, identity + sizeof data.pageA0, [](uint8 byte) { return byte == 0; }))
        return false;
    read_identity(identity, transceiver);
    const uint8 diagnostics = identity[A0_DIAGNOSTIC_TYPE];
    if (diagnostics & DIAGNOSTICS_IMPLEMENTED)
        read_diagnostics(data.pageA2, (diagnostics & EXTERNALLY_CALIBRATED) != 0, transceiver);
    return true;
}

} // namespace cimple
