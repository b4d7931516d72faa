#include "simulator/firmware_image.h"

#include <algorithm>
#include <array>
#include <cstdint>
#include <cstdio>
#include <memory>
#include <optional>
#include <stdexcept>
#include <string_view>

namespace vlnsim {
namespace {

constexpr std::string_view magic = "VLNSIM FIRMWARE 1\n";
constexpr std::size_t longest_line = 127;
constexpr std::size_t largest_image = 256u << 20;

// The check sum of zip files and Ethernet frames.
std::uint32_t crc32(std::string_view bytes) {
    static const auto table = [] {
        std::array<std::uint32_t, 256> rows{};
        for (std::uint32_t i = 0; i < rows.size(); ++i) {
            std::uint32_t row = i;
            for (int bit = 0; bit < 8; ++bit)
                row = (row >> 1) ^ ((row & 1) ? 0xEDB88320u : 0);
            rows[i] = row;
        }
        return rows;
    }();
    std::uint32_t sum = ~0u;
    for (const char byte : bytes)
        sum = (sum >> 8) ^ table[(sum ^ static_cast<unsigned char>(byte)) & 0xFF];
    return ~sum;
}

std::optional<std::string> contents(const char* path) {
    const std::unique_ptr<std::FILE, int (*)(std::FILE*)> file(std::fopen(path, "rb"),
                                                               &std::fclose);
    if (!file)
        return std::nullopt;
    std::string bytes;
    std::array<char, 65536> part{};
    while (const std::size_t read = std::fread(part.data(), 1, part.size(), file.get())) {
        bytes.append(part.data(), read);
        if (bytes.size() > largest_image)
            return std::nullopt;
    }
    return std::ferror(file.get()) ? std::nullopt : std::optional(std::move(bytes));
}

// Takes "key: value" and the end of its line away from the front.
std::optional<std::string> take_line(std::string_view& rest, std::string_view key) {
    const std::size_t end = rest.substr(0, longest_line + 1).find('\n');
    const std::string head = std::string(key) + ": ";
    if (end == rest.npos || !rest.starts_with(head))
        return std::nullopt;
    const std::string value(rest.substr(head.size(), end - head.size()));
    rest.remove_prefix(end + 1);
    return value;
}

bool is_line(const std::string& text) {
    return !text.empty() && text.size() <= 64 &&
           std::all_of(text.begin(), text.end(), [](char c) { return c >= ' ' && c <= '~'; });
}

std::string sum_of(std::string_view bytes) {
    char text[16];
    std::snprintf(text, sizeof text, "%08X", crc32(bytes));
    return text;
}

} // namespace

Firmware_Image read_firmware(const char* path) {
    Firmware_Image image;
    const auto bytes = contents(path);
    if (!bytes)
        return image;
    image.state = Firmware_Image::State::no_image;
    std::string_view rest = *bytes;
    if (!rest.starts_with(magic))
        return image;
    rest.remove_prefix(magic.size());
    const auto model = take_line(rest, "model");
    const auto version = take_line(rest, "version");
    const auto size = take_line(rest, "size");
    const auto sum = take_line(rest, "crc32");
    if (!model || !version || !size || !sum || !is_line(*model) || !is_line(*version))
        return image;
    image.model = *model;
    image.version = *version;
    const bool whole = *size == std::to_string(rest.size()) && *sum == sum_of(rest);
    image.state = whole ? Firmware_Image::State::whole : Firmware_Image::State::damaged;
    return image;
}

std::string firmware_image(const std::string& model, const std::string& version, std::size_t size) {
    if (!is_line(model) || !is_line(version))
        throw std::invalid_argument("model and version are texts of 1 to 64 plain characters");
    if (size > largest_image / 2)
        throw std::invalid_argument("an image has at most " + std::to_string(largest_image / 2) +
                                    " bytes");
    std::string code(size, '\0');
    std::uint32_t number = 1;
    for (char& byte : code)
        byte = static_cast<char>((number = number * 1664525 + 1013904223) >> 24);
    return std::string(magic) + "model: " + model + "\nversion: " + version +
           "\nsize: " + std::to_string(size) + "\ncrc32: " + sum_of(code) + "\n" + code;
}

} // namespace vlnsim
