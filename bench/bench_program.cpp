#include "bench/bench_program.h"

#include "simulator/vlnsim.h"

#include <dlfcn.h>
#include <unistd.h>

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>

namespace {

// A folder of this process, gone when it ends.
const std::string& root_folder() {
    struct Folder {
        std::string path;
        Folder() {
            std::string name = std::filesystem::temp_directory_path() / "vorlan-bench-XXXXXX";
            if (!mkdtemp(name.data()))
                fail("no temporary folder");
            path = name;
            std::filesystem::create_directories(path + "/etc");
        }
        ~Folder() {
            std::error_code ignored;
            std::filesystem::remove_all(path, ignored);
        }
    };
    static const Folder folder;
    return folder.path;
}

} // namespace

void fail(const std::string& text) {
    std::fprintf(stderr, "%s: %s\n", program_invocation_short_name, text.c_str());
    std::exit(2);
}

std::string read_scenario(const char* name) {
    std::ifstream file(std::string(VLN_SCENARIOS "/") + name);
    std::stringstream content;
    content << file.rdbuf();
    if (!file)
        fail(std::string("no scenario ") + name);
    return content.str();
}

std::string one_target(unsigned volumes) {
    return R"({"include": "parts/cna.json", "cards": [{"use": "cna", "functions": [{"use": "nic"},
        {"use": "fcoe", "targets": {"luns": )" +
           std::to_string(volumes) + R"(, "wwpn": "50:25:64:C0:00:00:00:01"}}]}]})";
}

void simulate(const std::string& scenario_text) {
    char error[512] = "";
    vlnsim_reset();
    vlnsim_use_virtual_clock(1400000000ull * 1000000);
    vlnsim_set_host_root(root_folder().c_str());
    if (vlnsim_load_scenario_text(scenario_text.c_str(), VLN_SCENARIOS "/measured", error,
                                  sizeof error) ||
        vlnsim_open_libraries(error, sizeof error))
        fail(error);
}

unsigned long resident_kilobytes() {
    unsigned long size = 0;
    unsigned long resident = 0;
    std::ifstream("/proc/self/statm") >> size >> resident;
    return resident * static_cast<unsigned long>(sysconf(_SC_PAGESIZE)) / 1024;
}

void* find_hook(const char* name) {
    void* module = dlopen(VLN_BENCH_MODULE, RTLD_NOW);
    void* symbol = module ? dlsym(module, name) : nullptr;
    if (!symbol)
        fail(dlerror());
    return symbol;
}
