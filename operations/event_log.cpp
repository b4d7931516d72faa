// What the modules of an adapter's firmware write to its event log, which dumps contain.
#include "operations/operation_frame.h"

#include <new>

namespace cimple {

namespace {

constexpr uint32 FIRST_MODULES = 32;
constexpr uint32 MODES_END = 1U << AX_LOG_MODES; // of the bits
constexpr uint32 TRACE_LEVEL_END = 256;

uint32 flag(uint32 modes, uint32 mode) {
    return modes >> mode & 1;
}

// The call of Reply::fetch, with the one check that the list's own words allow.
AX_STATUS fetchModules(AX_WWN wwn, AX_EventLogConfig* config, uint32& count) {
    const uint32 room = count;
    config->capacity = room;
    const AX_STATUS status = AX_Get_DX_EventLogConfigDataAll(wwn, config);
    count = config->moduleCount;
    if (status != AX_STATUS_OK || (count <= config->capacity && count <= room))
        return status;
    VLN_LOG(VLN_ERR,
            "AX_Get_DX_EventLogConfigDataAll call failed, with error code : %d, Invalid number",
            static_cast<int>(status));
    return AX_STATUS_ERROR;
}

} // namespace

AX_STATUS VLN_MethodWrapper::GetExtFATAdvancedData(const HBA_WWN* name,
                                                   VLN_EventLogSettings* settings) {
    constexpr char NO_MEMORY[] = "Unable to allocate the memory for the event log settings";
    Operation_Frame frame("VLN_MethodWrapper::GetExtFATAdvancedData");
    if (!frame.given(settings))
        return frame.status();
    Reply reply;
    const AX_STATUS status = reply.fetch(
        {offsetof(AX_EventLogConfig, module), sizeof(AX_EventLogModule), FIRST_MODULES},
        {NO_MEMORY}, [&](void* buffer, uint32& count) {
            return fetchModules(wwnOf(name), static_cast<AX_EventLogConfig*>(buffer), count);
        });
    if (status != AX_STATUS_OK) {
        VLN_OPERATION_FAILED(status, "GetExtFATAdvancedData exited with the error code %d", status);
        return status;
    }
    const auto* config = static_cast<const AX_EventLogConfig*>(reply.data());
    settings->maxLogEntries = config->maxLogEntries;
    settings->logEntrySize = config->logEntrySize;
    settings->logType = config->logType;
    try {
        settings->modules.assign(config->module, config->module + reply.count());
    } catch (const std::bad_alloc&) {
        VLN_LOG(VLN_ERR, "%s", NO_MEMORY);
        return AX_STATUS_ERROR;
    }
    return AX_STATUS_OK;
}

AX_STATUS VLN_MethodWrapper::SetExtFATAdvancedData(const HBA_WWN* name, const char* module,
                                                   uint32 modes, const AX_EventLogMode& values) {
    Operation_Frame frame("VLN_MethodWrapper::SetExtFATAdvancedData");
    if (!module || !*module || modes == 0 || modes >= MODES_END ||
        values.traceLevel >= TRACE_LEVEL_END) {
        VLN_LOG(VLN_ERR, "A module, a mode below %d and a trace level below %d are needed",
                static_cast<int>(MODES_END), static_cast<int>(TRACE_LEVEL_END));
        return AX_STATUS_ERROR;
    }
    const AX_STATUS status = AX_Set_DX_EventLogConfigDataModule(
        wwnOf(name), module, modes, values.traceLevel, values.portMask, values.pciFuncMask);
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "SetExtFATAdvancedData exited with the error code %d", status);
    return status;
}

AX_STATUS VLN_MethodWrapper::vlncimSetAdvancedDumpTraceLevel(const HBA_WWN* name, uint32 level,
                                                             uint32 modes) {
    Operation_Frame frame("VLN_MethodWrapper::vlncimSetAdvancedDumpTraceLevel");
    const AX_STATUS status = AX_Set_DX_EventLogTraceLevel(
        wwnOf(name), level, flag(modes, AX_LOG_MODE_RAM), flag(modes, AX_LOG_MODE_UART),
        flag(modes, AX_LOG_MODE_NVRAM), flag(modes, AX_LOG_MODE_TFTP));
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(
            status, "vlncimSetAdvancedDumpTraceLevel exited with the error code %d", status);
    return status;
}

AX_STATUS VLN_MethodWrapper::vlncimRestoreDefaultSettings(const HBA_WWN* name) {
    Operation_Frame frame("VLN_MethodWrapper::vlncimRestoreDefaultSettings");
    const AX_STATUS status = AX_Set_DX_DefaultLoggingConfig(wwnOf(name));
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "vlncimRestoreDefaultSettings exited with the error code %d",
                             status);
    return status;
}

AX_STATUS VLN_MethodWrapper::SetNIMATraceLevel(uint32 group, uint32 level) {
    Operation_Frame frame("VLN_MethodWrapper::SetNIMATraceLevel");
    const AX_STATUS status = AX_SetDebugTraces(group, level);
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "SetNIMATraceLevel exited with the error code %d", status);
    return status;
}

} // namespace cimple
