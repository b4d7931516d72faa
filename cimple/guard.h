// The last resort at the boundary to C: no exception may cross it, since it would end a process
// that is not ours.
#ifndef CIMPLE_GUARD_H
#define CIMPLE_GUARD_H

#include <cxxabi.h>

namespace cimple {

// Runs the body; false if an exception ended it. Thread::exit and cancellation unwind the stack
// like an exception, and go on through it: whoever swallowed them would end the process. So nothing
// between here and a wait may be noexcept, and no catch (...) stands there that does not throw on.
// (The run-time library gives a null reference then, which is none of a sanitizer's business.)
template <class Body>
__attribute__((no_sanitize("undefined"))) bool run_guarded(Body&& body) {
    try {
        body();
        return true;
    } catch (abi::__forced_unwind&) {
        throw;
    } catch (...) {
        return false;
    }
}

} // namespace cimple

#endif // CIMPLE_GUARD_H
