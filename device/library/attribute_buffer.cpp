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

const uint8* Attribute_Buffer::find(uint16 identifier, AX_STATUS& status, std::size_t& reported,
                                    std::size_t& room) {
    uint16 length = 0;
    const auto* value =
        static_cast<const uint8*>(AX_GetAttributeValue(data(), identifier, &length, &status));
    if (!value)
        return nullptr;
    const auto offset =
        reinterpret_cast<std::uintptr_t>(value) - reinterpret_cast<std::uintptr_t>(m_bytes.get());
    if (offset >= m_size) {
        VLN_LOG(VLN_ERR, "ERROR: AX_GetAttributeValue points outside of its buffer (%d)",
                identifier);
        status = AX_STATUS_ERROR;
        return nullptr;
    }
    reported = length;
    room = m_size - offset;
    return value;
}

namespace {

// Not found with a status of success is a failure nonetheless.
AX_STATUS failure_of(AX_STATUS status) {
    return status != AX_STATUS_OK ? status : AX_STATUS_ERROR;
}

void log_number_failure(const Attribute_Family& family, const char* label, AX_STATUS status) {
    if (family.kind == Attribute_Family::PORT)
        VLN_LOG(VLN_DBG, "ERROR: AX_GetPortAttributes HA_%s call failed (%d)", label, status);
    else
        VLN_LOG(VLN_DBG, "ERROR: AX_GetHBAAttributeValue HA_%s call failed (%d)", label, status);
}

} // namespace

AX_STATUS getAttributeNumber(const Attribute_Family& family, Attribute_Buffer& buffer,
                             uint16 identifier, const char* label, uint32* destination) {
    AX_STATUS status = AX_STATUS_ERROR;
    std::size_t reported = 0;
    std::size_t room = 0;
    const uint8* value = buffer.find(identifier, status, reported, room);
    if (status != AX_STATUS_OK || !value || room < sizeof *destination) {
        log_number_failure(family, label, status);
        return failure_of(status);
    }
    std::memcpy(destination, value, sizeof *destination);
    VLN_LOG(VLN_DBG, "%s: [ %d ]", label, *destination);
    return AX_STATUS_OK;
}

AX_STATUS getAttributeText(const Attribute_Family& family, Attribute_Text& text,
                           Attribute_Buffer& buffer, uint16 identifier, const char* label) {
    std::memset(text, 0, sizeof text);
    AX_STATUS status = family.textStatus;
    std::size_t reported = 0;
    std::size_t room = 0;
    const uint8* value = buffer.find(identifier, status, reported, room);
    if (status != AX_STATUS_OK || !value) {
        VLN_LOG(VLN_DBG, "ERROR: %s: AX_GetHBAAttributes call failed (%d)", label, status);
        return failure_of(status);
    }
    std::memcpy(text, value, std::min({reported, room, sizeof text - 1}));
    VLN_LOG(VLN_DBG, "%s : [ %s ]", label, text);
    return AX_STATUS_OK;
}

AX_WWN wwnOfPort(const std::string& portName) {
    HBA_WWN name{};
    if (VLN_Identifiers::string2HBAName(&name, portName.c_str()) != 1) {
        VLN_LOG(VLN_ERR, "VLN_MethodWrapper::string2HBAName failed");
        throw std::exception();
    }
    return AX_WwnOf(&name);
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

Attribute_Buffer fetchPortAttributes(AX_WWN wwn) {
    Attribute_Buffer buffer(AX_PORT_ATTRIBUTES_SIZE);
    uint32 size = buffer.size();
    const AX_STATUS status = AX_GetPortAttributes(wwn, buffer.data(), &size);
    if (status != AX_STATUS_OK) {
        VLN_LOG(VLN_ERR, "AX_GetPortAttributes call failed (%d)\n", status);
        throw std::exception();
    }
    return buffer;
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
