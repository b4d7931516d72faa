// The iSCSI stretch of the adapter pass: the ports of iSCSI functions and the endpoints on them.
//
// Runs on the refresh thread, with the adapter maps' ready mutex and m_DataMutex held. A port that
// fails is left out alone.
#ifndef VLN_AGENT_ISCSI_ISCSI_MAPS_H
#define VLN_AGENT_ISCSI_ISCSI_MAPS_H

#include "agent/provider_agent.h"
#include "device/iscsi_adapter.h"

namespace cimple {

class ISCSI_Map_Builder {
public:
    ISCSI_Map_Builder(ProviderAgent& agent, const CIM_ComputerSystem* system)
        : _agent(agent), _system(system) {}

    // 0, or a status that ends the pass.
    uint32 CreateISCSIClasses();

private:
    // A port on its way through the stretch.
    struct ISCSI_Port {
        const iSCSIAdapterAttributes& adapter;
        const iSCSIPortAttributes& attributes;
        uint32 adapter_number;
        uint32 index; // among the ports of its adapter
        String name;  // of the device model: 16 digits
        const VLNMPCA_EthernetPort* ethernet_port = nullptr;
        const VLNMPCA_TCPProtocolEndpoint* tcp_endpoint = nullptr;
        const VLNMPCA_IPProtocolEndpoint* ip_endpoint = nullptr;
    };

    // iscsi_maps.cpp
    uint32 createClasses();
    void createProtocolController();
    void createDriverIdentity();
    uint32 CreateISCSIDriverIdentity(const iSCSIAdapterAttributes& attributes);
    void createPorts(iSCSIAdapter& adapter);

    // iscsi_port_maps.cpp
    void createPort(iSCSIAdapter& adapter, Port& port);
    void joinPort(const ISCSI_Port& port);
    void joinPortController(const ISCSI_Port& port);
    void conformPort(const ISCSI_Port& port);
    void joinConnector(const ISCSI_Port& port);
    void createPCIDevice(const ISCSI_Port& port);

    // iscsi_endpoint_maps.cpp
    void createEndpoints(ISCSI_Port& port);
    void joinIPEndpoint(const ISCSI_Port& port);
    void createIPInterface(const ISCSI_Port& port);

    ProviderAgent& _agent;
    const CIM_ComputerSystem* _system;
    const VLNMPCA_SCSIProtocolController* _protocol_controller = nullptr; // in its store
    const VLNMPCA_SoftwareIdentity* _driver = nullptr;                    // in its store
};

} // namespace cimple

#endif // VLN_AGENT_ISCSI_ISCSI_MAPS_H
