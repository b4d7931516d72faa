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

    // Copies the first `count` bytes of a value. False, with the destination as it was, for one
    // that is missing, points outside the buffer or is cut short by its end. `status` is as the
    // library leaves it, but an error for a value outside.
    bool read(uint16 identifier, void* destination, std::size_t count, AX_STATUS& status);
    // The same for as much of the value as there is, at most `count` bytes.
    bool readUpTo(uint16 identifier, void* destination, std::size_t count, AX_STATUS& status);

private:
    struct Value;
    Value find(uint16 identifier, AX_STATUS& status);

    std::unique_ptr<uint8[]> m_bytes;
    uint32 m_size;
};

// The buffers of a whole family of attributes: one call into the library each. They throw
// std::exception, after a line at level 3, if the library refuses.
Attribute_Buffer fetchAdapterAttributes(AX_WWN wwn);
Attribute_Buffer fetchPortAttributes(AX_WWN wwn);
// The same into a buffer of AX_PORT_ATTRIBUTES_SIZE, with the library's status. No line.
AX_STATUS fetchPortAttributes(AX_WWN wwn, Attribute_Buffer& buffer);

// A port's name of 16 digits as the library takes it. Throws std::exception, after a line at level
// 3, if it is none.
AX_WWN wwnOfPort(const std::string& portName);

// The driver type of the adapter; a failure is logged and leaves the number as it is.
void readDriverType(AX_WWN wwn, uint32& type);

// How a family of attributes is read: its readers differ in their log lines, and in what they make
// of a library that leaves the status alone.
struct Attribute_Family {
    enum Kind {
        ADAPTER,
        PORT,
        STATUS, // single attributes between scans: a failure costs what is shown, and has level 3
    } kind;
    AX_STATUS textStatus; // of a text, before the library is asked
};
extern const Attribute_Family ADAPTER_FAMILY;
extern const Attribute_Family PORT_FAMILY;
extern const Attribute_Family STATUS_FAMILY; // its labels begin the line of a failure

// Value readers. They answer 0, or the library's status (1 for a value that is missing) with the
// number as it was and the text empty.
AX_STATUS getAttributeNumber(const Attribute_Family& family, Attribute_Buffer& buffer,
                             uint16 identifier, const char* label, uint32* destination);

// The port attributes of a name, between scans. False for what is no name (level 5) and for a
// library that refuses, with a line that begins with `what`.
bool fetchStatus(const char* portName, Attribute_Buffer& buffer, const char* what);

// The first bytes of an attribute, for numbers that are kept in less. False for a failure.
bool getAttributeBytes(const Attribute_Family& family, Attribute_Buffer& buffer, uint16 identifier,
                       const char* label, void* value, std::size_t count);
template <class Number>
bool getStatusNumber(Attribute_Buffer& buffer, uint16 identifier, const char* what, Number& value) {
    return getAttributeBytes(STATUS_FAMILY, buffer, identifier, what, &value, sizeof value);
}

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
