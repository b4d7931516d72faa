#include "services/diagnostics/log_provider.h"

#include "services/diagnostics/catalogue.h"
#include "services/diagnostics/records.h"
#include "services/method_call.h"

namespace cimple {

namespace {

enum Help_Result : uint32 { HELP_NOT_FOUND = 4, HELP_INVALID_ARGUMENT = 5 };

constexpr uint16 HELP_AS_TEXT = 1; // Format and RequestedDelivery

// ---- Logs ----

uint32 clear_log(ProviderAgent& agent, const VLNMPCA_DiagnosticsLog* self) {
    const auto* log = agent.m_VLNMPCA_DiagnosticsLog_map.lookup(self);
    if (!log)
        return METHOD_UNKNOWN_INSTANCE;
    VLN_LOG(VLN_DBG, "vlncimNIC CDM Clear log");
    if (find_diagnostic_test(log->InstanceID.value))
        delete_records(agent, log->InstanceID.value);
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
