#include "agent/text.h"

#include <cstdarg>
#include <cstdio>
#include <vector>

namespace cimple {

String format_text(const char* format, ...) {
    char text[256];
    va_list arguments;
    va_start(arguments, format);
    const int length = std::vsnprintf(text, sizeof text, format, arguments);
    va_end(arguments);
    if (length < 0)
        return {};
    const auto size = static_cast<std::size_t>(length);
    if (size < sizeof text)
        return String(text, size);
    std::vector<char> buffer(size + 1);
    va_start(arguments, format);
    std::vsnprintf(buffer.data(), buffer.size(), format, arguments);
    va_end(arguments);
    return String(buffer.data(), size);
}

} // namespace cimple
