// Identifiers of adapters and ports in their written and binary forms, and IP addresses.
//
// All of it may be called on any thread, holds no lock and throws nothing.
#ifndef VLN_DEVICE_LIBRARY_IDENTIFIERS_H
#define VLN_DEVICE_LIBRARY_IDENTIFIERS_H

#include "cimple/types.h"
#include "device/library/axapi.h"

#include <cstddef>

namespace cimple {

// An IP address: IPv4 in the first four bytes and the rest zero, or IPv6, in network order.
struct VLN_IpInfo {
    uint8 address[16];
};

// The name as the library takes it. A null pointer gives the null name, which is no adapter's and
// which the library refuses.
AX_WWN wwnOf(const HBA_WWN* name);
AX_WWN wwnOf(const AX_NAME& name); // one of a record

// A name of 16 hexadecimal digits as the library takes it. False, with a line at the level, for a
// text that is none.
bool wwnOfName(const char* name, AX_WWN& wwn, int level);

// A device identifier in binary. False, with the caller's line of the step that failed at the
// level, for a text that is none.
bool nameOfDeviceId(const char* deviceId, HBA_WWN& name, const char* caller, int level);

// By what the library takes a port whose firmware has failed, which has no name of its own: its MAC
// address as a number.
HBA_WWN nameOfDeadPort(const AX_DeadNicPort& port);

// A device identifier is 16 hexadecimal digits, with or without a double quote in front; the
// colon form is "XX:XX:XX:XX:XX:XX:XX:XX". Mind the senses of the results.
struct VLN_Identifiers {
    // Bytes of a name in colon form with its end mark.
    static constexpr std::size_t HBA_NAME_SIZE = 24;

    // Device identifier to colon form; text has room for HBA_NAME_SIZE. 0, or 1 for a null
    // argument. The characters are not tested: str2HBAName refuses what is no name.
    static uint32 Id2HBAName(char* text, const char* deviceId);
    // Colon form to binary. 0, or 1 when the text is not valid.
    static uint32 str2HBAName(HBA_WWN* name, const char* text);
    // 16 hexadecimal digits to binary. 1 for success and 0 for failure: the reverse of the others.
    static uint32 string2HBAName(HBA_WWN* name, const char* text);
    // Binary to colon form; text has room for HBA_NAME_SIZE. 0 always; a null text is left alone.
    static uint32 HBAName2Str(char* text, const HBA_WWN* name);
    // 0 when the name is a local adapter's, 1 otherwise.
    static uint32 Validatewwpn(const HBA_WWN* name);
    // Address or host name to binary; it may ask the resolver. 0, or 1 when that fails.
    static uint32 ipAddr2IpInfo(const char* text, VLN_IpInfo* address);
};

} // namespace cimple

#endif // VLN_DEVICE_LIBRARY_IDENTIFIERS_H
