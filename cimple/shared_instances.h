// Instances of a store on their way to a client: counted, not copied.
//
// They are taken under the store's lock and read without it. That is safe because nobody writes a
// shared instance: whoever changes a member of a store gives the store a changed copy (`change`,
// instance_map.h). Builds with CIMPLE_CHECK_LOCKS see to it: they keep a copy of each, and end the
// process when the instance no longer equals it.
#ifndef CIMPLE_SHARED_INSTANCES_H
#define CIMPLE_SHARED_INSTANCES_H

#include "cimple/instance.h"

#include <vector>

namespace cimple {

class Shared_Instances {
public:
    void reserve(std::size_t count) { _instances.reserve(count); }
    void add(const Instance* instance) {
#ifdef CIMPLE_CHECK_LOCKS
        _as_taken.push_back(Ref<Instance>(clone(instance)));
#endif
        _instances.push_back(Ref<const Instance>::share(instance));
    }

    std::size_t size() const noexcept {
        return _instances.size();
    }
    const Instance* operator[](std::size_t index) const noexcept {
        return _instances[index].get();
    }

    // Hands over the count of one that was read.
    const Instance* take(std::size_t index) noexcept {
        check(index);
        return _instances[index].release();
    }

private:
#ifdef CIMPLE_CHECK_LOCKS
    void check(std::size_t index) const noexcept {
        const Instance* instance = _instances[index].get();
        CIMPLE_ASSERT(identical(instance, _as_taken[index].get()) &&
                      "a shared instance is written");
    }
    std::vector<Ref<Instance>> _as_taken;
#else
    void check(std::size_t) const noexcept {}
#endif

    std::vector<Ref<const Instance>> _instances;
};

} // namespace cimple

#endif // CIMPLE_SHARED_INSTANCES_H
