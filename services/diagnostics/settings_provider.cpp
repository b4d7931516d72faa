#include "services/diagnostics/settings_provider.h"

#include "agent/hardware/port_name.h"
#include "services/diagnostics/catalogue.h"
#include "services/method_call.h"

#include <charconv>
#include <cstring>

namespace cimple {

namespace {

using enum Diagnostic_Runner;
using Setting = VLNMPCA_DiagnosticSettingData;

// Of a host whose dumps are set by a test of their own.
constexpr char DUMP_TEST[] = "VLN FC HBA:Diagnostic Dump";

constexpr uint32 MAX_PATTERN_SIZE = 8;
constexpr uint32 MAX_LOOPS_SIZE = 4;
constexpr uint32 MAX_TARGET_SIZE = 16;
constexpr uint32 BEACON_STATES[] = {2, 3}; // on, off

// ---- What a test takes ----

// The properties that the test takes, as the model has them; the others null.
Ref<Setting> taken_of(const Setting& model, Diagnostic_Runner runner) {
    auto taken = make_instance<Setting>();
    taken->HaltOnError = model.HaltOnError;
    if (runner == BEACON)
        taken->BeaconSetState = model.BeaconSetState;
    if (runner == ECHO)
        taken->TargetDevice = model.TargetDevice;
    if (runner == LOOPBACK || runner == ECHO) {
        taken->LoopPattern = model.LoopPattern;
        taken->LoopControlParameter = model.LoopControlParameter;
    }
    return taken;
}

bool is_empty(const Setting& taken) {
    return taken.HaltOnError.is_null() && taken.BeaconSetState.is_null() &&
           taken.TargetDevice.is_null() && taken.LoopPattern.is_null() &&
           taken.LoopControlParameter.is_null();
}

// ---- The rules of each property: the line of the one that is broken, or null ----

const char* check_pattern(const String& pattern, Diagnostic_Runner runner) {
    if (pattern.size() > MAX_PATTERN_SIZE)
        return runner == ECHO ? "Error: Buffer pattern exceeds 8 characters"
                              : "Error: loop pattern exceeds 8 characters";
    if (std::strspn(pattern.c_str(), "0123456789abcdefABCDEF") != pattern.size())
        return "Error: Invalid 'Pattern' used. Use hexadecimal characters. \n";
    return nullptr;
}

// One number at most, to go with the one LoopControl. None stands for no cycles.
const char* check_loops(const Array<String>& loops) {
    if (loops.size() == 0)
        return nullptr;
    const String& text = loops[0];
    if (text.size() > MAX_LOOPS_SIZE)
        return "Error: loopControlParameter exceeds 4 characters";
    uint32 count = 0;
    const char* const end = text.c_str() + text.size();
    const auto read = std::from_chars(text.c_str(), end, count);
    const bool valid = read.ec == std::errc() && read.ptr == end && count >= 1 &&
                       count <= MAX_TEST_LOOPS && loops.size() == 1;
    return valid ? nullptr : "Error: Invalid LoopControlData, Valid range 1-4000. \n";
}

const char* check_beacon(uint32 state) {
    for (const uint32 valid : BEACON_STATES)
        if (state == valid)
            return nullptr;
    return "Invalid BeaconSetState, Valid values are 2 or 3";
}

const char* broken_rule(const Setting& taken, Diagnostic_Runner runner) {
    const char* line = nullptr;
    if (!taken.LoopPattern.is_null())
        line = check_pattern(taken.LoopPattern.value, runner);
    if (!line && taken.TargetDevice.value.size() > MAX_TARGET_SIZE)
        line = "Error: TargetDevice exceeds 16 characters";
    if (!line && !taken.LoopControlParameter.is_null())
        line = check_loops(taken.LoopControlParameter.value);
    if (!line && !taken.BeaconSetState.is_null())
        line = check_beacon(taken.BeaconSetState.value);
    if (!line && is_empty(taken))
        line = "Error: Invalid Input Parameter";
    return line;
}

// ---- The change ----

template <class Value>
void take(Property<Value>& property, const Property<Value>& value) {
    if (!value.is_null())
        property = value;
}

sint32 modify_test(ProviderAgent& agent, const Setting& model, Diagnostic_Runner runner) {
    if (runner == ECHO)
        VLN_LOG(VLN_DBG, "Modifying the echo test parameters");
    const auto taken = taken_of(model, runner);
    if (const char* line = broken_rule(*taken, runner))
        return refuse_modify(MODIFY_INSTANCE_FAILED, line);
    change(agent.m_VLNMPCA_DiagnosticSettingData_map, &model, [&](Setting& setting) {
        take(setting.HaltOnError, taken->HaltOnError);
        take(setting.BeaconSetState, taken->BeaconSetState);
        take(setting.TargetDevice, taken->TargetDevice);
        take(setting.LoopPattern, taken->LoopPattern);
        take(setting.LoopControlParameter, taken->LoopControlParameter);
    });
    return MODIFY_INSTANCE_OK;
}

// The adapters share one count: the first Ethernet port stands for all.
sint32 modify_dump_test(ProviderAgent& agent, const Setting& model) {
    const auto& ports = agent.m_VLNMPCA_EthernetPort_map;
    const uint32 count = model.RetentionCount.value;
    HBA_WWN name{};
    if (model.RetentionCount.is_null() || ports.size() == 0 ||
        !port_name_to_wwn(ports[0]->DeviceID.value, name) ||
        VLN_MethodWrapper::vlncimSetRetentionCount(&name, count) != AX_STATUS_OK)
        return refuse_modify(MODIFY_INSTANCE_FAILED,
                             "VLNMPCA_DiagnosticSettingData_Provider::MODIFY_INSTANCE_FAILED");
    change(agent.m_VLNMPCA_DiagnosticSettingData_map, &model,
           [count](Setting& setting) { setting.RetentionCount.set(count); });
    return MODIFY_INSTANCE_OK;
}

sint32 modify(ProviderAgent& agent, const Setting* model, const Setting* instance) {
    if (!model || !instance)
        return refuse_modify(
            MODIFY_INSTANCE_FAILED,
            "VLNMPCA_DiagnosticSettingData_Provider::modify_instance invalid parameter");
    const auto* found = agent.m_VLNMPCA_DiagnosticSettingData_map.lookup(model);
    if (!found)
        return refuse_modify(MODIFY_INSTANCE_NOT_FOUND,
                             "Invalid instance of DiagnosticSetting Data");
    if (found->InstanceID.value == DUMP_TEST)
        return modify_dump_test(agent, *model);
    const Diagnostic_Row* test = find_diagnostic_test(found->InstanceID.value);
    return test ? modify_test(agent, *model, test->runner) : MODIFY_INSTANCE_FAILED;
}

} // namespace

sint32 Diagnostic_Settings_Provider::modify_instance(const Setting* model,
                                                     const Setting* instance) {
    return answer_modify([&](ProviderAgent& agent) { return modify(agent, model, instance); });
}

} // namespace cimple
