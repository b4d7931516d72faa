#include "device/port.h"

#include "foundation/log.h"

#include <exception>

namespace cimple {

Port::~Port() noexcept(false) {
    VLN_LOG(VLN_DBG, "~Port");
    for (std::unique_ptr<Target>& target : targets) {
        VLN_LOG(VLN_DBG, "Freeing Target: %s", target->portWWN.c_str());
        delete_guarded(target, "Target deletion failed !!!");
    }
}

Target* Port::getTarget(uint32 index) {
    if (index >= targets.size())
        throw std::exception();
    return targets[index].get();
}

void Port::releaseOwned(const Cleanup_Texts& texts) noexcept {
    VLN_LOG(VLN_DBG, "%s", texts.entry);
    delete_guarded(attributes, texts.attributes);
    delete_guarded(statistics, texts.statistics);
}

} // namespace cimple
