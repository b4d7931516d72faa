#include "cimple/assert.h"

#include <cstdio>
#include <cstdlib>

namespace cimple {

void __cimple_trace(const char* file, int line, const char* text) {
    std::fprintf(stderr, "TRACE: %s(%d): %s\n", file, line, text);
}

void __cimple_assert(const char* file, int line, const char* function, const char* text) {
    std::fprintf(stderr, "%s(%d): %s(): assert: %s\n\n", file, line, function, text);
    std::abort();
}

} // namespace cimple
