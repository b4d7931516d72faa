#include "agent/hardware/pci_maps.h"

#include "agent/adapter_map_builder.h"
#include "agent/associations.h"
#include "agent/hardware/port_name.h"
#include "agent/profiles/profile_maps.h"
#include "agent/text.h"
#include "classes/VLNMPCA_PCIDevice.h"
#include "classes/VLNMPCA_RegisteredProfile.h"
#include "classes/VLNMPCA_VitalProductData.h"
#include "device/library/bound_functions.h"
#include "operations/operation_frame.h"

namespace cimple {

namespace {

constexpr uint16 NOT_APPLICABLE = 5; // of a device that the host alone switches

struct Register_Row {
    Property<uint32> VLNMPCA_PCIDevice::*property;
    uint32_t AX_PCIRegisters::*value;
};

using D = VLNMPCA_PCIDevice;
using R = AX_PCIRegisters;

constexpr Register_Row REGISTERS[] = {
    {&D::CIS, &R::cis},
    {&D::PCIType, &R::pciType},
    {&D::FeatureEnable, &R::featureEnable},
    {&D::PwrMgtCaps, &R::pwrMgtCaps},
    {&D::PwrMgtCtrl, &R::pwrMgtCtrl},
    {&D::MSICtrl, &R::msiCtrl},
    {&D::MSILowAddr, &R::msiLowAddr},
    {&D::MSIHighAddr, &R::msiHighAddr},
    {&D::MSIData, &R::msiData},
    {&D::MSIMaskBits, &R::msiMaskBits},
    {&D::MSIPendingBits, &R::msiPendingBits},
    {&D::MSIXCtrl, &R::msiXCtrl},
    {&D::MSIXTableOffset, &R::msiXTableOffset},
    {&D::MSIXPBAOffset, &R::msiXPBAOffset},
    {&D::VPDAddr, &R::vpdAddr},
    {&D::PCIECap, &R::pcieCap},
    {&D::PCIEDeviceCapReg, &R::pcieDeviceCapReg},
    {&D::PCIEDeviceStatusCtrl, &R::pcieDeviceStatusCtrl},
    {&D::PCIEDeviceLinkCap, &R::pcieDeviceLinkCap},
    {&D::PCIEDeviceLinkStatusCtrl, &R::pcieDeviceLinkStatusCtrl},
    {&D::SlotCap, &R::slotCap},
    {&D::SlotStatusCtrlReg, &R::slotStatusCtrlReg},
    {&D::RootCapCtrlReg, &R::rootCapCtrlReg},
    {&D::RootStatusReg, &R::rootStatusReg},
    {&D::DeviceCap2Reg, &R::deviceCap2Reg},
    {&D::DeviceStatusCtl2Reg, &R::deviceStatusCtl2Reg},
    {&D::LinkCap2Reg, &R::linkCap2Reg},
    {&D::LinkStatus2Ctl2Reg, &R::linkStatus2Ctl2Reg},
    {&D::SlotCap2Reg, &R::slotCap2Reg},
    {&D::SlotStatusCtl2Reg, &R::slotStatusCtl2Reg},
    {&D::EnhancedCapHdrAER, &R::enhancedCapHdrAER},
    {&D::UncorrectableErrStat, &R::uncorrectableErrStat},
    {&D::UncorrectableErrMask, &R::uncorrectableErrMask},
    {&D::UncorrectableErrSeverity, &R::uncorrectableErrSeverity},
    {&D::CorrectableErrStat, &R::correctableErrStat},
    {&D::CorrectableErrMask, &R::correctableErrMask},
    {&D::AdvErrCapCtl, &R::advErrCapCtl},
    {&D::EnhancedCapHdrPBUDG, &R::enhancedCapHdrPBUDG},
    {&D::DataSelectReg, &R::dataSelectReg},
    {&D::DataReg, &R::dataReg},
    {&D::PowerBudget, &R::powerBudget},
};

// Registers that the class has one by one and the library as a list.
constexpr Property<uint32> D::*BASE_ADDRESSES[] = {
    &D::BaseAddresses0, &D::BaseAddresses1, &D::BaseAddresses2,
    &D::BaseAddresses3, &D::BaseAddresses4, &D::BaseAddresses5,
};
constexpr Property<uint32> D::*HEADER_LOG[] = {
    &D::HeaderLog0x0,
    &D::HeaderLog0x4,
    &D::HeaderLog0x8,
    &D::HeaderLog0xC,
};

void set_header(D& device, const R& registers) {
    device.FunctionNumber.set(static_cast<uint8>(registers.functionNumber));
    device.BusNumber.set(static_cast<uint8>(registers.busNumber));
    device.DeviceNumber.set(static_cast<uint8>(registers.deviceNumber));
    device.VendorID.set(registers.vendorID);
    device.PCIDeviceID.set(registers.deviceID);
    device.Command.set(registers.command);
    device.CommandRegister.set(registers.command);
    device.PCIStatus.set(registers.status);
    device.RevisionID.set(registers.revisionID);
    device.ProgIf.set(registers.progIf);
    device.SubClass.set(registers.subClass);
    device.BaseClass.set(registers.baseClass);
    device.ClassCode.set(registers.baseClass);
    device.CacheLineSize.set(registers.cacheLineSize);
    device.LatencyTimer.set(registers.latencyTimer);
    device.HeaderType.set(registers.headerType);
    device.BuiltInSelfTest.set(registers.builtInSelfTest);
    device.SubVendorID.set(registers.subVendorID);
    device.SubsystemVendorID.set(registers.subVendorID);
    device.SubsystemID.set(registers.subsystemID);
    device.ExpansionROMBaseAddress.set(registers.expansionROMBaseAddress);
    device.CapabilitiesPtr.set(registers.capabilitiesPtr);
    device.InterruptLine.set(registers.interruptLine);
    device.InterruptPin.set(registers.interruptPin);
    device.MinimumGrant.set(registers.minimumGrant);
    device.MinGrantTime.set(registers.minimumGrant);
    device.MaximumLatency.set(registers.maximumLatency);
    device.MaxLatency.set(registers.maximumLatency);
}

void set_registers(D& device, const R& registers) {
    for (const Register_Row& row : REGISTERS)
        (device.*row.property).set(registers.*row.value);
    for (std::size_t i = 0; i < std::size(BASE_ADDRESSES); ++i) {
        (device.*BASE_ADDRESSES[i]).set(registers.baseAddresses[i]);
        device.BaseAddress.append(registers.baseAddresses[i]);
    }
    for (std::size_t i = 0; i < std::size(HEADER_LOG); ++i)
        (device.*HEADER_LOG[i]).set(registers.headerLog[i]);
    for (const uint32 word : registers.vpdData)
        device.VPDData.append(word);
}

Ref<D> pci_device_instance(const PCI_Function& function, const R& registers,
                           const CIM_ComputerSystem& system) {
    VLN_LOG(VLN_DBG, "Creating VLNMPCA_PCIDevice");
    auto device = make_instance<D>();
    name_in_system(*device, system);
    device->DeviceID.set(format_text("%s:0x%04X", function.device_id.c_str(),
                                     static_cast<unsigned>(registers.deviceID)));
    device->ElementName.set(function.element_name);
    device->EnabledState.set(NOT_APPLICABLE);
    device->RequestedState.set(NOT_APPLICABLE);
    device->PrimaryStatus.set(NOT_APPLICABLE);
    device->HealthState.set(NOT_APPLICABLE);
    set_header(*device, registers);
    set_registers(*device, registers);
    return device;
}

bool pci_wwn(const String& port_name, AX_WWN& wwn) {
    VLN_LOG(VLN_DBG, "MAC address in std::string format = %s and size = %zu", port_name.c_str(),
            static_cast<std::size_t>(port_name.size()));
    HBA_WWN name{};
    if (!port_name_to_wwn(port_name, name)) {
        VLN_LOG(VLN_ERR, "VLNMPCA_PCIPort Id2HBAName failed");
        return false;
    }
    wwn = wwnOf(&name);
    return true;
}

} // namespace

uint32 PCI_Maps::CreatePCIDeviceInstance(const PCI_Function& function) {
    AX_WWN wwn{};
    if (!pci_wwn(function.port_name, wwn))
        return END_PASS;
    R registers{};
    const AX_STATUS status = AX_DiagReadPCIRegistersV2(wwn, &registers);
    VLN_LOG(VLN_DBG, "AX_DiagReadPCIRegistersV2 status = %d ", static_cast<int>(status));
    if (status != AX_STATUS_OK) {
        VLN_LOG(VLN_CRIT, "AX_DiagReadPCIRegistersV2 call failed");
        return SKIP_DEVICE;
    }
    VLN_LOG(VLN_DBG, "AX_DiagReadPCIRegistersV2 call passed");
    VLN_LOG(VLN_DBG, "Creating VLNMPCA_PCIDevice for MPCA %s adapters ", function.kind);
    const auto* device = insert_instance(_agent.m_VLNMPCA_PCIDevice_map,
                                         pci_device_instance(function, registers, *_system));
    return device ? join(function, *device) : static_cast<uint32>(END_PASS);
}

uint32 PCI_Maps::join(const PCI_Function& function, const VLNMPCA_PCIDevice& device) {
    if (const auto* profile = Profile_Maps(_agent).find(PROFILE_PCI_DEVICE))
        associate(_agent.m_VLNMPCA_PCIElementConformsToProfile_map, profile, &device);
    if (!associate(_agent.m_VLNMPCA_SystemDevice_map, _system, &device) ||
        !associate(function.identities, function.port, &device))
        return END_PASS;
    const auto* data = CreateVPD(function);
    if (!data) {
        VLN_LOG(VLN_DBG, "%s port %s CreateVPD failed", function.kind, function.port_name.c_str());
        return MAP_OK;
    }
    associate(_agent.m_VLNMPCA_ElementVPD_map, &device, data);
    return MAP_OK;
}

} // namespace cimple
