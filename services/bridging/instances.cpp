#include "services/bridging/instances.h"

#include "agent/associations.h"
#include "agent/element_setting.h"
#include "agent/hardware/physical_port.h"
#include "agent/hardware/port_name.h"
#include "agent/provider_agent.h"
#include "agent/store_search.h"
#include "agent/text.h"
#include "classes/CIM_ElementSettingData.h"
#include "classes/CIM_ServiceAffectsElement.h"
#include "classes/VLNMPCA_CEEService.h"
#include "classes/VLNMPCA_DcbxLldpData.h"
#include "classes/VLNMPCA_SoftwareIdentity.h"
#include "services/service_instance.h"

#include <bit>
#include <initializer_list>
#include <iterator>

namespace cimple {

namespace {

constexpr uint16 EFFECT_MANAGES = 5; // CIM_ServiceAffectsElement.ElementEffects
constexpr char CONFIGURED_ID[] = "Configured:VLNMPCA_PGData:%s"; // device identifier
constexpr char ACTIVE_ID[] = "Active:VLNMPCA_PGData:%s";
constexpr char EXCHANGE_ID[] = "VLNMPCA_DcbxLldpData:%s";

// A kind of function, and the driver that all ports of the kind have.
struct Function_Kind {
    Adapter_Type type;
    const char* driver; // in ClassificationDescriptions of its identity
};
constexpr Function_Kind NIC = {ADAPTER_NIC, "CNA Driver"};
constexpr Function_Kind FCOE = {ADAPTER_FCOE, "FCoE Driver"};
constexpr Function_Kind ISCSI = {ADAPTER_ISCSI, "CNA iSCSI Driver"};

// ---- Values ----

const char* state_word(uint32 value) {
    return value == 1 ? "Enabled" : value == 0 ? "Disabled" : "Unknown";
}

const char* answer_word(uint32 value) {
    return value == 1 ? "Yes" : value == 0 ? "No" : "Unknown";
}

Array<uint32> priorities_of(uint32 bitmap) {
    Array<uint32> priorities;
    for (uint32 priority = 0; priority < NUM_PRIORITIES; ++priority)
        if (bitmap >> priority & 1)
            priorities.append(priority);
    return priorities;
}

void fill_priority(Property<uint32>& property, const AX_CEE_Settings& settings,
                   Application application) {
    const uint32 bitmap = application_bitmap(settings.application, application);
    if (bitmap == 0)
        property.clear();
    else
        property.set(static_cast<uint32>(std::countr_zero(bitmap)));
}

void fill_groups(VLNMPCA_PGData& data, const AX_CEE_Settings& settings) {
    for (uint32 id = 0; id < AX_PRIORITY_GROUP_IDS; ++id) {
        const bool unlimited = id == AX_UNLIMITED_GROUP;
        if (id < AX_PRIORITY_GROUPS || unlimited) {
            const uint32 place = unlimited ? uint32{AX_PRIORITY_GROUPS} : id;
            (data.*PRIORITY_LISTS[place]).set(priorities_of(settings.groupBitmap[id]));
        } else if (settings.groupBitmap[id] != 0) {
            VLN_LOG(VLN_ERR, "switch error: pgindex range is 0 to 7. came for %d",
                    static_cast<int>(id));
        }
    }
    data.PriorityBandwidth.set({});
    for (const uint32 percent : settings.bandwidth)
        data.PriorityBandwidth.append(percent);
}

using Word = Property<String> VLNMPCA_PGData::*;

struct State_Row {
    AX_CEE_State AX_CEE_Settings::*state;
    Word enabled, syncd, error, willing, advertise;
    const char* (*enabled_word)(uint32 value) = state_word;
};

void fill_states(VLNMPCA_PGData& data, const AX_CEE_Settings& settings) {
    using D = VLNMPCA_PGData;
    // Flow control alone is switched here, so it shows the words that it is told.
    static constexpr State_Row ROWS[] = {
        {&AX_CEE_Settings::pg, &D::PGEnabled, &D::PGSyncd, &D::PGError, &D::PGWilling,
         &D::PGAdvertise},
        {&AX_CEE_Settings::pfc, &D::PFCEnabled, &D::PFCSyncd, &D::PFCError, &D::PFCWilling,
         &D::PFCAdvertise, answer_word},
        {&AX_CEE_Settings::fcoe, &D::FCoEPriorityEnabled, &D::FCoEPrioritySyncd,
         &D::FCoEPriorityError, &D::FCoEPriorityWilling, &D::FCoEPriorityAdvertise},
        {&AX_CEE_Settings::iscsi, &D::iSCSIPriorityEnabled, &D::iSCSIPrioritySyncd,
         &D::iSCSIPriorityError, &D::iSCSIPriorityWilling, &D::iSCSIPriorityAdvertise},
    };
    for (const State_Row& row : ROWS) {
        const AX_CEE_State& state = settings.*row.state;
        (data.*row.enabled).set(row.enabled_word(state.enabled));
        (data.*row.syncd).set(answer_word(state.syncd));
        (data.*row.error).set(answer_word(state.error));
        (data.*row.willing).set(answer_word(state.willing));
        (data.*row.advertise).set(answer_word(state.advertise));
    }
}

void fill(VLNMPCA_PGData& data, const AX_CEE_Params& record, const AX_CEE_Settings& settings) {
    fill_priority(data.FCoEPriority, settings, Application::FCOE);
    fill_priority(data.iSCSIPriority, settings, Application::ISCSI);
    fill_priority(data.RoCePriority, settings, Application::ROCE);
    if (settings.pfcBitmap >= 1 && settings.pfcBitmap <= 255)
        data.PFCPriority.set(priorities_of(settings.pfcBitmap));
    else
        data.PFCPriority.clear();
    data.MaxSupportedPG.set(record.maxSupportedPG);
    fill_groups(data, settings);
    fill_states(data, settings);
}

void fill(VLNMPCA_DcbxLldpData& data, const AX_CEE_Params& record) {
    const AX_Lldp& lldp = record.lldp;
    data.DCBXState.set(state_word(record.dcbx.state));
    data.DCBXOperatingVersion.set(record.dcbxOperatingVersion);
    data.DCBXMaximumVersion.set(record.dcbxMaximumVersion);
    data.LLDPtxState.set(state_word(lldp.txState));
    data.LLDPrxState.set(state_word(lldp.rxState));
    data.LLDPtxPortDesc.set(state_word(lldp.txPortDesc));
    data.LLDPtxSysDesc.set(state_word(lldp.txSysDesc));
    data.LLDPtxSysName.set(state_word(lldp.txSysName));
    data.LLDPtxSysCap.set(state_word(lldp.txSysCap));
}

// ---- Instances ----

template <class Data>
Ref<Data> data_instance(const String& instance_id, const String& device_id) {
    auto data = make_instance<Data>();
    data->InstanceID.set(instance_id);
    data->ElementName.set(device_id);
    return data;
}

Association_Details currency(uint16 is_current) {
    return [is_current](Instance& setting) {
        cast<CIM_ElementSettingData>(&setting)->IsCurrent.set(is_current);
    };
}

void manages(Instance& association) {
    cast<CIM_ServiceAffectsElement>(&association)->ElementEffects.append(EFFECT_MANAGES);
}

// What the settings of a port hang on.
struct Owners {
    const VLNMPCA_CEEService* service;
    const VLNMPCA_PortController* controller; // null for a port without a NIC function
};

// The functions of one kind, on their way into the stores.
class Bridging_Builder {
public:
    Bridging_Builder(ProviderAgent& agent, const CIM_ComputerSystem& system,
                     const Function_Kind& kind)
        : _agent(agent), _system(system), _kind(kind) {}

