// The platform's own objects, to which everything is tied.
#ifndef VLN_AGENT_PLATFORM_PLATFORM_OBJECTS_H
#define VLN_AGENT_PLATFORM_PLATFORM_OBJECTS_H

#include "classes/CIM_Chassis.h"
#include "classes/CIM_ComputerSystem.h"

namespace cimple {

// Null: the platform has none.
struct Platform_Objects {
    Ref<CIM_ComputerSystem> system;
    Ref<CIM_Chassis> chassis;
};

// Asks the object manager for them. With no lock held: a provider of the platform may ask us
// something on its way.
Platform_Objects find_platform_objects();

} // namespace cimple

#endif // VLN_AGENT_PLATFORM_PLATFORM_OBJECTS_H
