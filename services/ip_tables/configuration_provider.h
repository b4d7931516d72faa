// The service that gives an IP endpoint of an iSCSI port its static settings.
#ifndef VLN_SERVICES_IP_TABLES_CONFIGURATION_PROVIDER_H
#define VLN_SERVICES_IP_TABLES_CONFIGURATION_PROVIDER_H

#include "classes/CIM_ConcreteJob.h"
#include "classes/CIM_IPAssignmentSettingData.h"
#include "classes/CIM_IPProtocolEndpoint.h"
#include "classes/VLNMPCA_IPConfigurationService.h"
#include "derivedObjects/provider_for.h"

namespace cimple {

struct IP_Configuration_Provider : Pattern_Provider<VLNMPCA_IPConfigurationService> {
    // Has the adapter keep the address, the mask, the gateway and the VLAN of the static setting
    // that the configuration orders, whatever gave the endpoint its address before. There is no
    // job. On failure the value is 4 and the call INVOKE_METHOD_FAILED.
    sint32 ApplySettingToIPProtocolEndpoint(const VLNMPCA_IPConfigurationService* self,
                                            CIM_IPAssignmentSettingData* const* configuration,
                                            CIM_IPProtocolEndpoint* const* endpoint,
                                            CIM_ConcreteJob** job, Property<uint32>* result);
};

template <>
struct Provider_For<VLNMPCA_IPConfigurationService> {
    using type = IP_Configuration_Provider;
};

} // namespace cimple

#endif // VLN_SERVICES_IP_TABLES_CONFIGURATION_PROVIDER_H
