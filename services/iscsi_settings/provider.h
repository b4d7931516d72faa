// The service that adds portals and targets, logs in to them and out, and sets how that is done;
// and the settings of iSCSI ports that a console changes.
//
// Every call holds m_DataMutex through its calls into the library. What changes targets or sessions
// asks for a refresh, which the next look at the SAN waits for; none of these calls does. CHAP
// secrets go from the arguments to the library and nowhere else.
#ifndef VLN_SERVICES_ISCSI_SETTINGS_PROVIDER_H
#define VLN_SERVICES_ISCSI_SETTINGS_PROVIDER_H

#include "classes/VLNMPCA_ISCSIBootData.h"
#include "classes/VLNMPCA_ISCSIISNSServerData.h"
#include "classes/VLNMPCA_ISCSIInitiatorPropertiesData.h"
#include "classes/VLNMPCA_ISCSIQOSData.h"
#include "classes/VLNMPCA_ISCSIiSNSData.h"
#include "classes/VLNMPCA_iSCSISettingService.h"
#include "derivedObjects/provider_for.h"

namespace cimple {

// What a method answers stands in return_value: 0, 33068 for an unknown service, and what is told
// here. A port is meant by its 16 digits or by its MAC address.
struct ISCSI_Service_Provider : Pattern_Provider<VLNMPCA_iSCSISettingService> {
    using Service = VLNMPCA_iSCSISettingService;
    using Text = Property<String>;
    using Number = Property<uint32>;
    using Short = Property<uint16>;
    using Flag = Property<boolean>;

    // 5 for an argument that is not usable; the library's own status on failure. An address that
    // refuses to answer is no failure.
    sint32 Ping(const Service* self, Text* mac, Text* address, Number* port, Number* result);

    // 32968 for an argument that is not usable, 32769 for all that fails. Digests and immediate
    // data that are not given are as the initiator, or for a login the target, has them.
    sint32 AddTargetPortal(const Service* self, Text* mac, Text* address, Short* port,
                           Flag* header_digest, Flag* immediate_data, Flag* data_digest,
                           Number* method, Text* target_name, Text* target_secret,
                           Text* initiator_name, Text* initiator_secret, Number* result);
    sint32 RemoveTargetPortal(const Service* self, Text* mac, Text* address, Short* port,
                              Number* result);
    sint32 AddTarget(const Service* self, Text* mac, Text* address, Short* port, Text* target,
                     Flag* header_digest, Flag* immediate_data, Flag* data_digest, Flag* login,
                     Flag* boot, Number* method, Text* target_name, Text* target_secret,
                     Text* initiator_name, Text* initiator_secret, Number* result);
    sint32 RemoveTarget(const Service* self, Text* mac, Text* target, Number* result);
    sint32 TargetLogin(const Service* self, Text* mac, Text* target, Text* address, Short* port,
                       Flag* header_digest, Flag* immediate_data, Flag* data_digest, Number* method,
                       Text* target_name, Text* target_secret, Text* initiator_name,
                       Text* initiator_secret, Number* result);
    sint32 TargetLogout(const Service* self, Text* mac, Text* target, Number* session,
                        Text* address, Number* result);

    // 5 and 32968 for arguments that are not usable; the library's own status on failure. The
    // library takes no session number: all sessions with the target at the address are meant.
    sint32 setBootTargetSession(const Service* self, Text* mac, Text* target, Number* session,
                                Text* address, Number* enable, Number* result);
    // These three answer 5 for an unknown port, 32968 for authentication that is not usable, and 1
    // for all else.
    sint32 setTargetLoginProperties(const Service* self, Text* mac, Text* target,
                                    Number* header_digest, Number* immediate_data,
                                    Number* data_digest, Number* method, Text* target_name,
                                    Text* target_secret, Text* initiator_name,
                                    Text* initiator_secret, Number* result);
    sint32 setTargetProperties(const Service* self, Text* mac, Text* target, Number* eto,
                               Number* result);
    sint32 setTPLoginProperties(const Service* self, Text* mac, Text* address, Short* port,
                                Number* header_digest, Number* immediate_data, Number* data_digest,
                                Number* method, Text* target_name, Text* target_secret,
                                Text* initiator_name, Text* initiator_secret, Number* result);
};

struct Initiator_Properties_Provider : Pattern_Provider<VLNMPCA_ISCSIInitiatorPropertiesData> {
    sint32 modify_instance(const VLNMPCA_ISCSIInitiatorPropertiesData* model,
                           const VLNMPCA_ISCSIInitiatorPropertiesData* instance);
};

struct ISCSI_Boot_Provider : Pattern_Provider<VLNMPCA_ISCSIBootData> {
    sint32 modify_instance(const VLNMPCA_ISCSIBootData* model,
                           const VLNMPCA_ISCSIBootData* instance);
};

struct ISCSI_QoS_Provider : Pattern_Provider<VLNMPCA_ISCSIQOSData> {
    // Sets the limits that are given and reads both back. NOT_FOUND for what the adapter refuses.
    sint32 modify_instance(const VLNMPCA_ISCSIQOSData* model, const VLNMPCA_ISCSIQOSData* instance);
};

struct Name_Server_State_Provider : Pattern_Provider<VLNMPCA_ISCSIiSNSData> {
    // Adds the server and sets whether servers are asked. What is not given stays.
    sint32 modify_instance(const VLNMPCA_ISCSIiSNSData* model,
                           const VLNMPCA_ISCSIiSNSData* instance);
};

// Servers come and go; none is modified.
struct Name_Server_Provider : Pattern_Provider<VLNMPCA_ISCSIISNSServerData> {
    // Switches asking on as well.
    sint32 create_instance(VLNMPCA_ISCSIISNSServerData* instance);
    sint32 delete_instance(const VLNMPCA_ISCSIISNSServerData* keys);
};

template <>
struct Provider_For<VLNMPCA_iSCSISettingService> {
    using type = ISCSI_Service_Provider;
};

template <>
struct Provider_For<VLNMPCA_ISCSIInitiatorPropertiesData> {
    using type = Initiator_Properties_Provider;
};

template <>
struct Provider_For<VLNMPCA_ISCSIBootData> {
    using type = ISCSI_Boot_Provider;
};

template <>
struct Provider_For<VLNMPCA_ISCSIQOSData> {
    using type = ISCSI_QoS_Provider;
};

template <>
struct Provider_For<VLNMPCA_ISCSIiSNSData> {
    using type = Name_Server_State_Provider;
};

template <>
struct Provider_For<VLNMPCA_ISCSIISNSServerData> {
    using type = Name_Server_Provider;
};

} // namespace cimple

#endif // VLN_SERVICES_ISCSI_SETTINGS_PROVIDER_H
