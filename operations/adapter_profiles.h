// The profiles of an adapter, for the operations that look into them.
#ifndef OPERATIONS_ADAPTER_PROFILES_H
#define OPERATIONS_ADAPTER_PROFILES_H

#include "operations/operation_frame.h"

#include <span>

namespace cimple {

inline constexpr uint32 FEATURE_SRIOV_OF_SYSTEM = 35;
inline constexpr uint32 FEATURE_PROFILE_MANAGEMENT = VLN_MethodWrapper::HAS_PROFILES;

// The value of a feature that makes a difference whatever it is; the line of a query that fails.
inline AX_STATUS askFeature(const HBA_WWN* name, uint32 feature, const char* unknown, bool* value) {
    uint32 number = 0;
    const AX_STATUS status = AX_GetHBAFeature(wwnOf(name), feature, &number);
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "%s", unknown);
    *value = number != 0;
    return status;
}

// A list as the library gives it.
class Adapter_Profiles {
public:
    // A failure is logged.
    AX_STATUS read(const HBA_WWN* name) {
        const Reply_Shape shape{
            .head = sizeof(AX_ProfileList), .entry = sizeof(AX_Profile), .first = AX_PROFILES};
        const AX_STATUS status =
            m_reply.fetch(shape, {"Unable to allocate the memory for the list of profiles"},
                          counted<AX_ProfileList>([name](AX_ProfileList* list) {
                              return AX_ListProfiles(wwnOf(name), list);
                          }));
        if (status != AX_STATUS_OK)
            VLN_OPERATION_FAILED(status, "AX_ListProfiles error: %d", status);
        return status;
    }

    const AX_ProfileList& list() const {
        return *static_cast<const AX_ProfileList*>(m_reply.data());
    }
    std::span<const AX_Profile> profiles() const { return {list().profile, m_reply.count()}; }
    AX_ProfileList* release() { return static_cast<AX_ProfileList*>(m_reply.release()); }

private:
    Reply m_reply;
};

} // namespace cimple

#endif // OPERATIONS_ADAPTER_PROFILES_H
