// What the software identities of the provider, the drivers and the firmware have in common.
#ifndef VLN_AGENT_SOFTWARE_SOFTWARE_IDENTITY_H
#define VLN_AGENT_SOFTWARE_SOFTWARE_IDENTITY_H

#include "agent/associations.h"
#include "classes/VLNMPCA_SoftwareIdentity.h"
#include "device/adapter_attributes.h"

#include <array>
#include <initializer_list>
#include <string>

namespace cimple {

enum Software_Class : uint16 { // CIM_SoftwareIdentity.Classifications
    SOFTWARE_OTHER = 1,
    SOFTWARE_DRIVER = 2,
    SOFTWARE_FIRMWARE = 10,
};

enum Software_Status : uint16 { // CIM_ElementSoftwareIdentity.ElementSoftwareStatus
    STATUS_CURRENT = 2,
    STATUS_NEXT = 3,
    STATUS_ON_PORT = 9, // beside the two on ports and their controllers
};

// Who a software is besides its key: one pair of type and value.
void append_identity(CIM_SoftwareIdentity& software, const char* type, const String& value);

// How the driver of a kind of function is named.
struct Driver_Texts {
    const char* kind;        // "CNA Driver"
    const char* description; // "Vorlan CNA Driver"
    const char* id_head;     // of the key, before name and version: "VLN CNA"
};

Ref<VLNMPCA_SoftwareIdentity> driver_identity_instance(const Driver_Texts& texts,
                                                       const CNAAdapterAttributes& adapter);

// The firmware of the adapter's ASIC, or null: the functions of an ASIC share it
// (firmware_maps.cpp).
const VLNMPCA_SoftwareIdentity* find_firmware(const Instance_Map<VLNMPCA_SoftwareIdentity>& store,
                                              const AdapterAttributes& adapter);

// The identity of the provider itself, or null (software_maps.cpp).
const VLNMPCA_SoftwareIdentity*
find_provider_identity(const Instance_Map<VLNMPCA_SoftwareIdentity>& store);

// The statuses of the software on the element, for the association of the two.
Association_Details software_status(std::initializer_list<uint16> statuses);

// The systems that the software is for, as the library names the host's.
void setTargetOSTypes(CIM_SoftwareIdentity& software);
// The same from the name of a system.
void append_target_system(CIM_SoftwareIdentity& software, const String& system);

// The four numbers of "a.b.c.d". Throws std::out_of_range for a text with fewer dots.
std::array<uint16, 4> dotted_version(const std::string& version);

} // namespace cimple

#endif // VLN_AGENT_SOFTWARE_SOFTWARE_IDENTITY_H
