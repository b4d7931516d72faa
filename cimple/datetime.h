// CIM datetime values: a point in time or an interval, in microseconds.
//
// Copy on write, one handle. The text forms are those of the CIM Infrastructure: 25 characters, a
// timestamp with an offset in minutes or an interval that ends in ":000".
#ifndef CIMPLE_DATETIME_H
#define CIMPLE_DATETIME_H

#include "cimple/string.h"

namespace cimple {

struct Datetime_Rep; // refs, usec, utc, is_timestamp

class Datetime {
public:
    static constexpr uint64 SECOND = 1000000;
    static constexpr uint64 MINUTE = 60 * SECOND;
    static constexpr uint64 HOUR = 60 * MINUTE;
    static constexpr uint64 DAY = 24 * HOUR;

    Datetime(); // the all-zero interval
    explicit Datetime(uint64 usec, sint32 utc, bool is_timestamp);
    Datetime(const Datetime& other) noexcept;
    Datetime(Datetime&& other) noexcept;
    ~Datetime();
    Datetime& operator=(const Datetime& other) noexcept;
    Datetime& operator=(Datetime&& other) noexcept;

    uint64 usec() const noexcept; // microseconds: since the epoch for a timestamp
    sint32 utc() const noexcept;  // offset in minutes east
    bool is_timestamp() const noexcept;
    void usec(uint64 value);
    void utc(sint32 minutes);
    void set_timestamp(bool value);

    // Accepts exactly the 25-character forms; anything else answers false and changes nothing.
    bool set(const char* text);
    void clear(); // the all-zero interval

    String ascii() const;    // compact CIM form, 25 characters
    String readable() const; // "yyyy/mm/dd hh:mm:ss.uuuuuu+ooo" or "dddddddd hh:mm:ss.uuuuuu:000"

    // The present, by Time's clock; a failing clock gives the all-zero interval.
    static Datetime now();

private:
    Datetime_Rep* _rep;
};

bool operator==(const Datetime& a, const Datetime& b) noexcept;

} // namespace cimple

#endif // CIMPLE_DATETIME_H
