// From what a console writes to a port configuration to the library's record. No library, log or
// lock beside it: operations/refusal.h.
#ifndef VLN_SERVICES_CHANNELS_PORT_CONFIG_REQUEST_H
#define VLN_SERVICES_CHANNELS_PORT_CONFIG_REQUEST_H

#include "classes/VLNMPCA_PortConfigData.h"
#include "operations/method_wrapper.h"
#include "operations/refusal.h"

namespace cimple {

// What becomes of the number of functions, and the line that tells it.
struct Function_Count_Change {
    VLN_MethodWrapper::NPAR_Update npar = VLN_MethodWrapper::NPAR_STAYS;
    const char* line = "No change in NPAR Ep mode";
};

// Writes what model gives into next, which begins as the adapter's present configuration. What the
// rules of the adapter say to it is not looked at.
Refused read_port_config(const VLNMPCA_PortConfigData& model, const AX_AdapterPortConfig& present,
                         AX_AdapterPortConfig& next, Function_Count_Change& count);

} // namespace cimple

#endif // VLN_SERVICES_CHANNELS_PORT_CONFIG_REQUEST_H
