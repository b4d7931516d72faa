#include "tools/mpcactl/simulation.h"

#include "tools/mpcactl/failure.h"

#include "host/installation.h"
#include "host/text.h"

#include <algorithm>
#include <cstdlib>
#include <dlfcn.h>
#include <filesystem>
#include <vector>

namespace mpcactl {

namespace fs = std::filesystem;

namespace {

fs::path simulator_folder() {
    return fs::path(host::program_folder()) / "../lib/simulator";
}

std::vector<fs::path> scenario_folders() {
    return {MPCACTL_SCENARIOS,
            fs::path(host::program_folder()) / "../share/vorlan_mpca_provider/scenarios"};
}

std::string find_scenario(const std::string& given) {
    std::error_code error;
    if (fs::is_regular_file(given, error))
        return given;
    std::vector<std::string> known;
    for (const fs::path& folder : scenario_folders()) {
        for (const std::string& name : {given, given + ".json"})
            if (given.find('/') == std::string::npos && fs::is_regular_file(folder / name, error))
                return (folder / name).string();
        for (const auto& entry : fs::directory_iterator(folder, error))
            if (entry.path().extension() == ".json")
                known.push_back(entry.path().stem().string());
    }
    std::sort(known.begin(), known.end());
    std::string text = "there is no scenario " + given;
    if (!known.empty())
        text += "; known by name are " + host::join_or(known);
    throw Usage_Error(text);
}

} // namespace

std::string Simulation::module_path() {
    return (simulator_folder() / "libvorlan_mpca_provider.so").string();
}

template <class Function>
Function* Simulation::function(const char* name) const {
    void* found = dlsym(_library, name);
    if (!found)
        throw Usage_Error(std::string("the simulator's library lacks ") + name);
    return reinterpret_cast<Function*>(found);
}

Simulation::Simulation(const std::string& scenario, const std::string& host_root, bool trace) {
    const std::string path = find_scenario(scenario);
    _library = dlopen((simulator_folder() / "libvlnsim.so").c_str(), RTLD_NOW | RTLD_GLOBAL);
    if (!_library)
        throw Usage_Error(std::string("the simulator cannot be loaded: ") + dlerror());
    char error[1024] = "";
    if (function<decltype(vlnsim_load_scenario)>("vlnsim_load_scenario")(path.c_str(), error,
                                                                         sizeof error) != 0)
        throw Usage_Error(error);
    if (function<decltype(vlnsim_open_libraries)>("vlnsim_open_libraries")(error, sizeof error) !=
        0)
        throw Usage_Error(error);
    if (trace)
        function<decltype(vlnsim_trace)>("vlnsim_trace")(stderr);
    prepare_root(host_root);
}

void Simulation::prepare_root(const std::string& given) {
    fs::path root = given;
    if (given.empty()) {
        const char* folder = std::getenv("TMPDIR");
        std::string pattern =
            (fs::path(folder && *folder ? folder : "/tmp") / "mpcactl-XXXXXX").string();
        if (!mkdtemp(pattern.data()))
            throw Usage_Error("no temporary folder can be made: " + pattern);
        _temporary_root = pattern;
        root = pattern;
    }
    std::error_code error;
    for (const char* folder : {"etc", "var/log", "tmp", "proc"}) {
        fs::create_directories(root / folder, error);
        if (error)
            throw Usage_Error("the folder " + (root / folder).string() +
                              " cannot be made: " + error.message());
    }
    function<decltype(vlnsim_set_host_root)>("vlnsim_set_host_root")(fs::absolute(root).c_str());
}

// The libraries stay loaded: threads of a module may still be on their way out of them.
Simulation::~Simulation() {
    std::error_code error;
    if (!_temporary_root.empty())
        fs::remove_all(_temporary_root, error);
}

std::vector<std::string> Simulation::violations() const {
    auto* const count = function<decltype(vlnsim_violations)>("vlnsim_violations");
    auto* const text_of = function<decltype(vlnsim_violation)>("vlnsim_violation");
    std::vector<std::string> texts;
    for (size_t i = 0, n = count(); i < n; ++i) {
        char text[512] = "";
        if (text_of(i, text, sizeof text) == 0)
            texts.emplace_back(text);
    }
    return texts;
}

} // namespace mpcactl
