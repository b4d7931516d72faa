#include "device/port.h"

#include "cimple/guard.h"
#include "device/scan_end.h"
#include "device/target_mapping.h"
#include "foundation/log.h"

#include <exception>

namespace cimple {

Port::~Port() noexcept(false) {
    VLN_LOG(VLN_DBG, "~Port");
    dropTargets();
}

Target* Port::getTarget(uint32 index) {
    if (index >= targets.size())
        throw std::exception();
    return targets[index].get();
}

void Port::dropTargets() noexcept {
    for (std::unique_ptr<Target>& target : targets) {
        VLN_LOG(VLN_DBG, "Freeing Target: %s", target->portWWN.c_str());
        delete_guarded(target, "Target deletion failed !!!");
    }
    targets.clear();
}

void Port::makeTargets(Adapter& owner, const Target_Mapping& mapping) {
    if (mapping.status() != HBA_STATUS_OK)
        return;
    for (std::size_t unit = 0; unit < mapping.size() && !scan_is_to_end; ++unit) {
        const auto make_target = [&] {
            targets.push_back(std::make_unique<Target>(owner, mapping[unit]));
        };
        if (!run_guarded(make_target))
            VLN_LOG(VLN_ERR, "target creation failed - moving to the next target");
    }
}

void Port::releaseOwned(const Cleanup_Texts& texts) noexcept {
    VLN_LOG(VLN_DBG, "%s", texts.entry);
    delete_guarded(attributes, texts.attributes);
    delete_guarded(statistics, texts.statistics);
}

} // namespace cimple
