// Stands in for the logger in unit tests below it: keeps the lines in memory.
#ifndef TESTS_DEVICE_LOG_CAPTURE_H
#define TESTS_DEVICE_LOG_CAPTURE_H

#include "foundation/log.h"

#include <string>
#include <vector>

namespace log_capture {

// The lines since the last call as "level:text", and forgets them.
std::vector<std::string> take();

// How many of the lines are this one.
int count(const std::vector<std::string>& lines, const std::string& line);

} // namespace log_capture

#endif // TESTS_DEVICE_LOG_CAPTURE_H
