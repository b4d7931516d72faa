// The order of the iSCSI stretch, and what its ports share: the SCSI controller and the driver.

#include "agent/iscsi/iscsi_maps.h"

#include "agent/adapter_map_builder.h"
#include "agent/associations.h"
#include "agent/profiles/profile_maps.h"
#include "agent/software/software_identity.h"
#include "agent/text.h"
#include "cimple/guard.h"
#include "classes/VLNMPCA_SCSIProtocolController.h"

namespace cimple {

namespace {

Ref<VLNMPCA_SCSIProtocolController> protocol_controller_instance(const CIM_ComputerSystem& system) {
    auto controller = make_instance<VLNMPCA_SCSIProtocolController>();
    const String name = format_text("SCSI Protocol Controller:%s", system.Name.value.c_str());
    name_in_system(*controller, system);
    controller->DeviceID.set(name);
    controller->ElementName.set(name);
    return controller;
}

const iSCSIAdapterAttributes& attributes_of(iSCSIAdapter& adapter) {
    return static_cast<const iSCSIAdapterAttributes&>(*adapter.getAdapterAttributes());
}

} // namespace

uint32 ISCSI_Map_Builder::CreateISCSIClasses() {
    uint32 status = END_PASS;
    return run_guarded([&] { status = createClasses(); }) ? status : END_PASS;
}

uint32 ISCSI_Map_Builder::createClasses() {
    Profile_Maps profiles(_agent);
    profiles.registerForSystem(PROFILE_ISCSI_INITIATOR);
    profiles.registerForSystem(PROFILE_ISCSI_INITIATOR_PORTS);
    if (!_agent.m_pData) {
        VLN_LOG(VLN_DBG, "Could not locate the data pointer for iSCSI - Serious issue");
        return END_PASS;
    }
    if (!_agent.m_pData->hasISCSIAdapter) {
        VLN_LOG(VLN_DBG, "No iSCSI Card found");
        return MAP_OK;
    }
    if (const uint32 status = make_class_groups(Group_Place::ISCSI, {_agent, _system}))
        return status;
    createProtocolController();
    createDriverIdentity();
    for (const auto& adapter : _agent.m_pData->adapters) {
        if (adapter->getAdapterType() == ADAPTER_ISCSI)
            createPorts(static_cast<iSCSIAdapter&>(*adapter));
        else
            VLN_LOG(VLN_DBG, "Skippping Non iSCSI Adapter [%s]", adapter->getAdapterName().c_str());
    }
    return make_class_groups(Group_Place::ISCSI_PORTS, {_agent, _system});
}

// One for the host, whatever its number of ports.
void ISCSI_Map_Builder::createProtocolController() {
    _protocol_controller = insert_instance(_agent.m_VLNMPCA_SCSIProtocolController_map,
                                           protocol_controller_instance(*_system));
    associate(_agent.m_VLNMPCA_SCSIProtocolControllerSystemDevice_map, _system,
              _protocol_controller);
}

// All iSCSI functions run under one driver: the first one's.
void ISCSI_Map_Builder::createDriverIdentity() {
    for (const auto& adapter : _agent.m_pData->adapters) {
        if (adapter->getAdapterType() != ADAPTER_ISCSI)
            continue;
        if (CreateISCSIDriverIdentity(attributes_of(static_cast<iSCSIAdapter&>(*adapter))) !=
            MAP_OK)
            VLN_LOG(VLN_DBG, "CreateISCSIDriverIdentity failed");
        return;
    }
}

uint32 ISCSI_Map_Builder::CreateISCSIDriverIdentity(const iSCSIAdapterAttributes& attributes) {
    _driver = insert_instance(
        _agent.m_VLNMPCA_SoftwareIdentity_map,
        driver_identity_instance({"CNA iSCSI Driver", "Vorlan CNA Driver", "VLN CNA"}, attributes));
    if (!_driver)
        return END_PASS;
    Profile_Maps(_agent).createSoftwareConforms("Driver, Software Inventory",
                                                PROFILE_SOFTWARE_INVENTORY, _driver);
    return MAP_OK;
}

void ISCSI_Map_Builder::createPorts(iSCSIAdapter& adapter) {
    for (const auto& port : adapter.getPorts()) {
        VLN_LOG(VLN_DBG, "Creating classes for adapter %zu and port %d.",
                static_cast<std::size_t>(adapter.getAdapterNumber()),
                static_cast<int>(port->getPortIndex()));
        createPort(adapter, *port);
    }
}

} // namespace cimple
