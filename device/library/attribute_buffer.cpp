#include "device/library/attribute_buffer.h"

#include "device/library/identifiers.h"
#include "foundation/log.h"

#include <algorithm>
#include <cstdio>
#include <cstring>
#include <exception>

namespace cimple {

constexpr Attribute_Family ADAPTER_FAMILY = {Attribute_Family::ADAPTER, AX_STATUS_ERROR};
constexpr Attribute_Family PORT_FAMILY = {Attribute_Family::PORT, AX_STATUS_OK};
constexpr Attribute_Family STATUS_FAMILY = {Attribute_Family::STATUS, AX_STATUS_OK};

struct Attribute_Buffer::Value {
    const uint8* bytes;   // null for none
    std::size_t reported; // its length as the library tells it
    std::size_t room;     // what the buffer has from the value on
};

Attribute_Buffer::Value Attribute_Buffer::find(uint16 identifier, AX_STATUS& status) {
    uint16 length = 0;
    const auto* value =
        static_cast<const uint8*>(AX_GetAttributeValue(data(), identifier, &length, &status));
    if (!value || status != AX_STATUS_OK)
        return {};
    const auto offset =
        reinterpret_cast<std::uintptr_t>(value) - reinterpret_cast<std::uintptr_t>(m_bytes.get());
    if (offset >= m_size) {
        VLN_LOG(VLN_ERR, "ERROR: AX_GetAttributeValue points outside of its buffer (%d)",
                identifier);
        status = AX_STATUS_ERROR;
        return {};
    }
    return {value, length, m_size - offset};
}

bool Attribute_Buffer::read(uint16 identifier, void* destination, std::size_t count,
                            AX_STATUS& status) {
    const Value value = find(identifier, status);
    if (!value.bytes || value.room < count)
        return false;
    std::memcpy(destination, value.bytes, count);
    return true;
}

bool Attribute_Buffer::readUpTo(uint16 identifier, void* destination, std::size_t count,
                                AX_STATUS& status) {
    const Value value = find(identifier, status);
    if (!value.bytes)
        return false;
    std::memcpy(destination, value.bytes, std::min({value.reported, value.room, count}));
    return true;
}

namespace {

// Not found with a status of success is a failure nonetheless.
AX_STATUS failure_of(AX_STATUS status) {
    return status != AX_STATUS_OK ? status : AX_STATUS_ERROR;
}

void log_number_failure(const Attribute_Family& family, const char* label, AX_STATUS status) {
    switch (family.kind) {
    case Attribute_Family::ADAPTER:
        VLN_LOG(VLN_DBG, "ERROR: AX_GetHBAAttributeValue HA_%s call failed (%d)", label, status);
        break;
    case Attribute_Family::PORT:
        VLN_LOG(VLN_DBG, "ERROR: AX_GetPortAttributes HA_%s call failed (%d)", label, status);
        break;
    case Attribute_Family::STATUS:
        VLN_LOG(VLN_ERR, "%s call failed (%d)", label, status);
        break;
    }
}

AX_STATUS read_bytes(const Attribute_Family& family, Attribute_Buffer& buffer, uint16 identifier,
                     const char* label, void* value, std::size_t count) {
    AX_STATUS status = AX_STATUS_ERROR;
    if (buffer.read(identifier, value, count, status))
        return AX_STATUS_OK;
    log_number_failure(family, label, status);
    return failure_of(status);
}

} // namespace

bool getAttributeBytes(const Attribute_Family& family, Attribute_Buffer& buffer, uint16 identifier,
                       const char* label, void* value, std::size_t count) {
    return read_bytes(family, buffer, identifier, label, value, count) == AX_STATUS_OK;
}

AX_STATUS getAttributeNumber(const Attribute_Family& family, Attribute_Buffer& buffer,
                             uint16 identifier, const char* label, uint32* destination) {
    const AX_STATUS status =
        read_bytes(family, buffer, identifier, label, destination, sizeof *destination);
    if (status == AX_STATUS_OK)
        VLN_LOG(VLN_DBG, "%s: [ %d ]", label, *destination);
    return status;
}

AX_STATUS getAttributeText(const Attribute_Family& family, Attribute_Text& text,
                           Attribute_Buffer& buffer, uint16 identifier, const char* label) {
    std::memset(text, 0, sizeof text);
    AX_STATUS status = family.textStatus;
    if (!buffer.readUpTo(identifier, text, sizeof text - 1, status)) {
        VLN_LOG(VLN_DBG, "ERROR: %s: AX_GetHBAAttributes call failed (%d)", label, status);
        return failure_of(status);
    }
    VLN_LOG(VLN_DBG, "%s : [ %s ]", label, text);
    return AX_STATUS_OK;
}

AX_WWN wwnOfPort(const std::string& portName) {
    AX_WWN wwn{};
    if (!wwnOfName(portName.c_str(), wwn, VLN_ERR))
        throw std::exception();
    return wwn;
}

// The library may change the size that it is told; what was allocated stays what counts.
Attribute_Buffer fetchAdapterAttributes(AX_WWN wwn) {
    Attribute_Buffer buffer(AX_ADAPTER_ATTRIBUTES_SIZE);
    uint32 size = buffer.size();
    const AX_STATUS status = AX_GetHBAAttributes(wwn, buffer.data(), &size);
    if (status != AX_STATUS_OK) {
        VLN_LOG(VLN_ERR, "ERROR: AX_GetHBAAttributes call failed (%d)", status);
        throw std::exception();
    }
    return buffer;
}

AX_STATUS fetchPortAttributes(AX_WWN wwn, Attribute_Buffer& buffer) {
    uint32 size = buffer.size();
    return AX_GetPortAttributes(wwn, buffer.data(), &size);
}

Attribute_Buffer fetchPortAttributes(AX_WWN wwn) {
    Attribute_Buffer buffer(AX_PORT_ATTRIBUTES_SIZE);
    const AX_STATUS status = fetchPortAttributes(wwn, buffer);
    if (status != AX_STATUS_OK) {
        VLN_LOG(VLN_ERR, "AX_GetPortAttributes call failed (%d)\n", status);
        throw std::exception();
    }
    return buffer;
}

bool fetchStatus(const char* portName, Attribute_Buffer& buffer, const char* what) {
    AX_WWN wwn{};
    if (!wwnOfName(portName, wwn, VLN_DBG))
        return false;
    const AX_STATUS status = fetchPortAttributes(wwn, buffer);
    if (status != AX_STATUS_OK)
        VLN_LOG(VLN_ERR, "%s call failed (%d)", what, static_cast<int>(status));
    return status == AX_STATUS_OK;
}

void readDriverType(AX_WWN wwn, uint32& type) {
    uint32 value = 0;
    const AX_STATUS status = AX_GetDriverType(wwn, &value);
    if (status != AX_STATUS_OK) {
        VLN_LOG(VLN_ERR, "ERROR: AX_GetDriverType call failed (%d)", status);
        return;
    }
    type = value;
    VLN_LOG(VLN_DBG, "_DriverType: [ %d ]", type);
}

std::string colonText(const uint8* bytes, std::size_t count) {
    std::string text;
    char piece[4];
    for (std::size_t i = 0; i < count; ++i) {
        std::snprintf(piece, sizeof piece, i + 1 < count ? "%02x:" : "%02x", bytes[i]);
        text += piece;
    }
    return text;
}

std::string flagsText(uint32 flags) {
    char text[9];
    std::snprintf(text, sizeof text, "%08x", flags);
    return text;
}

namespace {

// The short form that consoles of this provider read: bytes without leading zeros, a colon behind
// each pair, the last one included, and runs of zero pairs swallowed up to the fourteenth byte.
std::string short_ipv6_text(const uint8 (&address)[16]) {
    std::string text;
    char piece[4];
    for (unsigned i = 0; i < sizeof address; ++i) {
        if (address[i] != 0) {
            std::snprintf(piece, sizeof piece, "%x", address[i]);
            text += piece;
        }
        if (i % 2 == 0)
            continue;
        const bool swallowed = i < 12 && i != 1 && address[i - 1] == 0 && address[i] == 0 &&
                               address[i + 1] == 0 && address[i + 2] == 0;
        if (!swallowed)
            text += ':';
    }
    return text;
}

} // namespace

std::string addressText(const AX_IPAddress& address) {
    if (address.flags & AX_IP_FLAG_V6)
        return short_ipv6_text(address.address);
    char text[16];
    std::snprintf(text, sizeof text, "%d.%d.%d.%d", address.address[0], address.address[1],
                  address.address[2], address.address[3]);
    return text;
}

} // namespace cimple
