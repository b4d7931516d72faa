// Dates in the 25 characters of CIM, and dates made of numbers.
#include "cimple/datetime.h"
#include "fuzz/fuzz.h"

using namespace cimple;

namespace {

// Numbers beyond the forms' reach, such as a year of five digits, make the texts longer.
void check_forms(const Datetime& date) {
    FUZZ_CHECK(date.readable().size() >= 28);
    FUZZ_CHECK(date.ascii().size() >= 25);
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    setenv("TZ", "UTC", 1); // an hour that daylight saving repeats has no one text
    const std::string text = fuzz::Input(data, size).rest();
    Datetime date(1, 2, true);
    if (date.set(text.c_str())) {
        check_forms(date);
        Datetime again;
        FUZZ_CHECK(again.set(date.ascii().c_str()));
        FUZZ_CHECK(again == date);
    } else {
        FUZZ_CHECK(date == Datetime(1, 2, true));
    }
    fuzz::Input input(data, size);
    uint64 usec = 0;
    input.fill(&usec, sizeof usec);
    const auto utc = static_cast<sint32>(input.word());
    check_forms(Datetime(usec, utc, input.byte() & 1));
    return 0;
}
