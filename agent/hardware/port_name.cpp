#include "agent/hardware/port_name.h"

#include "agent/text.h"
#include "foundation/log.h"

namespace cimple {

bool port_name_to_wwn(const String& port_name, HBA_WWN& wwn) {
    return nameOfDeviceId(port_name.c_str(), wwn, "VLNMPCA_Ethernetport::", VLN_ERR);
}

String asic_name(const AdapterAttributes& adapter) {
    if (adapter.Subadapter_number.empty())
        return text(adapter.SerialNumber);
    return text(adapter.SerialNumber + ":" + adapter.Subadapter_number);
}

String physical_port_name(const AdapterAttributes& adapter) {
    return format_text("%s:%d", adapter.SerialNumber.c_str(), static_cast<int>(adapter.PortNumber));
}

String tcp_endpoint_name(const String& port_name) {
    return format_text("VLN:TCP Endpoint:%s:%d", port_name.c_str(),
                       static_cast<int>(ISCSI_TCP_PORT));
}

String fc_statistics_name(const String& port_name) {
    return format_text("VLNMPCA :FC Statistics:%s", port_name.c_str());
}

} // namespace cimple
