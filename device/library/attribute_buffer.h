// The library's tagged buffer of attributes or counters, and reading single values out of it.
//
// Only the library knows the layout: it fills the buffer and finds the values. What it answers is
// not trusted: a value must lie inside the buffer, a text ends within 255 bytes.
#ifndef VLN_DEVICE_LIBRARY_ATTRIBUTE_BUFFER_H
#define VLN_DEVICE_LIBRARY_ATTRIBUTE_BUFFER_H

#include "cimple/types.h"
#include "device/library/axapi.h"

#include <memory>
#include <string>

namespace cimple {

class Attribute_Buffer {
public:
    explicit Attribute_Buffer(uint32 bytes)
        : m_bytes(std::make_unique<uint8[]>(bytes)), m_size(bytes) {}

    void* data() { return m_bytes.get(); }
    uint32 size() const { return m_size; }

    // The value of an attribute, null if the library has none or points outside. `status` is as the
    // library leaves it, an error in the last case. `reported` is the value's length as the library
    // tells it, `room` what the buffer has from the value on.
    const uint8* find(uint16 identifier, AX_STATUS& status, std::size_t& reported,
                      std::size_t& room);

private:
    std::unique_ptr<uint8[]> m_bytes;
    uint32 m_size;
};

// The buffers of a whole family of attributes: one call into the library each. They throw
// std::exception, after a line at level 3, if the library refuses.
Attribute_Buffer fetchAdapterAttributes(AX_WWN wwn);
Attribute_Buffer fetchPortAttributes(AX_WWN wwn);

// A port's name of 16 digits as the library takes it. Throws std::exception, after a line at level
// 3, if it is none.
AX_WWN wwnOfPort(const std::string& portName);

// The driver type of the adapter; a failure is logged and leaves the number as it is.
void readDriverType(AX_WWN wwn, uint32& type);

// How a family of attributes is read: its readers differ in their log lines, and in what they make
// of a library that leaves the status alone.
struct Attribute_Family {
    enum Kind { ADAPTER, PORT } kind;
    AX_STATUS textStatus; // of a text, before the library is asked
};
extern const Attribute_Family ADAPTER_FAMILY;
extern const Attribute_Family PORT_FAMILY;

// Value readers. They answer 0, or the library's status (1 for a value that is missing) with the
// number as it was and the text empty.
AX_STATUS getAttributeNumber(const Attribute_Family& family, Attribute_Buffer& buffer,
                             uint16 identifier, const char* label, uint32* destination);

constexpr std::size_t ATTRIBUTE_TEXT_SIZE = 256; // with the terminator
using Attribute_Text = char[ATTRIBUTE_TEXT_SIZE];
AX_STATUS getAttributeText(const Attribute_Family& family, Attribute_Text& text,
                           Attribute_Buffer& buffer, uint16 identifier, const char* label);

inline AX_STATUS getAdapterAttributeNumber(Attribute_Buffer& buffer, uint16 identifier,
                                           const char* label, uint32* destination) {
    return getAttributeNumber(ADAPTER_FAMILY, buffer, identifier, label, destination);
}
inline AX_STATUS getPortAttributeNumber(Attribute_Buffer& buffer, uint16 identifier,
                                        const char* label, uint32* destination) {
    return getAttributeNumber(PORT_FAMILY, buffer, identifier, label, destination);
}
inline void getAdapterAttributeText(Attribute_Text& text, Attribute_Buffer& buffer,
                                    uint16 identifier, const char* label) {
    getAttributeText(ADAPTER_FAMILY, text, buffer, identifier, label);
}
inline void getPortAttributeText(Attribute_Text& text, Attribute_Buffer& buffer, uint16 identifier,
                                 const char* label) {
    getAttributeText(PORT_FAMILY, text, buffer, identifier, label);
}

// Texts that several classes make of the raw bytes of a record.
std::string colonText(const uint8* bytes, std::size_t count); // "xx:xx:...", lower case
std::string flagsText(uint32 flags);                          // eight lower-case digits
// An address of the network properties. IPv6 in a short form of the system's own.
std::string addressText(const AX_IPAddress& address);

} // namespace cimple

#endif // VLN_DEVICE_LIBRARY_ATTRIBUTE_BUFFER_H
