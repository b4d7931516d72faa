// The records of the logs, and what joins them with their log.
#include "agent/gates.h"
#include "agent/store_search.h"
#include "agent/text.h"
#include "cimple/guard.h"
#include "cimple/shared_instances.h"
#include "services/record_logs/driver_logs.h"
#include "services/record_logs/provider.h"

namespace cimple {

namespace {

constexpr char DRIVER_RECORD_FORMAT[] = "[string record]";
constexpr char PROVIDER_RECORD_FORMAT[] = "[string fileName][uint32 lineNumber]:[string record]";

// One log with its records, counted, to be delivered without a lock.
struct Records {
    Ref<const VLNMPCA_RecordLog> log;
    Shared_Instances records;
};

const VLNMPCA_RecordLog* find_log(const Instance_Map<VLNMPCA_RecordLog>& logs, const char* head) {
    return find_first(logs, [head](const VLNMPCA_RecordLog& log) {
        return std::string_view(log.InstanceID.value.c_str()).starts_with(head);
    });
}

void set_record(CIM_LogEntry& record, const char* head, std::size_t number,
                const VLNMPCA_RecordLog& log) {
    record.InstanceID.set(format_text("%s%zu", head, number));
    record.LogInstanceID.set(log.InstanceID.value);
}

void take_provider_records(ProviderAgent& agent, Records& taken) {
    const std::string head = std::string(PROVIDER_LOG_HEAD) + ":";
    std::size_t number = 0;
    for (const VLN_CIMLogEntry& entry : agent.m_Loggers.ring().entries()) {
        auto record = make_instance<VLNMPCA_LogEntry>();
        set_record(*record, head.c_str(), number++, *taken.log);
        record->RecordFormat.set(PROVIDER_RECORD_FORMAT);
        record->RecordData.set(text(entry.message));
        record->LogLevel.set(level_word(static_cast<sint32>(entry.level)));
        record->CreationTimeStamp.set(entry.time);
        taken.records.add(record.get());
    }
}

template <class Entry>
Ref<Entry> driver_record(const Driver_Log_Row& row, std::size_t number, const std::string& line,
                         const VLNMPCA_RecordLog& log) {
    auto record = make_instance<Entry>();
    set_record(*record, row.record_head, number, log);
    record->RecordFormat.set(DRIVER_RECORD_FORMAT);
    record->RecordData.set(text(line));
    return record;
}

// Makes the records of a driver's log anew, in their store.
template <class Entry>
void take_driver_records(ProviderAgent& agent, Driver_Kind kind, Instance_Map<Entry>& store,
                         Records& taken) {
    const char* class_name = Entry::static_meta_class.name;
    const std::string failure = std::string("Insert Failed :  m_") + class_name + "_map";
    store.clear();
    for (const std::string& line : agent.m_DriverLogs[kind].lines.lines()) {
        const std::size_t number = store.size();
        Ref<Entry> record;
        if (!run_guarded([&] {
                record = driver_record<Entry>(driver_log_table[kind], number, line, *taken.log);
            })) {
            VLN_LOG(VLN_ERR, "Could not create %s instance", class_name);
            return;
        }
        const Entry* shown = insert_instance(store, std::move(record), failure.c_str());
        if (!shown)
            return;
        taken.records.add(shown);
        VLN_LOG(VLN_DBG, "%s returned instance %zu", class_name, number);
    }
}

// The log is not there on a host without adapters of its kind.
Records take_records(ProviderAgent& agent, Record_Class records) {
    const Operation_Prologue prologue(agent);
    Records taken;
    const auto is_there = [&](const Instance_Map<VLNMPCA_RecordLog>& logs, const char* head) {
        const auto* log = find_log(logs, head);
        taken.log = Ref<const VLNMPCA_RecordLog>::share(log);
        return log != nullptr;
    };
    const auto has_driver_log = [&](Driver_Kind kind) {
        const Driver_Log_Row& row = driver_log_table[kind];
        return is_there(agent.*row.logs, row.log_head);
    };
    switch (records) {
    case Record_Class::PROVIDER:
        if (is_there(agent.m_VLNMPCA_RecordLog_map, PROVIDER_LOG_HEAD))
            take_provider_records(agent, taken);
        break;
    case Record_Class::FC:
        if (has_driver_log(FC_DRIVER))
            take_driver_records(agent, FC_DRIVER, agent.m_VLNMPCA_FCDriverLogEntry_map, taken);
        break;
    case Record_Class::ISCSI:
        if (has_driver_log(ISCSI_DRIVER))
            take_driver_records(agent, ISCSI_DRIVER, agent.m_VLNMPCA_ISCSIDriverLogEntry_map,
                                taken);
        break;
    case Record_Class::NIC:
        if (has_driver_log(NIC_DRIVER))
            take_driver_records(agent, NIC_DRIVER, agent.m_VLNMPCA_NICDriverLogEntry_map, taken);
        break;
    }
    return taken;
}

void deliver(Records taken, const Meta_Class& delivered, const Enum_Instances_Handler& handler) {
    const bool joined = (delivered.flags & FLAG_ASSOCIATION) != 0;
    for (std::size_t i = 0; i < taken.records.size(); ++i) {
        const Instance* instance =
            joined ? association_of(&delivered, {taken.log.get(), taken.records[i]}).release()
                   : taken.records.take(i);
        if (!handler.handle(instance))
            return;
    }
}

} // namespace

sint32 enumerate_records(Record_Class records, const Meta_Class& delivered,
                         const Enum_Instances_Handler& handler) {
    ProviderAgent* agent = ProviderAgent::current();
    if (!agent)
        return ENUM_INSTANCES_OK;
    if (!agent->m_bLibraryLoaded) {
        VLN_LOG(VLN_DBG, "AX Init failed for %s_Provider.cpp", delivered.name);
        return ENUM_INSTANCES_OK;
    }
    if (!run_guarded([&] { deliver(take_records(*agent, records), delivered, handler); }))
        VLN_LOG(VLN_CRIT, "Exception in CIM Provider Enumeration - do nothing");
    VLN_LOG(VLN_DBG, "%s_Provider::enum_instances()", delivered.name);
    return ENUM_INSTANCES_OK;
}

} // namespace cimple
