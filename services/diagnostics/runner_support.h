// What the runners share: settings as the library takes them, the attributes that decide whether a
// port can be tested, and the end of a run.
#ifndef VLN_SERVICES_DIAGNOSTICS_RUNNER_SUPPORT_H
#define VLN_SERVICES_DIAGNOSTICS_RUNNER_SUPPORT_H

#include "device/library/attribute_buffer.h"
#include "services/diagnostics/run.h"

namespace cimple {

// AX_PA_FUNCTIONAL_PORT_STATE
inline constexpr uint32 PORT_LINK_DOWN = 6;
inline constexpr uint32 PORT_DISABLED = 22;

// Statuses by which the runners refuse a port.
inline constexpr AX_STATUS NOT_READY = 1;
inline constexpr AX_STATUS PORT_STATE_FORBIDS = 2;

// The number of cycles that the settings ask for; 0 for none.
uint32 cycles_of(const Test_Run& run);

// The attributes of the run's port as they are now. Numbers that it does not tell are 0.
class Port_Attributes {
public:
    explicit Port_Attributes(const Test_Run& run)
        : m_buffer(AX_PORT_ATTRIBUTES_SIZE),
          m_status(fetchPortAttributes(wwnOf(&run.name), m_buffer)) {}

    AX_STATUS status() const { return m_status; }
    uint32 number(uint16 identifier, const char* label) {
        uint32 value = 0;
        if (m_status == AX_STATUS_OK)
            getPortAttributeNumber(m_buffer, identifier, label, &value);
        return value;
    }
    uint32 functional_state() {
        return number(AX_PA_FUNCTIONAL_PORT_STATE, "_FunctionalPortState");
    }

private:
    Attribute_Buffer m_buffer;
    AX_STATUS m_status;
};

// The end of a run for which the library has started no test: the line, which tells the status,
// and no job.
Run_Result no_test(AX_STATUS status, const String& line);

// The end of a run with a test: its job and records.
Run_Result end_run(const Test_Run& run, const Test_Report& report);

} // namespace cimple

#endif // VLN_SERVICES_DIAGNOSTICS_RUNNER_SUPPORT_H
