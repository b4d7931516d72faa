#include "services/diagnostics/records.h"

#include "agent/associations.h"
#include "agent/store_search.h"
#include "agent/text.h"
#include "cimple/guard.h"
#include "classes/VLNMPCA_AffectedJobElement.h"
#include "classes/VLNMPCA_DiagnosticCompletionRecord.h"
#include "classes/VLNMPCA_DiagnosticServiceRecord.h"
#include "classes/VLNMPCA_DiagnosticsLog.h"
#include "classes/VLNMPCA_LogManagesRecord.h"
#include "classes/VLNMPCA_OwningJobElement.h"
#include "classes/VLNMPCA_RecordAppliesToElement.h"

#include <algorithm>
#include <atomic>
#include <vector>

namespace cimple {

namespace {

constexpr uint16 JOB_COMPLETED = 7; // CIM_ConcreteJob.JobState
constexpr uint16 JOB_EXCEPTION = 10;
constexpr uint16 ALL_PERCENT = 100;
constexpr uint16 RECORD_RESULTS = 2; // CIM_DiagnosticRecord.RecordType
constexpr uint16 COMPLETED_OK = 2;   // CIM_DiagnosticCompletionRecord.CompletionState
constexpr uint16 COMPLETED_FAILED = 5;
constexpr char MANAGED_ELEMENT[] = "VLNMPCA_Adapter";
constexpr char SERVICE_RECORD_OF[] = "%s:Service Record"; // the job's name

constinit std::atomic<int> runs_of_process{0};

// ---- Instances ----

Ref<VLNMPCA_ConcreteJob> job_instance(const Test_Run& run, const Test_Report& report) {
    auto job = make_instance<VLNMPCA_ConcreteJob>();
    job->InstanceID.set(format_text("%s:%d:%lu", run.row.name, ++runs_of_process,
                                    static_cast<unsigned long>(report.handle)));
    job->Description.set(VLNMPCA_ConcreteJob::static_meta_class.name);
    job->ElementName.set(VLNMPCA_ConcreteJob::static_meta_class.name);
    job->Name.set(run.row.name);
    job->DeleteOnCompletion.set(run.job_setting->DeleteOnCompletion.value);
    job->TimeSubmitted.set(Datetime::now());
    job->ElapsedTime.set(job->TimeSubmitted.value);
    job->JobState.set(report.passed ? JOB_COMPLETED : JOB_EXCEPTION);
    job->PercentComplete.set(report.passed ? ALL_PERCENT : report.percent);
    job->diagHandle.set(report.handle);
    job->wwpn.set(run.port->DeviceID.value);
    return job;
}

void set_loops(VLNMPCA_DiagnosticServiceRecord& record, const Test_Run& run,
               const AX_DiagResults& results) {
    if (run.row.runner == Diagnostic_Runner::BEACON) {
        record.LoopsFailed.set(0);
        record.LoopsPassed.set(0);
        return;
    }
    // The words of a cable test have the lengths of its pairs in that place.
    const uint32 failed = run.row.runner == Diagnostic_Runner::CABLE ? 0 : results.errorCycles;
    record.LoopsFailed.set(failed);
    record.LoopsPassed.set(results.cyclesComplete - std::min(failed, results.cyclesComplete));
    record.CompletedCycles.set(results.cyclesComplete);
    record.TimeToExecute.set(results.milliseconds);
}

void set_error_counts(VLNMPCA_DiagnosticServiceRecord& record, const AX_DiagResults& results) {
    record.ErrorCode.append(String("XmitErrors"));
    record.ErrorCode.append(String("RecvErrors"));
    record.ErrorCount.append(results.transmitErrors);
    record.ErrorCount.append(results.receiveErrors);
}

void set_pairs(VLNMPCA_DiagnosticServiceRecord& record, const AX_CableResults& cable) {
    for (std::size_t pair = 0; pair < std::size(cable.pairState); ++pair) {
        const char name = static_cast<char>('A' + pair);
        const auto length = static_cast<int>(cable.pairLength[pair]);
        switch (cable.pairState[pair]) {
        case 0:
            record.ErrorCode.append(
                format_text("Pair %c: OK. Cable Length Estimation: %d cm.", name, length));
            break;
        case 1:
            record.ErrorCode.append(
                format_text("Pair %c: OK. Cable Length Estimation: invalid.", name));
            break;
        case 2:
            record.ErrorCode.append(
                format_text("Pair %c: Open. Distance to Fault: %d cm.", name, length));
            break;
        case 3:
            record.ErrorCode.append(
                format_text("Pair %c: Shorted. Distance to Fault: %d cm.", name, length));
            break;
        default:
            break;
        }
    }
}

Ref<VLNMPCA_DiagnosticServiceRecord> CreateNICDiagnosticServiceRecord(const Test_Run& run,
                                                                      const Test_Report& report,
                                                                      const String& job_id) {
    auto record = make_instance<VLNMPCA_DiagnosticServiceRecord>();
    record->InstanceID.set(format_text(SERVICE_RECORD_OF, job_id.c_str()));
    record->Description.set("This class holds the results(service) of the test");
    record->ElementName.set(VLNMPCA_DiagnosticServiceRecord::static_meta_class.name);
    record->RecordType.set(RECORD_RESULTS);
    record->ServiceName.set(run.row.name);
    record->ManagedElementName.set(MANAGED_ELEMENT);
    record->CreationTimeStamp.set(Datetime::now());
    record->RecordData.set(report.text);
    record->Locale.set("");
    if (run.row.runner == Diagnostic_Runner::LOOPBACK)
        set_error_counts(*record, report.results);
    set_loops(*record, run, report.results);
    if (report.cable)
        set_pairs(*record, *report.cable);
    return record;
}

Ref<VLNMPCA_DiagnosticCompletionRecord>
CreateNICDiagnosticCompletionRecord(const Test_Run& run, const Test_Report& report,
                                    const String& job_id) {
    auto record = make_instance<VLNMPCA_DiagnosticCompletionRecord>();
    record->InstanceID.set(job_id);
    record->Description.set("This class holds the result of the test");
    record->ElementName.set(format_text("%s Completion Record", run.row.name));
    record->ServiceName.set(run.row.name);
    record->ManagedElementName.set(MANAGED_ELEMENT);
    record->CompletionState.set(report.passed ? COMPLETED_OK : COMPLETED_FAILED);
    return record;
}

// ---- All or nothing ----

// Instances on their way into the stores.
class New_Instances {
public:
    template <class C>
    void add(Instance_Map<C>& store, const Ref<C>& instance, const char* failure) {
        m_rows.push_back({store, Ref<Instance>(instance), {failure, VLN_ERR}});
    }
    void join(Instance_Map_Base& store, const Instance* first, const Instance* second) {
        m_rows.push_back({store, association_of(store.meta_class(), {first, second}), {}});
    }
    // False, and the stores are as they were, if one of them could not be taken in.
    bool insert() {
        std::size_t done = 0;
        run_guarded([&] {
            while (done < m_rows.size() &&
                   insert_instance(m_rows[done].store, m_rows[done].instance, m_rows[done].failure))
                ++done;
        });
        if (done == m_rows.size())
            return true;
        while (done-- > 0)
            m_rows[done].store.remove(m_rows[done].store.size() - 1);
        VLN_LOG(VLN_ERR, "Unable to create VLNMPCA_ConcreteJob");
        return false;
    }

private:
    struct Row {
        Instance_Map_Base& store;
        Ref<Instance> instance; // null: there was a line when it could not be made
        Insert_Failure failure;
    };
    std::vector<Row> m_rows;
};

// The job, unless it goes at once, as it was inserted.
Ref<const VLNMPCA_ConcreteJob> insert_run(const Test_Run& run, const Test_Report& report) {
    ProviderAgent& agent = run.agent;
    const auto job = job_instance(run, report);
    const String& id = job->InstanceID.value;
    const auto service = CreateNICDiagnosticServiceRecord(run, report, id);
    const auto completion = CreateNICDiagnosticCompletionRecord(run, report, id);
    const Instance* log = find_by_key(agent.m_VLNMPCA_DiagnosticsLog_map,
                                      &VLNMPCA_DiagnosticsLog::InstanceID, run.row.name);
    const bool keeps_job = !job->DeleteOnCompletion.value;
    New_Instances instances;
    if (keeps_job) {
        instances.add(agent.m_VLNMPCA_ConcreteJob_map, job, "Insert in ConcreteJob Failed");
        instances.join(agent.m_VLNMPCA_OwningJobElement_map, run.test, job.get());
        instances.join(agent.m_VLNMPCA_AffectedJobElement_map, run.port, job.get());
    }
    instances.add(agent.m_VLNMPCA_DiagnosticServiceRecord_map, service,
                  "Insert in DiagnosticServiceRecord Failed");
    instances.join(agent.m_VLNMPCA_LogManagesRecord_map, log, service.get());
    instances.join(agent.m_VLNMPCA_RecordAppliesToElement_map, service.get(), run.port);
    instances.add(agent.m_VLNMPCA_DiagnosticCompletionRecord_map, completion,
                  "Insert in DiagnosticCompletionRecord Failed");
    return instances.insert() && keeps_job ? Ref<const VLNMPCA_ConcreteJob>(job)
                                           : Ref<const VLNMPCA_ConcreteJob>();
}

// ---- Deletion ----

template <class C, class Predicate>
void remove_if(Instance_Map<C>& store, Predicate wanted) {
    for (uint32 i = store.size(); i-- > 0;)
        if (wanted(*store[i]))
            store.remove(i);
}

// Whether an end of an association is that record, or another instance with its name.
template <class C, class End>
bool is_end(const End* end, const String& id) {
    const C* instance = cast<C>(static_cast<const Instance*>(end));
    return instance && instance->InstanceID.value == id;
}

String job_id_of(const VLNMPCA_DiagnosticServiceRecord& record) {
    const String& id = record.InstanceID.value;
    const std::size_t ending = sizeof SERVICE_RECORD_OF - sizeof "%s";
    return id.substr(0, static_cast<uint32>(id.size() - std::min<std::size_t>(ending, id.size())));
}

void delete_job(ProviderAgent& agent, const String& id) {
    remove_if(agent.m_VLNMPCA_OwningJobElement_map, [&](const VLNMPCA_OwningJobElement& link) {
        return is_end<VLNMPCA_ConcreteJob>(link.OwnedElement, id);
    });
    remove_if(agent.m_VLNMPCA_AffectedJobElement_map, [&](const VLNMPCA_AffectedJobElement& link) {
        return is_end<VLNMPCA_ConcreteJob>(link.AffectingElement, id);
    });
    remove_if(agent.m_VLNMPCA_ConcreteJob_map,
              [&](const VLNMPCA_ConcreteJob& job) { return job.InstanceID.value == id; });
}

// The job goes as well: a log that is full is no reason to keep ever more jobs.
void make_room(ProviderAgent& agent, const String& test_name) {
    const auto& records = agent.m_VLNMPCA_DiagnosticServiceRecord_map;
    const auto is_of_test = [&](const VLNMPCA_DiagnosticServiceRecord& record) {
        return record.ServiceName.value == test_name;
    };
    uint32 count = 0;
    for (uint32 i = 0; i < records.size(); ++i)
        count += is_of_test(*records[i]);
    for (; count > MAX_LOG_RECORDS; --count) {
        const VLNMPCA_DiagnosticServiceRecord* oldest = find_first(records, is_of_test);
        delete_job(agent, job_id_of(*oldest));
        delete_record(agent, *oldest);
    }
}

} // namespace

Ref<const VLNMPCA_ConcreteJob> record_run(const Test_Run& run, const Test_Report& report) {
    Ref<const VLNMPCA_ConcreteJob> job;
    const bool complete = run_guarded([&] {
        job = insert_run(run, report);
        make_room(run.agent, run.row.name);
    });
    if (!complete)
        VLN_LOG(VLN_ERR, "Unable to create VLNMPCA_ConcreteJob");
    return job;
}

void delete_record(ProviderAgent& agent, const VLNMPCA_DiagnosticServiceRecord& record) {
    const String id = record.InstanceID.value, job_id = job_id_of(record);
    remove_if(agent.m_VLNMPCA_LogManagesRecord_map, [&](const VLNMPCA_LogManagesRecord& link) {
        return is_end<VLNMPCA_DiagnosticServiceRecord>(link.Record, id);
    });
    remove_if(agent.m_VLNMPCA_RecordAppliesToElement_map,
              [&](const VLNMPCA_RecordAppliesToElement& link) {
                  return is_end<VLNMPCA_DiagnosticServiceRecord>(link.Antecedent, id);
              });
    remove_if(agent.m_VLNMPCA_DiagnosticCompletionRecord_map,
              [&](const VLNMPCA_DiagnosticCompletionRecord& completion) {
                  return completion.InstanceID.value == job_id;
              });
    remove_if(
        agent.m_VLNMPCA_DiagnosticServiceRecord_map,
        [&](const VLNMPCA_DiagnosticServiceRecord& each) { return each.InstanceID.value == id; });
}

void delete_records(ProviderAgent& agent, const String& test_name) {
    const auto& records = agent.m_VLNMPCA_DiagnosticServiceRecord_map;
    for (uint32 i = records.size(); i-- > 0;)
        if (records[i]->ServiceName.value == test_name)
            delete_record(agent, *records[i]);
}

} // namespace cimple
