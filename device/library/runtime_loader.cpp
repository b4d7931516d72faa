#include "device/library/runtime_loader.h"

#include "foundation/log.h"

#include <cstdio>
#include <cstring>
#include <dlfcn.h>
#include <string>

namespace cimple {

namespace {

constexpr Loader_Calls DYNAMIC_LINKER{dlopen, dlsym, dlclose, dlerror};

constexpr uint32 FIRST_GENERATION = VLN_Runtime_Loader::GENERATION_MISSING + 1;

// dlerror answers null when it has nothing to say.
const char* errorText(const Loader_Calls& calls) {
    const char* text = calls.error();
    return text ? text : "unknown error";
}

// A name that begins with "HBA" brings its suffix along.
std::string fileName(const char* name) {
    std::string file = "lib";
    file += name;
    if (std::strncmp(name, "HBA", 3) != 0)
        file += ".so";
    return file;
}

} // namespace

constinit std::atomic<void*> VLN_Runtime_Loader::s_handle[LIBRARY_SLOTS]{};
constinit std::atomic<uint32> VLN_Runtime_Loader::s_lastGeneration{FIRST_GENERATION};
constinit std::atomic<uint32> VLN_Runtime_Loader::s_generation[LIBRARY_SLOTS]{
    FIRST_GENERATION, FIRST_GENERATION, FIRST_GENERATION, FIRST_GENERATION};
constinit std::atomic<const Loader_Calls*> VLN_Runtime_Loader::s_calls{&DYNAMIC_LINKER};

uint32 VLN_Runtime_Loader::loadRuntimeLibraries() {
    startGeneration(true);
    if (!loadRuntimeLibrary(SLOT_HBA, "HBAAPI.so.2") && !loadRuntimeLibrary(SLOT_HBA, "HBAAPI.so"))
        setMissing(SLOT_HBA);
    // With the local library the other one is not opened, even if it is installed: one host has one
    // library in charge of its adapters.
    if (loadRuntimeLibrary(SLOT_LOCAL, "laxapi"))
        return 0;
    setMissing(SLOT_LOCAL);
    if (loadRuntimeLibrary(SLOT_MANAGEMENT, "axapi"))
        return 1;
    setMissing(SLOT_MANAGEMENT);
    return 0;
}

bool VLN_Runtime_Loader::loadRuntimeLibrary(Library_Slot slot, const char* name) {
    if (s_handle[slot].load(std::memory_order_relaxed))
        return true;
    const Loader_Calls& calls = *s_calls.load(std::memory_order_relaxed);
    // A bare file name: the search path of the system decides on the directory.
    void* handle = calls.open(fileName(name).c_str(), RTLD_NOW);
    if (!handle) {
        VLN_LOG(VLN_ERR, "dlopen failed :%s", errorText(calls));
        return false;
    }
    s_handle[slot].store(handle, std::memory_order_relaxed);
    return true;
}

void VLN_Runtime_Loader::unloadRuntimeLibraries() {
    // The resolved symbols stay where they are cached, since the process unloads the provider next.
    // Where it does not, and the agent starts again, they carry an old generation and are not
    // called.
    startGeneration(false);
    const Loader_Calls& calls = *s_calls.load(std::memory_order_relaxed);
    for (auto& slot : s_handle) {
        void* handle = slot.exchange(nullptr, std::memory_order_relaxed);
        if (!handle || calls.close(handle) == 0)
            continue;
        char text[2 * sizeof handle + 8];
        std::snprintf(text, sizeof text, "%p", handle);
        VLN_LOG(VLN_ERR, "dlclose for lib %s failed with %s\n", text, errorText(calls));
    }
}

void VLN_Runtime_Loader::startGeneration(bool forgetMissing) {
    const uint32 next = s_lastGeneration.fetch_add(1, std::memory_order_relaxed) + 1;
    for (auto& generation : s_generation)
        if (forgetMissing || generation.load(std::memory_order_relaxed) != GENERATION_MISSING)
            generation.store(next, std::memory_order_relaxed);
}

void* VLN_Runtime_Loader::symbol(Library_Slot slot, const char* name) {
    return s_calls.load(std::memory_order_relaxed)
        ->symbol(s_handle[slot].load(std::memory_order_relaxed), name);
}

void VLN_Runtime_Loader::setCalls(const Loader_Calls* calls) {
    s_calls.store(calls ? calls : &DYNAMIC_LINKER, std::memory_order_relaxed);
}

void VLN_Runtime_Loader::setMissing(Library_Slot slot) {
    s_generation[slot].store(GENERATION_MISSING, std::memory_order_relaxed);
}

} // namespace cimple
