// The FCoE stretch of the adapter pass: FC ports, their services, endpoints and parameters.
//
// Runs on the refresh thread, with the adapter maps' ready mutex and m_DataMutex held. What it
// keeps are borrowed pointers into the stores that it fills.
#ifndef VLN_AGENT_FCOE_FCOE_MAPS_H
#define VLN_AGENT_FCOE_FCOE_MAPS_H

#include "agent/provider_agent.h"
#include "classes/VLNMPCA_FCPort.h"

namespace cimple {

// An FCoE function on its way through the port loop.
struct FC_Function {
    const FCoEAdapterAttributes& adapter;
    const FCoEPortAttributes& attributes;
    Port& port;
    uint32 adapter_number;
    String name;              // of the port: 16 digits
    String serial_and_name;   // for the texts of the log
    String serial_and_number; // "serial:port number", which functions of one connector share
    const VLNMPCA_FCPort* fc_port = nullptr;
};

class FCoE_Map_Builder {
public:
    FCoE_Map_Builder(ProviderAgent& agent, const CIM_ComputerSystem* system)
        : _agent(agent), _system(system) {}

    // 0, or 32769 which ends the pass. What throws in here ends the FCoE stretch alone, with a line
    // in the log.
    uint32 run();

private:
    // fcoe_maps.cpp. A step of the port loop answers false when its port is to be left there.
    uint32 createClasses();
    void createFCPorts();
    void createFCPort(FC_Function function);
    bool createPort(FC_Function& function);
    bool createPFCThrottle(const FC_Function& function);
    bool createStatistics(const FC_Function& function);
    void makePortGroups(const FC_Function& function);
    void createPCIDevice(const FC_Function& function);

    // fcoe_service_maps.cpp
    void createWebLaunch();
    uint32 createDriverIdentity();

    // fcoe_port_maps.cpp
    bool joinConnector(const FC_Function& function);
    bool joinPortController(const FC_Function& function);
    bool joinWWNService(const FC_Function& function);
    bool createInitiatorEndpoint(const FC_Function& function);
    bool joinFirmware(const FC_Function& function);
    bool joinEthernetPorts(const FC_Function& function);

    ProviderAgent& _agent;
    const CIM_ComputerSystem* _system;
    bool _first_adapter = true;
};

} // namespace cimple

#endif // VLN_AGENT_FCOE_FCOE_MAPS_H
