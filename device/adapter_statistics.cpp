#include "device/adapter_statistics.h"

#include "device/adapter.h"

namespace cimple {

AdapterStatistics::AdapterStatistics(Adapter& adapter) {
    adapter.getAdapterNumber();
}

} // namespace cimple
