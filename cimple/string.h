// A counted, copy-on-write text: the value of string properties.
//
// One handle. Copies share the characters and count them atomically, so a String may be copied by
// several threads at once; writing to one object from two threads is the caller's to prevent. Text
// is bytes with a terminating zero, UTF-8 by convention. Allocation failure throws std::bad_alloc,
// and so does a text of 2 GB or more: indexes are sint32. A null char pointer is the empty text
// everywhere.
#ifndef CIMPLE_STRING_H
#define CIMPLE_STRING_H

#include "cimple/types.h"

namespace cimple {

struct String_Rep {
    Atomic refs;
    uint32 size;
    uint32 capacity; // characters, without the terminating zero
    char text[4];    // the block is capacity + 16 bytes
};

// The one empty text. Its count is never changed, which keeps default construction free of any
// write to shared memory.
extern const String_Rep empty_string_rep;

class String {
public:
    static constexpr uint32 npos = 0xFFFFFFFFu; // to the end

    String() noexcept : _rep(const_cast<String_Rep*>(&empty_string_rep)) {}
    String(const char* text);
    String(const char* text, std::size_t size);
    String(const String& other) noexcept : _rep(other._rep) { retain(); }
    String(String&& other) noexcept : String() { swap(other); }
    ~String() { release(); }

    String& operator=(const String& other) noexcept {
        String(other).swap(*this);
        return *this;
    }
    String& operator=(String&& other) noexcept {
        String(static_cast<String&&>(other)).swap(*this);
        return *this;
    }
    String& operator=(const char* text);

    const char* c_str() const noexcept { return _rep->text; }
    uint32 size() const noexcept { return _rep->size; }
    uint32 capacity() const noexcept { return _rep->capacity; }
    bool empty() const noexcept { return size() == 0; }
    char operator[](uint32 index) const noexcept { return c_str()[index]; }

    void assign(const char* text, std::size_t size);
    void append(const char* text, std::size_t size);
    void append(const char* text);
    void append(const String& text);
    void append(char c) { append(&c, 1); }
    void prepend(const String& text);
    void clear() noexcept { String().swap(*this); }
    String& operator+=(const String& text);

    // Index of the first match, or -1.
    sint32 find(char c) const noexcept;
    sint32 find(const char* text) const noexcept;
    // A position behind the end selects nothing.
    String substr(uint32 position, uint32 count = npos) const;
    void erase(uint32 position, uint32 count = npos);

    // Exchanges the characters with another text's.
    void swap(String& other) noexcept {
        String_Rep* mine = _rep;
        _rep = other._rep;
        other._rep = mine;
    }

private:
    explicit String(String_Rep* rep) noexcept : _rep(rep) {}
    void retain() noexcept {
        if (_rep != &empty_string_rep)
            _rep->refs.fetch_add(1, std::memory_order_relaxed);
    }
    void release() noexcept;
    bool writable(std::size_t capacity) const noexcept;

    String_Rep* _rep;
};

// Exact, length first.
bool operator==(const String& a, const String& b) noexcept;
bool operator==(const String& a, const char* b) noexcept;
String operator+(const String& a, const String& b);

// Without regard to case.
bool equali(const String& a, const String& b) noexcept;
bool equali(const String& a, const char* b) noexcept;

} // namespace cimple

#endif // CIMPLE_STRING_H
