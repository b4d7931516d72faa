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

bool has_scenario(const char* name) {
    return std::filesystem::exists(std::string(VLN_SCENARIOS "/") + name);
}

std::string changed_scenario(const char* name, const std::string& as_it_is,
                             const std::string& wanted) {
    std::string text = read_scenario(name);
    const std::size_t at = text.find(as_it_is);
    if (at == std::string::npos)
        fail("the scenario has another form than expected");
    return text.replace(at, as_it_is.size(), wanted);
}

std::string one_target(unsigned volumes) {
    return R"({"include": "parts/cna.json", "cards": [{"use": "cna", "functions": [{"use": "nic"},
        {"use": "fcoe", "targets": {"luns": )" +
           std::to_string(volumes) + R"(, "wwpn": "50:25:64:C0:00:00:00:01"}}]}]})";
}

std::string san_of(unsigned units) {
    constexpr unsigned TARGETS = 16; // in the scenario, of 256 units each
    if (units % TARGETS != 0)
        fail("the scenario has targets of equal size");
    return changed_scenario("san-4096-luns.json", "\"luns\": 256,",
                            "\"luns\": " + std::to_string(units / TARGETS) + ",");
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

unsigned long resident_anonymous_kilobytes() {
    const std::string field = "RssAnon:";
    std::ifstream status("/proc/self/status");
    for (std::string word; status >> word;)
        if (unsigned long size = 0; word == field && status >> size)
            return size;
    fail("the system does not tell " + field);
}

void* find_hook(const char* name) {
    void* module = dlopen(VLN_BENCH_MODULE, RTLD_NOW);
    void* symbol = module ? dlsym(module, name) : nullptr;
    if (!symbol)
        fail(dlerror());
    return symbol;
}
