// What the fuzzers share: an input to draw from, a folder of their own, libraries that they play,
// and a log that formats every line and keeps none.
//
// Each fuzzer is one file with LLVMFuzzerTestOneInput: any bytes go through a parser, and what the
// parser accepts must hold what it promises. A broken promise ends the process, as a crash does.
#ifndef FUZZ_FUZZ_H
#define FUZZ_FUZZ_H

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <string>
#include <type_traits>

// Stays in every build, unlike assert.
#define FUZZ_CHECK(condition)                                                                      \
    ((condition) ? static_cast<void>(0)                                                            \
                 : (std::fprintf(stderr, "%s:%d: broken: %s\n", __FILE__, __LINE__, #condition),   \
                    std::abort()))

namespace fuzz {

// Draws from the front of the input; past its end there are only zeros.
class Input {
public:
    Input() = default;
    Input(const std::uint8_t* data, std::size_t size) : _data(data), _size(size) {}

    bool empty() const { return _size == 0; }

    std::uint8_t byte() {
        std::uint8_t value = 0;
        fill(&value, 1);
        return value;
    }
    // Below the limit, which fits 16 bits.
    std::uint32_t below(std::uint32_t limit) {
        const std::uint32_t high = byte();
        return (high << 8 | byte()) % limit;
    }
    std::uint32_t word() {
        std::uint32_t value = 0;
        fill(&value, sizeof value);
        return value;
    }
    void fill(void* destination, std::size_t size) {
        const std::size_t taken = std::min(size, _size);
        if (taken > 0)
            std::memcpy(destination, _data, taken);
        if (size > taken)
            std::memset(static_cast<char*>(destination) + taken, 0, size - taken);
        _data += taken;
        _size -= taken;
    }
    std::string rest() {
        std::string text(reinterpret_cast<const char*>(_data), _size);
        _data += _size;
        _size = 0;
        return text;
    }

private:
    const std::uint8_t* _data = nullptr;
    std::size_t _size = 0;
};

// Has the provider's log format its lines, which end nowhere.
void listen_to_log();

// A folder that goes with the process. It is also what stands for the host's root.
const std::string& folder();
void write_file(const std::string& path, const std::string& text);

// A function of the closed libraries by the name that the management library exports it under.
struct Symbol {
    const char* name;
    void* function;
};

template <class Function>
Symbol symbol(const char* name, Function* function) {
    static_assert(std::is_function_v<Function>);
    return {name, reinterpret_cast<void*>(function)};
}

// Loads libraries that have these functions and no others; the table must stay. Once per process.
void play_libraries(const Symbol* table, std::size_t count);

} // namespace fuzz

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size);

#endif // FUZZ_FUZZ_H
