// Deleting the objects of the device model.
//
// The destructors of the model may throw: an object that fails to go away is logged and passed
// over, and nothing leaks out of its owner's destructor. Owned pointers are therefore released to
// the functions here and never left to the destructor of their smart pointer.
#ifndef DEVICE_CLEANUP_H
#define DEVICE_CLEANUP_H

#include "cimple/guard.h"
#include "foundation/log.h"

#include <memory>

namespace cimple {

// What a class says while it is destroyed: first its own name, then each failure.
struct Cleanup_Texts {
    const char* entry;
    const char* attributes;
    const char* statistics;
    const char* ports; // adapters only
};

// Deletes the object. False, after a line at level 3, if that failed.
template <class T>
bool delete_guarded(std::unique_ptr<T>& owned, const char* failure) noexcept {
    const bool complete = run_guarded([&] { delete owned.release(); });
    if (!complete)
        VLN_LOG(VLN_ERR, "%s", failure);
    return complete;
}

} // namespace cimple

#endif // DEVICE_CLEANUP_H
