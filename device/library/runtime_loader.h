// Opens the closed libraries and finds their symbols.
//
// Nothing of the system links against the adapter libraries. The loader keeps a handle per library
// and a flag per library that is missing; the bound functions (bound_functions.cpp) look their
// symbols up through it. State is process-wide. Loading and unloading are for the one thread that
// constructs or destroys the ProviderAgent, while no bound function runs; bound functions may run
// on any number of threads, and there is no lock.
#ifndef VLN_DEVICE_LIBRARY_RUNTIME_LOADER_H
#define VLN_DEVICE_LIBRARY_RUNTIME_LOADER_H

#include "cimple/types.h"

namespace cimple {

enum Library_Slot : uint32 {
    SLOT_HBA = 0,        // the SNIA HBA API
    SLOT_LOCAL = 1,      // the local management library, "laxapi"
    SLOT_MANAGEMENT = 2, // the management library, "axapi"
    SLOT_CPQFC = 3,      // never loaded, so its symbols are sought in the default scope
};

inline constexpr uint32 LIBRARY_SLOTS = 4;

// The dynamic linker, dlfcn.h function for function. Tests put their own in its place.
struct Loader_Calls {
    void* (*open)(const char* file, int mode);
    void* (*symbol)(void* handle, const char* name);
    int (*close)(void* handle);
    char* (*error)();
};

class VLN_Runtime_Loader {
public:
    // Loads the HBA API library under either of its names, then the local management library, or
    // else the other one. 0 when the local library is there, 1 when only the other one is, and 0
    // again when neither is: a missing management library shows at AX_InitLib and not here.
    static uint32 loadRuntimeLibraries();

    // True when the slot holds a handle afterwards; one that does is not opened again.
    static bool loadRuntimeLibrary(Library_Slot slot, const char* name);

    // Closes and empties every slot. The missing flags stay until the next load, which starts with
    // none set.
    static void unloadRuntimeLibraries();

    // True as long as nothing says that the CPQFC library is missing, and nothing ever does.
    static bool isCpqfcLibraryPresent() { return !missing(SLOT_CPQFC); }

    // hbaLibraryMissing, localLibraryMissing, managementLibraryMissing, cpqfcLibraryMissing: set
    // when a load found no such library.
    static bool missing(Library_Slot slot) { return generation(slot) == GENERATION_MISSING; }

    // Which load of the slot's library a symbol must come from to be called; GENERATION_MISSING
    // when the library is missing. A resolved symbol carries the number that it was found under, so
    // one comparison tells a bound function both that its library is there and that its pointer
    // does not lead into a library that has been closed since. The number changes with every load
    // and unload.
    static uint32 generation(Library_Slot slot) {
        return s_generation[slot].load(std::memory_order_relaxed);
    }

    static constexpr uint32 GENERATION_MISSING = 0;
    static constexpr uint32 GENERATION_NONE = ~uint32{0}; // of a symbol never resolved

    // The symbol in the slot's library, or in the default search scope when the slot is empty, as
    // the dynamic linker takes a null handle. Null when there is none.
    static void* symbol(Library_Slot slot, const char* name);

    // For tests: null puts the dynamic linker back. Not while a library is loaded.
    static void setCalls(const Loader_Calls* calls);

private:
    static void setMissing(Library_Slot slot);
    static void startGeneration(bool forgetMissing);

    static std::atomic<void*> s_handle[LIBRARY_SLOTS];
    static std::atomic<uint32> s_lastGeneration;
    static std::atomic<uint32> s_generation[LIBRARY_SLOTS];
    static std::atomic<const Loader_Calls*> s_calls;
};

inline uint32 loadRuntimeLibraries() {
    return VLN_Runtime_Loader::loadRuntimeLibraries();
}

inline void unloadRuntimeLibraries() {
    VLN_Runtime_Loader::unloadRuntimeLibraries();
}

} // namespace cimple

#endif // VLN_DEVICE_LIBRARY_RUNTIME_LOADER_H
