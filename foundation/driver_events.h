// The lines that the drivers have written to the host's log.
#ifndef FOUNDATION_DRIVER_EVENTS_H
#define FOUNDATION_DRIVER_EVENTS_H

#include "foundation/device_log.h"

#include <span>

namespace cimple {

// The longest line that is looked at, and shown; of a longer one the rest is passed over.
inline constexpr std::size_t MAX_EVENT_LINE = 65536;
// The text of a driver that is kept, beside the limit that its log has: the newest lines.
inline constexpr std::size_t MAX_EVENT_TEXT = 512 * 1024;

struct Driver_Events {
    const char* key_word; // which all lines of the driver hold somewhere
    DeviceLog* log;
};

// Puts the newest lines of each driver into its log, the newest first, as UTF-8: a byte that is no
// text, and a zero, is shown as U+FFFD. The file is read once for all of them, up to where it
// ended when it was opened, and in memory that does not depend on its size. Nothing is added when
// it cannot be read, or is no file: a folder, a pipe, a device.
void ReadDriverEvents(std::span<const Driver_Events> drivers);

} // namespace cimple

#endif // FOUNDATION_DRIVER_EVENTS_H
