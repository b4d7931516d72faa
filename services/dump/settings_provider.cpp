#include "services/dump/settings_provider.h"

#include "agent/hardware/port_name.h"
#include "agent/text.h"
#include "services/dump/instances.h"
#include "services/dump/trace_levels.h"
#include "services/method_call.h"

#include <algorithm>

namespace cimple {

namespace {

// The name by which the library knows the chip; false, with a line, for a chip without a port.
bool find_adapter(const ProviderAgent& agent, const String& chip, HBA_WWN& name) {
    const String port = port_of_chip(agent, chip);
    if (!port.empty() && port_name_to_wwn(port, name))
        return true;
    VLN_LOG(VLN_ERR, "Invalid instance passed, not able to map with card : %s", chip.c_str());
    return false;
}

// ---- Dump files ----

sint32 set_retention_count(ProviderAgent& agent, const VLNMPCA_ExtFATDumpData& found,
                           const HBA_WWN& name, uint32 count) {
    if (found.RetentionCount.value != count &&
        VLN_MethodWrapper::vlncimSetRetentionCount(&name, count) != AX_STATUS_OK)
        return refuse_modify(MODIFY_INSTANCE_NOT_FOUND, "Failed to set the Retention count");
    change(agent.m_VLNMPCA_ExtFATDumpData_map, &found,
           [count](VLNMPCA_ExtFATDumpData& data) { data.RetentionCount.set(count); });
    return MODIFY_INSTANCE_OK;
}

sint32 modify_dump_data(ProviderAgent& agent, const VLNMPCA_ExtFATDumpData* model,
                        const VLNMPCA_ExtFATDumpData* instance) {
    if (!model || !instance)
        return refuse_modify(MODIFY_INSTANCE_FAILED,
                             "VLNMPCA_ExtFATDumpData::modify_instance invalid parameter");
    const auto* found = agent.m_VLNMPCA_ExtFATDumpData_map.lookup(model);
    if (!found)
        return refuse_modify(MODIFY_INSTANCE_NOT_FOUND,
                             "Invalid instance of VLNMPCA_ExtFATDumpData");
    const String chip = chip_of_setting(agent.m_VLNMPCA_ElementExtFATDumpData_map, *found);
    HBA_WWN name{};
    if (!find_adapter(agent, chip, name))
        return MODIFY_INSTANCE_NOT_FOUND;
    VLN_LOG(VLN_DBG, "Found Functional port for adapter : %s", chip.c_str());
    const Property<uint32>& count = model->RetentionCount;
    const Property<String>& directory = model->DumpDirectory;
    if (!count.is_null())
        VLN_LOG(VLN_DBG, "Input RetentionCount %d", static_cast<int>(count.value));
    if (!directory.is_null())
        VLN_LOG(VLN_DBG, "Input DumpDirectory %s", directory.value.c_str());
    if (count.is_null() && directory.is_null())
        return refuse_modify(MODIFY_INSTANCE_FAILED, "Error: No Modifiable parameter specified");
    if (!count.is_null())
        if (const sint32 status = set_retention_count(agent, *found, name, count.value))
            return status;
    if (directory.is_null())
        return MODIFY_INSTANCE_OK;
    return refuse_modify(MODIFY_INSTANCE_UNSUPPORTED,
                         "Setting DumpDirectory is not supported on this platform.");
}

// ---- Traces ----

constexpr char NO_MATCH[] = "Invalid Input parameter, Parameters are not matching with the modes "
                            "passed";

// What is to be set for one mode; what is not given is null.
struct Wanted_Mode {
    uint32 mode = 0; // AX_LOG_MODE_
    const String* level = nullptr;
    const uint32* port_mask = nullptr;
    const uint32* pci_mask = nullptr;
};
using Wanted_Modes = std::vector<Wanted_Mode>;

// The line of the first rule that the arguments break, or null. No library and no lock beside it.
const char* read_wanted(const VLNMPCA_ExtFATDumpAdvancedData& model, Wanted_Modes& wanted) {
    const Array<String>& modes = model.Modes.value;
    if (model.Modes.is_null() || modes.size() < 1 || modes.size() > AX_LOG_MODES)
        return "Invalid Modes passed, supported modes are ram and uart";
    for (const String& word : modes) {
        const auto mode = log_mode_number(word.c_str());
        if (mode != AX_LOG_MODE_RAM && mode != AX_LOG_MODE_UART)
            return "Invalid Mode passed, supported modes are ram and uart";
        wanted.push_back({.mode = *mode});
    }
    const auto give = [&wanted](const auto& property, auto member) {
        if (property.is_null())
            return true;
        if (property.value.size() != wanted.size())
            return false;
        for (uint32 i = 0; i < wanted.size(); ++i)
            wanted[i].*member = &property.value[i];
        return true;
    };
    if (!give(model.TraceLevel, &Wanted_Mode::level) ||
        !give(model.PortMask, &Wanted_Mode::port_mask) ||
        !give(model.PCIFuncMask, &Wanted_Mode::pci_mask))
        return NO_MATCH;
    for (const Wanted_Mode& each : wanted)
        if (each.level && trace_level_number(each.level->c_str()) == NO_TRACE_LEVEL)
            return "Invalid TraceLevel passed";
    return nullptr;
}

// A module of the adapter as it is; false, with a line, when the library does not tell it.
bool read_module(const HBA_WWN& name, const String& module, AX_EventLogModule& found) {
    VLN_EventLogSettings settings;
    if (VLN_MethodWrapper::GetExtFATAdvancedData(&name, &settings) != AX_STATUS_OK)
        return false;
    for (const AX_EventLogModule& each : settings.modules)
        if (field_text(each.name) == module) {
            found = each;
            return true;
        }
    VLN_LOG(VLN_ERR, "The adapter has no module %s", module.c_str());
    return false;
}

bool set_modes(const HBA_WWN& name, const AX_EventLogModule& module, const Wanted_Modes& wanted) {
    const std::string module_name = fieldText(module.name);
    return std::all_of(wanted.begin(), wanted.end(), [&](const Wanted_Mode& each) {
        AX_EventLogMode values = module.mode[each.mode];
        if (each.level)
            values.traceLevel = trace_level_number(each.level->c_str());
        if (each.port_mask)
            values.portMask = *each.port_mask;
        if (each.pci_mask)
            values.pciFuncMask = *each.pci_mask;
        return VLN_MethodWrapper::SetExtFATAdvancedData(&name, module_name.c_str(), 1U << each.mode,
                                                        values) == AX_STATUS_OK;
    });
}

sint32 modify_advanced_data(ProviderAgent& agent, const VLNMPCA_ExtFATDumpAdvancedData* model) {
    if (!model)
        return refuse_modify(MODIFY_INSTANCE_FAILED,
                             "VLNMPCA_ExtFATDumpAdvancedData::modify_instance invalid parameter");
    auto& store = agent.m_VLNMPCA_ExtFATDumpAdvancedData_map;
    const auto* found = store.lookup(model);
    if (!found)
        return refuse_modify(MODIFY_INSTANCE_NOT_FOUND,
                             "Invalid instance of VLNMPCA_ExtFATDumpAdvancedData");
    Wanted_Modes wanted;
    if (const char* broken = read_wanted(*model, wanted))
        return refuse_modify(MODIFY_INSTANCE_FAILED, broken);
    const String chip = chip_of_setting(agent.m_VLNMPCA_ElementExtFATDumpAdvancedData_map, *found);
    HBA_WWN name{};
    if (!find_adapter(agent, chip, name))
        return MODIFY_INSTANCE_FAILED;
    const String module_name = module_of(*found, chip);
    AX_EventLogModule module{};
    if (!read_module(name, module_name, module) || !set_modes(name, module, wanted) ||
        !read_module(name, module_name, module)) {
        VLN_LOG(VLN_ERR,
                "Failed to modify the ExtFATAdvanced Settings for module : %s : adapter : %s",
                module_name.c_str(), chip.c_str());
        return MODIFY_INSTANCE_FAILED;
    }
    change(store, model,
           [&module](VLNMPCA_ExtFATDumpAdvancedData& data) { fill_advanced_data(data, module); });
    VLN_LOG(VLN_WARN,
            "Successfully modify the ExtFATAdvanced Settings for module : %s : adapter : %s",
            module_name.c_str(), chip.c_str());
    return MODIFY_INSTANCE_OK;
}

} // namespace

sint32 Dump_Data_Provider::modify_instance(const VLNMPCA_ExtFATDumpData* model,
                                           const VLNMPCA_ExtFATDumpData* instance) {
    return answer_modify(
        [&](ProviderAgent& agent) { return modify_dump_data(agent, model, instance); });
}

sint32 Advanced_Dump_Data_Provider::modify_instance(const VLNMPCA_ExtFATDumpAdvancedData* model,
                                                    const VLNMPCA_ExtFATDumpAdvancedData*) {
    return answer_modify([&](ProviderAgent& agent) { return modify_advanced_data(agent, model); });
}

} // namespace cimple
