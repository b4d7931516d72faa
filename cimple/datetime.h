// CIM datetime values: a point in time or an interval, in microseconds.
//
// Copy on write, one handle; copies may be made by several threads at once. The text forms are
// those of the CIM Infrastructure (DSP0004): 25 characters, a timestamp with an offset in minutes
// or an interval that ends in ":000". The fields of a timestamp are the host's local time, whatever
// its offset says. Allocation failure throws std::bad_alloc.
#ifndef CIMPLE_DATETIME_H
#define CIMPLE_DATETIME_H

#include "cimple/string.h"

namespace cimple {

struct Datetime_Rep {
    Atomic refs;
    uint64 usec;
    sint32 utc;
    uint32 is_timestamp;
};

// The one all-zero interval; its count is never changed.
extern const Datetime_Rep zero_datetime_rep;

class Datetime {
public:
    static constexpr uint64 SECOND = 1000000;
    static constexpr uint64 MINUTE = 60 * SECOND;
    static constexpr uint64 HOUR = 60 * MINUTE;
    static constexpr uint64 DAY = 24 * HOUR;

    Datetime() noexcept : _rep(const_cast<Datetime_Rep*>(&zero_datetime_rep)) {} // all zero
    explicit Datetime(uint64 usec, sint32 utc, bool is_timestamp);
    Datetime(const Datetime& other) noexcept : _rep(other._rep) { retain(); }
    Datetime(Datetime&& other) noexcept : Datetime() { swap(other); }
    ~Datetime() { release(); }
    Datetime& operator=(const Datetime& other) noexcept {
        Datetime(other).swap(*this);
        return *this;
    }
    Datetime& operator=(Datetime&& other) noexcept {
        Datetime(static_cast<Datetime&&>(other)).swap(*this);
        return *this;
    }

    uint64 usec() const noexcept { return _rep->usec; } // a timestamp's: since the epoch
    sint32 utc() const noexcept { return _rep->utc; }   // offset in minutes east
    bool is_timestamp() const noexcept { return _rep->is_timestamp != 0; }
    void usec(uint64 value);
    void utc(sint32 minutes);
    void set_timestamp(bool value);

    // Accepts exactly the 25-character forms, with no hour, minute or second beyond its end, month
    // or day 0, or year beyond 9999; anything else answers false and changes nothing. What ascii
    // makes of an accepted text reads as the same value.
    bool set(const char* text);
    void clear() noexcept { Datetime().swap(*this); } // the all-zero interval

    String ascii() const;    // compact CIM form, 25 characters
    String readable() const; // "yyyy/mm/dd hh:mm:ss.uuuuuu+ooo" or "dddddddd hh mm ss.uuuuuu:000"

    // The present, by Time's clock; a failing clock gives the all-zero interval.
    static Datetime now();

    void swap(Datetime& other) noexcept {
        Datetime_Rep* mine = _rep;
        _rep = other._rep;
        other._rep = mine;
    }

private:
    void retain() noexcept {
        if (_rep != &zero_datetime_rep)
            _rep->refs.fetch_add(1, std::memory_order_relaxed);
    }
    void release() noexcept;
    Datetime_Rep& writable();

    Datetime_Rep* _rep;
};

bool operator==(const Datetime& a, const Datetime& b) noexcept;

} // namespace cimple

#endif // CIMPLE_DATETIME_H
