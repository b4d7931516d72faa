#include "services/iscsi_settings/instances.h"

#include "agent/element_setting.h"
#include "agent/provider_agent.h"
#include "agent/store_search.h"
#include "agent/text.h"
#include "classes/CIM_ElementSettingData.h"
#include "classes/VLNMPCA_EthernetPort.h"
#include "classes/VLNMPCA_ISCSIBootData.h"
#include "classes/VLNMPCA_ISCSIISNSServerData.h"
#include "classes/VLNMPCA_ISCSIInitiatorLoginOptionData.h"
#include "classes/VLNMPCA_ISCSILoginStatistics.h"
#include "classes/VLNMPCA_ISCSIQOSData.h"
#include "classes/VLNMPCA_ISCSISessionFailures.h"
#include "classes/VLNMPCA_ISCSIiSNSData.h"
#include "classes/VLNMPCA_SCSIProtocolController.h"
#include "classes/VLNMPCA_SoftwareIdentity.h"
#include "classes/VLNMPCA_iSCSISettingService.h"
#include "device/iscsi_adapter.h"
#include "device/library/attribute_buffer.h"
#include "foundation/address_text.h"
#include "services/iscsi_settings/rules.h"
#include "services/service_instance.h"

#include <initializer_list>
#include <strings.h>

namespace cimple {

namespace {

constexpr char SERVICE_ID[] = "VLN:iSCSI Setting Service";
constexpr char DRIVER_IDENTITY[] = "CNA iSCSI Driver";
constexpr char BOOT_PARAMETER[] = "iSCSIBoot";

// CIM_SettingData.ChangeableType
constexpr uint16 FIXED = 0;
constexpr uint16 CHANGEABLE = 2; // and what is set outlives a restart

// A port on its way through the builder, with what its settings are tied to.
struct Settings_Scope {
    ProviderAgent& agent;
    const VLNMPCA_iSCSISettingService* service;
    const VLNMPCA_SoftwareIdentity* driver;
    const VLNMPCA_EthernetPort* port = nullptr;
    const iSCSIPortAttributes* attributes = nullptr;
    HBA_WWN name{};

