#include "cimple/buffer.h"

#include <algorithm>
#include <bit>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <new>

namespace cimple {

namespace {

constexpr std::size_t SMALLEST_CAPACITY = 4096;
constexpr std::size_t LARGEST_CAPACITY = SIZE_MAX / 4;
constexpr std::size_t FIRST_FORMAT_SIZE = 128;

} // namespace

Buffer::~Buffer() {
    std::free(_data);
}

void Buffer::reserve(std::size_t capacity) {
    if (capacity <= _capacity)
        return;
    if (capacity > LARGEST_CAPACITY)
        throw std::bad_alloc();
    capacity = std::max(capacity, SMALLEST_CAPACITY);
    auto* data = static_cast<char*>(std::realloc(_data, capacity + 1));
    if (!data)
        throw std::bad_alloc();
    _data = data;
    _capacity = capacity;
    _data[_size] = '\0';
}

void Buffer::insert(std::size_t position, const char* text, std::size_t size) {
    if (size == 0)
        return;
    if (size > LARGEST_CAPACITY - _size)
        throw std::bad_alloc();
    if (_size + size > _capacity)
        reserve(std::bit_ceil(_size + size));
    position = std::min(position, _size);
    std::memmove(_data + position + size, _data + position, _size - position);
    std::memcpy(_data + position, text, size);
    _size += size;
    _data[_size] = '\0';
}

void Buffer::append(const char* text) {
    if (text)
        append(text, std::strlen(text));
}

void Buffer::append(std::size_t count, char c) {
    for (; count > 0; --count)
        append(c);
}

int Buffer::format(const char* format, ...) {
    std::va_list arguments;
    va_start(arguments, format);
    const int length = vformat(format, arguments);
    va_end(arguments);
    return length;
}

int Buffer::vformat(const char* format, std::va_list arguments) {
    reserve(_size + FIRST_FORMAT_SIZE);
    std::va_list again;
    va_copy(again, arguments);
    const std::size_t room = _capacity - _size;
    int length = std::vsnprintf(_data + _size, room + 1, format, arguments);
    if (length > 0 && static_cast<std::size_t>(length) > room) {
        // The first try told the exact length.
        _data[_size] = '\0';
        try {
            reserve(_size + static_cast<std::size_t>(length));
        } catch (...) {
            va_end(again);
            throw;
        }
        length = std::vsnprintf(_data + _size, static_cast<std::size_t>(length) + 1, format, again);
    }
    va_end(again);
    if (length < 0)
        _data[_size] = '\0';
    else
        _size += static_cast<std::size_t>(length);
    return length;
}

} // namespace cimple
