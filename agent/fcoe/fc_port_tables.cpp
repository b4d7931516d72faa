#include "agent/fcoe/fc_port_tables.h"

#include <algorithm>
#include <iterator>

namespace cimple {

namespace {

// The mask is eight words of four bytes, most significant first: type 0 is the lowest bit of the
// fourth byte.
bool has_type(const Fc4_Types& mask, uint32 type) {
    const uint32 byte = type / 32 * 4 + 3 - type % 32 / 8;
    return (mask[byte] >> type % 8 & 1) != 0;
}

uint16 fc4_value(uint32 type) {
    if (type >= FC4_FIRST_VENDOR_TYPE)
        return FC4_VENDOR_UNIQUE;
    const bool known =
        std::find(std::begin(fc4Types), std::end(fc4Types), type) != std::end(fc4Types);
    return known ? static_cast<uint16>(type) : FC4_OTHER;
}

void append_once(Property<Array<uint16>>& property, uint16 value) {
    if (property.value.find(value) < 0)
        property.append(value);
}

} // namespace

void append_service_classes(Property<Array<uint16>>& property, uint32 mask) {
    for (const Service_Class& row : serviceClasses)
        if (mask & row.bit)
            property.append(row.value);
    if (property.value.size() == 0)
        property.append(FC_UNKNOWN);
}

void append_fc4_types(Property<Array<uint16>>& property, const Fc4_Types& mask) {
    for (uint32 type = 0; type < mask.size() * 8; ++type)
        if (has_type(mask, type))
            append_once(property, fc4_value(type));
    if (property.value.size() == 0)
        property.append(FC_UNKNOWN);
}

} // namespace cimple
