#include "services/dump/down_ports.h"

#include "agent/associations.h"
#include "agent/hardware/port_identity.h"
#include "agent/provider_agent.h"
#include "agent/text.h"
#include "classes/VLNMPCA_DownEthernetPort.h"

#include <cinttypes>

namespace cimple {

namespace {

constexpr char IDENTITY_MODEL[] = "ModelNumber";

// The form that device identifiers have: 16 digits.
String device_id(const AX_DeadNicPort& port) {
    const HBA_WWN name = nameOfDeadPort(port);
    uint64 number = 0;
    for (const uint8 byte : name.wwn)
        number = number << 8 | byte;
    return format_text("%016" PRIX64, number);
}

Ref<VLNMPCA_DownEthernetPort> down_port_instance(const AX_DeadNicPort& record,
                                                 const CIM_ComputerSystem& system) {
    auto port = make_instance<VLNMPCA_DownEthernetPort>();
    name_in_system(*port, system);
    port->DeviceID.set(device_id(record));
    append_port_identity(*port, IDENTITY_SERIAL, field_text(record.serialNumber));
    append_port_identity(*port, IDENTITY_MODEL, field_text(record.model));
    return port;
}

} // namespace

uint32 retrieve_down_ports(const Map_Scope& scope) {
    ProviderAgent& agent = scope.agent;
    if (!agent.m_bFirstAdapterPass && agent.m_VLNMPCA_EthernetPort_map.size() == 0)
        return MAP_OK;
    std::vector<AX_DeadNicPort> records;
    if (VLN_MethodWrapper::GetDeadNICPorts(&records) != AX_STATUS_OK) {
        agent.m_bFirstAdapterPass = false;
        return SKIP_DEVICE;
    }
    for (const AX_DeadNicPort& record : records)
        if (const auto* port = insert_instance(agent.m_VLNMPCA_DownEthernetPort_map,
                                               down_port_instance(record, *scope.system)))
            VLN_LOG(VLN_DBG, "Created DownEthernetPort. Buffer: %s", port->DeviceID.value.c_str());
    return MAP_OK;
}

} // namespace cimple