    const String& port_name() const { return port->DeviceID.value; }
};

// ---- Ties ----

void mark_current(Instance& association) {
    cast<CIM_ElementSettingData>(&association)->IsCurrent.set(SETTING_IS);
}

void tie(Instance_Map_Base& store, const Instance* element, const Instance* setting) {
    if (element && setting)
        associate(store, element, setting, {}, mark_current);
}

template <class Setting>
Ref<Setting> setting_instance(const String& id, uint16 changeable) {
    auto setting = make_instance<Setting>();
    setting->InstanceID.set(id);
    setting->ElementName.set(id);
    setting->ChangeableType.set(changeable);
    return setting;
}

// ---- One setting each ----

Ref<VLNMPCA_iSCSISettingService> setting_service_instance(const CIM_ComputerSystem& system) {
    auto service =
        service_instance<VLNMPCA_iSCSISettingService>("Vorlan iSCSI Setting Service", "OK", system);
    service->CreationClassName.set("VLNMPCA_ISCSISettingService");
    service->Name.set(SERVICE_ID);
    service->ElementName.set(SERVICE_ID);
    service->InstanceID.set(SERVICE_ID);
    return service;
}

const char* digest_text(uint8 digest) {
    return digest ? "CRC32C" : "None";
}

Ref<VLNMPCA_ISCSIInitiatorLoginOptionData> login_option_instance(const Settings_Scope& scope) {
    const AX_iSCSI_LoginOptions& options = scope.attributes->LoginOptions;
    auto data = setting_instance<VLNMPCA_ISCSIInitiatorLoginOptionData>(
        format_text("VLN:iSCSI Initiator Login Options :%s", scope.port_name().c_str()), FIXED);
    data->InitialR2T.set(options.initialR2T);
    data->ImmediateData.set(options.immediateData);
    data->HeaderDigest.set(digest_text(options.headerDigest));
    data->DataDigest.set(digest_text(options.dataDigest));
    data->MaxConnections.set(options.maxConnections);
    data->MaxOutstandingR2T.set(options.maxOutstandingR2T);
    data->FirstBurstLength.set(options.firstBurstLength);
    data->MaxBurstLength.set(options.maxBurstLength);
    data->MaxRecvDataSegmentLength.set(options.maxRecvDataSegmentLength);
    data->DefaultTime2Wait.set(options.defaultTime2Wait);
    data->DefaultTime2Retain.set(options.defaultTime2Retain);
    data->ErrorRecoveryLevel.set(options.errorRecoveryLevel);
    data->DataPDUInOrder.set(options.dataPDUInOrder);
    data->DataSequenceInOrder.set(options.dataSequenceInOrder);
    return data;
}

// Null when the library does not tell.
Ref<VLNMPCA_ISCSIInitiatorPropertiesData> initiator_instance(const Settings_Scope& scope) {
    AX_iSCSI_InitiatorProperties properties{};
    if (VLN_MethodWrapper::GetIscsiInitiatorProps(&scope.name, &properties) != AX_STATUS_OK)
        return {};
    auto data = setting_instance<VLNMPCA_ISCSIInitiatorPropertiesData>(
        format_text("VLN:iSCSI Initiator Properties :%s", scope.port_name().c_str()), CHANGEABLE);
    fill_initiator_properties(*data, properties);
    return data;
}

Ref<VLNMPCA_ISCSIBootData> boot_instance(const Settings_Scope& scope) {
    auto data = setting_instance<VLNMPCA_ISCSIBootData>(
        format_text("VLN:iSCSIboot:%s", scope.port_name().c_str()), CHANGEABLE);
    data->ParameterName.set(BOOT_PARAMETER);
    data->Value.set(scope.attributes->iSCSIBoot);
    return data;
}

// Null for a port without limits.
Ref<VLNMPCA_ISCSIQOSData> qos_instance(const Settings_Scope& scope) {
    AX_QoS qos{};
    qos.kind = AX_QOS_ISCSI;
    if (VLN_MethodWrapper::GetQosInfo(&scope.name, &qos) != AX_STATUS_OK)
        return {};
    auto data = setting_instance<VLNMPCA_ISCSIQOSData>(
        format_text("VLN:iSCSI QOS:%s", scope.port_name().c_str()), CHANGEABLE);
    data->Description.set(scope.port_name());
    data->MaxBytesPerSecond.set(qos.maxBytesPerSecond);
    data->MaxIOsPerSecond.set(qos.maxIOsPerSecond);
    return data;
}

// ---- Counters ----

template <class Statistics>
Ref<Statistics> statistics_instance(const char* id, const String& port) {
    auto statistics = make_instance<Statistics>();
    statistics->InstanceID.set(format_text("%s:%s", id, port.c_str()));
    statistics->ElementName.set(statistics->InstanceID.value);
    return statistics;
}

uint64 failed_logins(const AX_iSCSI_PortStatistics& counted) {
    return uint64{counted.loginOtherFails} + counted.loginAuthenticateFails +
           counted.loginAuthorizeFails + counted.loginNegotiateFails;
}

// By value throughout: the library aligns its counters to four bytes only.
Ref<VLNMPCA_ISCSILoginStatistics>
login_statistics_instance(const String& port, const AX_iSCSI_PortStatistics& counted) {
    auto statistics =
        statistics_instance<VLNMPCA_ISCSILoginStatistics>("VLN:iSCSI Login Statistics", port);
    statistics->LoginFailures.set(failed_logins(counted));
    statistics->SuccessfulLogins.set(uint64{counted.loginAccepts});
    statistics->NegotiationLoginFailures.set(uint64{counted.loginNegotiateFails});
    statistics->AuthenticationLoginFailures.set(uint64{counted.loginAuthenticateFails});
    statistics->AuthorizationLoginFailures.set(uint64{counted.loginAuthorizeFails});
    statistics->LoginRedirects.set(uint64{counted.loginRedirects});
    statistics->OtherLoginFailures.set(uint64{counted.loginOtherFails});
    statistics->NormalLogouts.set(uint64{counted.logoutNormals});
    statistics->OtherLogouts.set(uint64{counted.logoutOtherCodes});
    statistics->SessionFailureCount.set(static_cast<uint32>(counted.sessionFailures));
    statistics->SessionDigestErrors.set(static_cast<uint32>(counted.sessionDigestErrors));
    statistics->SessionConnectionTimeout.set(static_cast<uint32>(counted.sessionTimeoutErrors));
    statistics->SessionFormatErrors.set(static_cast<uint32>(counted.sessionFormatErrors));
    statistics->AuthenticationLoginFailureRsps.set(
        static_cast<uint32>(counted.loginAuthenticateFails));
    return statistics;
}

Ref<VLNMPCA_ISCSISessionFailures>
session_failures_instance(const String& port, const AX_iSCSI_PortStatistics& counted) {
    auto failures =
        statistics_instance<VLNMPCA_ISCSISessionFailures>("VLN:iSCSI Session Failures", port);
    failures->SessionFailures.set(uint64{counted.sessionFailures});
    failures->SessionDigestFailures.set(uint64{counted.sessionDigestErrors});
    failures->SessionConnectionTimeoutFailures.set(uint64{counted.sessionTimeoutErrors});
    failures->SessionFormatErrors.set(uint64{counted.sessionFormatErrors});
    return failures;
}

void create_statistics(const Settings_Scope& scope) {
    ProviderAgent& agent = scope.agent;
    AX_iSCSI_PortStatistics counted{};
    if (VLN_MethodWrapper::GetIscsiPortStatistics(&scope.name, &counted) != AX_STATUS_OK)
        return;
    const auto* controller = agent.m_VLNMPCA_SCSIProtocolController_map[0];
    const auto* logins = insert_instance(agent.m_VLNMPCA_ISCSILoginStatistics_map,
                                         login_statistics_instance(scope.port_name(), counted));
    const auto* failures = insert_instance(agent.m_VLNMPCA_ISCSISessionFailures_map,
                                           session_failures_instance(scope.port_name(), counted));
    if (controller && logins)
        associate(agent.m_VLNMPCA_ISCSILoginStatisticalData_map, controller, logins);
    if (controller && failures)
        associate(agent.m_VLNMPCA_ISCSISessionFailuresStatisticalData_map, controller, failures);
}

// ---- Name servers ----

Ref<VLNMPCA_ISCSIiSNSData> name_server_state_instance(const String& port,
                                                      const VLN_NameServers& servers) {
    auto data = setting_instance<VLNMPCA_ISCSIiSNSData>(
        format_text("VLN:ISCSI iSNS:%s", port.c_str()), CHANGEABLE);
    data->InitPortMACAddress.set(port);
    data->Enable.set(servers.enabled);
    if (!servers.list.empty()) {
        data->IPAddress.set(text(addressText(servers.list.front())));
        data->TCPPort.set(servers.list.front().tcpPort);
    }
    return data;
}

Ref<VLNMPCA_ISCSIISNSServerData> name_server_instance(const String& port,
                                                      const AX_IPAddress& server) {
    auto data = setting_instance<VLNMPCA_ISCSIISNSServerData>(name_server_id(port, server), FIXED);
    data->InitPortMACAddress.set(port);
    data->IPAddress.set(text(addressText(server)));
    data->TCPPort.set(server.tcpPort);
    return data;
}

void create_name_servers(const Settings_Scope& scope) {
    ProviderAgent& agent = scope.agent;
    VLN_NameServers servers;
    if (VLN_MethodWrapper::GetiSNSServer(&scope.name, &servers) != AX_STATUS_OK)
        return;
    const auto* state = insert_instance(agent.m_VLNMPCA_ISCSIiSNSData_map,
                                        name_server_state_instance(scope.port_name(), servers));
    tie(agent.m_VLNMPCA_DriverISCSIISNSSettingData_map, scope.driver, state);
    tie(agent.m_VLNMPCA_ServiceiSCSIISNSSettingData_map, scope.service, state);
    for (const AX_IPAddress& each : servers.list) {
        const auto* server = insert_instance(agent.m_VLNMPCA_ISCSIISNSServerData_map,
                                             name_server_instance(scope.port_name(), each));
        tie(agent.m_VLNMPCA_DriverISCSIISNSServerSettingData_map, scope.driver, server);
        tie(agent.m_VLNMPCA_ServiceiSCSIISNSServerSettingData_map, scope.service, server);
    }
}

void clear_name_servers(ProviderAgent& agent) {
    for (Instance_Map_Base* store : std::initializer_list<Instance_Map_Base*>{
             &agent.m_VLNMPCA_DriverISCSIISNSSettingData_map,
             &agent.m_VLNMPCA_ServiceiSCSIISNSSettingData_map,
             &agent.m_VLNMPCA_DriverISCSIISNSServerSettingData_map,
             &agent.m_VLNMPCA_ServiceiSCSIISNSServerSettingData_map,
             &agent.m_VLNMPCA_ISCSIISNSServerData_map, &agent.m_VLNMPCA_ISCSIiSNSData_map})
        store->clear();
}

// ---- Ports ----

void create_port_settings(const Settings_Scope& scope) {
    ProviderAgent& agent = scope.agent;
    associate(agent.m_VLNMPCA_ISCSISettingServiceAffectsPort_map, scope.port, scope.service);

    const auto* options = insert_instance(agent.m_VLNMPCA_ISCSIInitiatorLoginOptionData_map,
                                          login_option_instance(scope));
    tie(agent.m_VLNMPCA_DriverISCSIInitiatorLoginOptionsSettingData_map, scope.driver, options);
    tie(agent.m_VLNMPCA_ServiceiSCSIInitiatorLoginOptionsSettingData_map, scope.service, options);

    if (auto made = initiator_instance(scope)) {
        const auto* initiator =
            insert_instance(agent.m_VLNMPCA_ISCSIInitiatorPropertiesData_map, made);
        tie(agent.m_VLNMPCA_DriverISCSIInitiatorPropertiesSettingData_map, scope.driver, initiator);
        tie(agent.m_VLNMPCA_ServiceiSCSIInitiatorPropertiesSettingData_map, scope.service,
            initiator);
    }

    const auto* boot = insert_instance(agent.m_VLNMPCA_ISCSIBootData_map, boot_instance(scope));
    tie(agent.m_VLNMPCA_PortISCSIBootSettingData_map, scope.port, boot);
    tie(agent.m_VLNMPCA_ServiceISCSIBootSettingData_map, scope.service, boot);

    if (auto made = qos_instance(scope)) {
        const auto* qos = insert_instance(agent.m_VLNMPCA_ISCSIQOSData_map, made);
        tie(agent.m_VLNMPCA_PortISCSIQOSSettingData_map, scope.port, qos);
        tie(agent.m_VLNMPCA_ServiceiSCSIQOSSettingData_map, scope.service, qos);
    }

    create_name_servers(scope);
    create_statistics(scope);
}

// Calls body(port, attributes) for each iSCSI port of the device model. There is none where the
// library has refused to come up.
template <class Body>
void for_each_iscsi_port(const ProviderAgent& agent, Body body) {
    if (!agent.m_pData)
        return;
    for (const auto& adapter : agent.m_pData->adapters)
        if (adapter->getAdapterType() == ADAPTER_ISCSI)
            for (const auto& port : adapter->getPorts())
                body(*port, static_cast<const iSCSIPortAttributes&>(*port->getPortAttributes()));
}

// The same for those that the host shows, with what their settings are tied to.
template <class Body>
void for_each_shown_port(const Settings_Scope& common, Body body) {
    for_each_iscsi_port(common.agent, [&](Port& port, const iSCSIPortAttributes& attributes) {
        Settings_Scope scope = common;
        scope.attributes = &attributes;
        scope.port = find_in_system(scope.agent, scope.agent.m_VLNMPCA_EthernetPort_map,
                                    &VLNMPCA_EthernetPort::DeviceID, text(port.getPortName()));
        if (scope.port &&
            VLN_MethodWrapper::string2HBAName(&scope.name, port.getPortName().c_str()))
            body(scope);
    });
}

const VLNMPCA_SoftwareIdentity* find_driver(const ProviderAgent& agent) {
    return find_first(
        agent.m_VLNMPCA_SoftwareIdentity_map, [](const VLNMPCA_SoftwareIdentity& identity) {
            return identity.ClassificationDescriptions.value.find(String(DRIVER_IDENTITY)) >= 0;
        });
}

} // namespace

// Two servers may be behind one address, so the port is part of the name.
String name_server_id(const String& port, const AX_IPAddress& server) {
    return format_text("VLN:ISCSI iSNS Server:%s:%s:%d", port.c_str(), addressText(server).c_str(),
                       static_cast<int>(server.tcpPort));
}

void fill_initiator_properties(VLNMPCA_ISCSIInitiatorPropertiesData& data,
                               const AX_iSCSI_InitiatorProperties& properties) {
    const AX_iSCSI_Authentication& account = properties.authentication;
    data.InitiatorSCSIName.set(field_text(properties.name));
    data.InitiatorAlias.set(field_text(properties.alias));
    data.AuthMethod.set(authentication_text(account.method));
    data.TargetCHAPName.null = account.method == AX_ISCSI_AUTH_NONE;
    data.InitCHAPName.null = account.method != AX_ISCSI_AUTH_MUTUAL_CHAP;
    if (!data.TargetCHAPName.null)
        data.TargetCHAPName.set(field_text(account.targetCHAPName));
    if (!data.InitCHAPName.null)
        data.InitCHAPName.set(field_text(account.initiatorCHAPName));
}

uint32 create_iscsi_settings(const Map_Scope& scope) {
    ProviderAgent& agent = scope.agent;
    const auto* driver = find_driver(agent);
    if (!driver) {
        VLN_LOG(VLN_ERR, "No VLNMPCA_SoftwareIdentity instance exist for iSCSI Driver");
        return SKIP_DEVICE;
    }
    const auto* service = insert_instance(agent.m_VLNMPCA_iSCSISettingService_map,
                                          setting_service_instance(*scope.system));
    if (!service)
        return SKIP_DEVICE;
    associate(agent.m_VLNMPCA_HostediSCSISettingService_map, scope.system, service);
    associate(agent.m_VLNMPCA_ISCSISettingServiceAffectsDriver_map, driver, service);
    for_each_shown_port({agent, service, driver}, create_port_settings);
    return MAP_OK;
}

void clear_iscsi_settings(ProviderAgent& agent) {
    clear_group(agent, Store_Group::REBUILT);
}

uint32 forget_iscsi_settings(const Map_Scope& scope) {
    clear_iscsi_settings(scope.agent);
    return MAP_OK;
}

void rebuild_name_servers(ProviderAgent& agent) {
    clear_name_servers(agent);
    const auto* driver = find_driver(agent);
    const auto* service = agent.m_VLNMPCA_iSCSISettingService_map[0];
    if (driver && service)
        for_each_shown_port({agent, service, driver}, create_name_servers);
}

bool find_iscsi_port(const ProviderAgent& agent, const String& text, HBA_WWN& name) {
    std::string wanted = text.c_str();
    const auto mac = parse_mac(wanted);
    std::string found;
    for_each_iscsi_port(agent, [&](Port& port, const iSCSIPortAttributes& attributes) {
        if (mac ? parse_mac(attributes.PermanentMACAddress) == mac
                : strcasecmp(port.getPortName().c_str(), wanted.c_str()) == 0)
            found = port.getPortName();
    });
    if (!found.empty())
        return VLN_MethodWrapper::string2HBAName(&name, found.c_str()) != 0;
    VLN_LOG(VLN_ERR, "No iSCSI port has the address %s", wanted.c_str());
    return false;
}

} // namespace cimple
