#include "operations/curl_library.h"

#include "foundation/log.h"

#include <atomic>
#include <cstring>
#include <dlfcn.h>

namespace cimple {

namespace {

struct Opening {
    const char* names[5]; // tried in this order
    int mode;
};

// The last name stands for hosts that keep their libraries in a folder per architecture, which only
// the dynamic linker knows.
constexpr Opening FETCHING = {{"/lib/libcurl.so.4", "/usr/lib/libcurl.so.4",
                               "/usr/lib64/libcurl.so.4", "libcurl.so", "libcurl.so.4"},
                              RTLD_LAZY | RTLD_GLOBAL};
constexpr Opening OTHERWISE = {
    {"/lib/libcurl.so.4", "/usr/lib/libcurl.so.4", "libcurl.so", "curl.dll", "libcurl.so.4"},
    RTLD_NOW | RTLD_GLOBAL};

constexpr Loader_Calls SYSTEM_LOADER = {dlopen, dlsym, dlclose, dlerror};

constinit std::atomic<const Loader_Calls*> loader{&SYSTEM_LOADER};

const Loader_Calls& calls() {
    return *loader.load(std::memory_order_relaxed);
}

template <class Function>
bool bind_one(void* library, const char* name, Function& function) {
    void* symbol = calls().symbol(library, name);
    std::memcpy(&function, &symbol, sizeof function);
    if (!symbol)
        VLN_LOG(VLN_ERR, "unable to locate function %s in curl so", name);
    return symbol != nullptr;
}

void log_version(void* library) {
    const char* (*version)() = nullptr;
    void* symbol = calls().symbol(library, "curl_version");
    std::memcpy(&version, &symbol, sizeof version);
    if (version)
        VLN_LOG(VLN_DBG, "curl version: %s", version());
}

} // namespace

Curl_Library::Curl_Library(Use use) {
    const Opening& opening = use == FETCH ? FETCHING : OTHERWISE;
    for (const char* name : opening.names)
        if ((m_handle = calls().open(name, opening.mode)) != nullptr)
            return;
}

bool Curl_Library::bind(Curl_Functions& functions) const {
    log_version(m_handle);
    const bool found[] = {
        bind_one(m_handle, "curl_global_init", functions.global_init),
        bind_one(m_handle, "curl_global_cleanup", functions.global_cleanup),
        bind_one(m_handle, "curl_easy_init", functions.easy_init),
        bind_one(m_handle, "curl_easy_setopt", functions.easy_setopt),
        bind_one(m_handle, "curl_easy_perform", functions.easy_perform),
        bind_one(m_handle, "curl_easy_cleanup", functions.easy_cleanup),
    };
    for (const bool one : found)
        if (!one)
            return false;
    return true;
}

bool Curl_Library::close() {
    void* handle = m_handle;
    m_handle = nullptr;
    return !handle || calls().close(handle) == 0;
}

bool curl_is_present() {
    Curl_Library library(Curl_Library::LOOK_FOR);
    if (!library.is_open()) {
        VLN_LOG(VLN_INFO, "libcurl is not present. only file type URIScheme will be supported");
        return false;
    }
    if (!library.close())
        VLN_LOG(VLN_ERR, "ERROR: UNABLE TO CLOSE DYNAMIC LIB");
    return true;
}

void replace_curl_loader(const Loader_Calls* calls) {
    loader.store(calls ? calls : &SYSTEM_LOADER, std::memory_order_relaxed);
}

} // namespace cimple
