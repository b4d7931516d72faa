#include "cimple/datetime.h"

#include "cimple/thread.h"

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <ctime>
#include <string_view>

namespace cimple {

namespace {

// The forms are "yyyymmddhhmmss.mmmmmmsutc" and "ddddddddhhmmss.mmmmmm:000".
constexpr std::size_t TEXT_SIZE = 25;
constexpr std::size_t POINT = 14;
constexpr std::size_t SIGN = 21;
constexpr int LAST_YEAR = 9999;

// Decimal digits only; false leaves value alone.
bool read_digits(std::string_view digits, uint32& value) {
    uint32 sum = 0;
    for (const char c : digits) {
        if (c < '0' || c > '9')
            return false;
        sum = sum * 10 + static_cast<uint32>(c - '0');
    }
    value = sum;
    return true;
}

bool is_time_of_day(uint32 hours, uint32 minutes, uint32 seconds) {
    return hours < 24 && minutes < 60 && seconds < 60;
}

bool parse_interval(std::string_view text, Datetime& out) {
    uint32 days, hours, minutes, seconds, usec;
    if (text.substr(SIGN + 1) != "000" || !read_digits(text.substr(0, 8), days) ||
        !read_digits(text.substr(8, 2), hours) || !read_digits(text.substr(10, 2), minutes) ||
        !read_digits(text.substr(12, 2), seconds) || !read_digits(text.substr(15, 6), usec) ||
        !is_time_of_day(hours, minutes, seconds))
        return false;
    out = Datetime(days * Datetime::DAY + hours * Datetime::HOUR + minutes * Datetime::MINUTE +
                       seconds * Datetime::SECOND + usec,
                   0, false);
    return true;
}

bool parse_timestamp(std::string_view text, Datetime& out) {
    uint32 year, month, day, hour, minute, second, usec, utc;
    if (!read_digits(text.substr(0, 4), year) || !read_digits(text.substr(4, 2), month) ||
        !read_digits(text.substr(6, 2), day) || !read_digits(text.substr(8, 2), hour) ||
        !read_digits(text.substr(10, 2), minute) || !read_digits(text.substr(12, 2), second) ||
        !read_digits(text.substr(15, 6), usec) || !read_digits(text.substr(22, 3), utc) ||
        month == 0 || day == 0 || !is_time_of_day(hour, minute, second))
        return false;

    std::tm fields{};
    fields.tm_year = static_cast<int>(year) - 1900;
    fields.tm_mon = static_cast<int>(month) - 1;
    fields.tm_mday = static_cast<int>(day);
    fields.tm_hour = static_cast<int>(hour);
    fields.tm_min = static_cast<int>(minute);
    fields.tm_sec = static_cast<int>(second);
    fields.tm_isdst = -1;
    fields.tm_wday = -1; // mktime sets it when it succeeds, also for the second before the epoch
    const std::time_t seconds = std::mktime(&fields);
    // A month or day beyond its end is carried over, but not into years that the form cannot tell.
    if (fields.tm_wday == -1 || fields.tm_year > LAST_YEAR - 1900)
        return false;

    const sint32 offset = static_cast<sint32>(utc);
    out = Datetime(static_cast<uint64>(seconds) * Datetime::SECOND + usec,
                   text[SIGN] == '-' ? -offset : offset, true);
    return true;
}

String print_timestamp(const Datetime& value, bool readable) {
    // A time before the epoch is a negative number in the unsigned field.
    const auto total = static_cast<sint64>(value.usec());
    const auto second = static_cast<sint64>(Datetime::SECOND);
    sint64 fraction = total % second;
    auto time = static_cast<std::time_t>(total / second);
    if (fraction < 0) {
        fraction += second;
        --time;
    }
    std::tm tm{};
    if (!localtime_r(&time, &tm))
        tm = std::tm{};

    const int year = tm.tm_year + 1900;
    const int usec = static_cast<int>(fraction);
    const char sign = value.utc() >= 0 ? '+' : '-';
    const long long offset = std::llabs(value.utc()); // also the smallest sint32 has one
    char text[96];
    if (readable)
        std::snprintf(text, sizeof text, "%04d/%02d/%02d %02d:%02d:%02d.%06d%c%03lld", year,
                      tm.tm_mon + 1, tm.tm_mday, tm.tm_hour, tm.tm_min, tm.tm_sec, usec, sign,
                      offset);
    else
        std::snprintf(text, sizeof text, "%04d%02d%02d%02d%02d%02d.%06d%c%03lld", year,
                      tm.tm_mon + 1, tm.tm_mday, tm.tm_hour, tm.tm_min, tm.tm_sec, usec, sign,
                      offset);
    return String(text);
}

String print_interval(const Datetime& value, bool readable) {
    const uint64 total = value.usec();
    const auto days = static_cast<uint32>(total / Datetime::DAY);
    const auto hours = static_cast<uint32>(total % Datetime::DAY / Datetime::HOUR);
    const auto minutes = static_cast<uint32>(total % Datetime::HOUR / Datetime::MINUTE);
    const auto seconds = static_cast<uint32>(total % Datetime::MINUTE / Datetime::SECOND);
    const auto usec = static_cast<uint32>(total % Datetime::SECOND);
    char text[64];
    if (readable)
        std::snprintf(text, sizeof text, "%08u %02u %02u %02u.%06u:000", days, hours, minutes,
                      seconds, usec);
    else
        std::snprintf(text, sizeof text, "%08u%02u%02u%02u.%06u:000", days, hours, minutes, seconds,
                      usec);
    return String(text);
}

// Minutes east of the host's zone at that time. The C library's clock call reports no zone any
// more, so the zone's own rules are asked.
sint32 minutes_east(uint64 usec) {
    const auto time = static_cast<std::time_t>(usec / Datetime::SECOND);
    std::tm tm{};
    return localtime_r(&time, &tm) ? static_cast<sint32>(tm.tm_gmtoff / 60) : 0;
}

} // namespace

constinit const Datetime_Rep zero_datetime_rep{{2}, 0, 0, 0};

Datetime::Datetime(uint64 usec, sint32 utc, bool is_timestamp)
    : _rep(new Datetime_Rep{{1}, usec, utc, is_timestamp ? 1u : 0u}) {}

void Datetime::release() noexcept {
    if (_rep != &zero_datetime_rep && _rep->refs.fetch_sub(1, std::memory_order_acq_rel) == 1)
        delete _rep;
}

Datetime_Rep& Datetime::writable() {
    if (_rep->refs.load(std::memory_order_acquire) != 1)
        Datetime(usec(), utc(), is_timestamp()).swap(*this);
    return *_rep;
}

void Datetime::usec(uint64 value) {
    writable().usec = value;
}

void Datetime::utc(sint32 minutes) {
    writable().utc = minutes;
}

void Datetime::set_timestamp(bool value) {
    writable().is_timestamp = value ? 1 : 0;
}

bool Datetime::set(const char* text) {
    if (!text || strnlen(text, TEXT_SIZE + 1) != TEXT_SIZE || text[POINT] != '.')
        return false;
    const std::string_view view(text, TEXT_SIZE);
    switch (view[SIGN]) {
    case ':':
        return parse_interval(view, *this);
    case '+':
    case '-':
        return parse_timestamp(view, *this);
    default:
        return false;
    }
}

String Datetime::ascii() const {
    return is_timestamp() ? print_timestamp(*this, false) : print_interval(*this, false);
}

String Datetime::readable() const {
    return is_timestamp() ? print_timestamp(*this, true) : print_interval(*this, true);
}

Datetime Datetime::now() {
    const uint64 usec = Time::now();
    return usec == 0 ? Datetime() : Datetime(usec, minutes_east(usec), true);
}

bool operator==(const Datetime& a, const Datetime& b) noexcept {
    return a.usec() == b.usec() && a.utc() == b.utc() && a.is_timestamp() == b.is_timestamp();
}

} // namespace cimple
