// What a run leaves in the stores: a job, a service record in the log of its test, a completion
// record, and the links between them, the test, the log and the port. They last until the catalogue
// of tests is built anew.
#ifndef VLN_SERVICES_DIAGNOSTICS_RECORDS_H
#define VLN_SERVICES_DIAGNOSTICS_RECORDS_H

#include "services/diagnostics/run.h"

namespace cimple {

struct VLNMPCA_DiagnosticServiceRecord;

// Makes all of it or, after a line of the log, nothing. Answers the job; null when there is none,
// also because the job setting wants it deleted with the end of the test: the records stay then. A
// log that is full loses its oldest record, and with it whatever else is left of that run.
Ref<const VLNMPCA_ConcreteJob> record_run(const Test_Run& run, const Test_Report& report);

// The service record with its links and its completion record.
void delete_record(ProviderAgent& agent, const VLNMPCA_DiagnosticServiceRecord& record);

// The same of all runs of a test.
void delete_records(ProviderAgent& agent, const String& test_name);

} // namespace cimple

#endif // VLN_SERVICES_DIAGNOSTICS_RECORDS_H
