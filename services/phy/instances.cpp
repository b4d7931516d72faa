#include "services/phy/instances.h"

#include "agent/associations.h"
#include "agent/provider_agent.h"
#include "agent/text.h"
#include "cimple/guard.h"
#include "classes/VLNMPCA_PHYPhysicalComponentData.h"
#include "classes/VLNMPCA_PortController.h"
#include "services/phy/functional_port.h"
#include "services/phy/ten_g_base_t.h"

namespace cimple {

namespace {

constexpr uint32 FEATURE_STATISTICS = 26; // of 10GBASE-T
constexpr uint32 FEATURE_10GBASE_T = 426;

bool offers(const HBA_WWN& name, uint32 feature) {
    uint32 value = 0;
    return AX_GetHBAFeature(wwnOf(&name), feature, &value) == AX_STATUS_OK && value != 0;
}

Ref<VLNMPCA_PHYPhysicalComponent> phy_instance(const String& physical_port) {
    auto phy = make_instance<VLNMPCA_PHYPhysicalComponent>();
    phy->Tag.set(format_text("VLN:MPCA PHY PhysicalComponent:%s", physical_port.c_str()));
    phy->ElementName.set(phy->Tag.value);
    phy->Description.set(physical_port);
    phy->CreationClassName.set("VLNMPCA_PHYPhysicalComponent");
    phy->TemperatureUnit.set("Celsius");
    return phy;
}

Ref<VLNMPCA_PHYPhysicalComponentData> data_instance(const String& physical_port,
                                                    const Phy_Settings& settings) {
    auto data = make_instance<VLNMPCA_PHYPhysicalComponentData>();
    data->InstanceID.set(
        format_text("VLN:MPCA PHY PhysicalComponentData:%s", physical_port.c_str()));
    data->ElementName.set(data->InstanceID.value);
    data->Description.set(physical_port);
    const auto advertised = [&](uint32 rate) { return uint32{(settings.line_rates & rate) != 0}; };
    data->LineRateAdvertised_10G.set(advertised(AX_LINE_RATE_10G));
    data->LineRateAdvertised_1G.set(advertised(AX_LINE_RATE_1G));
    data->LineRateAdvertised_100MB.set(advertised(AX_LINE_RATE_100MB));
    data->CableNVP.set(settings.cable_nvp);
    return data;
}

// False, with a line, for a port controller that no Ethernet port leads to, or that has no PHY.
bool find_phy(const ProviderAgent& agent, const String& physical_port, HBA_WWN& name) {
    const auto* port = find_functional_port(agent, physical_port);
    if (!port) {
        VLN_LOG(VLN_DBG, "Mac address for port not available, Skipping Port %s ",
                physical_port.c_str());
        return false;
    }
    VLN_LOG(VLN_DBG, "Valid Functional Port found");
    if (!nameOfDeviceId(port->DeviceID.value.c_str(), name, "CreatePHYClasses::", VLN_DBG))
        return false;
    const char* absent = !offers(name, FEATURE_10GBASE_T)    ? "feature"
                         : !offers(name, FEATURE_STATISTICS) ? "statistics"
                                                             : nullptr;
    if (absent)
        VLN_LOG(VLN_DBG, "10GBaseT %s is not supported for Port %s ", absent,
                physical_port.c_str());
    return !absent;
}

// What there is of one port controller; END_PASS ends the walk over them.
uint32 create_phy(ProviderAgent& agent, const VLNMPCA_PortController& controller) {
    const String& physical_port = controller.DeviceID.value;
    HBA_WWN name{};
    if (!find_phy(agent, physical_port, name))
        return SKIP_DEVICE;
    auto phy = phy_instance(physical_port);
    Phy_Settings settings;
    if (VLNMPCA_TenGBaseT::GetPHYPortAttributeValues(&name, phy.get(), &settings) != PHY_OK) {
        VLN_LOG(VLN_ERR, "Failed to get the attributes for port : %s", physical_port.c_str());
        return SKIP_DEVICE;
    }
    uint32 status = MAP_OK;
    if (VLNMPCA_TenGBaseT::GetPHYPortStatistics(&name, phy.get()) != PHY_OK) {
        VLN_LOG(VLN_ERR, "Failed to get the statistics for port : %s", physical_port.c_str());
        status = SKIP_DEVICE;
    }
    const auto* component = insert_instance(agent.m_VLNMPCA_PHYPhysicalComponent_map, phy);
    if (!component || !associate(agent.m_VLNMPCA_PHYComponent_map, &controller, component))
        return END_PASS;
    const auto* data = insert_instance(agent.m_VLNMPCA_PHYPhysicalComponentData_map,
                                       data_instance(physical_port, settings));
    if (!data || !associate(agent.m_VLNMPCA_PHYPhysicalComponentSettingData_map, component, data,
                            "Insert Failed : m_VLNMPCA_PHYComponentSettingData_map"))
        return END_PASS;
    return status;
}

} // namespace

uint32 create_phys(const Map_Scope& scope) {
    ProviderAgent& agent = scope.agent;
    const auto& controllers = agent.m_VLNMPCA_PortController_map;
    if (controllers.size() == 0 || agent.m_VLNMPCA_EthernetPort_map.size() == 0) {
        VLN_LOG(VLN_DBG,
                "Unable to create the MPCA 10G-BaseT feature, No Physical/Logical Port exist");
        return SKIP_DEVICE;
    }
    uint32 status = MAP_OK;
    for (uint32 i = 0; i < controllers.size() && status != END_PASS; ++i)
        status = create_phy(agent, *controllers[i]);
    return status == MAP_OK ? MAP_OK : SKIP_DEVICE;
}

void clear_phys(ProviderAgent& agent) {
    const bool complete = run_guarded([&] {
        agent.m_VLNMPCA_PHYPhysicalComponent_map.clear();
        agent.m_VLNMPCA_PHYComponent_map.clear();
        agent.m_VLNMPCA_PHYPhysicalComponentData_map.clear();
        agent.m_VLNMPCA_PHYPhysicalComponentSettingData_map.clear();
    });
    if (!complete)
        VLN_LOG(VLN_ERR, "Cleaning PHYClass Maps caught unexpected exception");
}

} // namespace cimple
