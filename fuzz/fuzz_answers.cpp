// The simulated libraries answer anything to anything: statuses, counts, sizes, bytes, texts
// without an end. A refresh goes through it, of an agent that begins anew or of the one that is
// there, then every class is enumerated, and operations follow.
//
// The input: the number of changed answers, with 128 added for an agent that begins anew; these as
// records (odd_answers.h); then operations.
#include "fuzz/odd_answers.h"
#include "fuzz/operations.h"

#include <dlfcn.h>

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    constexpr unsigned MOST_ANSWERS = 16, MOST_OPERATIONS = 4;
    fuzz::Operations& operations = fuzz::Operations::instance();
    fuzz::Simulated_Host& host = operations.host();
    static const auto answer = reinterpret_cast<decltype(&answer_oddly)>(
        dlsym(dlopen(VLN_MODULE, RTLD_NOW | RTLD_NOLOAD), "answer_oddly"));
    fuzz::Input input(data, size);
    fuzz::Odd_Answer odd[MOST_ANSWERS];
    const unsigned head = input.byte();
    const std::size_t count = head % 128 % (MOST_ANSWERS + 1);
    for (std::size_t i = 0; i < count; ++i)
        input.fill(&odd[i], sizeof odd[i]);
    answer(odd, count);
    if (head >= 128 || host.is_changed()) {
        host.restart();
    } else {
        host.outdate();
        host.settle();
    }
    for (const fuzz::Stocked_Class& stocked : host.stock())
        host.manager().enumerate(stocked.known->name);
    operations.make(input, MOST_OPERATIONS);
    host.check(true);
    return 0;
}
