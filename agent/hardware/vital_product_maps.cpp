// The vital product data of a port's PCI function.

#include "agent/associations.h"
#include "agent/hardware/pci_maps.h"
#include "agent/text.h"
#include "classes/VLNMPCA_VitalProductData.h"
#include "device/vpd.h"

#include <algorithm>

namespace cimple {

namespace {

struct Keyword_Row {
    const char* keyword; // PCI Local Bus Specification 3.0, appendix I; PA is the adapter's own
    Property<String> VLNMPCA_VitalProductData::*property;
};

using V = VLNMPCA_VitalProductData;

constexpr Keyword_Row KEYWORDS[] = {
    {"PA", &V::ProductName},     {"PN", &V::PartNumber},    {"SN", &V::VPDSerialNumber},
    {"V0", &V::FieldV0},         {"V1", &V::FieldV1},       {"V2", &V::FieldV2},
    {"V3", &V::FieldV3},         {"V4", &V::FieldV4},       {"V5", &V::FieldV5},
    {"VB", &V::FieldVB},         {"CP", &V::ExtCapability}, {"EC", &V::ECLevel},
    {"FG", &V::FabricGeography}, {"LC", &V::Location},      {"MN", &V::ManufactureId},
    {"PG", &V::PCIGeography},    {"YA", &V::VPDW}, // the asset tag, in the writable part
};

void take_entry(V& data, const PCI_VPD_Entry& entry) {
    const String value = text(entry.value);
    const auto* row =
        std::find_if(std::begin(KEYWORDS), std::end(KEYWORDS),
                     [&](const Keyword_Row& known) { return entry.keyword == known.keyword; });
    if (row != std::end(KEYWORDS))
        (data.*row->property).set(value);
    data.VPDTags.append(text(entry.keyword));
    data.VPDTagValues.append(value);
}

Ref<V> vital_product_data_instance(const String& port_name,
                                   const std::vector<PCI_VPD_Entry>& entries) {
    auto data = make_instance<V>();
    const String name = format_text("VLN MPCA VPD:%s", port_name.c_str());
    data->InstanceID.set(name);
    data->ElementName.set(name);
    for (const PCI_VPD_Entry& entry : entries)
        take_entry(*data, entry);
    return data;
}

} // namespace

// Null for a port without such data.
const VLNMPCA_VitalProductData* PCI_Maps::CreateVPD(const PCI_Function& function) {
    std::vector<PCI_VPD_Entry> entries;
    if (VLN_Vpd().GetPCIVPD(function.port_name.c_str(), &entries) != AX_STATUS_OK)
        return nullptr;
    return insert_instance(_agent.m_VLNMPCA_VitalProductData_map,
                           vital_product_data_instance(function.port_name, entries));
}

} // namespace cimple
