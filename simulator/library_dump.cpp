// Dumps: files in the dump directory below the host root, named after the adapter's serial number
// and counted on, the oldest of which go when there are more than are to be kept.
#include "simulator/call.h"
#include "simulator/identifiers.h"
#include "simulator/same_hardware.h"

#include <algorithm>
#include <cstring>
#include <filesystem>
#include <fstream>

namespace vlnsim::library {
namespace {

namespace fs = std::filesystem;

constexpr AX_STATUS no_such_directory = 27;
constexpr std::size_t max_options = 31;
constexpr std::uint32_t max_level = 11;

// ---- Adapters ----

// Null, with the status, for a name that is no function's, or one that keeps no dumps.
Function* find_adapter(Call& call, AX_WWN wwn, AX_STATUS& status) {
    Function* function = call.function(wwn);
    status = !function          ? AX_STATUS_ILLEGAL_WWN
             : !function->dumps ? AX_STATUS_NOT_SUPPORTED
                                : AX_STATUS_OK;
    return status == AX_STATUS_OK ? function : nullptr;
}

template <class Body>
AX_STATUS with_adapter(Call& call, AX_WWN wwn, Body body) {
    AX_STATUS status = AX_STATUS_OK;
    Function* function = find_adapter(call, wwn, status);
    return function ? body(*function) : status;
}

// All functions of an adapter have what one of them was set to.
template <class Set>
void set_adapter(Host& host, const Function& of, Set set) {
    for (Function& each : host.functions)
        if (same_adapter(each, of) && each.dumps)
            set(*each.dumps);
}

// A dead port has what the others of its adapter were set to, if there are any.
Function with_settings(const Host& host, Function port) {
    for (const Function& each : host.functions)
        if (port.dead && same_adapter(each, port) && each.dumps) {
            const AX_STATUS core_dump = port.dumps ? port.dumps->core_dump : AX_STATUS_OK;
            port.dumps = each.dumps;
            port.dumps->core_dump = core_dump;
            break;
        }
    return port;
}

// ---- Files ----

std::string file_head(const Function& function) {
    const auto serial = function.adapter_attributes.find(adapter_serial_number);
    char sub_adapter[8];
    std::snprintf(sub_adapter, sizeof sub_adapter, "-%02X-", function.sub_adapter);
    return (serial == function.adapter_attributes.end() ? "" : serial->second.text()) + sub_adapter;
}

// Empty without a host root: the machine's own folders are no simulated host's.
fs::path folder_of(const Function& function) {
    const std::string root = vlnsim_host_root();
    return root.empty() ? fs::path() : fs::path(root + function.dumps->directory);
}

// The adapter's files, the oldest first.
std::vector<std::string> files_of(const Function& function) {
    const std::string head = file_head(function);
    std::vector<std::string> names;
    std::error_code error;
    for (const auto& entry : fs::directory_iterator(folder_of(function), error)) {
        const std::string name = entry.path().filename();
        if (name.starts_with(head) && name.size() < AX_DUMP_FILE_NAME_SIZE)
            names.push_back(name);
    }
    std::sort(names.begin(), names.end());
    return names;
}

std::string next_file(const Function& function, const char* extension) {
    unsigned number = 0;
    const std::string head = file_head(function);
    for (const std::string& name : files_of(function))
        number = std::max(number, static_cast<unsigned>(std::atoi(name.c_str() + head.size())));
    char text[32];
    std::snprintf(text, sizeof text, "%04u.%s", number + 1, extension);
    return head + text;
}

std::string port_text(const Function& function) {
    char text[20];
    std::snprintf(
        text, sizeof text, "%016llX",
        static_cast<unsigned long long>(function.dead ? function.mac_address() : function.wwpn));
    return text;
}

AX_STATUS write_dump(const Function& function, const char* extension, const std::string& what) {
    const fs::path folder = folder_of(function);
    std::error_code error;
    if (folder.empty() || (fs::create_directories(folder, error), error))
        return no_such_directory;
    std::ofstream file(folder / next_file(function, extension));
    file << what << " of " << function.model << ' ' << port_text(function) << '\n';
    for (const AX_EventLogModule& module : function.dumps->modules)
        file << std::string(module.name, strnlen(module.name, sizeof module.name)) << ' '
             << module.mode[AX_LOG_MODE_RAM].traceLevel << '\n';
    if (!file.flush())
        return no_such_directory;
    std::vector<std::string> names = files_of(function);
    for (std::size_t i = 0; i + function.dumps->retention < names.size(); ++i)
        fs::remove(folder / names[i], error);
    return AX_STATUS_OK;
}

AX_STATUS fetch_stored(Host& host, const Function& function) {
    if (!function.dumps->stored)
        return AX_STATUS_ERROR;
    const AX_STATUS status = write_dump(function, "fat", "Stored dump");
    if (status == AX_STATUS_OK)
        set_adapter(host, function, [](Dumps& dumps) { --dumps.stored; });
    return status;
}

AX_STATUS take_core_dump(Call& call, const Function& function, const std::string& options) {
    const bool fits = function.dead ? options == "dead" : options == "live" || options == "full";
    if (!fits)
        return AX_STATUS_INVALID_ARGUMENT;
    if (!function.dumps)
        return AX_STATUS_NOT_SUPPORTED;
    const AX_STATUS told = function.dumps->core_dump;
    call.out("told", told);
    if (told != AX_STATUS_OK && told != AX_STATUS_REBOOT_NEEDED)
        return told;
    const AX_STATUS status = write_dump(function, "core", "Core dump (" + options + ")");
    return status == AX_STATUS_OK ? told : status;
}

// ---- Traces ----

bool level_is_known(Call& call, std::uint32_t level) {
    if (level >= 1 && level <= max_level)
        return true;
    call.violation("unknown trace level " + std::to_string(level));
    return false;
}

} // namespace

AX_STATUS AX_ListDeadNicPorts(AX_DeadNicPortList* list) {
    return answer<AX_STATUS>(Entry::AX_ListDeadNicPorts, [&](Call& call) -> AX_STATUS {
        if (call.null(list, "list"))
            return AX_STATUS_INVALID_ARGUMENT;
        std::vector<const Function*> ports;
        for (const Function& port : call.host.dead_ports)
            if (port.special_features & AX_FEATURE_NIC_FUNCTION)
                ports.push_back(&port);
        const std::uint32_t room = list->count;
        if (call.list_too_small(list->count, ports.size()))
            return AX_STATUS_MORE_DATA;
        for (std::uint32_t i = 0; i < list->count; ++i) {
            AX_DeadNicPort& entry = list->entry[i];
            std::memset(&entry, 0, sizeof entry);
            std::uint8_t name[8];
            put_name(ports[i]->mac_address(), name);
            std::memcpy(entry.mac, name + 2, sizeof entry.mac);
            copy_text(ports[i]->model, entry.model, sizeof entry.model);
            copy_text(ports[i]->adapter_attributes.at(adapter_serial_number).text(),
                      entry.serialNumber, sizeof entry.serialNumber);
        }
        soil(list->entry, list->count * sizeof *list->entry, room * sizeof *list->entry);
        return AX_STATUS_OK;
    });
}

AX_STATUS AX_GenerateDump(uint32_t reserved0, uint32_t reserved1, AX_WWN wwn) {
    return answer<AX_STATUS>(
        Entry::AX_GenerateDump,
        [&](Call& call) -> AX_STATUS {
            if (reserved0 || reserved1)
                call.violation("a reserved argument is not 0");
            return with_adapter(call, wwn, [](const Function& function) {
                return write_dump(function, "fat", "Dump");
            });
        },
        reserved0, reserved1, wwn);
}

AX_STATUS AX_GenerateEfdDump(AX_WWN wwn, int32_t snapshotMode, uint32_t reserved) {
    return answer<AX_STATUS>(
        Entry::AX_GenerateEfdDump,
        [&](Call& call) -> AX_STATUS {
            if (snapshotMode < 0 || snapshotMode > 1 || reserved) {
                call.violation("unknown snapshot mode or reserved argument");
                return AX_STATUS_INVALID_ARGUMENT;
            }
            return with_adapter(call, wwn, [&](const Function& function) -> AX_STATUS {
                const auto tessel = function.features.find(feature_tessel);
                if (tessel != function.features.end() && tessel->second.value == 1)
                    return AX_STATUS_NOT_SUPPORTED; // that generation has the other call alone
                return write_dump(function, "efd", snapshotMode ? "RAM dump" : "Flash dump");
            });
        },
        wwn, snapshotMode, reserved);
}

AX_STATUS AX_GenerateCoreDump(AX_WWN wwn, const char* options) {
    return answer<AX_STATUS>(
        Entry::AX_GenerateCoreDump,
        [&](Call& call) -> AX_STATUS {
            if (call.null(options, "options"))
                return AX_STATUS_INVALID_ARGUMENT;
            if (std::strlen(options) > max_options)
                call.violation("options are too long");
            const Function* function = call.function_or_dead_port(wwn);
            return function ? take_core_dump(call, with_settings(call.host, *function), options)
                            : AX_STATUS_ILLEGAL_WWN;
        },
        wwn, options);
}

AX_STATUS AX_RetrieveFATDump() {
    return answer<AX_STATUS>(Entry::AX_RetrieveFATDump, [](Call& call) -> AX_STATUS {
        AX_STATUS status = AX_STATUS_ERROR; // nobody keeps one
        for (const Function& function : call.host.functions)
            if (function.dumps && function.dumps->stored)
                status = fetch_stored(call.host, function);
        return status;
    });
}

AX_STATUS AX_RetrieveFATDump2(AX_WWN wwn) {
    return answer<AX_STATUS>(
        Entry::AX_RetrieveFATDump2,
        [&](Call& call) {
            return with_adapter(call, wwn, [&](const Function& function) {
                return fetch_stored(call.host, function);
            });
        },
        wwn);
}

AX_STATUS AX_GetDumpDirectoryA(AX_WWN wwn, char* directory, uint32_t size) {
    return answer<AX_STATUS>(
        Entry::AX_GetDumpDirectoryA,
        [&](Call& call) -> AX_STATUS {
            if (call.null(directory, "directory"))
                return AX_STATUS_INVALID_ARGUMENT;
            return with_adapter(call, wwn, [&](const Function& function) -> AX_STATUS {
                const std::string& text = function.dumps->directory;
                if (text.size() >= size)
                    return AX_STATUS_BUFFER_TOO_SMALL;
                copy_text(text, directory, size);
                soil(directory, text.size() + 1, size);
                call.out("directory", directory);
                return AX_STATUS_OK;
            });
        },
        wwn, size);
}

AX_STATUS AX_SetDumpDirectory(AX_WWN wwn, const char* directory) {
    return answer<AX_STATUS>(
        Entry::AX_SetDumpDirectory,
        [&](Call& call) -> AX_STATUS {
            if (call.null(directory, "directory"))
                return AX_STATUS_INVALID_ARGUMENT;
            return with_adapter(call, wwn, [&](const Function& function) -> AX_STATUS {
                const std::string root = vlnsim_host_root();
                if (root.empty() || std::strlen(directory) >= AX_DUMP_DIRECTORY_SIZE ||
                    !fs::is_directory(root + directory))
                    return no_such_directory;
                set_adapter(call.host, function,
                            [&](Dumps& dumps) { dumps.directory = directory; });
                return AX_STATUS_OK;
            });
        },
        wwn, directory);
}

AX_STATUS AX_GetDumpRetentionCount(AX_WWN wwn, uint32_t* count) {
    return answer<AX_STATUS>(
        Entry::AX_GetDumpRetentionCount,
        [&](Call& call) -> AX_STATUS {
            if (call.null(count, "count"))
                return AX_STATUS_INVALID_ARGUMENT;
            return with_adapter(call, wwn, [&](const Function& function) {
                *count = function.dumps->retention;
                call.out("count", *count);
                return AX_STATUS_OK;
            });
        },
        wwn);
}

AX_STATUS AX_SetDumpRetentionCount(AX_WWN wwn, uint32_t count) {
    return answer<AX_STATUS>(
        Entry::AX_SetDumpRetentionCount,
        [&](Call& call) -> AX_STATUS {
            if (count < 1 || count > 20) {
                call.violation("retention count " + std::to_string(count));
                return AX_STATUS_INVALID_ARGUMENT;
            }
            return with_adapter(call, wwn, [&](const Function& function) {
                set_adapter(call.host, function, [&](Dumps& dumps) { dumps.retention = count; });
                return AX_STATUS_OK;
            });
        },
        wwn, count);
}

AX_STATUS AX_GetDumpFileNames(AX_WWN wwn, AX_DumpFileList* list) {
    return answer<AX_STATUS>(
        Entry::AX_GetDumpFileNames,
        [&](Call& call) -> AX_STATUS {
            if (call.null(list, "list"))
                return AX_STATUS_INVALID_ARGUMENT;
            return with_adapter(call, wwn, [&](const Function& function) -> AX_STATUS {
                const std::vector<std::string> names = files_of(function);
                const std::uint32_t room = list->count;
                if (call.list_too_small(list->count, names.size()))
                    return AX_STATUS_LIST_TOO_SMALL;
                soil(list->name, 0, room * sizeof *list->name);
                for (std::uint32_t i = 0; i < list->count; ++i)
                    copy_text(names[i], list->name[i], sizeof list->name[i]);
                return AX_STATUS_OK;
            });
        },
        wwn);
}

AX_STATUS AX_DeleteDumpFiles(AX_WWN wwn) {
    return answer<AX_STATUS>(
        Entry::AX_DeleteDumpFiles,
        [&](Call& call) {
            return with_adapter(call, wwn, [](const Function& function) -> AX_STATUS {
                std::error_code error;
                for (const std::string& name : files_of(function))
                    if (!fs::remove(folder_of(function) / name, error))
                        return AX_STATUS_ERROR;
                return AX_STATUS_OK;
            });
        },
        wwn);
}

// ---- What the firmware traces ----

AX_STATUS AX_Get_DX_EventLogConfigDataAll(AX_WWN wwn, AX_EventLogConfig* config) {
    return answer<AX_STATUS>(
        Entry::AX_Get_DX_EventLogConfigDataAll,
        [&](Call& call) -> AX_STATUS {
            if (call.null(config, "config"))
                return AX_STATUS_INVALID_ARGUMENT;
            return with_adapter(call, wwn, [&](const Function& function) -> AX_STATUS {
                const Trace_Settings& modules = function.dumps->modules;
                const std::uint32_t room = config->capacity;
                config->moduleCount = room;
                if (call.list_too_small(config->moduleCount, modules.size()))
                    return AX_STATUS_MORE_DATA;
                config->maxLogEntries = function.dumps->log.maxLogEntries;
                config->logEntrySize = function.dumps->log.logEntrySize;
                config->logType = function.dumps->log.logType;
                std::copy(modules.begin(), modules.end(), config->module);
                soil(config->module, modules.size() * sizeof *config->module,
                     room * sizeof *config->module);
                return AX_STATUS_OK;
            });
        },
        wwn);
}

AX_STATUS AX_Set_DX_EventLogConfigDataModule(AX_WWN wwn, const char* module, uint32_t modes,
                                             uint32_t level, uint32_t portMask,
                                             uint32_t pciFuncMask) {
    return answer<AX_STATUS>(
        Entry::AX_Set_DX_EventLogConfigDataModule,
        [&](Call& call) -> AX_STATUS {
            if (call.null(module, "module") || !level_is_known(call, level))
                return AX_STATUS_INVALID_ARGUMENT;
            if (modes == 0 || modes >> AX_LOG_MODES) {
                call.violation("unknown modes " + std::to_string(modes));
                return AX_STATUS_INVALID_ARGUMENT;
            }
            return with_adapter(call, wwn, [&](const Function& function) -> AX_STATUS {
                bool found = false;
                set_adapter(call.host, function, [&](Dumps& dumps) {
                    for (AX_EventLogModule& each : dumps.modules)
                        if (std::strncmp(each.name, module, sizeof each.name) == 0)
                            for (std::uint32_t mode = 0; mode < AX_LOG_MODES; ++mode)
                                if (found = true; modes >> mode & 1)
                                    each.mode[mode] = {1, level, portMask, pciFuncMask};
                });
                if (!found)
                    call.violation("unknown module");
                return found ? AX_STATUS_OK : AX_STATUS_INVALID_ARGUMENT;
            });
        },
        wwn, module, modes, level, portMask, pciFuncMask);
}

AX_STATUS AX_Set_DX_EventLogTraceLevel(AX_WWN wwn, uint32_t level, uint32_t ram, uint32_t uart,
                                       uint32_t nvram, uint32_t tftp) {
    return answer<AX_STATUS>(
        Entry::AX_Set_DX_EventLogTraceLevel,
        [&](Call& call) -> AX_STATUS {
            if (!level_is_known(call, level))
                return AX_STATUS_INVALID_ARGUMENT;
            const std::uint32_t flags[AX_LOG_MODES] = {ram, uart, nvram, tftp};
            return with_adapter(call, wwn, [&](const Function& function) {
                set_adapter(call.host, function, [&](Dumps& dumps) {
                    for (AX_EventLogModule& each : dumps.modules)
                        for (std::size_t mode = 0; mode < AX_LOG_MODES; ++mode)
                            if (flags[mode]) {
                                each.mode[mode].enabled = 1;
                                each.mode[mode].traceLevel = level;
                            }
                });
                return AX_STATUS_OK;
            });
        },
        wwn, level, ram, uart, nvram, tftp);
}

AX_STATUS AX_Set_DX_DefaultLoggingConfig(AX_WWN wwn) {
    return answer<AX_STATUS>(
        Entry::AX_Set_DX_DefaultLoggingConfig,
        [&](Call& call) {
            return with_adapter(call, wwn, [&](const Function& function) {
                set_adapter(call.host, function,
                            [](Dumps& dumps) { dumps.modules = dumps.factory; });
                return AX_STATUS_OK;
            });
        },
        wwn);
}

} // namespace vlnsim::library
