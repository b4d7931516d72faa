// The adapter pass: turns the device model into the CIM picture of the host, in named steps.
//
// One builder lives for one pass, on the refresh thread, with the adapter maps' ready mutex and
// m_DataMutex held. What it keeps are borrowed pointers into the stores that it fills. A step
// answers 0, SKIP_DEVICE or END_PASS; the stores stay as far as they were filled, since a partial
// picture is better than none. The properties of each class stand in a function of their own, in
// one order.
#ifndef VLN_AGENT_ADAPTER_MAP_BUILDER_H
#define VLN_AGENT_ADAPTER_MAP_BUILDER_H

#include "agent/associations.h"
#include "agent/class_groups.h"
#include "agent/map_status.h"
#include "agent/platform/platform_objects.h"
#include "agent/provider_agent.h"
#include "classes/VLNMPCA_Card.h"
#include "classes/VLNMPCA_EthernetPort.h"
#include "classes/VLNMPCA_LANEndpoint.h"
#include "classes/VLNMPCA_PhysicalConnector.h"
#include "classes/VLNMPCA_PortController.h"
#include "classes/VLNMPCA_Product.h"
#include "device/nic_adapter.h"

#include <vector>

namespace cimple {

struct IP_Interface;
class VLN_IPInterfaceConfig;

class Adapter_Map_Builder {
public:
    Adapter_Map_Builder(ProviderAgent& agent, const Platform_Objects& platform)
        : _agent(agent), _platform(platform) {}

    // The whole pass. Exceptions of the card loop end that loop only.
    uint32 run();

private:
    // adapter_maps.cpp
    uint32 createNICClasses();
    void registerBaseProfiles();
    void registerStorageProfiles();
    uint32 createNICPart();
    uint32 createNICSoftware();
    void updateSoftwareIdentities();
    uint32 makeGroups(Group_Place place) { return make_class_groups(place, {_agent, _system}); }

    // A NIC function on its way through the card loop, with what its card shares with others.
    struct NIC_Function {
        NICAdapter* adapter;
        const NICAdapterAttributes* attributes;
        const VLNMPCA_Product* product;
        const VLNMPCA_Card* card;
        bool new_card; // made for this function, and not yet tied to its surroundings
        const VLNMPCA_Chip* chip = nullptr;
    };
    // One port of it.
    struct NIC_Port {
        const NIC_Function& function;
        const NICPortAttributes* attributes;
        uint32 index;             // among the ports of its adapter
        String name;              // of the device model: 16 digits
        String serial_and_number; // "serial:port number", which functions of one connector share
        const VLNMPCA_PhysicalConnector* connector = nullptr;
        const VLNMPCA_EthernetPort* ethernet_port = nullptr;
        const VLNMPCA_LANEndpoint* lan_endpoint = nullptr;
        const VLNMPCA_PortController* port_controller = nullptr;
        bool new_port_controller = false; // made for this port
        const VLNMPCA_SoftwareIdentity* firmware = nullptr;
    };

    // platform/platform_maps.cpp
    uint32 createComputerSystem();
    Ref<CIM_ComputerSystem> ownComputerSystem() const;
    uint32 createChassis();
    Ref<CIM_Chassis> ownChassis() const;

    // software/software_maps.cpp
    void createProviderIdentity();
    uint32 createDriverIdentity();
    uint32 CreateDriverIdentity(NICAdapter& adapter);

    // software/firmware_maps.cpp
    void findOrMakeFirmware(NIC_Port& port);
    const VLNMPCA_SoftwareIdentity*
    CreateFirmwareIdentityInstance(const NICAdapterAttributes& adapter);
    void joinFirmwareToPort(const NIC_Port& port);
    void joinFirmwareToController(const NIC_Port& port);
    void joinFlashImage(const NIC_Port& port);

    // hardware/card_maps.cpp
    uint32 createNICCards();
    uint32 createNICCard(NICAdapter& adapter);
    const VLNMPCA_Product* findOrMakeProduct(const NICAdapterAttributes& attributes);
    const VLNMPCA_Card* CreateMPCACardInstance(const NICAdapterAttributes& attributes);
    const VLNMPCA_Card* readCard(const VLNMPCA_Card& new_card);
    void tieNewCard(NIC_Function& function);
    void conformCard(const VLNMPCA_Card& card);
    void findOrMakeConnector(NIC_Port& port);
    void joinConnector(const NIC_Port& port);

    // hardware/chip_maps.cpp
    void findOrMakeChip(NIC_Function& function);
    uint32 CreateMPCAChipInstance(NIC_Function& function);

    // ethernet/port_maps.cpp
    uint32 createNICPort(NIC_Function& function, Port& port);
    Ref<VLNMPCA_EthernetPort> CreateEthernetPort(const NIC_Port& port) const;
    void createLANEndpoint(NIC_Port& port);
    void joinLANEndpoint(const NIC_Port& port);
    void conformEthernetPort(const VLNMPCA_EthernetPort& port);
    uint32 createPCIDevice(const NIC_Port& port);

    // ethernet/vlan_maps.cpp
    void createVLANObjects(const NIC_Port& port);

    // hardware/port_controller_maps.cpp
    void findOrMakePortController(NIC_Port& port);
    void joinPortController(const NIC_Port& port);
    void joinControlledBy(const NIC_Port& port);

    // hardware/transceiver_maps.cpp
    void createTransceiver(const NIC_Port& port);

    // ip/ip_maps.cpp
    uint32 createIPClasses();
    void createIPEndpoint(NICAdapter& adapter, Port& port, VLN_IPInterfaceConfig& kernel);
    void joinIPEndpoint(const IP_Interface& interface);

    ProviderAgent& _agent;
    const Platform_Objects& _platform;           // found by the up-calls
    const CIM_ComputerSystem* _system = nullptr; // in its store
    const CIM_Chassis* _chassis = nullptr;       // in its store
    std::vector<const VLNMPCA_Card*> _untied_cards;    // in their store; see createNICCard
};

} // namespace cimple

#endif // VLN_AGENT_ADAPTER_MAP_BUILDER_H
