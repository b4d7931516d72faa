// The drivers' lines, beside the stores: the records of their logs are made from them.
#ifndef VLN_AGENT_DRIVER_LOGS_H
#define VLN_AGENT_DRIVER_LOGS_H

#include "foundation/device_log.h"

namespace cimple {

// In the order in which their lines are read.
enum Driver_Kind : uint8 { FC_DRIVER, ISCSI_DRIVER, NIC_DRIVER, NUM_DRIVER_KINDS };

struct Driver_Log {
    DeviceLog lines;
    bool is_on = true; // a refresh reads its lines anew; else it stays as it is
};

} // namespace cimple

#endif // VLN_AGENT_DRIVER_LOGS_H
