// Dumps of the firmware, the files that they go to, and the ports that have nothing else to give.
#include "foundation/field_text.h"
#include "operations/operation_frame.h"

#include <cstring>
#include <new>

namespace cimple {

namespace {

constexpr uint32 FEATURE_CORE_DUMP = 430;
constexpr uint32 FIRST_FILES = 4;
constexpr uint32 FIRST_DEAD_PORTS = 8;
constexpr uint32 MIN_RETENTION_COUNT = 1;
constexpr uint32 MAX_RETENTION_COUNT = 20;

// Statuses of AX_SetDumpDirectory.
constexpr AX_STATUS NO_SUCH_DIRECTORY = 27;
constexpr AX_STATUS NO_CONFIGURATION_FILE = 160;
constexpr AX_STATUS NO_CONFIGURATION_FILE_TOO = 178;

bool isDead(const HBA_WWN* name) {
    std::vector<AX_DeadNicPort> ports;
    if (VLN_MethodWrapper::GetDeadNICPorts(&ports) != AX_STATUS_OK)
        return false;
    for (const AX_DeadNicPort& port : ports) {
        const HBA_WWN dead = nameOfDeadPort(port);
        if (name && std::memcmp(&dead, name, sizeof dead) == 0)
            return true;
    }
    return false;
}

// A reply's buffer that there was no memory for, or one whose entries there is none for.
AX_STATUS outOfMemory(const char* line) {
    VLN_LOG(VLN_ERR, "%s", line);
    return AX_STATUS_ERROR;
}

} // namespace

AX_STATUS VLN_MethodWrapper::vlncimDumpDiagnostic(const HBA_WWN* name, Snapshot_Mode mode) {
    Operation_Frame frame("VLN_MethodWrapper::vlncimDumpDiagnostic");
    const AX_STATUS status = mode == SNAPSHOT_TESSEL ? AX_GenerateDump(0, 0, wwnOf(name))
                                                     : AX_GenerateEfdDump(wwnOf(name), mode, 0);
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "vlncimDumpDiagnostic exited with the error code %d", status);
    return status;
}

AX_STATUS VLN_MethodWrapper::vlncimGetCoreDump(const HBA_WWN* name, const char* options) {
    Operation_Frame frame("VLN_MethodWrapper::vlncimGetCoreDump");
    if (!frame.given(options))
        return frame.status();
    if (Validatewwpn(name) != 0) {
        if (!isDead(name))
            return AX_STATUS_ERROR;
        if (!frame.offers(name,
                          {FEATURE_CORE_DUMP, "Unable to determine if adapter supports core dump",
                           "Core dump is not supported on this adapter"}))
            return frame.status();
    }
    const AX_STATUS status = AX_GenerateCoreDump(wwnOf(name), options);
    if (status != AX_STATUS_OK && status != AX_STATUS_REBOOT_NEEDED)
        VLN_OPERATION_FAILED(status, "vlncimGetCoreDump exited with the error code %d", status);
    return status;
}

AX_STATUS VLN_MethodWrapper::vlncimRetrieveFATDump(const HBA_WWN* name) {
    Operation_Frame frame("VLN_MethodWrapper::vlncimRetrieveFATDump");
    const AX_STATUS status = name ? AX_RetrieveFATDump2(wwnOf(name)) : AX_RetrieveFATDump();
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "vlncimRetrieveFATDump exited with the error code %d", status);
    return status;
}

AX_STATUS VLN_MethodWrapper::GetDumpFileNames(const HBA_WWN* name,
                                              std::vector<std::string>* files) {
    constexpr char NO_MEMORY[] = "Unable to allocate the memory for GetDumpFileNames";
    Operation_Frame frame("VLN_MethodWrapper::GetDumpFileNames");
    if (!frame.given(files))
        return frame.status();
    files->clear();
    const Reply_Shape shape{.head = offsetof(AX_DumpFileList, name),
                            .entry = AX_DUMP_FILE_NAME_SIZE,
                            .first = FIRST_FILES,
                            .tooSmall = AX_STATUS_LIST_TOO_SMALL,
                            .tooSmallToo = AX_STATUS_LIST_TOO_SMALL};
    Reply reply;
    const AX_STATUS status =
        reply.fetch(shape, {NO_MEMORY}, counted<AX_DumpFileList>([&](AX_DumpFileList* list) {
                        return AX_GetDumpFileNames(wwnOf(name), list);
                    }));
    if (status != AX_STATUS_OK) {
        VLN_OPERATION_FAILED(status, "GetDumpFileNames exited with the error code %d", status);
        return status;
    }
    try {
        const auto* list = static_cast<const AX_DumpFileList*>(reply.data());
        for (uint32 i = 0; i < reply.count(); ++i)
            files->push_back(fieldText(list->name[i]));
    } catch (const std::bad_alloc&) {
        return outOfMemory(NO_MEMORY);
    }
    return AX_STATUS_OK;
}

