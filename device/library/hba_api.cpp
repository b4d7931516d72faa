#include "device/library/hba_api.h"

#include "foundation/log.h"

#include <exception>

namespace cimple {

namespace {

template <class Record, class Call>
HBA_STATUS read_fresh(HBA_HANDLE handle, Record& record, Call call) {
    record = {};
    HBA_STATUS status = call(record);
    if (status == HBA_STATUS_ERROR_STALE_DATA) {
        HBA_RefreshInformation(handle);
        record = {};
        status = call(record);
    }
    return status;
}

} // namespace

HBA_STATUS readHbaAdapterName(uint32 index, HBA_Name_Buffer& name) {
    const HBA_STATUS status = HBA_GetAdapterName(index, name.text);
    name.text[sizeof name.text - 1] = '\0';
    return status;
}

HBA_HANDLE openHbaAdapter(const std::string& name) {
    std::string writable(name);
    return HBA_OpenAdapter(writable.data());
}

uint32 boundedHbaCount(uint32 count, const char* what) {
    constexpr uint32 MOST = 1024;
    if (count <= MOST)
        return count;
    VLN_LOG(VLN_ERR, "ERROR: HBA API reports %u %s, taking %u", count, what, MOST);
    return MOST;
}

HBA_Adapter::HBA_Adapter(const std::string& name) : m_handle(openHbaAdapter(name)) {
    if (m_handle == HBA_HANDLE_INVALID) {
        VLN_LOG(VLN_ERR, "HBA_OpenAdapter failed, skipping Adapter %s", name.c_str());
        throw std::exception();
    }
}

HBA_Adapter::~HBA_Adapter() {
    HBA_CloseAdapter(m_handle);
}

HBA_STATUS HBA_Adapter::getAttributes(HBA_ADAPTERATTRIBUTES& attributes) {
    return read_fresh(m_handle, attributes, [this](HBA_ADAPTERATTRIBUTES& record) {
        return HBA_GetAdapterAttributes(m_handle, &record);
    });
}

HBA_STATUS HBA_Adapter::getPortAttributes(uint32 portIndex, HBA_PORTATTRIBUTES& attributes) {
    return read_fresh(m_handle, attributes, [this, portIndex](HBA_PORTATTRIBUTES& record) {
        return HBA_GetAdapterPortAttributes(m_handle, portIndex, &record);
    });
}

} // namespace cimple
