// A counted, copy-on-write text: the value of string properties.
//
// One handle. Copies share the characters and count them atomically, so a String may be copied by
// several threads at once; writing to one object from two threads is the caller's to prevent. Text is
// bytes with a terminating zero, UTF-8 by convention. Allocation failure throws std::bad_alloc.
#ifndef CIMPLE_STRING_H
#define CIMPLE_STRING_H

#include "cimple/types.h"

namespace cimple {

struct String_Rep; // refs, size, capacity, characters

class String {
public:
    static constexpr uint32 npos = 0xFFFFFFFFu; // to the end

    String() noexcept;
    String(const char* text);
    String(const char* text, std::size_t size);
    String(const String& other) noexcept;
    String(String&& other) noexcept;
    ~String();

    String& operator=(const String& other) noexcept;
    String& operator=(String&& other) noexcept;
    String& operator=(const char* text);

    const char* c_str() const noexcept;
    uint32 size() const noexcept;
    uint32 capacity() const noexcept;
    bool empty() const noexcept { return size() == 0; }
    char operator[](uint32 index) const noexcept { return c_str()[index]; }

    void assign(const char* text, std::size_t size);
    void append(const char* text, std::size_t size);
    void append(const char* text);
    void append(const String& text);
    void append(char c) { append(&c, 1); }
    void prepend(const String& text);
    void clear();
    void reserve(uint32 capacity);
    String& operator+=(const String& text);

    // Index of the first match, or -1.
    sint32 find(char c) const noexcept;
    sint32 find(const char* text) const noexcept;
    String substr(uint32 position, uint32 count = npos) const;
    void erase(uint32 position, uint32 count = npos);

    // Exchanges the characters with another text's.
    void swap(String& other) noexcept;

private:
    String_Rep* _rep;
};

// Exact, length first.
bool operator==(const String& a, const String& b) noexcept;
bool operator==(const String& a, const char* b) noexcept;
bool operator<(const String& a, const String& b) noexcept;
String operator+(const String& a, const String& b);

// Without regard to case.
bool equali(const String& a, const String& b) noexcept;
bool equali(const String& a, const char* b) noexcept;

} // namespace cimple

#endif // CIMPLE_STRING_H
