#include "operations/curl_library.h"

#include "foundation/log.h"

#include <atomic>
#include <dlfcn.h>

namespace cimple {

namespace {

// Tried in this order.
constexpr const char* NAMES[] = {"/lib/libcurl.so.4", "/usr/lib/libcurl.so.4", "libcurl.so",
                                 "curl.dll"};

constexpr Loader_Calls SYSTEM_LOADER = {dlopen, dlsym, dlclose, dlerror};

constinit std::atomic<const Loader_Calls*> loader{&SYSTEM_LOADER};

} // namespace

bool curl_is_present() {
    const Loader_Calls& calls = *loader.load(std::memory_order_relaxed);
    for (const char* name : NAMES) {
        void* library = calls.open(name, RTLD_NOW | RTLD_GLOBAL);
        if (!library)
            continue;
        if (calls.close(library) != 0)
            VLN_LOG(VLN_ERR, "ERROR: UNABLE TO CLOSE DYNAMIC LIB");
        return true;
    }
    VLN_LOG(VLN_INFO, "libcurl is not present. only file type URIScheme will be supported");
    return false;
}

void replace_curl_loader(const Loader_Calls* calls) {
    loader.store(calls ? calls : &SYSTEM_LOADER, std::memory_order_relaxed);
}

} // namespace cimple
