// The two forms of a CIM datetime (DSP0004): the 25-character text, and microseconds.
//
// A point in time counts microseconds since 1970-01-01 00:00 UTC, an interval its length.
#ifndef HOST_DATETIME_H
#define HOST_DATETIME_H

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace host {

struct DateTime {
    bool interval = false;
    std::uint64_t microseconds = 0;
};

// Nothing for a text that is not a datetime. A point in time before 1970 answers 0 microseconds.
// Fields written as asterisks count as their least value.
std::optional<DateTime> parse_datetime(std::string_view text);
// A point in time is written in UTC.
std::string format_datetime(const DateTime& datetime);

} // namespace host

#endif // HOST_DATETIME_H
