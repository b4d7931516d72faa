#include "services/diagnostics/log_provider.h"

#include "classes/CIM_DiagnosticRecord.h"
#include "classes/CIM_LogManagesRecord.h"
#include "classes/CIM_RecordAppliesToElement.h"
#include "services/diagnostics/catalogue.h"
#include "services/method_call.h"

#include <initializer_list>

namespace cimple {

namespace {

enum Help_Result : uint32 { HELP_NOT_FOUND = 4, HELP_INVALID_ARGUMENT = 5 };

constexpr uint16 HELP_AS_TEXT = 1; // Format and RequestedDelivery

// ---- Logs ----

// The record that the member of a store is, or that it joins with something.
const CIM_DiagnosticRecord* record_of(const Instance* member) {
    if (const auto* managed = cast<CIM_LogManagesRecord>(member))
        return cast<CIM_DiagnosticRecord>(managed->Record);
    if (const auto* applied = cast<CIM_RecordAppliesToElement>(member))
        return cast<CIM_DiagnosticRecord>(applied->Antecedent);
    return cast<CIM_DiagnosticRecord>(member);
}

void clear_records_of(ProviderAgent& agent, const String& test) {
    for (Instance_Map_Base* store : std::initializer_list<Instance_Map_Base*>{
             &agent.m_VLNMPCA_LogManagesRecord_map, &agent.m_VLNMPCA_RecordAppliesToElement_map,
             &agent.m_VLNMPCA_DiagnosticCompletionRecord_map,
             &agent.m_VLNMPCA_DiagnosticServiceRecord_map})
        for (uint32 i = store->size(); i-- > 0;) {
            const auto* record = record_of(store->at(i));
            if (record && record->ServiceName.value == test)
                store->remove(i);
        }
}

uint32 clear_log(ProviderAgent& agent, const VLNMPCA_DiagnosticsLog* self) {
    const auto* log = agent.m_VLNMPCA_DiagnosticsLog_map.lookup(self);
    if (!log)
        return METHOD_UNKNOWN_INSTANCE;
    VLN_LOG(VLN_DBG, "vlncimNIC CDM Clear log");
    if (find_diagnostic_test(log->InstanceID.value))
        clear_records_of(agent, log->InstanceID.value);
    return METHOD_DONE;
}

// ---- Help ----

uint32 refuse(uint32 value, const char* line) {
    VLN_LOG(VLN_ERR, "%s", line);
    return value;
}

uint32 get_help(const ProviderAgent& agent, const VLNMPCA_HelpService* self,
                const Property<String>& document, const Property<uint16>& format,
                const Property<uint16>& delivery, Property<String>& text) {
    const auto* help = agent.m_VLNMPCA_HelpService_map.lookup(self);
    if (!help)
        return refuse(METHOD_UNKNOWN_INSTANCE, "Invalid instance of Help Service");
    if (document.is_null() || format.is_null() || delivery.is_null())
        return refuse(HELP_INVALID_ARGUMENT, "Invalid Requested Document");
    const Array<String>& documents = help->DocumentsAvailable.value;
    if (documents.size() == 0 || documents[0] != document.value)
        return HELP_NOT_FOUND;
    if (delivery.value != HELP_AS_TEXT || format.value != HELP_AS_TEXT)
        return refuse(HELP_INVALID_ARGUMENT,
                      "Unsupported Delivery options, Use '1' for proper support");
    const Array<String>& descriptions = help->DocumentDescriptions.value;
    text.set(descriptions.size() == 0 ? String() : descriptions[0]);
    return METHOD_DONE;
}

} // namespace

sint32 Diagnostics_Log_Provider::ClearLog(const VLNMPCA_DiagnosticsLog* self,
                                          Property<uint32>* return_value) {
    return answer_method(*return_value, [&](ProviderAgent& agent) {
        const Operation_Prologue prologue(agent);
        return clear_log(agent, self);
    });
}

sint32 Help_Provider::GetHelp(const VLNMPCA_HelpService* self, const Property<String>* document,
                              const Property<uint16>* format, const Property<uint16>* delivery,
                              Property<String>* text, Property<uint32>* return_value) {
    return answer_method(*return_value, [&](ProviderAgent& agent) {
        const Operation_Prologue prologue(agent);
        return get_help(agent, self, *document, *format, *delivery, *text);
    });
}

} // namespace cimple
