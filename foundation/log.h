// The one log call of the provider.
//
// VLN_LOG(level, format, ...) hands a line to every sink that is interested (logger.h). It never
// throws, and when no sink would write the line it costs one load: the arguments are not evaluated,
// so they must be free of side effects.
#ifndef FOUNDATION_LOG_H
#define FOUNDATION_LOG_H

#include "cimple/types.h"

namespace cimple {

enum VLN_LogLevel : sint32 {
    VLN_INVALID = 0, // not for callers
    VLN_CRIT = 1,
    VLN_WARN = 2,
    VLN_ERR = 3,
    VLN_INFO = 4,
    VLN_DBG = 5, // by far the most common
};

// Bit n: a sink would write a line of level n. CLogger keeps it current.
extern std::atomic<uint32> log_interest;

inline bool log_wanted(sint32 level) noexcept {
    return (log_interest.load(std::memory_order_relaxed) >> (static_cast<uint32>(level) & 31U)) &
           1U;
}

// Formats and passes the line to the sinks. `file` is a name without directory.
__attribute__((format(printf, 4, 5))) void log_line(sint32 level, const char* file, uint32 line,
                                                    const char* format, ...) noexcept;

} // namespace cimple

#define VLN_LOG(level, ...)                                                                        \
    (::cimple::log_wanted(level)                                                                   \
         ? ::cimple::log_line((level), __FILE_NAME__, __LINE__, __VA_ARGS__)                       \
         : static_cast<void>(0))

#endif // FOUNDATION_LOG_H
