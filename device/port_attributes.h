// What the libraries report about a port, read once when the port object is made.
//
// Names, defaults and failures as in adapter_attributes.h.
#ifndef DEVICE_PORT_ATTRIBUTES_H
#define DEVICE_PORT_ATTRIBUTES_H

#include "cimple/types.h"
#include "device/library/axapi.h"

#include <array>
#include <string>

namespace cimple {

class Adapter;
class Attribute_Buffer;

using Fc4_Types = std::array<uint8, 32>; // a bit for each FC-4 type, as FC-GS lays them out

class PortAttributes {
public:
    virtual ~PortAttributes() noexcept(false) = default;

protected:
    PortAttributes() = default;
};

// What NIC and iSCSI functions tell of their Ethernet port.
struct EthernetPortFacts {
    explicit EthernetPortFacts(uint32 functionalState) : FunctionalPortState(functionalState) {}

    uint32 FunctionalPortState;
    uint32 PortSupportedSpeed = 0;
    uint32 PortSpeed = 0;
    uint32 MaximumMTU = 0;
    uint32 PhysicalPortState = 1;
    bool tellsPhysicalPortState = false;
    std::string PermanentMACAddress;
    uint32 CurrentMTU = 0;
    std::string FuncPortSpeed;
    std::string FuncQosBandwidth;
    std::string CurrentMACAddress;
    uint32 PhyLinkDownReason = 0;
    std::string FuncQosMinBandwidth;
    std::string IPV6GatewayAddr;
};

class NICPortAttributes : public PortAttributes, public EthernetPortFacts {
public:
    NICPortAttributes(Adapter& adapter, uint32 portIndex, const HBAIdentifier& hbaIdentifier,
                      const LocalHBAInfoV4& localHBAInfo);

    std::string PortName; // 16 upper-case digits, made of the MAC address
    uint32 SpecialFeature = 0;
    uint32 PortType = 1;

    uint32 FunctionType = 0;
    std::string IfName;
    std::string ProtocolIFType;
    std::string LinkTechnology;
    std::string Capabilities;
    std::string EnabledCapabilities;
    std::string IPProtocolEndpointName;
    std::string IPProtocolIFType;
    std::string IPv4Address;
    std::string SubnetMask;
    std::string AddressOrigin;
    uint32 vNICEnabledState = 0;
    std::string VNICName;
    uint32 vNICOuterVLANId = 0;
    std::string VNICMinBandwidth;
    std::string VNICMaxBandwidth;
    std::string GatewayAddress;
    uint32 SRIOVState = 3;
    uint32 VEPAState = 2;
};

// Of a port that storage is reached through, as the management library lists it.
class StoragePortAttributes : public PortAttributes {
public:
    std::string PortWWN; // 16 upper-case digits
    std::string NodeWWN;
    std::string FabricName; // "xx:xx:xx:xx:xx:xx:xx:xx"
    std::string nFlags;     // eight lower-case digits
    uint32 PortType = 1;

protected:
    explicit StoragePortAttributes(const LocalHBAInfoV4& localHBAInfo);
};

class iSCSIPortAttributes : public StoragePortAttributes, public EthernetPortFacts {
public:
    iSCSIPortAttributes(Adapter& adapter, uint32 portIndex, const HBAIdentifier& hbaIdentifier,
                        const LocalHBAInfoV4& localHBAInfo);

    uint32 LDTO = 0;
    uint32 DefaultETO = 0;
    uint32 MaxCDBLength = 0;
    uint32 PhysicalPortSpeed = 0;
    uint32 iSCSIBoot = 0; // 1: the host boots over the port

    // From the initiator properties.
    std::string InitiatorName;
    std::string InitiatorAlias;
    AX_iSCSI_LoginOptions LoginOptions{};
    std::string AuthenticationMethod = "Not Available"; // "None", "One-Way CHAP" or "Mutual CHAP"
    std::string TargetCHAPName = "Not Available";       // with one-way and mutual CHAP
    std::string InitiatorCHAPName = "Not Available";    // with mutual CHAP

    // From the network properties.
    std::string IPAddress = "Not Available";
    std::string SubnetMask = "Not Available";
    std::string GatewayAddress = "Not Available";
    uint8 AddressOrigin = 0;
    uint8 LinkUp = 0;
    uint8 VLANEnabled = 0;
    uint8 VLANPriority = 0;
    uint16 VLANID = 0;

private:
    void readInitiatorProperties(AX_WWN wwn);
    void readNetworkProperties(AX_WWN wwn);
};

// What ports tell that speak Fibre Channel, over Ethernet or not.
struct FibreChannelPortFacts {
    std::string PortSymbolicName;
    uint32 PortFcId = 0;
    uint32 PortSupportedClassofService = 0;
    Fc4_Types PortSupportedFc4Types{};
    Fc4_Types PortActiveFc4Types{};
    uint32 PortSupportedSpeed = 0;
    uint32 PortSpeed = 0;
    uint32 PortMaxFrameSize = 0;
    std::string OSDeviceName;
    uint32 NumberofDiscoveredPorts = 0;
};

class FCoEPortAttributes : public StoragePortAttributes, public FibreChannelPortFacts {
public:
    FCoEPortAttributes(Adapter& adapter, uint32 portIndex, const HBAIdentifier& hbaIdentifier,
                       const LocalHBAInfoV4& localHBAInfo);

    uint32 FunctionalPortState = 0;
    uint32 PORT_SERVICE_TYPE = 0; // the attribute of the class of service, read once more
    uint32 PhysicalPortState = 1;
    std::string FuncPortSpeed;
    std::string FuncQosBandwidth;
    uint32 PFCThrottle = 0;
    uint32 PhysicalPortSpeed = 0;
    uint32 PhyLinkDownReason = 0;
};

// Reads the published record of the HBA API first, then the management library.
class FCPortAttributes : public PortAttributes, public FibreChannelPortFacts {
public:
    FCPortAttributes(Adapter& adapter, uint32 portIndex);

    std::string PortWWN;
    std::string NodeWWN;
    std::string FabricName; // 16 upper-case digits
    uint32 PortType = 1;
    uint32 PortState = 1; // the physical state, once the management library has told it
    uint32 FECState = 2;

private:
    void readPublishedRecord(const std::string& adapterName, uint32 portIndex);
};

} // namespace cimple

#endif // DEVICE_PORT_ATTRIBUTES_H
