// Addresses as clients write them, and as they are shown.
#ifndef FOUNDATION_ADDRESS_TEXT_H
#define FOUNDATION_ADDRESS_TEXT_H

#include "cimple/types.h"

#include <array>
#include <optional>
#include <string>
#include <string_view>

namespace cimple {

using IPv4_Bytes = std::array<uint8, 4>; // the most significant first
using MAC_Bytes = std::array<uint8, 6>;

// "a.b.c.d": four decimal numbers up to 255 of at most three digits, with nothing before, between
// or behind them. A number with leading zeros is a decimal one like others.
std::optional<IPv4_Bytes> parse_ipv4(std::string_view text) noexcept;

// Twelve hexadecimal digits of either case, bare or in pairs that are all parted by "-" or all by
// ":".
std::optional<MAC_Bytes> parse_mac(std::string_view text) noexcept;

std::string ipv4_text(const IPv4_Bytes& address);
// Bare digits, as the ports show theirs.
std::string mac_digits(const MAC_Bytes& mac);

} // namespace cimple

#endif // FOUNDATION_ADDRESS_TEXT_H
