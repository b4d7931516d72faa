#include "services/record_logs/provider.h"

#include "agent/text.h"
#include "foundation/host_paths.h"
#include "services/method_call.h"
#include "services/record_logs/driver_logs.h"
#include "services/service_instance.h"

#include <optional>
#include <string_view>

namespace cimple {

namespace {

using Logs = Instance_Map<VLNMPCA_RecordLog>;

constexpr uint16 NOT_A_NIMA_LEVEL = 7;
constexpr uint32 NIMA_TRACE_GROUP = 106;
constexpr uint16 STATUS_OK = 2;             // CIM_ManagedSystemElement.OperationalStatus
constexpr std::size_t MAX_TRACE_PATH = 255; // what the file of the settings gives back

// A log that a client means.
struct Meant_Log {
    Logs* store = nullptr; // null: there is none
    uint32 index = 0;
    std::optional<Driver_Kind> driver;
    bool is_nima = false;

    template <class Apply>
    void change(Apply apply) const {
        cimple::change(*store, index, apply);
    }
};

Meant_Log find_log(ProviderAgent& agent, const VLNMPCA_RecordLog* self) {
    for (Logs* store : {&agent.m_VLNMPCA_RecordLog_map, &agent.m_VLNMPCA_DriverRecordLog_map,
                        &agent.m_VLNMPCA_ISCSIRecordLog_map}) {
        const sint32 index = store->find(self);
        if (index < 0)
            continue;
        Meant_Log log{store, static_cast<uint32>(index), {}, false};
        const std::string_view id = (*store)[log.index]->InstanceID.value.c_str();
        log.is_nima = id.starts_with(NIMA_LOG_HEAD);
        for (const Driver_Kind kind : {FC_DRIVER, ISCSI_DRIVER, NIC_DRIVER})
            if (id.starts_with(driver_log_table[kind].log_head))
                log.driver = kind;
        return log;
    }
    VLN_LOG(VLN_ERR, "Invalid instance of Record Log");
    return {};
}

// What a method answers: the status of the call, and its value if that is INVOKE_METHOD_OK.
struct Answer {
    uint32 value = METHOD_DONE;
    sint32 status = INVOKE_METHOD_OK;
};

Answer refuse(uint32 value, const char* line) {
    VLN_LOG(VLN_ERR, "%s", line);
    return {value};
}

Answer refuse_call(sint32 status, const char* line) {
    VLN_LOG(VLN_ERR, "%s", line);
    return {METHOD_DONE, status};
}

// Runs act(agent, log) behind the prologue, with a log that there is.
template <class Act>
sint32 answer(const VLNMPCA_RecordLog* self, Property<uint32>& result, const Answer& unknown,
              Act act) {
    sint32 status = INVOKE_METHOD_OK;
    const sint32 answered = answer_method(result, [&](ProviderAgent& agent) {
        const Operation_Prologue prologue(agent);
        const Meant_Log log = find_log(agent, self);
        const Answer answer = log.store ? act(agent, log) : unknown;
        status = answer.status;
        return answer.value;
    });
    return answered == INVOKE_METHOD_OK ? status : answered;
}

// ---- Parameters ----

struct Log_Params {
    const Property<uint16>& level;
    const Property<uint16>& mode;
    const String& path;
};

Answer set_nima_params(ProviderAgent& agent, const Meant_Log& log, const Log_Params& params) {
    static constexpr uint32 LEVELS[] = {0, 2, 4, 3, 5, 6, 1};
    if (params.level.is_null() || params.level.value == NOT_A_NIMA_LEVEL || !params.path.empty())
        return refuse(METHOD_INVALID_TARGET,
                      "Either Log level provided is out of range or Tracepath is set");
    const uint16 level = params.level.value;
    const AX_STATUS status = VLN_MethodWrapper::SetNIMATraceLevel(
        NIMA_TRACE_GROUP, level < std::size(LEVELS) ? LEVELS[level] : 0);
    if (status == AX_STATUS_OK) {
        VLN_LOG(VLN_DBG, "VLNMPCA_RecordLog_Provider::SetNIMATraceLevel succesful");
        agent.m_NIMALogLevel = level;
    }
    log.change([&](VLNMPCA_RecordLog& stored) {
        stored.OperationalStatus.set({});
        stored.OperationalStatus.append(STATUS_OK);
        stored.LogLevel.set(agent.m_NIMALogLevel);
    });
    return {status == AX_STATUS_OK ? METHOD_DONE : METHOD_LIBRARY_STATUS + status};
}

// A path that the settings could not give back would be another file after the next start.
bool can_be_kept(const std::string& path) {
    return !path.empty() && path.size() <= MAX_TRACE_PATH &&
           path.find_first_of("\r\n") == std::string::npos;
}

Answer set_provider_params(ProviderAgent& agent, const Meant_Log& log, const Log_Params& params) {
    const uint16 level = params.level.value, mode = params.mode.value;
    if (level < VLN_CRIT || level > VLN_DBG)
        return refuse(METHOD_INVALID_TARGET, "Log level provided is out of range");
    if (mode < LOG_MODE_RING || mode > LOG_MODE_BOTH)
        return refuse(METHOD_INVALID_TARGET, "Log mode provided is out of range");
    if (mode_has_file(mode)) {
        const std::string path =
            params.path.empty() ? std::string() : working_file(params.path.c_str());
        if (!can_be_kept(path) ||
            agent.m_Loggers.file().validateAndSetPath(path.c_str(), false) != 0)
            return refuse(METHOD_INVALID_TARGET, "Setting the trace path failed");
    }
    CLogger& logger = CLogger::instance();
    VLN_LOG(VLN_CRIT, "Changing the record log parameters %d-%d-%s", level, mode,
            params.path.c_str());
    logger.set_level(level);
    logger.set_mode(mode);
    logger.clear_ffdc(); // a setting of the console's, to be saved
    VLN_LOG(VLN_DBG, "Setting path as %s", params.path.c_str());
    logger.apply_mode(mode);
    log.change([&](VLNMPCA_RecordLog& stored) {
        stored.LogLevel.set(level);
        stored.LogMode.set(mode);
        stored.TracePath.set(trace_path(agent.m_Loggers));
    });
    return {};
}

// ---- On and off ----

// The small default log serves until a console has chosen a file.
void use_default_file(ProviderAgent& agent) {
    VLN_LOG(VLN_WARN,
            "The tracepath has not been set yet. Until the tracepath is set, FFDC will be "
            "used to log messages.");
    CLogger& logger = CLogger::instance();
    if (!agent.m_Loggers.use_default_file() || logger.get_mode() != LOG_MODE_NONE)
        return;
    logger.set_ffdc();
    logger.set_mode(LOG_MODE_FILE);
}

void switch_provider_log(ProviderAgent& agent, bool on) {
    CLogger& logger = CLogger::instance();
    if (!on) {
        VLN_LOG(VLN_WARN, "Logs disabled");
        logger.clear_enabled();
        return;
    }
    logger.set_enabled();
    if (trace_path(agent.m_Loggers).empty())
        use_default_file(agent);
    VLN_LOG(VLN_WARN, "Logs enabled");
}

void switch_driver_log(ProviderAgent& agent, Driver_Kind kind, bool on) {
    agent.m_DriverLogs[kind].is_on = on;
    VLN_LOG(VLN_WARN, on ? "Logs enabled" : "Logs disabled");
    if (!on)
        return;
    if (const char* line = driver_log_table[kind].switched_on)
        VLN_LOG(VLN_DBG, "%s", line);
    read_driver_events(agent, kind);
}

Answer switch_log(ProviderAgent& agent, const Meant_Log& log, const Property<uint16>& state) {
    if (state.is_null() || (state.value != LOG_ENABLED && state.value != LOG_DISABLED))
        return refuse_call(INVOKE_METHOD_FAILED, "Invalid input");
    if (log.is_nima)
        return refuse_call(INVOKE_METHOD_UNSUPPORTED,
                           "RequestStateChange is not supported for NIMA Log Instance");
    const bool on = state.value == LOG_ENABLED;
    if (log.driver)
        switch_driver_log(agent, *log.driver, on);
    else
        switch_provider_log(agent, on);
    log.change([&](VLNMPCA_RecordLog& stored) {
        stored.EnabledState.set(state.value);
        stored.RequestedState.set(state.value);
        if (log.driver)
            stored.CurrentNumberOfRecords.set(driver_record_count(agent, *log.driver));
        else
            stored.TracePath.set(trace_path(agent.m_Loggers));
    });
    return {};
}

// ---- Records ----

Answer clear_log(ProviderAgent& agent, const Meant_Log& log) {
    if (log.driver) {
        VLN_LOG(VLN_DBG, "%s", driver_log_table[*log.driver].found);
        agent.m_DriverLogs[*log.driver].lines.clear();
        log.change([](VLNMPCA_RecordLog& stored) { stored.CurrentNumberOfRecords.set(0); });
    } else if (!log.is_nima) {
        CLogger::instance().clear_all();
        VLN_LOG(VLN_WARN, "Cleared all the logs");
    }
    return {};
}

} // namespace

sint32 Record_Log_Provider::RequestStateChange(const Log* self, Property<uint16>* state,
                                               CIM_ConcreteJob**, Property<Datetime>*,
                                               Result* result) {
    const Answer unknown = {METHOD_DONE, INVOKE_METHOD_FAILED};
    return answer(self, *result, unknown, [&](ProviderAgent& agent, const Meant_Log& log) {
        return switch_log(agent, log, *state);
    });
}

sint32 Record_Log_Provider::ClearLog(const Log* self, Result* result) {
    return answer(self, *result, {METHOD_UNKNOWN_INSTANCE}, clear_log);
}

sint32 Record_Log_Provider::SetLogParams(const Log* self, Property<uint16>* level,
                                         Property<uint16>* mode, Property<String>* path,
                                         Result* result) {
    return answer(self, *result, {METHOD_UNKNOWN_INSTANCE},
                  [&](ProviderAgent& agent, const Meant_Log& log) {
                      if (log.driver)
                          return refuse_call(INVOKE_METHOD_UNSUPPORTED,
                                             driver_log_table[*log.driver].no_parameters);
                      const Log_Params params = {*level, *mode, path->value};
                      return log.is_nima ? set_nima_params(agent, log, params)
                                         : set_provider_params(agent, log, params);
                  });
}

} // namespace cimple
