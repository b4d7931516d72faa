#include "device/port_attributes.h"

#include "device/library/attribute_buffer.h"
#include "foundation/common.h"

namespace cimple {

StoragePortAttributes::StoragePortAttributes(const LocalHBAInfoV4& localHBAInfo)
    : PortWWN(VLN_Common::wwnText(localHBAInfo.portWWN)),
      NodeWWN(VLN_Common::wwnText(localHBAInfo.nodeWWN)),
      FabricName(colonText(localHBAInfo.fabricName, sizeof localHBAInfo.fabricName)),
      nFlags(flagsText(localHBAInfo.nFlags)) {}

} // namespace cimple
