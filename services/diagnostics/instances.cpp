#include "services/diagnostics/instances.h"

#include "agent/associations.h"
#include "agent/element_setting.h"
#include "agent/profiles/profile_maps.h"
#include "agent/provider_agent.h"
#include "agent/software/software_identity.h"
#include "agent/store_search.h"
#include "agent/text.h"
#include "classes/CIM_ElementSettingData.h"
#include "classes/VLNMPCA_DiagnosticIdentity.h"
#include "classes/VLNMPCA_DiagnosticServiceCapabilities.h"
#include "classes/VLNMPCA_DiagnosticSettingData.h"
#include "classes/VLNMPCA_DiagnosticTest.h"
#include "classes/VLNMPCA_DiagnosticsLog.h"
#include "classes/VLNMPCA_EthernetPort.h"
#include "classes/VLNMPCA_FCPort.h"
#include "classes/VLNMPCA_HelpService.h"
#include "classes/VLNMPCA_JobSettingData.h"
#include "classes/VLNMPCA_RegisteredProfile.h"
#include "services/diagnostics/catalogue.h"
#include "services/diagnostics/test_support.h"
#include "services/service_instance.h"

#include <cstring>

namespace cimple {

namespace {

constexpr uint16 LOG_OPTIONS[] = {2, 6, 9}; // CIM_DiagnosticSettingData.LogOptions
constexpr uint16 LOG_STORAGE_LOG = 2;       // CIM_DiagnosticSettingData.LogStorage
constexpr uint16 DELIVERY_TEXT = 1;         // CIM_HelpService.DeliveryOptions, DocumentFormat
constexpr uint16 MODE_OTHER = 1; // CIM_DiagnosticServiceCapabilities.SupportedServiceModes
constexpr uint16 MODE_HALT_ON_ERROR = 4;
constexpr uint16 OVERWRITE_WRAPS_WHEN_FULL = 2; // CIM_Log.OverwritePolicy

// ---- A test and what belongs to it ----

Ref<VLNMPCA_DiagnosticTest> test_instance(const Diagnostic_Row& test,
                                          const CIM_ComputerSystem& system) {
    auto instance = make_instance<VLNMPCA_DiagnosticTest>();
    name_in_system(*instance, system);
    instance->Name.set(test.name);
    instance->ElementName.set(VLNMPCA_DiagnosticTest::static_meta_class.name);
    instance->Description.set("VLNMPCA_DiagnosticTest represents a CDM test for NIC personality");
    return instance;
}

Ref<VLNMPCA_DiagnosticSettingData> setting_instance(const Diagnostic_Row& test) {
    const Diagnostic_Defaults& defaults = test.defaults();
    auto setting = make_instance<VLNMPCA_DiagnosticSettingData>();
    setting->InstanceID.set(test.name);
    setting->ElementName.set(defaults.element_name ? defaults.element_name : test.name);
    setting->HaltOnError.set(true);
    setting->LoopControl.append(defaults.loop_control);
    setting->LoopControlParameter.append(String(defaults.loop_control_parameter));
    setting->LoopPattern.set(defaults.loop_pattern);
    setting->TargetDevice.set("");
    if (defaults.beacon_set_state != 0)
        setting->BeaconSetState.set(defaults.beacon_set_state);
    setting->NonDestructive.set(defaults.non_destructive);
    if (defaults.max_loops != 0)
        setting->MaxLoopsSupported.set(defaults.max_loops);
    for (const uint16 option : LOG_OPTIONS)
        setting->LogOptions.append(option);
    setting->LogStorage.append(LOG_STORAGE_LOG);
    return setting;
}

Ref<VLNMPCA_JobSettingData> job_setting_instance(const Diagnostic_Row& test) {
    auto setting = make_instance<VLNMPCA_JobSettingData>();
    setting->InstanceID.set(test.name);
    setting->ElementName.set(test.name);
    setting->DeleteOnCompletion.set(false);
    return setting;
}

// The two arrays go together: a mode, and the property by which it is set.
Ref<VLNMPCA_DiagnosticServiceCapabilities> capabilities_instance(const Diagnostic_Row& test) {
    auto capabilities = make_instance<VLNMPCA_DiagnosticServiceCapabilities>();
    capabilities->InstanceID.set(test.name);
    capabilities->ElementName.set(test.name);
    for (const char* property : test.defaults().settable) {
        const bool halts = std::strcmp(property, "HaltOnError") == 0;
        capabilities->SupportedServiceModes.append(halts ? MODE_HALT_ON_ERROR : MODE_OTHER);
        capabilities->OtherSupportedServiceModesDescriptions.append(String(property));
    }
    return capabilities;
}

Ref<VLNMPCA_HelpService> help_instance(const Diagnostic_Row& test,
                                       const CIM_ComputerSystem& system) {
    auto help = make_instance<VLNMPCA_HelpService>();
    name_in_system(*help, system);
    help->Name.set(test.name);
    help->ElementName.set(VLNMPCA_HelpService::static_meta_class.name);
    help->DeliveryOptions.append(DELIVERY_TEXT);
    help->DocumentFormat.append(DELIVERY_TEXT);
    help->DocumentsAvailable.append(String(test.name));
    help->DocumentDescriptions.append(String(test.help));
    return help;
}

Ref<VLNMPCA_DiagnosticsLog> log_instance(const Diagnostic_Row& test) {
    auto log = make_instance<VLNMPCA_DiagnosticsLog>();
    log->InstanceID.set(test.name);
    log->Name.set(test.name);
    log->ElementName.set(test.name);
    log->Description.set("VLNMPCA_DiagnosticsLog represents the logs for CDM tests");
    log->HealthState.set(HEALTH_OK);
    log->MaxNumberOfRecords.set(MAX_LOG_RECORDS);
    log->OverwritePolicy.set(OVERWRITE_WRAPS_WHEN_FULL);
    return log;
}

void join_setting(ProviderAgent& agent, const VLNMPCA_DiagnosticTest* test,
                  const VLNMPCA_DiagnosticSettingData* setting) {
    associate(agent.m_VLNMPCA_ElementSettingData_map, test, setting, {}, [](Instance& association) {
        cast<CIM_ElementSettingData>(&association)->IsCurrent.set(SETTING_IS);
    });
}

void create_help(const Map_Scope& scope, const Diagnostic_Row& row,
                 const VLNMPCA_DiagnosticTest* test) {
    ProviderAgent& agent = scope.agent;
    const auto* help =
        insert_instance(agent.m_VLNMPCA_HelpService_map, help_instance(row, *scope.system));
    associate(agent.m_VLNMPCA_HostedService_map, scope.system, help);
    associate(agent.m_VLNMPCA_ServiceAvailableToElement_map, help, test);
}

// ---- The version of the diagnostics ----

Ref<VLNMPCA_DiagnosticIdentity> identity_instance(uint16 number) {
    constexpr uint16 MAJOR = 1, REVISION = 1;
    const String version = format_text("%d.%d.%d", MAJOR, number, REVISION);
    auto identity = make_instance<VLNMPCA_DiagnosticIdentity>();
    identity->InstanceID.set(format_text("VLN:MPCA Diagnostics:%s", version.c_str()));
    identity->ElementName.set("Vorlan MPCA Diagnostics");
    identity->Name.set(identity->ElementName.value);
    identity->Manufacturer.set("Vorlan Corporation");
    identity->VersionString.set(version);
    identity->MajorVersion.set(MAJOR);
    identity->MinorVersion.set(number);
    identity->RevisionNumber.set(REVISION);
    identity->Classifications.append(uint16{SOFTWARE_OTHER});
    identity->IsEntity.set(true);
    return identity;
}

// One for each version that the host's NIC adapters have.
void create_identities(ProviderAgent& agent) {
    auto& identities = agent.m_VLNMPCA_DiagnosticIdentity_map;
    for (const auto& adapter : agent.m_pData->adapters) {
        if (adapter->getAdapterType() != ADAPTER_NIC)
            continue;
        const auto& attributes =
            static_cast<const NICAdapterAttributes&>(*adapter->getAdapterAttributes());
        auto identity = identity_instance(static_cast<uint16>(attributes.DiagVersionNumber));
        if (!identities.lookup(identity.get()))
            insert_instance(identities, identity);
    }
}

void join_identities(ProviderAgent& agent, const VLNMPCA_DiagnosticTest* test) {
    const auto& identities = agent.m_VLNMPCA_DiagnosticIdentity_map;
    for (uint32 i = 0; i < identities.size(); ++i)
        associate(agent.m_VLNMPCA_DiagElementSoftwareIdentity_map, identities[i], test, {},
                  software_status({STATUS_CURRENT}));
}

// ---- Ports ----

template <class Port>
void join_ports(ProviderAgent& agent, const Diagnostic_Row& row, const VLNMPCA_DiagnosticTest* test,
                const Instance_Map<Port>& ports) {
    for (uint32 i = 0; i < ports.size(); ++i) {
        if (!port_serves(ports[i]->DeviceID.value, row))
            continue;
        associate(agent.m_VLNMPCA_AvailableDiagnosticService_map, test, ports[i]);
        associate(agent.m_VLNMPCA_ServiceAffectsElement_map, ports[i], test);
    }
}

bool any_port_serves(const ProviderAgent& agent, const Diagnostic_Row& row) {
    return find_first(agent.m_VLNMPCA_EthernetPort_map, [&](const VLNMPCA_EthernetPort& port) {
        return port_serves(port.DeviceID.value, row);
    });
}

// ---- The whole ----

void create_test(const Map_Scope& scope, const VLNMPCA_RegisteredProfile* profile,
                 const Diagnostic_Row& row) {
    ProviderAgent& agent = scope.agent;
    const auto* test =
        insert_instance(agent.m_VLNMPCA_DiagnosticTest_map, test_instance(row, *scope.system));
    const auto* setting =
        insert_instance(agent.m_VLNMPCA_DiagnosticSettingData_map, setting_instance(row));
    insert_instance(agent.m_VLNMPCA_JobSettingData_map, job_setting_instance(row));
    const auto* capabilities = insert_instance(agent.m_VLNMPCA_DiagnosticServiceCapabilities_map,
                                               capabilities_instance(row));
    const auto* log = insert_instance(agent.m_VLNMPCA_DiagnosticsLog_map, log_instance(row));
    associate(agent.m_VLNMPCA_DiagHostedService_map, scope.system, test);
    associate(agent.m_VLNMPCA_ServiceConformsToProfile_map, profile, test);
    join_setting(agent, test, setting);
    associate(agent.m_VLNMPCA_DiagElementCapabilities_map, test, capabilities);
    associate(agent.m_VLNMPCA_UseOfLog_map, log, test);
    create_help(scope, row, test);
    join_identities(agent, test);
    if (row.ports & ETHERNET_PORTS)
        join_ports(agent, row, test, agent.m_VLNMPCA_EthernetPort_map);
    if (row.ports & FC_PORTS)
        join_ports(agent, row, test, agent.m_VLNMPCA_FCPort_map);
}

} // namespace

uint32 createDiagnosticClasses(const Map_Scope& scope) {
    ProviderAgent& agent = scope.agent;
    if (!agent.m_pData->hasNICAdapter)
        return MAP_OK;
    VLN_LOG(VLN_DBG, "Number of EthernetPort %d FCoE port %d",
            static_cast<int>(agent.m_VLNMPCA_EthernetPort_map.size()),
            static_cast<int>(agent.m_VLNMPCA_FCPort_map.size()));
    uint32 count = NUM_DIAGNOSTIC_TESTS;
    if (!any_port_serves(agent, diagnostic_tests[NUM_DIAGNOSTIC_TESTS - 1]))
        --count;
    VLN_LOG(VLN_DBG, "Total no of Diagnostic tests available: %d", static_cast<int>(count));
    const auto* profile = Profile_Maps(agent).createRegisteredProfile(PROFILE_DIAGNOSTICS);
    create_identities(agent);
    for (uint32 i = 0; i < count; ++i)
        create_test(scope, profile, diagnostic_tests[i]);
    return MAP_OK;
}

void clear_diagnostic_classes(ProviderAgent& agent) {
    agent.clearRecords();
    clear_group(agent, Store_Group::DIAGNOSTICS);
}

} // namespace cimple
