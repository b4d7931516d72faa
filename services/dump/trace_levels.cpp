#include "services/dump/trace_levels.h"

#include "cimple/meta.h"
#include "device/library/axapi.h"

namespace cimple {

namespace {

// The first has the number 1.
constexpr const char* LEVELS[] = {"disable", "all",     "enterfunction", "verbose", "info",  "test",
                                  "show",    "warning", "error",         "fatal",   "always"};
constexpr uint32 NUM_LEVELS = sizeof LEVELS / sizeof *LEVELS;

constexpr const char* MODES[] = {"RAM", "UART", "NVRAM", "TFTP"}; // by AX_LOG_MODE_
static_assert(sizeof MODES / sizeof *MODES == AX_LOG_MODES);

} // namespace

uint32 trace_level_number(const char* text) {
    for (uint32 i = 0; i < NUM_LEVELS; ++i)
        if (name_equal(text, LEVELS[i]))
            return i + 1;
    return NO_TRACE_LEVEL;
}

const char* trace_level_text(uint32 number) {
    return number >= 1 && number <= NUM_LEVELS ? LEVELS[number - 1] : "32768";
}

std::optional<uint32> log_mode_number(const char* text) {
    for (uint32 mode = 0; mode < AX_LOG_MODES; ++mode)
        if (name_equal(text, MODES[mode]))
            return mode;
    return std::nullopt;
}

const char* log_mode_text(uint32 mode) {
    return MODES[mode];
}

} // namespace cimple
