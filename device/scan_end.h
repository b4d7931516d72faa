// Whether scans are to end early: somebody waits for the thread that scans. What was found so far
// stays, and is known to be a part only.
#ifndef DEVICE_SCAN_END_H
#define DEVICE_SCAN_END_H

#include <atomic>

namespace cimple {

inline constinit std::atomic<bool> scan_is_to_end{false};

} // namespace cimple

#endif // DEVICE_SCAN_END_H
