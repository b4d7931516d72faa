// The chips on a card. Most cards have one; a card with several sub-adapters has a chip for each.

#include "agent/adapter_map_builder.h"
#include "agent/associations.h"
#include "agent/hardware/port_name.h"
#include "agent/software/install_service.h"
#include "agent/store_search.h"
#include "agent/text.h"
#include "classes/VLNMPCA_Chip.h"

namespace cimple {

namespace {

Ref<VLNMPCA_Chip> chip_instance(const NICAdapterAttributes& adapter, const String& key) {
    auto chip = make_instance<VLNMPCA_Chip>();
    chip->CreationClassName.set("VLNMPCA_Chip");
    chip->Tag.set(key);
    chip->Name.set(key);
    chip->Manufacturer.set(text(adapter.Manufacturer));
    chip->Model.set(text(adapter.Model));
    chip->SerialNumber.set(text(adapter.SerialNumber));
    chip->SubAdapterId.set(text(adapter.Subadapter_number));
    chip->ElementName.set(format_text("VLN MPCA ASIC:%s:%s", adapter.Model.c_str(), key.c_str()));
    chip->BoardTemperature.set(adapter.BoardTemperature);
    chip->ThresholdCriticalTemp.set(adapter.ThresholdCriticalTemp);
    chip->ThresholdWarningTemp.set(adapter.ThresholdWarningTemp);
    chip->TemperatureUnit.set("Celsius");
    chip->Description.set(text(adapter.ModelDescription));
    return chip;
}

} // namespace

void Adapter_Map_Builder::findOrMakeChip(NIC_Function& function) {
    if (function.chip)
        return;
    const String key = asic_name(*function.attributes);
    function.chip = find_by_key(_agent.m_VLNMPCA_Chip_map, &VLNMPCA_Chip::Tag, key);
    if (!function.chip && CreateMPCAChipInstance(function) != MAP_OK)
        VLN_LOG(VLN_CRIT, "CreateMPCAChipInstance failed");
}

uint32 Adapter_Map_Builder::CreateMPCAChipInstance(NIC_Function& function) {
    function.chip =
        insert_instance(_agent.m_VLNMPCA_Chip_map,
                        chip_instance(*function.attributes, asic_name(*function.attributes)));
    if (!function.chip)
        return SKIP_DEVICE;
    // The line names the class that joins card and connector; consoles know it.
    associate(_agent.m_VLNMPCA_CardContainsChip_map, function.card, function.chip,
              "Insert Failed (CNA): VLNMPCA_Container");
    affect_by_install_service(_agent, _agent.m_VLNMPCA_InstallServiceAffectsChip_map, function.chip,
                              "Insert Failed:VLNMPCA_InstallServiceAffectsChip");
    return MAP_OK;
}

} // namespace cimple
