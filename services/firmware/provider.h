// The service that installs firmware: its methods.
#ifndef VLN_SERVICES_FIRMWARE_PROVIDER_H
#define VLN_SERVICES_FIRMWARE_PROVIDER_H

#include "classes/VLNMPCA_SoftwareInstallationService.h"
#include "derivedObjects/provider_for.h"

namespace cimple {

// Every method runs to its end in the call: there is no job, and Job stays null. Each holds
// m_DataMutex through its calls into the library, a download's minutes included. An unload cuts a
// fetch from another host short.
struct Installation_Service_Provider : Pattern_Provider<VLNMPCA_SoftwareInstallationService> {
    using Service = VLNMPCA_SoftwareInstallationService;

    sint32 unload();

    sint32 InstallFromURI(const Service* self, CIM_ConcreteJob** job, Property<String>* uri,
                          CIM_ManagedElement** target, Property<Array<uint16>>* options,
                          Property<Array<String>>* values, Property<uint32>* return_value);
    // Writes the image to a file of the object manager's working folder, unless the name that the
    // client gives says otherwise, and removes it.
    sint32 InstallFromByteStream(const Service* self, CIM_ConcreteJob** job,
                                 Property<Array<uint8>>* image, CIM_ManagedElement** target,
                                 Property<Array<uint16>>* options, Property<Array<String>>* values,
                                 Property<uint32>* return_value);
    sint32 Reset(const Service* self, CIM_LogicalPort** target, Property<uint32>* return_value);
    sint32 SetPortEnabled(const Service* self, CIM_LogicalPort** target, Property<boolean>* enabled,
                          Property<uint8>* config_status, Property<uint32>* return_value);
    sint32 SetSRIOVState(const Service* self, CIM_LogicalPort** target, Property<boolean>* enabled,
                         Property<uint32>* return_value);
    sint32 GetHBAFeatures(const Service* self, CIM_LogicalPort** target,
                          Property<Array<uint8>>* features, Property<uint32>* return_value);
};

template <>
struct Provider_For<VLNMPCA_SoftwareInstallationService> {
    using type = Installation_Service_Provider;
};

} // namespace cimple

#endif // VLN_SERVICES_FIRMWARE_PROVIDER_H
