// What carries the tests out, one function for each kind. Each takes the settings of the run's
// test, waits until the library has done it, and leaves a job and records behind. The status says
// why there was no test: 1 and 2 for a port that is in no state for it, 63 for a host without
// diagnostics, else the library's own.
#ifndef VLN_SERVICES_DIAGNOSTICS_RUNNERS_H
#define VLN_SERVICES_DIAGNOSTICS_RUNNERS_H

#include "services/diagnostics/run.h"

namespace cimple {

// Sets the port's light as the settings say, and the port's LocationIndicator with it.
Run_Result SetBeaconState(const Test_Run& run);

// Sends the pattern round within the port, as far as the test's type says. 4 for an unknown type.
Run_Result LoopBackTest(const Test_Run& run);

// Sends the pattern to the target of the settings and back.
Run_Result EchoTest(const Test_Run& run);

// Measures the four pairs of a copper cable.
Run_Result PHYTest(const Test_Run& run);

} // namespace cimple

#endif // VLN_SERVICES_DIAGNOSTICS_RUNNERS_H
