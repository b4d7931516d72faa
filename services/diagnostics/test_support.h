// Which tests a port can serve. m_DataMutex is held: the management library is asked.
#ifndef VLN_SERVICES_DIAGNOSTICS_TEST_SUPPORT_H
#define VLN_SERVICES_DIAGNOSTICS_TEST_SUPPORT_H

#include "services/diagnostics/catalogue.h"

namespace cimple {

inline constexpr uint32 TEST_UNSUPPORTED = 32768;

// 0 for the beacon of the port with that device identifier, if it has one; TEST_UNSUPPORTED for a
// port without, which the log tells, and for every other test.
uint32 IsTestSupported(const String& device_id, Diagnostic_Runner test);

// The same for the cable test (CABLE_TDR) of a port with a copper PHY.
uint32 ISDiagTestSupported(const String& device_id, uint32 test);

// Whether the port of one of the test's kinds has what the test needs.
bool port_serves(const String& device_id, const Diagnostic_Row& test);

} // namespace cimple

#endif // VLN_SERVICES_DIAGNOSTICS_TEST_SUPPORT_H
