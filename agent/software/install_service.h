// What the service that installs firmware has an effect on.
#ifndef VLN_AGENT_SOFTWARE_INSTALL_SERVICE_H
#define VLN_AGENT_SOFTWARE_INSTALL_SERVICE_H

#include "agent/associations.h"
#include "agent/provider_agent.h"

namespace cimple {

// For the stores of the classes that join the service with what it changes. Nothing happens on a
// host without the service. m_DataMutex and the ready mutex of the adapter maps are held.
void affect_by_install_service(ProviderAgent& agent, Instance_Map_Base& store,
                               const Instance* element, const Insert_Failure& failure = {});

} // namespace cimple

#endif // VLN_AGENT_SOFTWARE_INSTALL_SERVICE_H
