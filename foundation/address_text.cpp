#include "foundation/address_text.h"

#include <charconv>
#include <cstdio>

namespace cimple {

namespace {

constexpr std::size_t IPV4_DIGITS = 3; // of one number

// Cuts a number of digits and nothing else off the text. A sign is no digit, though from_chars
// takes one for a signed type.
template <class Number>
bool take_number(std::string_view& text, std::size_t digits, int base, Number& number) noexcept {
    const std::string_view head = text.substr(0, digits);
    const auto [end, error] = std::from_chars(head.data(), head.data() + head.size(), number, base);
    if (error != std::errc())
        return false;
    text.remove_prefix(static_cast<std::size_t>(end - head.data()));
    return true;
}

} // namespace

std::optional<IPv4_Bytes> parse_ipv4(std::string_view text) noexcept {
    IPv4_Bytes address{};
    for (std::size_t i = 0; i < address.size(); ++i) {
        if (i > 0 && !text.starts_with('.'))
            return std::nullopt;
        text.remove_prefix(i > 0);
        if (!take_number(text, IPV4_DIGITS, 10, address[i]))
            return std::nullopt;
    }
    return text.empty() ? std::optional(address) : std::nullopt;
}

std::optional<MAC_Bytes> parse_mac(std::string_view text) noexcept {
    constexpr std::size_t BARE = 12, PARTED = 17;
    if (text.size() != BARE && text.size() != PARTED)
        return std::nullopt;
    const std::size_t step = text.size() == PARTED ? 3 : 2;
    const char separator = text[2];
    if (step == 3 && separator != '-' && separator != ':')
        return std::nullopt;
    MAC_Bytes mac{};
    for (std::size_t i = 0; i < mac.size(); ++i) {
        std::string_view pair = text.substr(i * step, 2);
        if (!take_number(pair, 2, 16, mac[i]) || !pair.empty())
            return std::nullopt;
        if (step == 3 && i > 0 && text[i * step - 1] != separator)
            return std::nullopt;
    }
    return mac;
}

std::string ipv4_text(const IPv4_Bytes& address) {
    char text[16];
    std::snprintf(text, sizeof text, "%d.%d.%d.%d", address[0], address[1], address[2], address[3]);
    return text;
}

std::string mac_digits(const MAC_Bytes& mac) {
    char text[13];
    std::snprintf(text, sizeof text, "%02x%02x%02x%02x%02x%02x", mac[0], mac[1], mac[2], mac[3],
                  mac[4], mac[5]);
    return text;
}

} // namespace cimple
