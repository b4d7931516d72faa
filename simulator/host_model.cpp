#include "simulator/host_model.h"

#include "simulator/identifiers.h"

#include <cstring>

namespace vlnsim {

namespace {

template <class Number>
Attribute attribute_of(Number number) {
    Bytes bytes(sizeof number);
    std::memcpy(bytes.data(), &number, sizeof number);
    return Attribute::of_bytes(std::move(bytes));
}

template <class Number>
Number number_of(const Attribute& attribute) {
    Number number = 0;
    if (attribute.length >= sizeof number)
        std::memcpy(&number, attribute.bytes.data(), sizeof number);
    return number;
}

} // namespace

Attribute Attribute::of_number(std::uint32_t number) {
    return attribute_of(number);
}

Attribute Attribute::of_wide(std::uint64_t number) {
    return attribute_of(number);
}

Attribute Attribute::of_text(const std::string& text) {
    Attribute attribute;
    attribute.bytes.assign(text.begin(), text.end());
    attribute.bytes.push_back(0);
    attribute.length = static_cast<std::uint16_t>(text.size());
    return attribute;
}

Attribute Attribute::of_bytes(Bytes bytes) {
    Attribute attribute;
    attribute.length = static_cast<std::uint16_t>(bytes.size());
    attribute.bytes = std::move(bytes);
    return attribute;
}

std::uint32_t Attribute::number() const {
    return number_of<std::uint32_t>(*this);
}

std::uint64_t Attribute::wide() const {
    return number_of<std::uint64_t>(*this);
}

std::string Attribute::text() const {
    return std::string(bytes.begin(), bytes.begin() + length);
}

std::uint64_t Function::mac_address() const {
    std::uint8_t name[8] = {};
    const auto found = adapter_attributes.find(adapter_ieee_address);
    if (found != adapter_attributes.end() && found->second.length == 6)
        std::memcpy(name + 2, found->second.bytes.data(), 6);
    return get_name(name);
}

bool Function::shares_port(const Function& other) const {
    const auto port = [](const Function& function) {
        const auto found = function.adapter_attributes.find(adapter_port_number);
        return found == function.adapter_attributes.end() ? 0 : found->second.number();
    };
    return card == other.card && port(*this) == port(other);
}

void put_name(std::uint64_t wwn, std::uint8_t* bytes) {
    for (int i = 7; i >= 0; --i, wwn >>= 8)
        bytes[i] = static_cast<std::uint8_t>(wwn);
}

std::uint64_t get_name(const std::uint8_t* bytes) {
    std::uint64_t wwn = 0;
    for (int i = 0; i < 8; ++i)
        wwn = wwn << 8 | bytes[i];
    return wwn;
}

} // namespace vlnsim
