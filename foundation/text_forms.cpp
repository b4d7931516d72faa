// VLN_Common: text forms of names, addresses and records.
#include "foundation/common.h"

#include "foundation/field_text.h"

#include "cimple/instance.h"
#include "foundation/log.h"

#include <algorithm>
#include <cctype>
#include <cstdio>
#include <cstring>
#include <hbaapi.h>

namespace cimple {

namespace {

void append_hex(std::string& dst, const uint8* bytes, std::size_t count) {
    static constexpr char DIGITS[] = "0123456789ABCDEF";
    for (std::size_t i = 0; i < count; ++i) {
        dst += DIGITS[bytes[i] >> 4];
        dst += DIGITS[bytes[i] & 0xF];
    }
}

sint32 hex_text(std::string* dst, const uint8* bytes, std::size_t count) {
    if (!dst)
        return 0;
    dst->clear();
    if (bytes)
        append_hex(*dst, bytes, count);
    return 0;
}

std::string mac_text(const uint8* mac) {
    char text[18];
    std::snprintf(text, sizeof text, "%02x-%02x-%02x-%02x-%02x-%02x", mac[0], mac[1], mac[2],
                  mac[3], mac[4], mac[5]);
    return text;
}

bool is_digit_pair_text(const char* text, std::size_t length) {
    return std::strlen(text) == length &&
           std::all_of(text, text + length, [](unsigned char c) { return std::isxdigit(c) != 0; });
}

} // namespace

sint32 VLN_Common::wwnToString(std::string* dst, const uint8* wwn) {
    return hex_text(dst, wwn, 8);
}

sint32 VLN_Common::wwn16ToString(std::string* dst, const uint8* bytes) {
    return hex_text(dst, bytes, 16);
}

std::string VLN_Common::wwnText(const uint8* wwn) {
    std::string text;
    wwnToString(&text, wwn);
    return text;
}

sint32 VLN_Common::stringToWwn(uint8* bytes, const char* text) {
    if (!bytes || !text || !is_digit_pair_text(text, 16)) {
        VLN_LOG(VLN_ERR, "INVALID WWN");
        return VLN_GENERAL_ERROR;
    }
    for (int i = 0; i < 8; ++i) {
        unsigned value = 0;
        std::sscanf(text + 2 * i, "%02x", &value);
        bytes[i] = static_cast<uint8>(value);
    }
    return 0;
}

sint32 VLN_Common::stringToWwnWord(uint8* out, const char* text) {
    uint8 bytes[8];
    if (!out || stringToWwn(bytes, text) != 0)
        return 0;
    std::memcpy(out, bytes, sizeof bytes);
    return 1;
}

sint32 VLN_Common::formatMacWithDashes(std::string* dst, const uint8* mac) {
    if (!dst || !mac)
        return VLN_GENERAL_ERROR;
    *dst = mac_text(mac);
    return 0;
}

sint32 VLN_Common::macToText(const uint8* mac, std::string* dst) {
    if (dst && mac)
        *dst = mac_text(mac);
    return 0;
}

sint32 VLN_Common::macToNaa(std::string* dst, const char* mac) {
    if (!dst || !mac || std::strlen(mac) != 17)
        return VLN_GENERAL_ERROR;
    std::string text(mac);
    for (std::size_t dash : {2U, 5U, 8U, 11U, 14U}) {
        if (text[dash] != '-')
            return VLN_GENERAL_ERROR;
        text[dash] = ':';
    }
    *dst = text + ":00:00";
    return 0;
}

sint32 VLN_Common::bytesToSeparatedText(const sint8* bytes, char* dst, const char* separator,
                                        uint32 count, uint32 max) {
    if (!dst)
        return 0;
    uint32 length = 0;
    dst[0] = dst[max] = '\0';
    if (!bytes)
        return 0;
    for (uint32 i = 0; i < count; ++i) {
        std::string piece = (i > 0 && separator ? separator : "") + std::to_string(bytes[i]);
        if (length + piece.size() >= max)
            return 1;
        std::memcpy(dst + length, piece.c_str(), piece.size() + 1);
        length += static_cast<uint32>(piece.size());
    }
    return 0;
}

sint32 VLN_Common::descriptorToString(std::string* dst, const uint8* bytes, uint32 length) {
    if (!dst)
        return 0;
    if (length == 16 || length == 12 || length == 8)
        return hex_text(dst, bytes, length);
    dst->clear();
    VLN_LOG(VLN_ERR, "INVALID Descriptor");
    return 0;
}

void VLN_Common::hexRangeToString(std::string* dst, const uint8* record, uint32 from, uint32 to) {
    if (dst && record && from < to)
        append_hex(*dst, record + from, to - from);
}

void VLN_Common::byteSwapCopy(const void* src, void* dst, std::size_t n) {
    const auto* from = static_cast<const uint8*>(src);
    std::reverse_copy(from, from + n, static_cast<uint8*>(dst));
}

sint32 VLN_Common::adapterAttributesText(const hba_AdapterAttributes* attributes,
                                         std::string* dst) {
    if (!dst)
        return 0;
    if (!attributes)
        return VLN_GENERAL_ERROR;
    *dst = "Manufacturer: " + fieldText(attributes->Manufacturer) +
           "NodeWWN: " + wwnText(attributes->NodeWWN.wwn) +
           "ModelDescription: " + fieldText(attributes->ModelDescription) +
           "NodeSymbolicName: " + fieldText(attributes->NodeSymbolicName) +
           "HardwareVersion: " + fieldText(attributes->HardwareVersion) +
           "DriverVersion: " + fieldText(attributes->DriverVersion) +
           "FirmwareVersion: " + fieldText(attributes->FirmwareVersion) +
           "DriverName: " + fieldText(attributes->DriverName);
    return 0;
}

char* VLN_Common::nextToken(char* text, const char* delimiters, char** save) {
    char* token = text ? text : *save;
    if (!token)
        return nullptr;
    token += std::strspn(token, delimiters);
    if (*token == '\0') {
        *save = nullptr;
        return nullptr;
    }
    char* end = token + std::strcspn(token, delimiters);
    *save = *end ? end + 1 : nullptr;
    *end = '\0';
    return token;
}

void VLN_Common::traceInt(const char* name, sint32 value) {
    VLN_LOG(VLN_DBG, "%s: %d", name, value);
}

void VLN_Common::traceString(const char* name, const char* value) {
    VLN_LOG(VLN_DBG, "%s: %s", name, value ? value : "");
}

void VLN_Common::traceUint16Array(const char* name, const Array<uint16>& array) {
    if (!log_wanted(VLN_DBG))
        return;
    std::string numbers;
    for (uint32 i = 0; i < array.size(); ++i)
        numbers += (i > 0 ? "," : "") + std::to_string(array[i]);
    VLN_LOG(VLN_DBG, "%s: %s", name, numbers.c_str());
}

void VLN_Common::traceInstance(const char* name, const Instance* instance) {
    if (!log_wanted(VLN_DBG))
        return;
    String path;
    if (instance)
        instance_to_model_path(instance, path);
    VLN_LOG(VLN_DBG, "%s: %s", name, path.c_str());
}

} // namespace cimple
