// The settings of the FCoE driver that a console changes, and the service that turns priorities
// off.
//
// A change goes to the adapter first and then to the stores. m_DataMutex is held through the call
// into the library. What the adapter refuses leaves the stores as they are.
#ifndef VLN_SERVICES_DRIVER_PARAMETERS_PROVIDER_H
#define VLN_SERVICES_DRIVER_PARAMETERS_PROVIDER_H

#include "classes/VLNMPCA_DriverParameterService.h"
#include "classes/VLNMPCA_DriverParameterSettingData.h"
#include "derivedObjects/provider_for.h"

namespace cimple {

struct Driver_Parameter_Provider : Pattern_Provider<VLNMPCA_DriverParameterSettingData> {
    using Setting = VLNMPCA_DriverParameterSettingData;

    // Sets Value of a current setting. MODIFY_INSTANCE_INVALID_PARAMETER for any other setting and
    // without a value; else MODIFY_INSTANCE_FAILED.
    sint32 modify_instance(const Setting* model, const Setting* instance);
    // Gives the logical unit of the identifier priority, or takes it away. An identifier that is
    // not of this kind is CREATE_INSTANCE_INVALID_PARAMETER; else ..._FAILED.
    sint32 create_instance(Setting* instance);
    sint32 delete_instance(const Setting* instance);
};

struct Driver_Parameter_Service_Provider : Pattern_Provider<VLNMPCA_DriverParameterService> {
    sint32 DisableAllPrioViaLuns(const VLNMPCA_DriverParameterService* self,
                                 Property<String>* initiator, Property<String>* target,
                                 Property<uint8>* option, Property<uint32>* return_value);
};

template <>
struct Provider_For<VLNMPCA_DriverParameterSettingData> {
    using type = Driver_Parameter_Provider;
};

template <>
struct Provider_For<VLNMPCA_DriverParameterService> {
    using type = Driver_Parameter_Service_Provider;
};

} // namespace cimple

#endif // VLN_SERVICES_DRIVER_PARAMETERS_PROVIDER_H
