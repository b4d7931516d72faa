// The masks of Fibre Channel ports as a client sees them.

#include "agent/fcoe/fc_port_tables.h"

#include "cimple/instance.h"
#include "classes/VLNMPCA_FCPort.h"

#include <gtest/gtest.h>
#include <vector>

namespace cimple {

namespace {

using Values = std::vector<uint16>;

Values values_of(const Property<Array<uint16>>& property) {
    EXPECT_FALSE(property.is_null());
    return {property.value.begin(), property.value.end()};
}

Values service_classes(uint32 mask) {
    const Ref<VLNMPCA_FCPort> port(create<VLNMPCA_FCPort>(true));
    append_service_classes(port->SupportedCOS, mask);
    return values_of(port->SupportedCOS);
}

Values fc4_types(const Fc4_Types& mask) {
    const Ref<VLNMPCA_FCPort> port(create<VLNMPCA_FCPort>(true));
    append_fc4_types(port->ActiveFC4Types, mask);
    return values_of(port->ActiveFC4Types);
}

// The byte of the mask and the bit in it, as the standard numbers them.
Fc4_Types bit(std::size_t byte, unsigned number) {
    Fc4_Types mask{};
    mask[byte] = static_cast<uint8>(1U << number);
    return mask;
}

} // namespace

TEST(FC_Port_Tables, ServiceClasses) {
    EXPECT_EQ(service_classes(0), (Values{0}));
    EXPECT_EQ(service_classes(8), (Values{3}));
    EXPECT_EQ(service_classes(1 | 2 | 4 | 8 | 16 | 64), (Values{7, 1, 2, 3, 4, 5}));
    EXPECT_EQ(service_classes(32 | 128), (Values{0})) << "bits of no class";
}

TEST(FC_Port_Tables, FC4Types) {
    EXPECT_EQ(fc4_types({}), (Values{0}));
    EXPECT_EQ(fc4_types(bit(2, 0)), (Values{8})) << "SCSI-FCP";
    EXPECT_EQ(fc4_types(bit(3, 5)), (Values{5})) << "IP";
    EXPECT_EQ(fc4_types(bit(7, 0)), (Values{32})) << "Fibre Channel services";
    EXPECT_EQ(fc4_types(bit(15, 0)), (Values{96})) << "FC-AV";
    EXPECT_EQ(fc4_types(bit(6, 0)), (Values{1})) << "type 40, which CIM does not know";
    EXPECT_EQ(fc4_types(bit(28, 7)), (Values{255})) << "the last of a vendor's";
    EXPECT_EQ(fc4_types(bit(24, 7)), (Values{1})) << "just below a vendor's";
    EXPECT_EQ(fc4_types(bit(31, 0)), (Values{255})) << "the first of a vendor's";
    Fc4_Types all;
    all.fill(0xFF);
    const Values values = fc4_types(all);
    EXPECT_EQ(values.front(), 1);
    EXPECT_EQ(values.back(), 255);
    EXPECT_EQ(values.size(), std::size(fc4Types) + 2) << "each value once";
}

} // namespace cimple
