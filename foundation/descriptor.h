// The owner of a file descriptor.
#ifndef FOUNDATION_DESCRIPTOR_H
#define FOUNDATION_DESCRIPTOR_H

#include <unistd.h>
#include <utility>

namespace cimple {

class Descriptor {
public:
    Descriptor() = default;
    explicit Descriptor(int number) : _number(number) {}
    ~Descriptor() {
        if (_number >= 0)
            close(_number);
    }
    Descriptor(Descriptor&& other) noexcept : _number(other.release()) {}
    Descriptor& operator=(Descriptor&& other) noexcept {
        std::swap(_number, other._number);
        return *this;
    }

    explicit operator bool() const noexcept { return _number >= 0; }
    int get() const noexcept { return _number; }
    int release() noexcept { return std::exchange(_number, -1); }

private:
    int _number = -1;
};

} // namespace cimple

#endif // FOUNDATION_DESCRIPTOR_H
