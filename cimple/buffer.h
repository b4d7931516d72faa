// A growing run of bytes with a terminating zero: where texts are put together before they are
// written out. Not shared, not counted. Allocation failure throws std::bad_alloc.
#ifndef CIMPLE_BUFFER_H
#define CIMPLE_BUFFER_H

#include "cimple/types.h"

#include <cstdarg>

namespace cimple {

class Buffer {
public:
    Buffer() noexcept = default;
    explicit Buffer(std::size_t capacity) { reserve(capacity); }
    ~Buffer();
    Buffer(const Buffer&) = delete;
    Buffer& operator=(const Buffer&) = delete;

    const char* data() const noexcept { return _data ? _data : ""; } // always terminated
    std::size_t size() const noexcept { return _size; }
    std::size_t capacity() const noexcept { return _capacity; }
    bool empty() const noexcept { return _size == 0; }

    void reserve(std::size_t capacity); // 4096 bytes at least
    // A position behind the end means the end. The bytes may not lie in this buffer.
    void insert(std::size_t position, const char* text, std::size_t size);
    void append(const char* text, std::size_t size) { insert(_size, text, size); }
    void append(const char* text);
    void append(char c) { insert(_size, &c, 1); }
    void append(std::size_t count, char c);

    // Append printed text and answer its length, or -1 (and append nothing) if it cannot be
    // printed.
    __attribute__((format(printf, 2, 3))) int format(const char* format, ...);
    __attribute__((format(printf, 2, 0))) int vformat(const char* format, std::va_list arguments);

private:
    char* _data = nullptr;
    std::size_t _size = 0;
    std::size_t _capacity = 0; // without the byte of the terminator
};

} // namespace cimple

#endif // CIMPLE_BUFFER_H
