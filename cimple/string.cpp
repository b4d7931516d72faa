#include "cimple/string.h"

#include "cimple/fold.h"
#include "cimple/meta.h"

#include <bit>
#include <cstdlib>
#include <cstring>
#include <new>

namespace cimple {

namespace {

constexpr std::size_t SMALLEST_CAPACITY = 32;
constexpr std::size_t LARGEST_SIZE = 0x7FFFFFFF;
constexpr std::size_t BLOCK_OVERHEAD = 16; // the head and the terminating zero
static_assert(sizeof(String_Rep) == BLOCK_OVERHEAD);

std::size_t checked_sum(std::size_t a, std::size_t b) {
    if (a > LARGEST_SIZE || b > LARGEST_SIZE - a)
        throw std::bad_alloc();
    return a + b;
}

std::size_t text_length(const char* text) {
    return text ? std::strlen(text) : 0;
}

// An unshared block for at least size characters, empty so far.
String_Rep* allocate(std::size_t size) {
    if (size > LARGEST_SIZE)
        throw std::bad_alloc();
    const std::size_t capacity = size < SMALLEST_CAPACITY ? SMALLEST_CAPACITY : std::bit_ceil(size);
    void* block = std::malloc(capacity + BLOCK_OVERHEAD);
    if (!block)
        throw std::bad_alloc();
    auto* rep = static_cast<String_Rep*>(block);
    new (&rep->refs) Atomic(1);
    rep->size = 0;
    rep->capacity = static_cast<uint32>(capacity);
    rep->text[0] = '\0';
    return rep;
}

void add(String_Rep* rep, const char* text, std::size_t size) {
    char* end = static_cast<char*>(rep->text) + rep->size;
    if (size)
        std::memmove(end, text, size);
    end[size] = '\0';
    rep->size += static_cast<uint32>(size);
}

} // namespace

// The count of 2 tells every writer that the block is shared.
constinit const String_Rep empty_string_rep{{2}, 0, SMALLEST_CAPACITY, {}};

String::String(const char* text) : String(text, text_length(text)) {}

String::String(const char* text, std::size_t size) : String() {
    if (text && size) {
        _rep = allocate(size);
        add(_rep, text, size);
    }
}

String& String::operator=(const char* text) {
    assign(text, text_length(text));
    return *this;
}

void String::release() noexcept {
    if (_rep == &empty_string_rep)
        return;
    // The last owner needs no locked decrement: nobody else has a handle to count up from.
    if (_rep->refs.load(std::memory_order_acquire) == 1 ||
        _rep->refs.fetch_sub(1, std::memory_order_acq_rel) == 1)
        std::free(_rep);
}

bool String::writable(std::size_t capacity) const noexcept {
    return _rep->refs.load(std::memory_order_acquire) == 1 && capacity <= _rep->capacity;
}

// The text may lie within this string: a new block is filled before the old one is let go.
void String::assign(const char* text, std::size_t size) {
    if (!text || size == 0) {
        clear();
    } else if (writable(size)) {
        std::memmove(_rep->text, text, size);
        static_cast<char*>(_rep->text)[size] = '\0';
        _rep->size = static_cast<uint32>(size);
    } else {
        String(text, size).swap(*this);
    }
}

void String::append(const char* text, std::size_t size) {
    if (!text || size == 0)
        return;
    const std::size_t sum = checked_sum(this->size(), size);
    if (writable(sum)) {
        add(_rep, text, size);
        return;
    }
    String grown(allocate(sum));
    add(grown._rep, c_str(), this->size());
    add(grown._rep, text, size);
    swap(grown);
}

void String::append(const char* text) {
    append(text, text_length(text));
}

void String::append(const String& text) {
    if (empty())
        *this = text;
    else
        append(text.c_str(), text.size());
}

void String::prepend(const String& text) {
    String sum(text);
    sum.append(*this);
    swap(sum);
}

String& String::operator+=(const String& text) {
    append(text);
    return *this;
}

sint32 String::find(char c) const noexcept {
    const void* match = empty() ? nullptr : std::memchr(c_str(), c, size());
    return match ? static_cast<sint32>(static_cast<const char*>(match) - c_str()) : -1;
}

sint32 String::find(const char* text) const noexcept {
    const char* match = text ? std::strstr(c_str(), text) : nullptr;
    return match ? static_cast<sint32>(match - c_str()) : -1;
}

String String::substr(uint32 position, uint32 count) const {
    if (position >= size())
        return String();
    const uint32 rest = size() - position;
    return String(c_str() + position, count < rest ? count : rest);
}

void String::erase(uint32 position, uint32 count) {
    if (position >= size() || count == 0)
        return;
    const uint32 rest = size() - position;
    String shorter(c_str(), position);
    if (count < rest)
        shorter.append(c_str() + position + count, rest - count);
    swap(shorter);
}

bool operator==(const String& a, const String& b) noexcept {
    return a.size() == b.size() &&
           (a.c_str() == b.c_str() || std::memcmp(a.c_str(), b.c_str(), a.size()) == 0);
}

bool operator==(const String& a, const char* b) noexcept {
    const std::size_t size = text_length(b);
    return a.size() == size && (size == 0 || std::memcmp(a.c_str(), b, size) == 0);
}

String operator+(const String& a, const String& b) {
    String sum(a);
    sum.append(b);
    return sum;
}

bool equali(const String& a, const String& b) noexcept {
    if (a.size() != b.size())
        return false;
    for (uint32 i = 0; i < a.size(); ++i) {
        if (fold(a[i]) != fold(b[i]))
            return false;
    }
    return true;
}

bool equali(const String& a, const char* b) noexcept {
    return name_equal(a.c_str(), b ? b : "");
}

} // namespace cimple