AX_STATUS VLN_MethodWrapper::vlncimDeleteDumpFiles(const HBA_WWN* name) {
    Operation_Frame frame("VLN_MethodWrapper::vlncimDeleteDumpFiles");
    const AX_STATUS status = AX_DeleteDumpFiles(wwnOf(name));
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "vlncimDeleteDumpFiles exited with the error code %d", status);
    return status;
}

AX_STATUS VLN_MethodWrapper::vlncimGetDumpDirectory(const HBA_WWN* name, std::string* directory) {
    Operation_Frame frame("VLN_MethodWrapper::vlncimGetDumpDirectory");
    if (!frame.given(directory))
        return frame.status();
    char text[AX_DUMP_DIRECTORY_SIZE] = {};
    const AX_STATUS status = AX_GetDumpDirectoryA(wwnOf(name), text, sizeof text);
    if (status != AX_STATUS_OK) {
        VLN_OPERATION_FAILED(status, "vlncimGetDumpDirectory exited with the error code %d",
                             status);
        return status;
    }
    try {
        *directory = fieldText(text);
    } catch (const std::bad_alloc&) {
        return outOfMemory("Unable to allocate the memory for the dump directory");
    }
    return AX_STATUS_OK;
}

AX_STATUS VLN_MethodWrapper::vlncimSetDumpDirectory(const HBA_WWN* name, const char* directory) {
    Operation_Frame frame("VLN_MethodWrapper::vlncimSetDumpDirectory");
    if (!frame.given(directory))
        return frame.status();
    const AX_STATUS status = AX_SetDumpDirectory(wwnOf(name), directory);
    constexpr char FAILED[] = "ERROR: vlncimSetDumpDirectory: AX_SetDumpDirectory call failed";
    if (status == NO_SUCH_DIRECTORY)
        VLN_LOG(VLN_ERR, "%s. The specified directory [' / vmfs / volumes / %s'] cannot be opened",
                FAILED, directory);
    else if (status == NO_CONFIGURATION_FILE || status == NO_CONFIGURATION_FILE_TOO)
        VLN_LOG(VLN_ERR, "%s. The configuration file could not be opened", FAILED);
    else if (status != AX_STATUS_OK)
        VLN_LOG(VLN_ERR, "%s with error code : %d \n", FAILED, static_cast<int>(status));
    if (status != AX_STATUS_OK)
        logStatus(status);
    return status;
}

AX_STATUS VLN_MethodWrapper::vlncimGetRetentionCount(const HBA_WWN* name, uint32* count) {
    Operation_Frame frame("VLN_MethodWrapper::vlncimGetRetentionCount");
    if (!frame.given(count))
        return frame.status();
    const AX_STATUS status = AX_GetDumpRetentionCount(wwnOf(name), count);
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "vlncimGetRetentionCount exited with the error code %d",
                             status);
    return status;
}

AX_STATUS VLN_MethodWrapper::vlncimSetRetentionCount(const HBA_WWN* name, uint32 count) {
    Operation_Frame frame("VLN_MethodWrapper::vlncimSetRetentionCount");
    if (count < MIN_RETENTION_COUNT || count > MAX_RETENTION_COUNT) {
        VLN_LOG(VLN_ERR, "ERROR: RetentionCount value must be in-between %d and %d",
                static_cast<int>(MIN_RETENTION_COUNT), static_cast<int>(MAX_RETENTION_COUNT));
        return AX_STATUS_ERROR;
    }
    const AX_STATUS status = AX_SetDumpRetentionCount(wwnOf(name), count);
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "vlncimSetRetentionCount exited with the error code %d",
                             status);
    return status;
}

AX_STATUS VLN_MethodWrapper::GetDeadNICPorts(std::vector<AX_DeadNicPort>* ports) {
    constexpr char NO_MEMORY[] = "Unable to allocate the memory for the list of dead ports";
    Operation_Frame frame("VLN_MethodWrapper::GetDeadNICPorts");
    if (!frame.given(ports))
        return frame.status();
    const AX_STATUS status =
        fetch_list<AX_DeadNicPortList>(ports, FIRST_DEAD_PORTS, {NO_MEMORY}, AX_ListDeadNicPorts);
    if (status != AX_STATUS_OK) {
        VLN_OPERATION_FAILED(status, "GetDeadNICPorts exited with the error code %d", status);
        return status;
    }
    for (const AX_DeadNicPort& port : *ports) {
        const uint8(&mac)[6] = port.mac;
        VLN_LOG(VLN_DBG, "MAC Address    : %02x-%02x-%02x-%02x-%02x-%02x", mac[0], mac[1], mac[2],
                mac[3], mac[4], mac[5]);
        VLN_LOG(VLN_DBG, "Model          : %.*s\n", static_cast<int>(sizeof port.model),
                port.model);
        VLN_LOG(VLN_DBG, "Serial Number  : %.*s\n\n", static_cast<int>(sizeof port.serialNumber),
                port.serialNumber);
    }
    return AX_STATUS_OK;
}

} // namespace cimple
