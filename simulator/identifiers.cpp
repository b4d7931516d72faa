#include "simulator/identifiers.h"

#include "simulator/source_reader.h"

#include <algorithm>

namespace vlnsim {
namespace {

constexpr auto number = Attribute_Kind::number;
constexpr auto wide = Attribute_Kind::wide;
constexpr auto text = Attribute_Kind::text;
constexpr auto bytes = Attribute_Kind::bytes;

constexpr Identifier adapter_table[] = {
    {514, text, "Manufacturer"},
    {515, text, "SerialNumber"},
    {516, text, "Model"},
    {517, text, "ModelDescription"},
    {519, text, "NodeSymbolicName"},
    {520, text, "HWVersion"},
    {521, text, "OptionROMVersion"},
    {522, text, "FirmwareVersion"},
    {523, number, "VendorSpecificID"},
    {525, text, "DriverName"},
    {526, number, "DeviceID"},
    {527, number, "ModelID"},
    {528, text, "OperationalFirmwareVersion"},
    {529, text, "SLI1FirmwareName"},
    {530, text, "SLI2FirmwareName"},
    {531, bytes, "IEEEAddress"},
    {532, number, "BootCodeEnabled"},
    {533, text, "DriverVersion"},
    {534, text, "BootVersion"},
    {544, number, "DiagVersionNumber"},
    {545, text, "FunctionalFirmwareVersion"},
    {546, text, "KernelFirmwareVersion"},
    {548, text, "SLI3FirmwareName"},
    {549, number, "SLIMode"},
    {551, number, "BoardTemperature"},
    {553, number, "FCPortNumber"},
    {555, number, "PCIBusNumber"},
    {556, number, "FunctionType"},
    {557, number, "SubDeviceID"},
    {559, number, "PortNumber"},
    {560, number, "PCIFunctionNumber"},
    {561, number, "SubVendorID"},
    {562, number, "FirmwareStatus"},
    {563, text, "SPFirmwareVersion"},
    {564, text, "SPFirmwareName"},
    {565, text, "ULPFirmwareVersion"},
    {566, text, "ULPFirmwareName"},
    {572, text, "IPLFilename"},
    {573, text, "NCSIVersion"},
    {574, text, "FCOEUniversalVersion"},
    {575, text, "FCOE_X86_BIOSVersion"},
    {576, text, "FCOE_EFIVersion"},
    {577, text, "FCOE_FCODEVersion"},
    {578, text, "UEFI_BIOSVersion"},
    {579, text, "UEFI_NICVersion"},
    {580, text, "UEFI_FCODEVersion"},
    {581, text, "UEFI_ISCSIVersion"},
    {582, text, "PCIBusSpeed"},
    {583, text, "PCIBusWidth"},
    {585, number, "PortConnectionType"},
    {586, text, "Subadapter_number"},
    {587, text, "FCUniversalVersion"},
    {588, text, "FC_X86_BIOSVersion"},
    {589, text, "FC_EFIVersion"},
    {590, text, "FC_FCODEVersion"},
    {591, text, "FirmwareOnFlash"},
    {592, text, "BootMethod"},
    {593, text, "BootMethodsAvailable"},
};

constexpr Identifier port_table[] = {
    {771, text, "PortSymbolicName"},
    {772, number, "PortFcId"},
    {773, number, "PortType"},
    {774, number, "FunctionalPortState"},
    {775, number, "PortSupportedClassofService"},
    {776, bytes, "PortSupportedFc4Types"},
    {777, bytes, "PortActiveFc4Types"},
    {778, number, "PortSupportedSpeed"},
    {779, number, "PortSpeed"},
    {780, number, "PortMaxFrameSize"},
    {781, text, "OSDeviceName"},
    {782, number, "NumberofDiscoveredPorts"},
    {784, number, "MaximumMTU"},
    {785, number, "LDTO"},
    {786, number, "DefaultETO"},
    {800, number, "FunctionType"},
    {801, number, "MaxCDBLength"},
    {802, number, "PhysicalPortState"},
    {803, text, "IfName"},
    {804, text, "PermanentMACAddress"},
    {805, number, "CurrentMTU"},
    {806, text, "ProtocolIFType"},
    {807, text, "LinkTechnology"},
    {808, text, "Capabilities"},
    {809, text, "EnabledCapabilities"},
    {810, text, "IPProtocolEndpointName"},
    {811, text, "IPProtocolIFType"},
    {812, text, "IPv4Address"},
    {813, text, "SubnetMask"},
    {814, text, "AddressOrigin"},
    {815, text, "FuncPortSpeed"},
    {816, text, "FuncQosBandwidth"},
    {817, text, "CurrentMACAddress"},
    {818, number, "vNICEnabledState"},
    {819, text, "VNICName"},
    {820, number, "vNICOuterVLANId"},
    {821, text, "VNICMinBandwidth"},
    {822, text, "VNICMaxBandwidth"},
    {823, number, "PFCThrottle"},
    {824, number, "AutoNegStatus"},
    {825, number, "LineRateAdvertised"},
    {826, number, "OnLineEstimation"},
    {827, number, "PhyTemp"},
    {828, number, "Pair-A-SNR"},
    {829, number, "Pair-B-SNR"},
    {830, number, "Pair-C-SNR"},
    {831, number, "Pair-D-SNR"},
    {832, wide, "TimeSinceLink"},
    {833, number, "PairA-AvgMSE"},
    {834, number, "PairB-AvgMSE"},
    {835, number, "PairC-AvgMSE"},
    {836, number, "PairD-AvgMSE"},
    {837, wide, "LDPCErrs"},
    {838, wide, "PHYCRCErrs"},
    {839, number, "CableNVP"},
    {840, number, "AutoNegEnable"},
    {841, number, "LinkPartnerAutoNeg"},
    {842, number, "PhysicalPortSpeed"},
    {843, text, "GatewayAddress"},
    {845, text, "PHYConfigID"},
    {846, text, "PHYFirmwareRev"},
    {847, number, "InterfaceType"},
    {848, text, "AutoNegSupportedSpeeds"},
    {849, text, "ForceSupportedSpeeds"},
    {850, number, "PortSpeedMode"},
    {851, text, "ConfiguredPortSpeed"},
    {852, number, "DACCableLength"},
    {853, number, "SRIOVState"},
    {854, number, "iSCSIBoot"},
    {855, number, "PhyLinkDownReason"},
    {856, text, "FuncQosMinBandwidth"},
    {857, text, "IPV6GatewayAddr"},
    {864, number, "FECState"},
    {865, number, "VEPAState"},
};

// Numbers of 64 bits.
constexpr Identifier statistic_table[] = {
    {1025, number, "PacketsTransmitted"},
    {1026, number, "ExCountResp"},
    {1027, number, "ActiveXRIs"},
    {1028, number, "RxSequences"},
    {1029, number, "ExCountOrig"},
    {1030, number, "WordsTransmitted"},
    {1031, number, "WordsReceived"},
    {1032, number, "PacketsReceived"},
    {1033, number, "LIPCount"},
    {1036, number, "NOSCount"},
    {1037, number, "ErrorFrames"},
    {1038, number, "DumpedFrames"},
    {1039, number, "LinkFailures"},
    {1040, number, "LossOfSyncCounter"},
    {1041, number, "LossOfSignalCounter"},
    {1042, number, "PrimitiveSeqProtocolErrCount"},
    {1043, number, "InvalidTransmissionWords"},
    {1044, number, "CRCErrors"},
    {1045, number, "TxSequences"},
    {1046, number, "PrimitiveSeqTimesouts"},
    {1047, number, "ElasticBufOverruns"},
    {1048, number, "ActiveRPIs"},
    {1057, number, "ArbitrationTimeouts"},
    {1058, number, "LinkTransitions"},
    {1059, number, "Counter1059"},
    {1060, number, "MDI_PLLEvents"},
    {1061, number, "MDI_LinkUpTime"},
    {1062, number, "EMI10GEvents"},
    {1063, number, "PHYFrames"},
    {1064, number, "MDI_CRC8Errors"},
};

constexpr Identifier feature_table[] = {
    {26, number, "Counters10GBaseT"},
    {35, number, "SRIOV"},
    {201, number, "Tessel"},
    {400, number, "PriorityGroupBandwidth"},
    {401, number, "iSCSI"},
    {402, number, "NIC"},
    {403, number, "FCoE"},
    {412, number, "FCoEFunction"},
    {413, number, "iSCSIFunction"},
    {422, number, "ChangePersonality"},
    {426, number, "Feature10GBaseT"},
    {428, number, "CableDiagnostics"},
    {429, number, "LineRateAdvertisement"},
    {430, number, "CoreDump"},
    {434, number, "Multichannel"},
    {435, number, "SetSRIOV"},
    {436, number, "ProfileManagement"},
    {437, number, "ProfileListing"},
    {438, number, "GMC"},
    {439, number, "RoCE"},
    {440, number, "DataCentreBridging"},
};

} // namespace

std::span<const Identifier> adapter_attribute_identifiers() {
    return adapter_table;
}
std::span<const Identifier> port_attribute_identifiers() {
    return port_table;
}
std::span<const Identifier> statistic_identifiers() {
    return statistic_table;
}
std::span<const Identifier> feature_identifiers() {
    return feature_table;
}

const Identifier* find_identifier(std::span<const Identifier> table, std::string_view name) {
    if (const auto by_number = parse_number(name); by_number && *by_number <= 0xFFFF)
        return find_identifier(table, static_cast<std::uint32_t>(*by_number));
    const auto it =
        std::find_if(table.begin(), table.end(), [&](const auto& row) { return row.name == name; });
    return it == table.end() ? nullptr : &*it;
}

const Identifier* find_identifier(std::span<const Identifier> table, std::uint32_t wanted) {
    const auto it = std::find_if(table.begin(), table.end(),
                                 [&](const auto& row) { return row.number == wanted; });
    return it == table.end() ? nullptr : &*it;
}

} // namespace vlnsim
