// What the module of fuzz_answers exports beside the factories: it is the product with an ear of
// its own for what the closed libraries answer. Every answer comes from the simulator first.
#ifndef FUZZ_ODD_ANSWERS_H
#define FUZZ_ODD_ANSWERS_H

#include <cstddef>
#include <cstdint>

namespace fuzz {

// One change of answers: of which function, at which of its calls, and how. An input is a row of
// such records.
struct Odd_Answer {
    std::uint8_t function; // a number in the table of entry points
    std::uint8_t when;     // below 128: after so many calls, once; else always
    std::uint8_t what;
    std::uint8_t argument; // of those that the function answers in
    std::uint8_t offset[2];
    std::uint8_t value[4];
};

} // namespace fuzz

// From now on answers are changed by these records, counted from here.
extern "C" __attribute__((visibility("default"))) void answer_oddly(const fuzz::Odd_Answer* records,
                                                                    std::size_t count);

#endif // FUZZ_ODD_ANSWERS_H
