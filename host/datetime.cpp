#include "host/datetime.h"

#include <algorithm>
#include <cinttypes>
#include <cstdio>

namespace host {

namespace {

constexpr std::uint64_t SECOND = 1'000'000;
constexpr std::int64_t DAY_SECONDS = 86'400;

// A field of digits, or of asterisks for "not known". Nothing for anything else.
std::optional<unsigned> field(std::string_view text, unsigned unknown) {
    if (std::all_of(text.begin(), text.end(), [](char c) { return c == '*'; }))
        return unknown;
    unsigned value = 0;
    bool seen_asterisk = false;
    for (char c : text) {
        if (c == '*') { // the tail of the microseconds may be unknown
            seen_asterisk = true;
            value *= 10;
        } else if (c >= '0' && c <= '9' && !seen_asterisk) {
            value = value * 10 + static_cast<unsigned>(c - '0');
        } else {
            return std::nullopt;
        }
    }
    return value;
}

bool is_leap(unsigned year) {
    return (year % 4 == 0 && year % 100 != 0) || year % 400 == 0;
}

unsigned month_length(unsigned year, unsigned month) {
    constexpr unsigned lengths[] = {31, 28, 31, 30, 31, 30, 31, 31, 30, 31, 30, 31};
    return month == 2 && is_leap(year) ? 29 : lengths[month - 1];
}

// Days from 1970-01-01 in the Gregorian calendar, which is taken to have always been in use.
std::int64_t days_from_civil(std::int64_t year, unsigned month, unsigned day) {
    year -= month <= 2;
    const std::int64_t era = (year >= 0 ? year : year - 399) / 400;
    const std::int64_t year_of_era = year - era * 400;
    const std::int64_t day_of_year = (153 * ((month + 9) % 12) + 2) / 5 + day - 1;
    return era * 146'097 + year_of_era * 365 + year_of_era / 4 - year_of_era / 100 + day_of_year -
           719'468;
}

struct Civil {
    std::int64_t year;
    unsigned month, day;
};

Civil civil_from_days(std::int64_t days) {
    days += 719'468;
    const std::int64_t era = (days >= 0 ? days : days - 146'096) / 146'097;
    const std::int64_t day_of_era = days - era * 146'097;
    const std::int64_t year_of_era =
        (day_of_era - day_of_era / 1'460 + day_of_era / 36'524 - day_of_era / 146'096) / 365;
    const std::int64_t day_of_year =
        day_of_era - (365 * year_of_era + year_of_era / 4 - year_of_era / 100);
    const std::int64_t shifted = (5 * day_of_year + 2) / 153;
    const auto month = static_cast<unsigned>(shifted < 10 ? shifted + 3 : shifted - 9);
    return {year_of_era + era * 400 + (month <= 2), month,
            static_cast<unsigned>(day_of_year - (153 * shifted + 2) / 5 + 1)};
}

struct Clock {
    unsigned hours, minutes, seconds, microseconds;
};

// "hhmmss.mmmmmm", the middle of both forms.
std::optional<Clock> parse_clock(std::string_view text) {
    const auto hours = field(text.substr(0, 2), 0), minutes = field(text.substr(2, 2), 0);
    const auto seconds = field(text.substr(4, 2), 0), micro = field(text.substr(7, 6), 0);
    if (!hours || !minutes || !seconds || !micro || text[6] != '.' || *hours > 23 ||
        *minutes > 59 || *seconds > 60)
        return std::nullopt;
    return Clock{*hours, *minutes, *seconds, *micro};
}

std::int64_t seconds_of(const Clock& clock) {
    return clock.hours * 3'600 + clock.minutes * 60 + clock.seconds;
}

} // namespace

std::optional<DateTime> parse_datetime(std::string_view text) {
    constexpr std::size_t length = 25, clock_start = 8, sign_at = 21;
    if (text.size() != length)
        return std::nullopt;
    const auto clock = parse_clock(text.substr(clock_start, 13));
    const auto offset = field(text.substr(sign_at + 1), 0);
    if (!clock || !offset)
        return std::nullopt;
    if (text[sign_at] == ':') {
        const auto days = field(text.substr(0, clock_start), 0);
        if (!days || *offset != 0)
            return std::nullopt;
        const auto seconds = static_cast<std::uint64_t>(*days * DAY_SECONDS + seconds_of(*clock));
        return DateTime{true, seconds * SECOND + clock->microseconds};
    }
    if (text[sign_at] != '+' && text[sign_at] != '-')
        return std::nullopt;
    const auto year = field(text.substr(0, 4), 0), month = field(text.substr(4, 2), 1);
    const auto day = field(text.substr(6, 2), 1);
    if (!year || !month || !day || *month < 1 || *month > 12 || *day < 1 ||
        *day > month_length(*year, *month))
        return std::nullopt;
    const std::int64_t east = (text[sign_at] == '-' ? -60 : 60) * static_cast<int>(*offset);
    const std::int64_t seconds =
        days_from_civil(*year, *month, *day) * DAY_SECONDS + seconds_of(*clock) - east;
    if (seconds < 0)
        return DateTime{false, 0};
    return DateTime{false, static_cast<std::uint64_t>(seconds) * SECOND + clock->microseconds};
}

std::string format_datetime(const DateTime& datetime) {
    const auto seconds = static_cast<std::int64_t>(datetime.microseconds / SECOND);
    const std::int64_t days = seconds / DAY_SECONDS;
    const auto rest = static_cast<int>(seconds % DAY_SECONDS);
    const auto micro = static_cast<int>(datetime.microseconds % SECOND);
    char text[64];
    if (datetime.interval) {
        std::snprintf(text, sizeof text, "%08" PRId64 "%02d%02d%02d.%06d:000",
                      std::min<std::int64_t>(days, 99'999'999), rest / 3'600, rest / 60 % 60,
                      rest % 60, micro);
    } else {
        const Civil date = civil_from_days(days);
        std::snprintf(text, sizeof text, "%04" PRId64 "%02u%02u%02d%02d%02d.%06d+000",
                      std::min<std::int64_t>(date.year, 9'999), date.month, date.day, rest / 3'600,
                      rest / 60 % 60, rest % 60, micro);
    }
    return text;
}

} // namespace host
