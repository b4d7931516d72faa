// The words for trace levels and for where a trace goes, and the numbers that the library has for
// them.
#ifndef VLN_SERVICES_DUMP_TRACE_LEVELS_H
#define VLN_SERVICES_DUMP_TRACE_LEVELS_H

#include "cimple/types.h"

#include <optional>

namespace cimple {

// A level that has no word or no number.
inline constexpr uint32 NO_TRACE_LEVEL = 32768;

// The number of the word, in any case; NO_TRACE_LEVEL for none.
uint32 trace_level_number(const char* text);
// The word of the number; of a number without a word, that of NO_TRACE_LEVEL.
const char* trace_level_text(uint32 number);

// The number AX_LOG_MODE_ of "ram", "uart", "nvram" or "tftp", in any case; none for another word.
std::optional<uint32> log_mode_number(const char* text);
// The word, in capitals.
const char* log_mode_text(uint32 mode);

} // namespace cimple

#endif // VLN_SERVICES_DUMP_TRACE_LEVELS_H
