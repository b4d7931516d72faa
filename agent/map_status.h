// What a step of a map builder answers.
#ifndef VLN_AGENT_MAP_STATUS_H
#define VLN_AGENT_MAP_STATUS_H

#include "cimple/types.h"

namespace cimple {

enum Map_Status : uint32 {
    MAP_OK = 0,
    SKIP_DEVICE = 32768, // the present port or device is left out
    END_PASS = 32769,    // the pass ends here
};

} // namespace cimple

#endif // VLN_AGENT_MAP_STATUS_H
