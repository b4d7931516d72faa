#include "services/record_logs/driver_logs.h"

#include "agent/software/software_identity.h"
#include "agent/store_search.h"
#include "agent/text.h"
#include "device/adapter.h"
#include "foundation/driver_events.h"
#include "foundation/host_paths.h"

#include <algorithm>
#include <vector>

namespace cimple {

namespace {

using Stores = Instance_Stores;

// The identity of the driver that the adapter runs under, or null.
const VLNMPCA_SoftwareIdentity* find_driver(const ProviderAgent& agent, const Driver_Log_Row& row,
                                            Adapter& adapter) {
    const auto& attributes =
        static_cast<const CNAAdapterAttributes&>(*adapter.getAdapterAttributes());
    return find_by_key(agent.m_VLNMPCA_SoftwareIdentity_map, &VLNMPCA_SoftwareIdentity::InstanceID,
                       format_text("%s: Driver %s v%s", row.driver_head,
                                   attributes.DriverName.c_str(),
                                   attributes.DriverVersion.c_str()));
}

Ref<VLNMPCA_RecordLog> driver_log_instance(const Map_Scope& scope, Driver_Kind kind) {
    const Driver_Log_Row& row = driver_log_table[kind];
    const std::string_view name = std::string_view(row.log_head).substr(sizeof "VLN:" - 1);
    auto log = record_log_instance(row.log_head, *scope.system, name.data());
    log->Description.set("Driver logs for MPCA Provider");
    log->TracePath.set(text(host_path(Host_File::SYSTEM_LOG)));
    log->CurrentNumberOfRecords.set(driver_record_count(scope.agent, kind));
    if (!scope.agent.m_DriverLogs[kind].is_on) {
        log->RequestedState.set(LOG_DISABLED);
        log->EnabledState.set(LOG_DISABLED);
    }
    return log;
}

uint32 create_driver_log(const Map_Scope& scope, Driver_Kind kind, Adapter& adapter) {
    ProviderAgent& agent = scope.agent;
    const Driver_Log_Row& row = driver_log_table[kind];
    const auto* log = insert_instance(agent.*row.logs, driver_log_instance(scope, kind));
    if (!log)
        return SKIP_DEVICE;
    const String id = format_text("%s Capabilities", row.log_head);
    join_log_with_capabilities(agent, *log,
                               insert_instance(agent.*row.capabilities,
                                               log_capabilities_instance(id.c_str(), id.c_str())));
    const auto* driver = find_driver(agent, row, adapter);
    if (!driver) {
        VLN_LOG(VLN_DBG, "Missing Provider Software Identity");
        return SKIP_DEVICE;
    }
    join_log_with_user(agent.*row.uses, *log, *driver);
    return MAP_OK;
}

bool has_adapter(const ProviderAgent& agent, uint32 type) {
    const auto& adapters = agent.m_pData->adapters;
    return std::any_of(adapters.begin(), adapters.end(),
                       [type](const auto& adapter) { return adapter->getAdapterType() == type; });
}

uint32 create_driver_log(const Map_Scope& scope, Driver_Kind kind) {
    const Driver_Log_Row& row = driver_log_table[kind];
    for (const auto& adapter : scope.agent.m_pData->adapters) {
        if (adapter->getAdapterType() == row.adapter)
            return create_driver_log(scope, kind, *adapter);
        if (row.adapter_name)
            VLN_LOG(VLN_DBG, "Skippping Adapter [%s] since it is not an %s Adapter",
                    adapter->getAdapterName().c_str(), row.adapter_name);
    }
    return MAP_OK;
}

void read_events(ProviderAgent& agent, const std::vector<Driver_Kind>& kinds) {
    std::vector<Driver_Events> wanted;
    for (const Driver_Kind kind : kinds) {
        DeviceLog& lines = agent.m_DriverLogs[kind].lines;
        lines.clear();
        wanted.push_back({driver_log_table[kind].key_word, &lines});
    }
    ReadDriverEvents(wanted);
}

} // namespace

const Driver_Log_Row driver_log_table[NUM_DRIVER_KINDS] = {
    {"vfcd", ADAPTER_FCOE, "FCoE", "VLN FCoE", "VLN:MPCA FC Driver Record Log",
     "VLN:MPCA FC Driver Record :", "Found FCoE-FC Record Log Instance ",
     "Log FCOE FC Driver Events ",
     "SetLogParams is not supported for Driver Record(MPCA-FC) Log Instance",
     &Stores::m_VLNMPCA_DriverRecordLog_map,
     &Stores::m_VLNMPCA_DriverEnabledRecordLogCapabilities_map,
     &Stores::m_VLNMPCA_DriverProviderUseOfLog_map},
    {"viscd", ADAPTER_ISCSI, nullptr, "VLN CNA", "VLN:MPCA ISCSI Driver Record Log",
     "VLN:MPCA ISCSI Driver Record:", "Found ISCSI Record Log Instance ", nullptr,
     "SetLogParams is not supported for Driver Record(MPCA-ISCSI) Log Instance",
     &Stores::m_VLNMPCA_ISCSIRecordLog_map,
     &Stores::m_VLNMPCA_ISCSIEnabledRecordLogCapabilities_map,
     &Stores::m_VLNMPCA_ISCSIProviderUseOfLog_map},
    {"vnicd", ADAPTER_NIC, "MPCA NIC", "VLN CNA", "VLN:MPCA NIC Driver Record Log",
     "VLN:MPCA NIC Driver Record :", "Found FCoE-NIC Record Log Instance ",
     "Log FCOE NIC Driver Events ",
     "SetLogParams is not supported for Driver Record(MPCA-NIC) Log Instance",
     &Stores::m_VLNMPCA_DriverRecordLog_map,
     &Stores::m_VLNMPCA_DriverEnabledRecordLogCapabilities_map,
     &Stores::m_VLNMPCA_DriverProviderUseOfLog_map},
};

uint64 driver_record_count(const ProviderAgent& agent, Driver_Kind kind) {
    return agent.m_DriverLogs[kind].lines.lines().size();
}

void read_driver_events(ProviderAgent& agent, Driver_Kind kind) {
    read_events(agent, {kind});
}

uint32 read_driver_events(const Map_Scope& scope) {
    std::vector<Driver_Kind> kinds;
    for (const Driver_Kind kind : {FC_DRIVER, ISCSI_DRIVER, NIC_DRIVER})
        if (scope.agent.m_DriverLogs[kind].is_on &&
            has_adapter(scope.agent, driver_log_table[kind].adapter))
            kinds.push_back(kind);
    if (!kinds.empty()) // else the host's log need not be read
        read_events(scope.agent, kinds);
    return MAP_OK;
}

uint32 create_nic_driver_log(const Map_Scope& scope) {
    return create_driver_log(scope, NIC_DRIVER);
}

uint32 create_fc_driver_log(const Map_Scope& scope) {
    return create_driver_log(scope, FC_DRIVER);
}

uint32 create_iscsi_driver_log(const Map_Scope& scope) {
    return create_driver_log(scope, ISCSI_DRIVER);
}

} // namespace cimple
