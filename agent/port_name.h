// A port's identifier as the library takes it.
#ifndef VLN_AGENT_PORT_NAME_H
#define VLN_AGENT_PORT_NAME_H

#include "cimple/string.h"
#include "operations/method_wrapper.h"

namespace cimple {

// The port's name in binary. False, with the line of the step that failed, when it is no name.
bool port_name_to_wwn(const String& port_name, HBA_WWN& wwn);

} // namespace cimple

#endif // VLN_AGENT_PORT_NAME_H
