// Transceiver memory: any two pages.
#include "device/sff8472.h"
#include "fuzz/fuzz.h"

#include <cmath>

using namespace cimple;

namespace {

void check_text(const std::string& text, std::size_t size) {
    FUZZ_CHECK(text.size() <= size && (text.empty() || text.back() != ' '));
    for (char c : text)
        FUZZ_CHECK(c >= ' ' && c <= '~');
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    AX_SffData pages;
    fuzz::Input(data, size).fill(&pages, sizeof pages);
    SFF_Transceiver module;
    if (!parse_sff8472(pages, module))
        FUZZ_CHECK(module.oui.empty() && !module.hasDiagnostics);
    check_text(module.vendor, 16);
    check_text(module.partNumber, 16);
    check_text(module.revision, 4);
    check_text(module.serialNumber, 16);
    check_text(module.dateCode, 8);
    for (const auto& levels : module.value)
        for (const auto& value : levels)
            FUZZ_CHECK(!value || (module.hasDiagnostics && std::isfinite(*value)));
    return 0;
}
