// The table of attributes of a class: a row says which attribute goes into which member and how.
#ifndef DEVICE_ATTRIBUTE_TABLE_H
#define DEVICE_ATTRIBUTE_TABLE_H

#include "device/library/attribute_buffer.h"
#include "device/port_attributes.h"

#include <span>
#include <string>
#include <variant>

namespace cimple {

template <class Class>
struct Attribute_Row {
    struct Raw_Address { // six bytes, kept as text
        std::string Class::*member;
    };
    using Take_Number = void (*)(Class& object, uint32 value);
    using Target = std::variant<uint32 Class::*, bool Class::*, std::string Class::*, Raw_Address,
                                Fc4_Types Class::*, Take_Number>;

    uint16 identifier;
    const char* label;
    Target target;
};

// One value, by the kind of its member. A value that the library does not give leaves a number as
// it is and a text empty.
void readValue(const Attribute_Family& family, Attribute_Buffer& buffer, uint16 identifier,
               const char* label, uint32& number);
void readValue(const Attribute_Family& family, Attribute_Buffer& buffer, uint16 identifier,
               const char* label, bool& flag);
void readValue(const Attribute_Family& family, Attribute_Buffer& buffer, uint16 identifier,
               const char* label, std::string& text);
void readValue(const Attribute_Family& family, Attribute_Buffer& buffer, uint16 identifier,
               const char* label, Fc4_Types& types);
void readRawAddress(const Attribute_Family& family, Attribute_Buffer& buffer, uint16 identifier,
                    const char* label, std::string& text);

template <class Class>
void readRow(const Attribute_Family& family, Attribute_Buffer& buffer, Class& object,
             const Attribute_Row<Class>& row) {
    using Row = Attribute_Row<Class>;
    if (const auto* address = std::get_if<typename Row::Raw_Address>(&row.target)) {
        readRawAddress(family, buffer, row.identifier, row.label, object.*(address->member));
    } else if (const auto* take = std::get_if<typename Row::Take_Number>(&row.target)) {
        uint32 value = 0;
        if (getAttributeNumber(family, buffer, row.identifier, row.label, &value) == AX_STATUS_OK)
            (*take)(object, value);
    } else {
        std::visit(
            [&](auto target) {
                if constexpr (std::is_member_object_pointer_v<decltype(target)>)
                    readValue(family, buffer, row.identifier, row.label, object.*target);
            },
            row.target);
    }
}

// For ports whose state is polled between scans: one that does not tell it is left alone there.
template <class Class>
void takePhysicalPortState(Class& object, uint32 value) {
    object.PhysicalPortState = value;
    object.tellsPhysicalPortState = true;
}

// Reads all rows in table order.
template <class Class, std::size_t N>
void readTable(const Attribute_Family& family, Attribute_Buffer& buffer, Class& object,
               const Attribute_Row<Class> (&table)[N]) {
    for (const Attribute_Row<Class>& row : table)
        readRow(family, buffer, object, row);
}

} // namespace cimple

#endif // DEVICE_ATTRIBUTE_TABLE_H
