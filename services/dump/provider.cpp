#include "services/dump/provider.h"

#include "agent/gates.h"
#include "agent/hardware/port_name.h"
#include "agent/store_search.h"
#include "agent/text.h"
#include "cimple/meta.h"
#include "classes/VLNMPCA_DownEthernetPort.h"
#include "classes/VLNMPCA_EthernetPort.h"
#include "classes/VLNMPCA_FCPort.h"
#include "services/dump/instances.h"
#include "services/dump/trace_levels.h"
#include "services/method_call.h"

#include <algorithm>
#include <string_view>

namespace cimple {

namespace {

// Return values beside those that all services have.
constexpr uint32 INVALID_ARGUMENT = 5;
constexpr uint32 NO_ADAPTER_NAME = 4097;

constexpr char INVALID_CALL[] = "Invalid instance of VLNMPCA_DumpService/Target";
constexpr char INVALID_PORT[] = "Invalid MPCA Target Port";
constexpr uint32 MAX_OPTIONS = 31;
constexpr std::string_view DUMP_FILE_ENDS[] = {".fat", "core", ".efd", ".txt"};

// One call on the service. Its checks answer false when they have put what is wrong into the
// result.
struct Dump_Call {
    ProviderAgent& agent;
    Operation_Prologue& prologue;
    const VLNMPCA_DumpService* self;
    const CIM_LogicalPort* target;
    uint32 result = METHOD_DONE;
    sint32 status = INVOKE_METHOD_OK;
    HBA_WWN name{}; // of the target, once convert has found it

    const String& device_id() const { return target->DeviceID.value; }

    bool refuse(uint32 value, const char* line) {
        VLN_LOG(VLN_ERR, "%s", line);
        result = value;
        return false;
    }

    bool has_service() const { return self && agent.m_VLNMPCA_DumpService_map.lookup(self); }

    // A reference may be to an object of any class.
    bool is_port() const {
        return cast<CIM_LogicalPort>(static_cast<const Instance*>(target)) != nullptr;
    }

    bool check_call(bool complete = true, const char* line = INVALID_CALL) {
        return (has_service() && target && complete) || refuse(METHOD_UNKNOWN_INSTANCE, line);
    }

    bool check_port(const char* no_port = INVALID_PORT, const char* unknown = INVALID_PORT) {
        if (!is_port())
            return refuse(METHOD_INVALID_TARGET, no_port);
        return is_known_port(agent, device_id()) || refuse(METHOD_INVALID_TARGET, unknown);
    }

    bool check_port_or_down_port() {
        if (!is_port())
            return refuse(METHOD_INVALID_TARGET, INVALID_PORT);
        if (is_known_port(agent, device_id()))
            return true;
        VLN_LOG(VLN_DBG, "Checking the Down EthernetPort");
        if (!find_port(agent.m_VLNMPCA_DownEthernetPort_map, device_id()))
            return refuse(METHOD_INVALID_TARGET, INVALID_PORT);
        VLN_LOG(VLN_DBG, "Valid Down EthernetPort");
        return true;
    }

