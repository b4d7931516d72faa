// What an adapter can be configured to be: its profiles, and its personalities.
#include "services/channels/port_config.h"

#include "agent/associations.h"
#include "agent/element_setting.h"
#include "agent/provider_agent.h"
#include "agent/text.h"
#include "classes/CIM_ElementSettingData.h"
#include "classes/VLNMPCA_PIDData.h"
#include "classes/VLNMPCA_PersonalitySettingData.h"
#include "classes/VLNMPCA_SupportedPersonalitiesData.h"
#include "services/channels/protocol_words.h"

#include <cstdlib>
#include <memory>
#include <span>

namespace cimple {

namespace {

constexpr uint32 MADE_FOR_ROCE = 1, MADE_FOR_NIC = 2; // flags of a profile

struct Free {
    void operator()(AX_ProfileList* list) const { std::free(list); }
};

// Joins a chip with one of its settings, in force or not, now and after the next reboot.
void join(Instance_Map_Base& links, const VLNMPCA_Chip& chip, const Instance* setting, bool current,
          bool next) {
    if (setting)
        associate(links, &chip, setting, {}, [current, next](Instance& association) {
            auto* link = cast<CIM_ElementSettingData>(&association);
            link->IsCurrent.set(current ? SETTING_IS : SETTING_IS_NOT);
            link->IsNext.set(next ? SETTING_IS : SETTING_IS_NOT);
        });
}

Ref<VLNMPCA_PIDData> profile_instance(const VLNMPCA_Chip& chip, const AX_ProfileList& list,
                                      const AX_Profile& profile) {
    auto data = make_instance<VLNMPCA_PIDData>();
    data->InstanceID.set(format_text("VLN:MPCA PIDData:%s:%u", chip.Tag.value.c_str(), profile.id));
    data->ElementName.set(data->InstanceID.value);
    data->ParameterName.set("Profile");
    data->PIDNumbers.append(static_cast<uint16>(profile.id));
    data->PIDDescriptions.append(field_text(profile.name));
    data->PIDRoCE.append((profile.flags & MADE_FOR_ROCE) != 0);
    data->PIDNICOnly.append((profile.flags & MADE_FOR_NIC) != 0);
    data->ActivePID.set(static_cast<uint8>(list.activeProfileId));
    data->ConfiguredPID.set(static_cast<uint8>(list.configuredProfileId));
    return data;
}

String personality_word(uint32 personality) {
    const Protocol_Word* row = find_word(&Protocol_Word::personality, personality);
    return row && personality != 0 ? String(row->word) : format_text("%u", personality);
}

template <class Setting>
Ref<Setting> personality_instance(const String& instance_id, const String& value) {
    auto data = make_instance<Setting>();
    data->InstanceID.set(instance_id);
    data->ElementName.set(instance_id);
    data->ParameterName.set("Personality");
    data->Value.set(value);
    return data;
}

} // namespace

AX_STATUS create_profiles(ProviderAgent& agent, const VLNMPCA_Chip& chip, const HBA_WWN& name) {
    AX_ProfileList* told = nullptr;
    if (const AX_STATUS status = VLN_MethodWrapper::ListProfiles(&name, &told))
        return status;
    const std::unique_ptr<AX_ProfileList, Free> list(told);
    for (const AX_Profile& profile : std::span<const AX_Profile>(list->profile, list->count))
        join(agent.m_VLNMPCA_ElementPIDData_map, chip,
             insert_instance(agent.m_VLNMPCA_PIDData_map, profile_instance(chip, *list, profile)),
             profile.id == list->activeProfileId, profile.id == list->configuredProfileId);
    return AX_STATUS_OK;
}

AX_STATUS create_personalities(ProviderAgent& agent, const VLNMPCA_Chip& chip,
                               const HBA_WWN& name) {
    AX_AdapterPersonalityInfo info{};
    if (const AX_STATUS status = VLN_MethodWrapper::GetAdapterPersonalities(&name, &info))
        return status;
    const char* tag = chip.Tag.value.c_str();
    const auto* current =
        insert_instance(agent.m_VLNMPCA_PersonalitySettingData_map,
                        personality_instance<VLNMPCA_PersonalitySettingData>(
                            format_text("VLN:MPCA PersonalitySettingData:%s", tag),
                            personality_word(info.current)));
    join(agent.m_VLNMPCA_ElementPersonalityData_map, chip, current, true,
         info.current == info.configured);
    for (const uint32 each : std::span(info.available, info.availableCount)) {
        const String word = personality_word(each);
        const auto* supported = insert_instance(
            agent.m_VLNMPCA_SupportedPersonalitiesData_map,
            personality_instance<VLNMPCA_SupportedPersonalitiesData>(
                format_text("VLN:MPCA SupportedPersonalitiesData:%s:%s", tag, word.c_str()), word));
        join(agent.m_VLNMPCA_ElementSupportedPersonalitiesData_map, chip, supported,
             each == info.current, each == info.configured);
    }
    return AX_STATUS_OK;
}

} // namespace cimple
