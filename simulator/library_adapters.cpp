// The library itself and the enumeration of its instances.
#include "simulator/call.h"
#include "simulator/host_files.h"

#include <algorithm>
#include <cstring>

namespace vlnsim::library {
namespace {

struct Status_Text {
    AX_STATUS status;
    const char* text;
};
constexpr Status_Text status_texts[] = {
    {AX_STATUS_OK, "Success"},
    {AX_STATUS_ERROR, "General failure"},
    {AX_STATUS_INVALID_ARGUMENT, "Invalid argument"},
    {AX_STATUS_ILLEGAL_WWN, "Unknown World Wide Name"},
    {AX_STATUS_MORE_DATA, "More data than the buffer holds"},
    {AX_STATUS_NO_MEMORY, "Out of memory"},
    {AX_STATUS_WWN_NOT_SUPPORTED, "Names of this kind can't be changed"},
    {AX_STATUS_WWN_NOT_AVAILABLE, "The adapter has no name management"},
    {name_in_use, "Another port has the name"},
    {AX_STATUS_WWN_IN_PROGRESS, "In progress"},
    {ip_entry_exists, "The table has an entry for this address"},
    {ip_no_such_entry, "The table has no such entry"},
    {ip_gateway_unreachable, "The gateway is not in the port's network"},
    {AX_STATUS_TARGET_IN_USE, "The target has sessions"},
    {iscsi_login_refused, "The login was refused"},
    {iscsi_unknown, "There is no such target, portal, session or server"},
    {iscsi_exists, "It exists already"},
    {iscsi_full, "The list is full"},
    {AX_STATUS_PORTAL_EXISTS, "The portal exists with other login options"},
    {firmware_unreadable, "The firmware file can't be read"},
    {firmware_no_image, "The file is no firmware image"},
    {firmware_damaged, "The firmware image is damaged"},
    {firmware_of_other_model, "The firmware image is for another model"},
    {AX_STATUS_MAILBOX_FAILED, "Mailbox failed"},
    {AX_STATUS_MAILBOX_TIMEOUT, "Mailbox timed out"},
    {AX_STATUS_MAILBOX_BUSY, "Mailbox busy"},
    {boot_code_enabled, "Boot code is enabled"},
    {parameter_unknown, "The driver has no such parameter"},
    {parameter_out_of_range, "The value is out of the parameter's range"},
    {parameter_fixed, "The parameter can't be changed"},
    {parameter_not_while_running, "The parameter can't be changed while the driver runs"},
    {unit_not_seen, "The port sees no such target or logical unit"},
    {AX_STATUS_NOT_ANSWERING, "The adapter does not answer"},
    {AX_STATUS_REBOOT_NEEDED, "A reboot is needed"},
    {AX_STATUS_NOT_SUPPORTED, "Feature not supported by hardware or software"},
    {AX_STATUS_BUFFER_TOO_SMALL, "The buffer is too small"},
};

// The start that all records share.
template <class Record>
void fill_names(const Function& function, Record& record) {
    put_name(function.wwpn, record.portWWN);
    put_name(function.wwnn, record.nodeWWN);
}

template <class Record>
void fill_record(const Function& function, Record& record) {
    std::memset(&record, 0, sizeof record);
    fill_names(function, record);
    put_name(function.fabric, record.fabricName);
    record.nFlags = function.flags;
    copy_text(function.model, record.model, sizeof record.model);
    record.subAdapterNumber = function.sub_adapter;
    record.SpecialFeatures = function.special_features;
}

AX_STATUS answer_version(Call& call, const std::string& version, char* text, uint32_t* size) {
    if (call.null(text, "text") || call.null(size, "size"))
        return AX_STATUS_INVALID_ARGUMENT;
    auto needed = static_cast<std::uint32_t>(version.size() + 1);
    if (call.too_small(*size, needed)) {
        *size = needed;
        return AX_STATUS_BUFFER_TOO_SMALL;
    }
    copy_text(version, text, *size);
    soil(text, needed, *size);
    *size = needed;
    call.out("text", text);
    return AX_STATUS_OK;
}

template <class Record>
AX_STATUS answer_record(Call& call, const HBAIdentifier* identifier, Record* info,
                        bool Function::*answers) {
    if (call.null(identifier, "identifier") || call.null(info, "info"))
        return AX_STATUS_INVALID_ARGUMENT;
    if (identifier->instanceCount != call.host.functions.size()) {
        call.violation("the instance count " + std::to_string(identifier->instanceCount) +
                       " is not that of an enumeration");
        return AX_STATUS_INVALID_ARGUMENT;
    }
    Function* function = call.sim.find_instance(identifier->instance);
    if (!function) {
        call.violation("unknown instance " + std::to_string(identifier->instance));
        return AX_STATUS_INVALID_ARGUMENT;
    }
    if (!(function->*answers))
        return AX_STATUS_NOT_ANSWERING;
    fill_record(*function, *info);
    return AX_STATUS_OK;
}

} // namespace

AX_STATUS AX_InitLib() {
    return answer<AX_STATUS>(Entry::AX_InitLib, [](Call& call) -> AX_STATUS {
        // Only a status above zero, read as signed, is a failure.
        if (static_cast<std::int32_t>(call.host.initialisation) <= 0)
            call.sim.initialised = true;
        return call.host.initialisation;
    });
}

AX_STATUS AX_ExitLib() {
    return answer<AX_STATUS>(Entry::AX_ExitLib, [](Call& call) -> AX_STATUS {
        call.sim.initialised = false;
        return AX_STATUS_OK;
    });
}

AX_STATUS AX_GetVersion(char* text, uint32_t* size) {
    return answer<AX_STATUS>(Entry::AX_GetVersion, [&](Call& call) {
        return answer_version(call, call.host.axapi_version, text, size);
    });
}

AX_STATUS AX_NimaVersion(char* text, uint32_t* size) {
    return answer<AX_STATUS>(Entry::AX_NimaVersion, [&](Call& call) {
        return answer_version(call, call.host.nima_version, text, size);
    });
}

AX_STATUS AX_StatusString(AX_STATUS status, char* text, uint32_t size) {
    return answer<AX_STATUS>(
        Entry::AX_StatusString,
        [&](Call& call) -> AX_STATUS {
            if (call.null(text, "text") || size == 0)
                return AX_STATUS_INVALID_ARGUMENT;
            text[0] = 0;
            for (const Status_Text& row : status_texts)
                if (row.status == status)
                    copy_text(row.text, text, size);
            call.out("text", text);
            return AX_STATUS_OK;
        },
        status);
}

AX_STATUS AX_SetDebugTraces(uint32_t traceGroup, uint32_t level) {
    return answer<AX_STATUS>(
        Entry::AX_SetDebugTraces,
        [&](Call&) -> AX_STATUS {
            constexpr std::uint32_t max_level = 6;
            if (level > max_level)
                return AX_STATUS_INVALID_ARGUMENT;
            append_lines(nima_log, {"trace group " + std::to_string(traceGroup) + ": level " +
                                    std::to_string(level)});
            return AX_STATUS_OK;
        },
        traceGroup, level);
}

int32_t VlnGetBoardNumber(AX_WWN wwn) {
    return answer<int32_t>(
        Entry::VlnGetBoardNumber,
        [&](Call& call) -> int32_t {
            const Function* function = call.function(wwn);
            return function ? static_cast<int32_t>(function->card) : -1;
        },
        wwn);
}

AX_STATUS AX_GetAllLocalHBAInstances(uint32_t* count, uint32_t* instances) {
    return answer<AX_STATUS>(Entry::AX_GetAllLocalHBAInstances, [&](Call& call) -> AX_STATUS {
        if (call.null(count, "count"))
            return AX_STATUS_INVALID_ARGUMENT;
        auto needed = static_cast<std::uint32_t>(call.host.functions.size());
        call.out("room", *count);
        if (call.too_small(*count, needed)) {
            *count = needed;
            call.out("count", *count);
            return AX_STATUS_MORE_DATA;
        }
        if (needed && call.null(instances, "instances"))
            return AX_STATUS_INVALID_ARGUMENT;
        for (std::uint32_t i = 0; i < needed; ++i)
            instances[i] = call.host.functions[i].instance;
        if (instances)
            soil(instances, needed * sizeof *instances, *count * sizeof *instances);
        *count = needed;
        call.out("count", *count);
        return AX_STATUS_OK;
    });
}

uint32_t AX_GetNumberOfLocalAdapters() {
    return answer<uint32_t>(Entry::AX_GetNumberOfLocalAdapters, [](Call& call) -> uint32_t {
        return static_cast<std::uint32_t>(call.host.functions.size());
    });
}

AX_STATUS AX_GetLocalHBAInfo(uint32_t index, AX_LocalHBAInfo* info) {
    return answer<AX_STATUS>(
        Entry::AX_GetLocalHBAInfo,
        [&](Call& call) -> AX_STATUS {
            if (call.null(info, "info"))
                return AX_STATUS_INVALID_ARGUMENT;
            if (index >= call.host.functions.size()) {
                call.violation("index " + std::to_string(index) + " is beyond the last adapter");
                return AX_STATUS_INVALID_ARGUMENT;
            }
            std::memset(info, 0, sizeof *info);
            fill_names(call.host.functions[index], *info);
            return AX_STATUS_OK;
        },
        index);
}

AX_STATUS AX_GetLocalHBAInfoV3(const HBAIdentifier* identifier, LocalHBAInfoV3* info) {
    return answer<AX_STATUS>(
        Entry::AX_GetLocalHBAInfoV3,
        [&](Call& call) { return answer_record(call, identifier, info, &Function::v3_record); },
        identifier ? identifier->instance : 0);
}

AX_STATUS AX_GetLocalHBAInfoV4(const HBAIdentifier* identifier, LocalHBAInfoV4* info) {
    return answer<AX_STATUS>(
        Entry::AX_GetLocalHBAInfoV4,
        [&](Call& call) { return answer_record(call, identifier, info, &Function::v4_record); },
        identifier ? identifier->instance : 0);
}

AX_STATUS AX_IsLocalHBA(AX_WWN wwn, uint32_t* isLocal) {
    return answer<AX_STATUS>(
        Entry::AX_IsLocalHBA,
        [&](Call& call) -> AX_STATUS {
            if (call.null(isLocal, "isLocal"))
                return AX_STATUS_INVALID_ARGUMENT;
            // Asking about a name that is not here is what the function is for.
            std::uint8_t bytes[8];
            std::memcpy(bytes, &wwn, sizeof bytes);
            *isLocal = call.sim.find_function(get_name(bytes)) != nullptr;
            call.out("isLocal", *isLocal);
            return AX_STATUS_OK;
        },
        wwn);
}

AX_STATUS AX_ValidateWwn(AX_WWN wwn) {
    return answer<AX_STATUS>(
        Entry::AX_ValidateWwn,
        [&](Call&) -> AX_STATUS {
            // The name address authority of FC-FS: 1, 2, 5 and 6 are the registered forms.
            const std::uint32_t naa = (wwn.word[0] & 0xFF) >> 4;
            return naa == 1 || naa == 2 || naa == 5 || naa == 6 ? AX_STATUS_OK
                                                                : AX_STATUS_ILLEGAL_WWN;
        },
        wwn);
}

AX_STATUS AX_GetServerAttributes(AX_ServerAttributes* attributes) {
    return answer<AX_STATUS>(Entry::AX_GetServerAttributes, [&](Call& call) -> AX_STATUS {
        if (call.null(attributes, "attributes"))
            return AX_STATUS_INVALID_ARGUMENT;
        *attributes = call.host.server;
        return AX_STATUS_OK;
    });
}

} // namespace vlnsim::library