    AX_STATUS run();

private:
    AX_STATUS createPort(Adapter& adapter, const Port& port);
    void createGroups(const Owners& owners, const String& instance_id, const String& device_id,
                      const AX_CEE_Params& record, const AX_CEE_Settings& settings,
                      uint16 is_current);
    void createExchange(const Owners& owners, const String& device_id, const AX_CEE_Params& record);
    const VLNMPCA_CEEService* service();
    Owners joinOwners(const String& physical_port);
    bool exchangeIsThere(const String& physical_port);

    ProviderAgent& _agent;
    const CIM_ComputerSystem& _system;
    const Function_Kind& _kind;
};

void join(const Owners& owners, Instance_Map_Base& of_service, Instance_Map_Base& of_controller,
          const Instance* data, uint16 is_current) {
    if (!data)
        return;
    associate(of_service, owners.service, data, {}, currency(is_current));
    if (owners.controller)
        associate(of_controller, owners.controller, data, {}, currency(is_current));
}

// What fails drops out alone; the status of the last such port is answered.
AX_STATUS Bridging_Builder::run() {
    AX_STATUS status = AX_STATUS_OK;
    if (!_agent.m_pData)
        return status;
    for (const auto& adapter : _agent.m_pData->adapters) {
        if (adapter->getAdapterType() != _kind.type)
            continue;
        for (const auto& port : adapter->getPorts())
            if (const AX_STATUS failure = createPort(*adapter, *port))
                status = failure;
    }
    return status;
}

// The service comes with the first port that has settings.
const VLNMPCA_CEEService* Bridging_Builder::service() {
    auto& services = _agent.m_VLNMPCA_CEEService_map;
    if (services.size() == 0) {
        constexpr char DESCRIPTION[] = "Vorlan MPCA Data Center Bridging Service";
        auto instance = service_instance<VLNMPCA_CEEService>(DESCRIPTION, "OK", _system);
        instance->ElementName.set(DESCRIPTION);
        if (const auto* made = insert_instance(services, std::move(instance)))
            associate(_agent.m_VLNMPCA_HostedCEEService_map, &_system, made);
    }
    return services.size() == 0 ? nullptr : services[0];
}

// Controller and driver are the same for many a function.
Owners Bridging_Builder::joinOwners(const String& physical_port) {
    const Owners owners = {service(), find_port_controller(_agent, physical_port)};
    if (owners.controller)
        associate_once(_agent.m_VLNMPCA_CEEServiceAffectsElement_map, owners.controller,
                       owners.service, {}, manages);
    const String kind(_kind.driver);
    const auto* driver = find_first(
        _agent.m_VLNMPCA_SoftwareIdentity_map, [&](const VLNMPCA_SoftwareIdentity& each) {
            return each.ClassificationDescriptions.value.find(kind) >= 0;
        });
    if (driver)
        associate_once(_agent.m_VLNMPCA_CEEServiceAffectsDriver_map, driver, owners.service, {},
                       manages);
    return owners;
}

// What is exchanged belongs to the link, which functions of all kinds share.
bool Bridging_Builder::exchangeIsThere(const String& physical_port) {
    for (const auto& adapter : _agent.m_pData->adapters) {
        if (physical_port_name(*adapter->getAdapterAttributes()) != physical_port)
            continue;
        for (const auto& port : adapter->getPorts())
            if (find_by_key(_agent.m_VLNMPCA_DcbxLldpData_map, &VLNMPCA_DcbxLldpData::InstanceID,
                            format_text(EXCHANGE_ID, port->getPortName().c_str())))
                return true;
    }
    return false;
}

void Bridging_Builder::createGroups(const Owners& owners, const String& instance_id,
                                    const String& device_id, const AX_CEE_Params& record,
                                    const AX_CEE_Settings& settings, uint16 is_current) {
    auto data = data_instance<VLNMPCA_PGData>(instance_id, device_id);
    fill(*data, record, settings);
    join(owners, _agent.m_VLNMPCA_ElementPGData_map, _agent.m_VLNMPCA_PortControllerPGData_map,
         insert_instance(_agent.m_VLNMPCA_PGData_map, std::move(data)), is_current);
}

void Bridging_Builder::createExchange(const Owners& owners, const String& device_id,
                                      const AX_CEE_Params& record) {
    auto data =
        data_instance<VLNMPCA_DcbxLldpData>(format_text(EXCHANGE_ID, device_id.c_str()), device_id);
    fill(*data, record);
    join(owners, _agent.m_VLNMPCA_ElementDcbxLLdpData_map,
         _agent.m_VLNMPCA_PortControllerDcbxLLdpData_map,
         insert_instance(_agent.m_VLNMPCA_DcbxLldpData_map, std::move(data)), SETTING_IS);
}

// A port whose adapter has no bridging has no settings either, and that is no failure.
AX_STATUS Bridging_Builder::createPort(Adapter& adapter, const Port& port) {
    const String id = text(port.getPortName());
    HBA_WWN name{};
    if (!port_name_to_wwn(id, name))
        return AX_STATUS_ERROR;
    AX_CEE_Params record{};
    if (const AX_STATUS status = VLN_MethodWrapper::vlncimGetCEEParams(&name, &record))
        return status == AX_STATUS_NOT_SUPPORTED ? AX_STATUS_OK : status;
    const String physical_port = physical_port_name(*adapter.getAdapterAttributes());
    const Owners owners = joinOwners(physical_port);
    createGroups(owners, format_text(CONFIGURED_ID, id.c_str()), id, record, record.configured,
                 SETTING_IS_NOT);
    createGroups(owners, format_text(ACTIVE_ID, id.c_str()), id, record, record.active, SETTING_IS);
    if (exchangeIsThere(physical_port))
        VLN_LOG(VLN_DBG, "Concurrent mode and instance is already created");
    else
        createExchange(owners, id, record);
    return AX_STATUS_OK;
}

AX_STATUS CreateCeeClasses(ProviderAgent& agent, const CIM_ComputerSystem& system,
                           const Function_Kind& kind) {
    VLN_LOG(VLN_DBG, "Entering CreateCeeClasses");
    return Bridging_Builder(agent, system, kind).run();
}

uint32 create_bridging(const Map_Scope& scope, const Function_Kind& kind, const char* failed) {
    const AX_STATUS status = CreateCeeClasses(scope.agent, *scope.system, kind);
    if (status == AX_STATUS_OK)
        return MAP_OK;
    VLN_LOG(VLN_ERR, "%s%d", failed, static_cast<int>(status));
    return SKIP_DEVICE;
}

template <class Data, class Fill>
AX_STATUS read_back(const HBA_WWN& name, Instance_Map<Data>& store, Fill fill_all) {
    AX_CEE_Params record{};
    const AX_STATUS status = VLN_MethodWrapper::vlncimGetCEEParams(&name, &record);
    if (status == AX_STATUS_OK)
        fill_all(store, record);
    return status;
}

template <class Data, class Fill>
void change_by_id(Instance_Map<Data>& store, const String& instance_id, Fill fill_one) {
    if (const Data* found = find_by_key(store, &Data::InstanceID, instance_id))
        change(store, found, fill_one);
}

} // namespace

uint32 create_nic_bridging(const Map_Scope& scope) {
    return create_bridging(scope, NIC, "CreateCeeClasses failed with ");
}

uint32 create_fcoe_bridging(const Map_Scope& scope) {
    return create_bridging(scope, FCOE, "CreateCeeClasses failed status = ");
}

uint32 create_iscsi_bridging(const Map_Scope& scope) {
    return create_bridging(scope, ISCSI, "CreateCeeClasses failed status = ");
}

void clear_bridging(ProviderAgent& agent) {
    VLN_LOG(VLN_DBG, "Clearing all cee classes before updating");
    for (Instance_Map_Base* store : std::initializer_list<Instance_Map_Base*>{
             &agent.m_VLNMPCA_ElementPGData_map, &agent.m_VLNMPCA_ElementDcbxLLdpData_map,
             &agent.m_VLNMPCA_PortControllerPGData_map,
             &agent.m_VLNMPCA_PortControllerDcbxLLdpData_map,
             &agent.m_VLNMPCA_CEEServiceAffectsElement_map,
             &agent.m_VLNMPCA_CEEServiceAffectsDriver_map, &agent.m_VLNMPCA_HostedCEEService_map,
             &agent.m_VLNMPCA_PGData_map, &agent.m_VLNMPCA_DcbxLldpData_map,
             &agent.m_VLNMPCA_CEEService_map})
        store->clear();
}

void rebuild_bridging(ProviderAgent& agent) {
    static constexpr struct {
        const Function_Kind& kind;
        const char* failed;
    } KINDS[] = {{NIC, "CreateCeeClasses for NIC failed with status = "},
                 {FCOE, "CreateCeeClasses for FCoE failed with status = "},
                 {ISCSI, "CreateCeeClasses for iSCSI failed with status = "}};
    const CIM_ComputerSystem* system = agent.m_CIM_ComputerSystem_map[0];
    if (!system)
        return;
    clear_bridging(agent);
    for (const auto& [kind, failed] : KINDS)
        create_bridging({agent, system}, kind, failed);
}

AX_STATUS read_groups_back(ProviderAgent& agent, const String& device_id, const HBA_WWN& name) {
    return read_back(name, agent.m_VLNMPCA_PGData_map, [&](auto& store, const auto& record) {
        change_by_id(store, format_text(CONFIGURED_ID, device_id.c_str()),
                     [&](VLNMPCA_PGData& data) { fill(data, record, record.configured); });
        change_by_id(store, format_text(ACTIVE_ID, device_id.c_str()),
                     [&](VLNMPCA_PGData& data) { fill(data, record, record.active); });
    });
}

AX_STATUS read_exchange_back(ProviderAgent& agent, const String& device_id, const HBA_WWN& name) {
    return read_back(name, agent.m_VLNMPCA_DcbxLldpData_map, [&](auto& store, const auto& record) {
        change_by_id(store, format_text(EXCHANGE_ID, device_id.c_str()),
                     [&](VLNMPCA_DcbxLldpData& data) { fill(data, record); });
    });
}

} // namespace cimple
