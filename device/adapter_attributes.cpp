#include "device/adapter_attributes.h"

#include "foundation/common.h"

namespace cimple {

CNAAdapterAttributes::CNAAdapterAttributes(const LocalHBAInfoV4& localHBAInfo) {
    PortWWN = VLN_Common::wwnText(localHBAInfo.portWWN);
    NodeWWN = VLN_Common::wwnText(localHBAInfo.nodeWWN);
}

} // namespace cimple
