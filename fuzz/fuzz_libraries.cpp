#include "device/library/runtime_loader.h"
#include "fuzz/fuzz.h"

namespace fuzz {

namespace {

const Symbol* symbols;
std::size_t symbol_count;
char library;

constexpr cimple::Loader_Calls LOADER = {
    [](const char*, int) -> void* { return &library; },
    [](void*, const char* name) -> void* {
        const char* wanted = std::strncmp(name, "LAX_", 4) == 0 ? name + 1 : name;
        for (std::size_t i = 0; i < symbol_count; ++i)
            if (std::strcmp(symbols[i].name, wanted) == 0)
                return symbols[i].function;
        return nullptr;
    },
    [](void*) { return 0; },
    [] {
        static char none[] = "";
        return none;
    },
};

} // namespace

void play_libraries(const Symbol* table, std::size_t count) {
    if (symbols)
        return;
    symbols = table;
    symbol_count = count;
    cimple::VLN_Runtime_Loader::setCalls(&LOADER);
    cimple::loadRuntimeLibraries();
}

} // namespace fuzz
