// The logs that a console can read: the provider's own, and the management library's.

#include "services/record_logs/instances.h"

#include "agent/associations.h"
#include "agent/profiles/profile_maps.h"
#include "agent/provider_agent.h"
#include "agent/software/software_identity.h"
#include "agent/text.h"
#include "classes/VLNMPCA_RegisteredProfile.h"
#include "classes/VLNMPCA_SoftwareIdentity.h"
#include "foundation/host_paths.h"
#include "services/service_instance.h"

namespace cimple {

namespace {

constexpr uint64 MAX_RECORDS = 1024;
constexpr uint16 LOG_STATE_NOT_APPLICABLE = 4;  // CIM_Log.LogState
constexpr uint16 OVERWRITE_WRAPS_WHEN_FULL = 2; // CIM_Log.OverwritePolicy
constexpr uint16 REQUESTED_STATE_NO_CHANGE = 5;

Ref<VLNMPCA_RecordLog> provider_log_instance(const CIM_ComputerSystem& system,
                                             Provider_Loggers& loggers) {
    const CLogger& logger = CLogger::instance();
    auto log =
        record_log_instance(PROVIDER_LOG_HEAD, system, "Record logs for Vorlan CIM Provider");
    // An enabled logger shows 5 and 3 and a disabled one 2 and 2: consoles know it so.
    if (logger.is_enabled()) {
        log->RequestedState.set(REQUESTED_STATE_NO_CHANGE);
        log->EnabledState.set(LOG_DISABLED);
    }
    log->TracePath.set(trace_path(loggers));
    log->LogLevel.set(static_cast<uint16>(logger.get_level()));
    log->LogMode.set(static_cast<uint16>(logger.get_mode()));
    return log;
}

Ref<VLNMPCA_RecordLog> nima_log_instance(const CIM_ComputerSystem& system, uint16 level) {
    auto log = record_log_instance(NIMA_LOG_HEAD, system, "NIMA logs for Vorlan CIM Provider");
    log->TracePath.set(text(host_path(Host_File::NIMA_LOG)));
    log->LogLevel.set(level);
    return log;
}

// Both of its states let the parameters be set.
Ref<VLNMPCA_EnabledRecordLogCapabilities> provider_log_capabilities() {
    auto capabilities = log_capabilities_instance("VLNMPCA provider log capabilities",
                                                  "Vorlan CIM Provider log capabilities");
    for (uint16 state : {LOG_ENABLED, LOG_DISABLED})
        capabilities->LogParamsSupported.append(state);
    return capabilities;
}

void conform(ProviderAgent& agent, const VLNMPCA_RecordLog& log) {
    Profile_Maps(agent).createRecordLogConforms(
        format_text("%s conformant to %s profile", log.ElementName.value.c_str(),
                    profile_table[PROFILE_REGISTRATION].name),
        PROFILE_REGISTRATION, &log);
}

void create_capabilities(ProviderAgent& agent, const VLNMPCA_RecordLog* provider_log) {
    const auto* capabilities = insert_instance(agent.m_VLNMPCA_EnabledRecordLogCapabilities_map,
                                               provider_log_capabilities());
    if (provider_log)
        join_log_with_capabilities(agent, *provider_log, capabilities);
}

// A host without a NIC has no software identity of the provider: its logs are nobody's, and the
// pass goes on to what else the host has.
uint32 join_with_provider(ProviderAgent& agent) {
    const auto* provider = find_provider_identity(agent.m_VLNMPCA_SoftwareIdentity_map);
    if (!provider) {
        VLN_LOG(VLN_DBG, "Missing Provider Software Identity");
        return agent.m_pData->hasNICAdapter ? END_PASS : MAP_OK;
    }
    const auto& logs = agent.m_VLNMPCA_RecordLog_map;
    for (uint32 i = 0; i < logs.size(); ++i)
        join_log_with_user(agent.m_VLNMPCA_ProviderUseOfLog_map, *logs[i], *provider);
    return MAP_OK;
}

} // namespace

String trace_path(Provider_Loggers& loggers) {
    Auto_Mutex lock(CLogger::instance().list_lock());
    return text(std::string_view(loggers.file().get_path().c_str()));
}

Ref<VLNMPCA_RecordLog> record_log_instance(const char* id_head, const CIM_ComputerSystem& system,
                                           const char* name) {
    auto log = make_instance<VLNMPCA_RecordLog>();
    log->InstanceID.set(format_text("%s:%s", id_head, system.Name.value.c_str()));
    log->MaxNumberOfRecords.set(MAX_RECORDS);
    log->LogState.set(LOG_STATE_NOT_APPLICABLE);
    log->OverwritePolicy.set(OVERWRITE_WRAPS_WHEN_FULL);
    log->RequestedState.set(LOG_ENABLED);
    log->EnabledState.set(LOG_ENABLED);
    log->HealthState.set(HEALTH_OK);
    log->Name.set(name);
    log->ElementName.set(name);
    return log;
}

Ref<VLNMPCA_EnabledRecordLogCapabilities> log_capabilities_instance(const char* id,
                                                                    const char* name) {
    auto capabilities = make_instance<VLNMPCA_EnabledRecordLogCapabilities>();
    capabilities->InstanceID.set(id);
    capabilities->ElementName.set(name);
    for (uint16 state : {LOG_ENABLED, LOG_DISABLED})
        capabilities->RequestedStatesSupported.append(state);
    capabilities->ElementNameEditSupported.set(false);
    return capabilities;
}

void join_log_with_capabilities(ProviderAgent& agent, const VLNMPCA_RecordLog& log,
                                const VLNMPCA_EnabledRecordLogCapabilities* capabilities) {
    associate_as(agent.m_VLNMPCA_RecordLogCapabilities_map,
                 format_text("%s : Logging capabilities", log.ElementName.value.c_str()), &log,
                 capabilities);
}

void join_log_with_user(Instance_Map_Base& store, const VLNMPCA_RecordLog& log,
                        const VLNMPCA_SoftwareIdentity& user) {
    associate_as(store,
                 format_text("%s uses log : %s", user.ElementName.value.c_str(),
                             log.ElementName.value.c_str()),
                 &log, &user);
}

uint32 create_record_logs(const Map_Scope& scope) {
    ProviderAgent& agent = scope.agent;
    auto& logs = agent.m_VLNMPCA_RecordLog_map;
    const auto* provider_log =
        insert_instance(logs, provider_log_instance(*scope.system, agent.m_Loggers),
                        "Insert Failed : m_VLNMPCA_VLNMPCA_RecordLog_map");
    const auto* nima_log =
        insert_instance(logs, nima_log_instance(*scope.system, agent.m_NIMALogLevel));

    Profile_Maps profiles(agent);
    profiles.registerForSystem(PROFILE_RECORD_LOG);
    if (!profiles.find(PROFILE_REGISTRATION)) {
        VLN_LOG(VLN_CRIT, "Missing Profile Registration Profile instance");
        return END_PASS;
    }
    for (const auto* log : {provider_log, nima_log})
        if (log)
            conform(agent, *log);
    create_capabilities(agent, provider_log);
    return join_with_provider(agent);
}

} // namespace cimple
