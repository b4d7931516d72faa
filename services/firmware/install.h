// Installing firmware. m_DataMutex is held, the answer is that of the method.
#ifndef VLN_SERVICES_FIRMWARE_INSTALL_H
#define VLN_SERVICES_FIRMWARE_INSTALL_H

#include "agent/provider_agent.h"
#include "classes/CIM_ManagedElement.h"

namespace cimple {

// A fetch from another host is given up when stop goes up.
uint32 install_from_uri(ProviderAgent& agent, const CIM_ManagedElement* target, const String& uri,
                        const Array<uint16>& options, const bool& stop);
uint32 install_from_bytes(ProviderAgent& agent, const CIM_ManagedElement* target,
                          const Array<uint8>& image, const Array<uint16>& options,
                          const Array<String>& values);

// Shows with the firmware of the port's ASIC what is on flash now. A failure is told in the log.
void update_firmware_on_flash(ProviderAgent& agent, const String& device_id, const HBA_WWN& name);

} // namespace cimple

#endif // VLN_SERVICES_FIRMWARE_INSTALL_H
