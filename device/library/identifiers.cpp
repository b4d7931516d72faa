// Identifiers: device identifier, colon form, plain hexadecimal and binary names, IP addresses.
#include "device/library/identifiers.h"

#include "device/library/bound_functions.h"
#include "foundation/log.h"

#include <cstdio>
#include <cstring>
#include <netdb.h>
#include <netinet/in.h>

namespace cimple {

namespace {

constexpr std::size_t NAME_LENGTH = VLN_Identifiers::HBA_NAME_SIZE - 1;
constexpr std::size_t PLAIN_LENGTH = 2 * sizeof(HBA_WWN);

bool isSeparatorPlace(std::size_t index) {
    return index % 3 == 2;
}

// Of a hexadecimal digit in whatever locale; -1 for any other character.
int digitValue(char c) {
    if (c >= '0' && c <= '9')
        return c - '0';
    if (c >= 'a' && c <= 'f')
        return c - 'a' + 10;
    if (c >= 'A' && c <= 'F')
        return c - 'A' + 10;
    return -1;
}

// Eight pairs of digits, step characters from the start of one to the start of the next.
void readPairs(HBA_WWN& name, const char* text, std::size_t step) {
    for (std::size_t i = 0; i < sizeof name.wwn; ++i)
        name.wwn[i] = static_cast<HBA_UINT8>(digitValue(text[i * step]) * 16 +
                                             digitValue(text[i * step + 1]));
}

bool isColonForm(const char* text) {
    for (std::size_t i = 0; i < NAME_LENGTH; ++i) {
        const bool good =
            isSeparatorPlace(i) ? text[i] == ':' || text[i] == ' ' : digitValue(text[i]) >= 0;
        if (!good)
            return false;
    }
    return true;
}

bool copyAddress(const addrinfo& found, VLN_IpInfo& address) {
    switch (found.ai_family) {
    case AF_INET:
        std::memcpy(address.address, &reinterpret_cast<const sockaddr_in*>(found.ai_addr)->sin_addr,
                    4);
        return true;
    case AF_INET6:
        std::memcpy(address.address,
                    &reinterpret_cast<const sockaddr_in6*>(found.ai_addr)->sin6_addr, 16);
        return true;
    default:
        return false;
    }
}

} // namespace

HBA_WWN nameOfDeadPort(const AX_DeadNicPort& port) {
    HBA_WWN name{};
    std::memcpy(name.wwn + sizeof name.wwn - sizeof port.mac, port.mac, sizeof port.mac);
    return name;
}

AX_WWN wwnOf(const HBA_WWN* name) {
    return name ? AX_WwnOf(name) : AX_WWN{};
}

AX_WWN wwnOf(const AX_NAME& name) {
    AX_WWN wwn;
    static_assert(sizeof wwn == sizeof name);
    std::memcpy(&wwn, &name, sizeof wwn);
    return wwn;
}

bool wwnOfName(const char* name, AX_WWN& wwn, int level) {
    HBA_WWN binary{};
    if (VLN_Identifiers::string2HBAName(&binary, name) != 1) {
        VLN_LOG(level, "VLN_MethodWrapper::string2HBAName failed");
        return false;
    }
    wwn = AX_WwnOf(&binary);
    return true;
}

bool nameOfDeviceId(const char* deviceId, HBA_WWN& name, const char* caller, int level) {
    char colonForm[VLN_Identifiers::HBA_NAME_SIZE];
    if (VLN_Identifiers::Id2HBAName(colonForm, deviceId) != 0) {
        VLN_LOG(level, "%sId2HBAName failed", caller);
        return false;
    }
    if (VLN_Identifiers::str2HBAName(&name, colonForm) != 0) {
        VLN_LOG(level, "%sstr2HBAName failed", caller);
        return false;
    }
    return true;
}

uint32 VLN_Identifiers::Id2HBAName(char* text, const char* deviceId) {
    VLN_LOG(VLN_DBG, "Entering VLN_MethodWrapper::Id2HBAName");
    if (!text || !deviceId) {
        VLN_LOG(VLN_ERR, "Null pointer argument in one of the arguments");
        return 1;
    }
    VLN_LOG(VLN_DBG, "DeviceID is:: %s", deviceId);
    const char* source = deviceId[0] == '"' ? deviceId + 1 : deviceId;
    // Past the end of a short identifier its end mark is repeated: the name comes out too short,
    // and str2HBAName refuses it.
    for (std::size_t i = 0; i < NAME_LENGTH; ++i) {
        if (isSeparatorPlace(i) && *source != '\0')
            text[i] = ':';
        else if ((text[i] = *source) != '\0')
            ++source;
    }
    text[NAME_LENGTH] = '\0';
    VLN_LOG(VLN_DBG, "HBA Name is:: %s", text);
    return 0;
}

uint32 VLN_Identifiers::str2HBAName(HBA_WWN* name, const char* text) {
    VLN_LOG(VLN_DBG, "Entering VLN_MethodWrapper::str2HBAName");
    if (!name || !text || strnlen(text, NAME_LENGTH + 1) != NAME_LENGTH) {
        VLN_LOG(VLN_ERR, "INVALID HBA Name");
        return 1;
    }
    VLN_LOG(VLN_DBG, "wwpn:( %s ) ", text);
    if (!isColonForm(text)) {
        VLN_LOG(VLN_ERR, "INVALID HBA Name");
        return 1;
    }
    readPairs(*name, text, 3);
    const HBA_UINT8* b = name->wwn;
    VLN_LOG(VLN_DBG, "After tokenizing wwpn:( %2x %2x %2x %2x %2x %2x %2x %2x )", b[0], b[1], b[2],
            b[3], b[4], b[5], b[6], b[7]);
    return 0;
}

uint32 VLN_Identifiers::string2HBAName(HBA_WWN* name, const char* text) {
    const std::size_t length = text ? strnlen(text, PLAIN_LENGTH + 1) : 0;
    // An empty text passes for a length and fails at its first character.
    bool good = name && length == PLAIN_LENGTH;
    for (std::size_t i = 0; good && i < PLAIN_LENGTH; ++i)
        good = digitValue(text[i]) >= 0;
    if (!good) {
        VLN_LOG(VLN_ERR, "INVALID WWN");
        return 0;
    }
    readPairs(*name, text, 2);
    return 1;
}

uint32 VLN_Identifiers::HBAName2Str(char* text, const HBA_WWN* name) {
    if (text && name) {
        const HBA_UINT8* b = name->wwn;
        std::snprintf(text, HBA_NAME_SIZE, "%02X:%02X:%02X:%02X:%02X:%02X:%02X:%02X", b[0], b[1],
                      b[2], b[3], b[4], b[5], b[6], b[7]);
    }
    return 0;
}

uint32 VLN_Identifiers::Validatewwpn(const HBA_WWN* name) {
    VLN_LOG(VLN_DBG, "Entering VLN_MethodWrapper::Validatewwpn()");
    uint32 isLocal = 0;
    const AX_STATUS status = AX_IsLocalHBA(wwnOf(name), &isLocal);
    VLN_LOG(VLN_DBG, "AX_IsLocalHBA: status=%d", status);
    if (status == AX_STATUS_OK && isLocal != 0)
        return 0;
    VLN_LOG(VLN_ERR, "HBA IS NOT LOCAL");
    return 1;
}

uint32 VLN_Identifiers::ipAddr2IpInfo(const char* text, VLN_IpInfo* address) {
    VLN_LOG(VLN_DBG, "Entering VLN_MethodWrapper ipAddr2IpInfo");
    bool good = false;
    if (address)
        *address = VLN_IpInfo{};
    if (address && text) {
        const addrinfo hints{};
        addrinfo* found = nullptr;
        const int error = getaddrinfo(text, nullptr, &hints, &found);
        if (error != 0) {
            VLN_LOG(VLN_CRIT, "getaddrinfo fails with %s", gai_strerror(error));
        } else {
            good = copyAddress(*found, *address);
            freeaddrinfo(found);
        }
    }
    if (!good)
        VLN_LOG(VLN_ERR, "VLN_HostAddrStrToIPAddr returned false");
    return good ? 0 : 1;
}

} // namespace cimple