    bool convert() {
        if (nameOfDeviceId(device_id().c_str(), name, "VLNMPCA_DumpService_Provider::", VLN_ERR))
            return true;
        result = NO_ADAPTER_NAME;
        return false;
    }
};

// Runs the steps of a method behind the prologue.
template <class Steps>
sint32 run(const VLNMPCA_DumpService* self, CIM_LogicalPort* const* target,
           Property<uint32>* result, Steps steps) {
    sint32 status = INVOKE_METHOD_OK;
    const sint32 answered = answer_method(*result, [&](ProviderAgent& agent) {
        Operation_Prologue prologue(agent);
        Dump_Call call{agent, prologue, self, target ? *target : nullptr};
        steps(call);
        status = call.status;
        return call.result;
    });
    return answered == INVOKE_METHOD_OK ? status : answered;
}

uint32 library_result(AX_STATUS status) {
    return status == AX_STATUS_OK ? METHOD_DONE : METHOD_LIBRARY_STATUS + status;
}

// ---- Steps ----

bool read_snapshot_mode(Dump_Call& call, const String& word,
                        VLN_MethodWrapper::Snapshot_Mode& mode) {
    if (name_equal(word.c_str(), "ram")) {
        VLN_LOG(VLN_DBG, "SSMode : RAM");
        mode = VLN_MethodWrapper::SNAPSHOT_RAM;
        return true;
    }
    if (name_equal(word.c_str(), "flash")) {
        VLN_LOG(VLN_DBG, "SSMode : FLASH");
        mode = VLN_MethodWrapper::SNAPSHOT_FLASH;
        return true;
    }
    return call.refuse(METHOD_INVALID_TARGET,
                       "Invalid Mode passed, supported modes are ram and flash");
}

bool is_dump_file(std::string_view name) {
    return std::any_of(std::begin(DUMP_FILE_ENDS), std::end(DUMP_FILE_ENDS),
                       [name](std::string_view end) { return name.ends_with(end); });
}

void append_dump_files(const std::vector<std::string>& names, Property<Array<String>>& files) {
    files.set({});
    for (const std::string& name : names)
        if (is_dump_file(name)) {
            files.append(text(name));
            VLN_LOG(VLN_DBG, "Filename[%d] = %s", static_cast<int>(files.value.size() - 1),
                    name.c_str());
        }
}

bool read_modes(Dump_Call& call, const Array<String>& words, uint32& modes) {
    for (const String& word : words) {
        const auto mode = log_mode_number(word.c_str());
        if (!mode)
            return call.refuse(INVALID_ARGUMENT,
                               "Invalid Mode, Supported Modes are ram|nvram|uart|tftp");
        modes |= 1U << *mode;
    }
    return true;
}

void read_settings_back(Dump_Call& call) {
    const AX_STATUS status =
        rebuild_dump_settings(call.agent, chip_of_port(call.agent, call.device_id()));
    if (status == AX_STATUS_OK)
        return;
    call.refuse(status, "Failed to create the Enhanced FAT Dump Setting classes for MPCA Card");
    call.status = INVOKE_METHOD_FAILED;
}

// What the library takes for the client's word.
String core_dump_options(const String& options) {
    if (options == "down")
        return "dead";
    return options.empty() ? String("live") : options.substr(0, MAX_OPTIONS);
}

template <class Port>
bool store_core_dump_status(Instance_Map<Port>& ports, const String& device_id, uint32 status) {
    for (uint32 i = 0; i < ports.size(); ++i)
        if (ports[i]->DeviceID.value == device_id) {
            change(ports, i, [status](Port& port) { port.CoreDumpStatus.set(status); });
            return true;
        }
    return false;
}

void store_core_dump_status(ProviderAgent& agent, const String& device_id, uint32 status) {
    if (!store_core_dump_status(agent.m_VLNMPCA_EthernetPort_map, device_id, status))
        store_core_dump_status(agent.m_VLNMPCA_FCPort_map, device_id, status);
}

void take_core_dump(Dump_Call& call, const String& options) {
    const String& port = call.device_id();
    VLN_LOG(VLN_DBG, "GenerateCoreDump Inputs: Device Id: %s, Options String: %s ", port.c_str(),
            options.c_str());
    const AX_STATUS status = VLN_MethodWrapper::vlncimGetCoreDump(&call.name, options.c_str());
    if (status == AX_STATUS_OK) {
        VLN_LOG(VLN_WARN, "CNA Generate core dump functionality completed for target %s",
                port.c_str());
        return;
    }
    if (status == AX_STATUS_REBOOT_NEEDED) {
        VLN_LOG(VLN_WARN, "Generate core dump completed for target %s Please reboot the system. ",
                port.c_str());
        VLN_LOG(VLN_DBG, "Constructing the maps ");
        call.prologue.refreshAdapterMaps();
    } else {
        VLN_LOG(VLN_ERR, "Error - in the generating core dump status=%d", static_cast<int>(status));
        call.result = library_result(status);
    }
    store_core_dump_status(call.agent, port, library_result(status));
}

} // namespace

// ---- Methods ----

sint32 Dump_Service_Provider::GenerateExtFATDump(const Service* self, Target_Port target,
                                                 Property<String>* mode, Result* result) {
    return run(self, target, result, [&](Dump_Call& call) {
        VLN_MethodWrapper::Snapshot_Mode snapshot{};
        if (!call.check_call(!mode->value.empty(),
                             "Invalid instance of VLNMPCA_DumpService/Target/SSMode") ||
            !call.check_port("Invalid MPCA Port", "Invalid MPCA Target port") ||
            !read_snapshot_mode(call, mode->value, snapshot) || !call.convert())
            return;
        if (VLN_MethodWrapper::IsTesselCNA(&call.name)) {
            VLN_LOG(VLN_DBG, "Tessel CNA : Setting iSnapShotMode = -1");
            snapshot = VLN_MethodWrapper::SNAPSHOT_TESSEL;
        }
        call.result = VLN_MethodWrapper::vlncimDumpDiagnostic(&call.name, snapshot);
        if (call.result == AX_STATUS_OK)
            VLN_LOG(VLN_INFO, "ExtFATDump file generated successfully");
        else
            VLN_LOG(VLN_ERR, "Failed to generate the ExtFATDump file");
    });
}

sint32 Dump_Service_Provider::GetDumpFileNames(const Service* self, Target_Port target,
                                               Property<Array<String>>* files, Result* result) {
    files->clear(); // it goes in as well, and any bytes of a client would come back
    return run(self, target, result, [&](Dump_Call& call) {
        if (!call.check_call() || !call.check_port() || !call.convert())
            return;
        std::vector<std::string> names;
        const AX_STATUS status = VLN_MethodWrapper::GetDumpFileNames(&call.name, &names);
        call.result = library_result(status);
        if (status == AX_STATUS_OK)
            append_dump_files(names, *files);
        else
            VLN_LOG(VLN_ERR, "Failed to Get the DumpFileNames");
    });
}

sint32 Dump_Service_Provider::DeleteDumpFiles(const Service* self, Target_Port target,
                                              Result* result) {
    return run(self, target, result, [&](Dump_Call& call) {
        if (!call.check_call() || !call.check_port() || !call.convert())
            return;
        call.result = VLN_MethodWrapper::vlncimDeleteDumpFiles(&call.name);
        if (call.result == AX_STATUS_OK)
            VLN_LOG(VLN_INFO, "ExtFATDump files deleted Succesfully");
        else
            VLN_LOG(VLN_ERR, "Failed to delete the dump files");
    });
}

sint32 Dump_Service_Provider::SetAdvancedFATDumpTraceLevel(const Service* self, Target_Port target,
                                                           Property<String>* level,
                                                           Property<Array<String>>* modes,
                                                           Result* result) {
    return run(self, target, result, [&](Dump_Call& call) {
        if (level->value.empty()) {
            call.refuse(INVALID_ARGUMENT, "Invalid TraceLevel Passed");
            return;
        }
        if (modes->value.size() == 0) {
            call.refuse(INVALID_ARGUMENT,
                        "Modes are empty. Different Mode Supported are RAM|NVRAM|UART|TFTP.");
            return;
        }
        if (!call.check_call() || !call.check_port())
            return;
        const uint32 number = trace_level_number(level->value.c_str());
        if (number == NO_TRACE_LEVEL) {
            call.refuse(METHOD_INVALID_TARGET,
                        "Invalid TraceLevel passed, supported TraceLevels are "
                        "All|EnterFunction|verbose|info|test|show|warning|error|fatal|always");
            return;
        }
        uint32 flags = 0;
        if (!read_modes(call, modes->value, flags) || !call.convert())
            return;
        call.result = library_result(
            VLN_MethodWrapper::vlncimSetAdvancedDumpTraceLevel(&call.name, number, flags));
        if (call.result == METHOD_DONE)
            read_settings_back(call);
        else
            VLN_LOG(VLN_ERR, "Failed to set the trace level for the adapter : %s",
                    call.device_id().c_str());
    });
}

sint32 Dump_Service_Provider::RestoreAdvancedFATDumpSetting(const Service* self, Target_Port target,
                                                            Result* result) {
    return run(self, target, result, [&](Dump_Call& call) {
        if (!call.check_call() || !call.check_port() || !call.convert())
            return;
        call.result = library_result(VLN_MethodWrapper::vlncimRestoreDefaultSettings(&call.name));
        if (call.result != METHOD_DONE)
            return;
        read_settings_back(call);
        if (call.result == METHOD_DONE)
            VLN_LOG(VLN_INFO, "Restored the ExtFATDump settings Succesfully");
    });
}

sint32 Dump_Service_Provider::GenerateCoreDump(const Service* self, Target_Port target,
                                               Property<String>* options, Result* result) {
    return run(self, target, result, [&](Dump_Call& call) {
        if (call.check_call() && call.check_port_or_down_port() && call.convert())
            take_core_dump(call, core_dump_options(options->value));
    });
}

// The words of a failure are those of the installation service, and meant to be.
sint32 Dump_Service_Provider::RetrieveFATDump(const Service* self, Target_Port target,
                                              Result* result) {
    return run(self, target, result, [&](Dump_Call& call) {
        if (!call.has_service()) {
            call.refuse(METHOD_UNKNOWN_INSTANCE, INVALID_CALL);
            return;
        }
        if (call.target && (!call.check_port() || !call.convert()))
            return;
        call.result = library_result(
            VLN_MethodWrapper::vlncimRetrieveFATDump(call.target ? &call.name : nullptr));
        if (call.result != METHOD_DONE)
            VLN_LOG(VLN_ERR,
                    "VLNMPCA_SoftwareInstallationService_Provider::RetrieveFATDump failed. ");
    });
}

} // namespace cimple
