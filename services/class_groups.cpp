#include "agent/class_groups.h"

#include "foundation/logger.h"
#include "services/bridging/instances.h"
#include "services/channels/instances.h"
#include "services/channels/port_config.h"
#include "services/configuration/instances.h"
#include "services/diagnostics/instances.h"
#include "services/driver_parameters/instances.h"
#include "services/driver_parameters/lun_priorities.h"
#include "services/dump/down_ports.h"
#include "services/dump/instances.h"
#include "services/fip/instances.h"
#include "services/firmware/instances.h"
#include "services/ip_tables/instances.h"
#include "services/iscsi_settings/instances.h"
#include "services/nic_settings/instances.h"
#include "services/nic_settings/virtual_functions.h"
#include "services/nic_settings/vnic_data.h"
#include "services/phy/instances.h"
#include "services/record_logs/driver_logs.h"
#include "services/record_logs/instances.h"
#include "services/virtual_ports/instances.h"
#include "services/wwn/instances.h"

namespace cimple {

namespace {

using enum Group_Place;

constexpr Class_Group GROUPS[] = {
    {.place = PLATFORM, .create = create_configuration_settings},
    {.place = PLATFORM, .create = forget_iscsi_settings},
    {.place = PLATFORM,
     .create = read_driver_events,
     .thrown = {VLN_ERR, "Exception in reading the events of the drivers"}},
    {.place = NIC_CARDS,
     .create = StartSoftwareInstallationService,
     .failed = {VLN_CRIT, "StartSoftwareInstallationService failed"}},
    {.place = NIC_PORTS,
     .create = create_phys,
     .clear = clear_phys,
     .done = {VLN_DBG, "10GBaseT feature classes created Successfully"},
     .failed = {VLN_DBG, "10GBaseT feature is either Not Supported/Failed to Create the feature"},
     .thrown = {VLN_ERR, "Exception in 10GBaseT class creation"}},
    {.place = NIC_PORTS,
     .create = create_adapter_configurations,
     .clear = clear_adapter_configurations,
     .failed = {VLN_ERR, "The configuration of an adapter could not be read"},
     .thrown = {VLN_ERR, "Exception in the configuration of the adapters"}},
    {.place = NIC,
     .create = create_nic_settings,
     .clear = clear_nic_settings,
     .done = {VLN_INFO, "NIC Setting Service classes are successfully created"},
     .failed = {VLN_INFO, "Issue with NIC Setting Service classes"},
     .thrown = {VLN_ERR, "----- unknown exception ------ "}},
    {.place = NIC,
     .create = create_nic_driver_log,
     .before = {VLN_DBG, "Calling DriverLog Creation class for NIC "},
     .done = {VLN_INFO, "MPCA Driver Log classes are successfully created for NIC"},
     .failed = {VLN_INFO, "Issue with MPCA Driver Log classes for NIC"},
     .thrown = {VLN_ERR, "----- unknown exception ------ "}},
    {.place = NIC,
     .create = create_nic_bridging,
     .clear = clear_bridging,
     .before = {VLN_DBG, "calling CreateCeeClasses for NIC port"}},
    {.place = NIC,
     .create = retrieve_down_ports,
     .failed = {VLN_ERR, "RetrieveDownNICPorts failed"}},
    {.place = NIC,
     .create = create_dump_service,
     .clear = clear_dump_service,
     .failed = {VLN_ERR, "MPCA Dump Feature is either Not Supported/Failed to create the feature"},
     .thrown = {VLN_ERR, "Failed to create the MPCA Dump service"}},
    {.place = LOGS, .create = create_record_logs},
    {.place = FCOE,
     .create = start_wwn_service,
     .failed = {VLN_CRIT, "Failed to create WWN Services class"}},
    {.place = FCOE, .create = create_driver_parameter_service},
    {.place = FC_PORT, .create = create_driver_parameters},
    {.place = FC_PORTS, .create = join_driver_parameters},
    {.place = FC_PORTS,
     .create = create_fc_driver_log,
     .before = {VLN_DBG, "Calling DriverLog Creation class for MPCA -- FCoE-FC "},
     .done = {VLN_INFO, "MPCA Driver Log classes are successfully created for FCoE-FC"},
     .failed = {VLN_INFO, "Issue with MPCA Driver Log classes for FCoE-FC"},
     .thrown = {VLN_INFO, "Issue with MPCA Driver Log classes for FCoE-FC"}},
    {.place = FC_PORTS,
     .create = create_fip_classes,
     .clear = clear_fip_classes,
     .done = {VLN_INFO, "FCoE FIP classes are successfully created"},
     .failed = {VLN_INFO, "Issue with FIP classes"},
     .thrown = {VLN_INFO, "Issue with FIP classes"}},
    {.place = FC_PORTS,
     .create = create_fcoe_bridging,
     .before = {VLN_DBG, "calling CreateCeeClasses for FCoE port"}},
    {.place = FC_PORTS,
     .create = create_virtual_ports,
     .clear = ClearPortVirtualizationMaps,
     .done = {VLN_DBG, "Port Virtualization classes are successfully created"},
     .failed = {VLN_ERR, "Port Virtualization classes are not created"},
     .thrown = {VLN_ERR, "Port Virtualization classes are not created"}},
    {.place = FC_PORTS, .create = create_lun_priorities}, // behind virtual ports, which it joins
    {.place = ISCSI_PORT, .create = create_ip_tables},
    {.place = ISCSI_PORTS,
     .create = create_iscsi_bridging,
     .before = {VLN_DBG, "calling CreateCeeClasses for iSCSI port"}},
    {.place = ALL_PORTS,
     .create = createDiagnosticClasses,
     .clear = clear_diagnostic_classes,
     .before = {VLN_DBG, "Create the Diagnostic classes"},
     .thrown = {VLN_DBG, "Dignostic Test creation failed"}},
    {.place = ISCSI_PORTS,
     .create = create_iscsi_driver_log,
     .failed = {VLN_INFO, "Issue with MPCA ISCSI Driver Log classes"},
     .thrown = {VLN_INFO, "Issue with MPCA ISCSI Driver Log classes"}},
    {.place = ISCSI_PORTS,
     .create = create_iscsi_settings,
     .clear = clear_iscsi_settings,
     .failed = {VLN_ERR, "Failed to create the iscsi driver setting data"}},
    {.place = CLOSING,
     .create = create_virtual_functions,
     .clear = clear_virtual_functions,
     .before = {VLN_DBG, "Creating CreateNICSrIovClasses "},
     .failed = {VLN_DBG, "SR-IOV classes are not created"},
     .thrown = {VLN_ERR, "CreateNICSrIovClasses Failed"}},
    {.place = CLOSING,
     .create = create_channel_service,
     .clear = clear_channel_service,
     .before = {VLN_DBG, "Updating MC parameters "},
     .failed = {VLN_ERR, "MC parameters are not updated"},
     .thrown = {VLN_ERR, "CreateChannelMgmtServiceClasses Failed"}},
    // Behind all that makes settings of channels.
    {.place = CLOSING,
     .create = update_vnic_data,
     .before = {VLN_DBG, "Updating VNIC Information in the Ports "},
     .failed = {VLN_DBG, "vNIC Info not updated"},
     .thrown = {VLN_ERR, "UpdateVNICInfo Failed"}},
};

} // namespace

constinit const std::span<const Class_Group> class_groups = GROUPS;

} // namespace cimple
