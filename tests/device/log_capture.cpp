#include "tests/device/log_capture.h"

#include <algorithm>
#include <cstdarg>
#include <cstdio>
#include <mutex>
#include <utility>

namespace {

std::mutex g_mutex;
std::vector<std::string> g_lines;

} // namespace

namespace cimple {

std::atomic<uint32> log_interest{0xFFFFFFFFU};

void log_line(sint32 level, const char*, uint32, const char* format, ...) noexcept {
    char text[1024];
    va_list arguments;
    va_start(arguments, format);
    std::vsnprintf(text, sizeof text, format, arguments);
    va_end(arguments);
    std::lock_guard lock(g_mutex);
    g_lines.push_back(std::to_string(level) + ":" + text);
}

} // namespace cimple

namespace log_capture {

std::vector<std::string> take() {
    std::lock_guard lock(g_mutex);
    return std::exchange(g_lines, {});
}

int count(const std::vector<std::string>& lines, const std::string& line) {
    return static_cast<int>(std::count(lines.begin(), lines.end(), line));
}

} // namespace log_capture
