// The library files of the simulated host: which are there, what they export, and opening them.
#include "simulator/faces.h"

#include "simulator/call.h"

#include <algorithm>
#include <array>
#include <dlfcn.h>

namespace {

using namespace vlnsim;

constexpr std::array<const char*, 3> file_names{"liblaxapi.so", "libaxapi.so", "libHBAAPI.so.2"};

// Its own lock, since the dynamic linker's is held while a symbol is resolved under the
// simulator's.
std::mutex opened_mutex;
std::array<void*, 3> opened{};

// Below the folder of this library; with a slash.
std::string faces_folder() {
    Dl_info info{};
    if (!dladdr(reinterpret_cast<void*>(&vlnsim_open_libraries), &info) || !info.dli_fname)
        return "";
    const std::string path = info.dli_fname;
    const auto slash = path.rfind('/');
    return (slash == std::string::npos ? "" : path.substr(0, slash + 1)) + "libraries/";
}

bool contains(const std::vector<std::string>& list, std::string_view name) {
    return std::find(list.begin(), list.end(), name) != list.end();
}

bool absent_by_script(const std::vector<Fault>& faults, std::string_view symbol, Entry entry) {
    return std::any_of(faults.begin(), faults.end(), [&](const Fault& fault) {
        return fault.kind == VLNSIM_ABSENT && (fault.function == "*" || fault.function == symbol ||
                                               fault.function == entry_name(entry));
    });
}

} // namespace

int vlnsim_library_present(enum vlnsim_library library) {
    Simulator& simulator = Simulator::instance();
    std::lock_guard lock(simulator.mutex);
    simulator.choose_scenario();
    return simulator.host.libraries[library].present;
}

int vlnsim_open_libraries(char* error, size_t size) {
    const std::string folder = faces_folder();
    std::lock_guard lock(opened_mutex);
    for (std::size_t i = 0; i < file_names.size(); ++i) {
        if (opened[i] || !vlnsim_library_present(static_cast<vlnsim_library>(i)))
            continue;
        opened[i] = dlopen((folder + file_names[i]).c_str(), RTLD_NOW | RTLD_LOCAL);
        if (!opened[i]) {
            if (error)
                copy_text(dlerror(), error, size);
            return 1;
        }
    }
    if (error)
        copy_text("", error, size);
    return 0;
}

void vlnsim_close_libraries(void) {
    std::lock_guard lock(opened_mutex);
    for (void*& handle : opened)
        if (handle)
            dlclose(std::exchange(handle, nullptr));
}

unsigned long vlnsim_lookups(const char* symbol) {
    Simulator& simulator = Simulator::instance();
    std::lock_guard lock(simulator.mutex);
    unsigned long count = 0;
    for (const auto& [name, lookups] : simulator.lookups)
        if (!symbol || name == symbol)
            count += lookups;
    return count;
}

vlnsim_any_function vlnsim_resolve(int library, const char* symbol, unsigned number, int exported) {
    const auto entry = static_cast<Entry>(number);
    Simulator& simulator = Simulator::instance();
    std::lock_guard lock(simulator.mutex);
    simulator.choose_scenario();
    ++simulator.lookups[symbol];
    const Library& file = simulator.host.libraries[static_cast<std::size_t>(library)];
    if (contains(file.missing, symbol) || absent_by_script(simulator.faults, symbol, entry))
        return nullptr;
    if (!exported && !contains(file.extra, symbol))
        return nullptr;
    return entry_function(entry);
}
