#include "agent/text.h"

#include "foundation/utf8.h"

#include <cstdarg>
#include <cstdio>
#include <vector>

namespace cimple {

String text(std::string_view bytes) {
    if (is_utf8(bytes))
        return String(bytes.data(), bytes.size());
    const std::string replaced = to_utf8(bytes);
    return String(replaced.data(), replaced.size());
}

String format_text(const char* format, ...) {
    char small[256];
    va_list arguments;
    va_start(arguments, format);
    const int length = std::vsnprintf(small, sizeof small, format, arguments);
    va_end(arguments);
    if (length < 0)
        return {};
    const auto size = static_cast<std::size_t>(length);
    if (size < sizeof small)
        return text({small, size});
    std::vector<char> buffer(size + 1);
    va_start(arguments, format);
    std::vsnprintf(buffer.data(), buffer.size(), format, arguments);
    va_end(arguments);
    return text({buffer.data(), size});
}

} // namespace cimple
