// The PCI function of a port, with its registers and its vital product data.
//
// Runs in the adapter pass, with the adapter maps' ready mutex and m_DataMutex held.
#ifndef VLN_AGENT_HARDWARE_PCI_MAPS_H
#define VLN_AGENT_HARDWARE_PCI_MAPS_H

#include "agent/provider_agent.h"

namespace cimple {

// The port that the function serves, and how its kind of port names its function.
struct PCI_Function {
    String port_name;              // 16 digits
    const char* kind;              // for the log
    String device_id;              // of the function, up to the device number of its registers
    String element_name;           // of the function
    Instance_Map_Base& identities; // the associations of port and function
    const Instance* port;          // in its store
};

class PCI_Maps {
public:
    PCI_Maps(ProviderAgent& agent, const CIM_ComputerSystem* system)
        : _agent(agent), _system(system) {}

    // 0; 32768 for a function whose registers can't be read, with which all else of its port
    // stays; 32769 when the name is none or an insertion failed.
    uint32 CreatePCIDeviceInstance(const PCI_Function& function);

private:
    uint32 join(const PCI_Function& function, const VLNMPCA_PCIDevice& device);
    const VLNMPCA_VitalProductData*
    CreateVPD(const PCI_Function& function); // vital_product_maps.cpp

    ProviderAgent& _agent;
    const CIM_ComputerSystem* _system;
};

} // namespace cimple

#endif // VLN_AGENT_HARDWARE_PCI_MAPS_H
