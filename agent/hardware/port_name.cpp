#include "agent/hardware/port_name.h"

#include "agent/text.h"
#include "foundation/log.h"

namespace cimple {

bool port_name_to_wwn(const String& port_name, HBA_WWN& wwn) {
    char colon_form[VLN_MethodWrapper::HBA_NAME_SIZE];
    // A text shorter than a name must not be read past its end.
    const bool long_enough = port_name.size() >= 16;
    if (!long_enough || VLN_MethodWrapper::Id2HBAName(colon_form, port_name.c_str()) != 0) {
        VLN_LOG(VLN_ERR, "VLNMPCA_Ethernetport::Id2HBAName failed");
        return false;
    }
    if (VLN_MethodWrapper::str2HBAName(&wwn, colon_form) != 0) {
        VLN_LOG(VLN_ERR, "VLNMPCA_Ethernetport::str2HBAName failed");
        return false;
    }
    return true;
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

} // namespace cimple
