#include "operations/refusal.h"

#include <cstdarg>
#include <cstdio>

namespace cimple {

Rule_Refusal refusal(uint32 number, const char* format, ...) {
    Rule_Refusal made{number, ""};
    va_list arguments;
    va_start(arguments, format);
    std::vsnprintf(made.line, sizeof made.line, format, arguments);
    va_end(arguments);
    return made;
}

} // namespace cimple
