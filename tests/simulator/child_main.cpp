// Prints the number of adapters that the local library of the library path tells.
#include "device/library/axapi.h"

#include <cstdio>
#include <dlfcn.h>

int main() {
    void* library = dlopen("liblaxapi.so", RTLD_NOW);
    if (!library) {
        std::printf("%s\n", dlerror());
        return 1;
    }
    const auto init = reinterpret_cast<decltype(&AX_InitLib)>(dlsym(library, "LAX_InitLib"));
    const auto count = reinterpret_cast<decltype(&AX_GetNumberOfLocalAdapters)>(
        dlsym(library, "AX_GetNumberOfLocalAdapters"));
    const AX_STATUS status = init();
    std::printf("status %u, %u adapters\n", status, count());
    return 0;
}
