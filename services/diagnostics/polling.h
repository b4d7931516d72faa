// How a test that the library runs in its background is waited for, and cancelled when it takes
// too long.
#ifndef VLN_SERVICES_DIAGNOSTICS_POLLING_H
#define VLN_SERVICES_DIAGNOSTICS_POLLING_H

#include "services/diagnostics/run.h"

namespace cimple {

// Looks at the test once a second until it has ended. True when it has ended by itself, with its
// results in the report; false when it failed otherwise, with the reason as the report's text:
// errors that show while a loopback runs, a library that refuses, a test that others cancelled, or
// one that is cancelled here since it takes longer than its kind may or since its class is being
// unloaded.
bool poll_test(const Test_Run& run, Test_Report& report);

// The words for the result code of a test.
const char* result_text(uint32 code);

// Gives the report its text, and logs it: of a test that passed at level 4, of another at level 3.
void conclude(Test_Report& report, String text);

} // namespace cimple

#endif // VLN_SERVICES_DIAGNOSTICS_POLLING_H
