// Statistics of an adapter. The libraries count by port, so these hold nothing; they stand for the
// adapter's side of the four kinds.
#ifndef DEVICE_ADAPTER_STATISTICS_H
#define DEVICE_ADAPTER_STATISTICS_H

#include "cimple/types.h"

namespace cimple {

class Adapter;

class AdapterStatistics {
public:
    virtual ~AdapterStatistics() noexcept(false) = default;

protected:
    explicit AdapterStatistics(Adapter& adapter);
};

class FCAdapterStatistics : public AdapterStatistics {
public:
    explicit FCAdapterStatistics(Adapter& adapter) : AdapterStatistics(adapter) {}
};

class NICAdapterStatistics : public AdapterStatistics {
public:
    explicit NICAdapterStatistics(Adapter& adapter) : AdapterStatistics(adapter) {}
};

class iSCSIAdapterStatistics : public AdapterStatistics {
public:
    explicit iSCSIAdapterStatistics(Adapter& adapter) : AdapterStatistics(adapter) {}
};

class FCoEAdapterStatistics : public AdapterStatistics {
public:
    explicit FCoEAdapterStatistics(Adapter& adapter) : AdapterStatistics(adapter) {}
};

} // namespace cimple

#endif // DEVICE_ADAPTER_STATISTICS_H
