#include "tools/mpcactl/simulation.h"

#include "tools/mpcactl/failure.h"

#include "host/installation.h"
#include "host/text.h"
#include "host/value_json.h"

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <dlfcn.h>
#include <fcntl.h>
#include <sys/file.h>
#include <unistd.h>

namespace mpcactl {

namespace fs = std::filesystem;

namespace {

fs::path simulator_file(const char* name) {
    const fs::path file = fs::path(host::simulator_folder()) / name;
    std::error_code error;
    if (!fs::exists(file, error))
        throw Usage_Error("the simulator is not installed: there is no " + file.string());
    return file;
}

std::string find_scenario(const std::string& given) {
    std::error_code error;
    if (fs::is_regular_file(given, error))
        return given;
    std::vector<std::string> known;
    const fs::path folder = host::scenario_folder();
    for (const std::string& name : {given, given + ".json"})
        if (given.find('/') == std::string::npos && fs::is_regular_file(folder / name, error))
            return (folder / name).string();
    for (const auto& entry : fs::directory_iterator(folder, error))
        if (entry.path().extension() == ".json")
            known.push_back(entry.path().stem().string());
    std::sort(known.begin(), known.end());
    std::string text = "there is no scenario " + given;
    if (!known.empty())
        text += "; known by name are " + host::join_or(known);
    throw Usage_Error(text);
}

} // namespace

std::string Simulation::module_path() {
    return simulator_file("libvorlan_mpca_provider.so").string();
}

template <class Function>
Function* Simulation::function(const char* name) const {
    void* found = dlsym(_library, name);
    if (!found)
        throw Usage_Error(std::string("the simulator's library lacks ") + name);
    return reinterpret_cast<Function*>(found);
}

Simulation::Simulation(const Session_Settings& settings) {
    const fs::path library = simulator_file("libvlnsim.so");
    const std::string path = find_scenario(settings.scenario);
    _library = dlopen(library.c_str(), RTLD_NOW | RTLD_GLOBAL);
    if (!_library)
        throw Usage_Error(std::string("the simulator cannot be loaded: ") + dlerror());
    char error[4096] = "";
    function<decltype(vlnsim_skip_sleeps)>("vlnsim_skip_sleeps")();
    if (function<decltype(vlnsim_load_scenario)>("vlnsim_load_scenario")(path.c_str(), error,
                                                                         sizeof error) != 0)
        throw Usage_Error(error);
    if (function<decltype(vlnsim_open_libraries)>("vlnsim_open_libraries")(error, sizeof error) !=
        0)
        throw Usage_Error(error);
    if (settings.trace_calls)
        function<decltype(vlnsim_trace)>("vlnsim_trace")(stderr);
    if (!settings.keep.empty())
        open_kept(settings.keep);
    prepare_root(settings.keep.empty() ? fs::path(settings.host_root)
                                       : fs::path(settings.keep) / "root");
}

// Two processes at a time would each keep its own changes and undo those of the other.
void Simulation::open_kept(const fs::path& folder) {
    std::error_code error;
    fs::create_directories(folder, error);
    if (error)
        throw Usage_Error("the folder " + folder.string() + " cannot be made: " + error.message());
    _lock = open(folder.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    if (_lock < 0 || flock(_lock, LOCK_EX | LOCK_NB) != 0)
        throw Usage_Error(errno == EWOULDBLOCK
                              ? "another mpcactl keeps a host in " + folder.string()
                              : folder.string() + ": " + std::strerror(errno));
    const fs::path state = folder / "state.json";
    char text[4096] = "";
    if (fs::exists(state, error) && function<decltype(vlnsim_load_state)>("vlnsim_load_state")(
                                        state.c_str(), text, sizeof text) != 0)
        throw Usage_Error(std::string(text) + "\nGive another folder, or remove " +
                          folder.string() + " to begin with the scenario as it is.");
    _state = state.string();
}

void Simulation::keep() {
    char error[4096] = "";
    if (!_state.empty() && function<decltype(vlnsim_save_state)>("vlnsim_save_state")(
                               _state.c_str(), error, sizeof error) != 0)
        throw Usage_Error(error);
}

void Simulation::prepare_root(fs::path root) {
    if (root.empty()) {
        const char* folder = std::getenv("TMPDIR");
        std::string pattern =
            (fs::path(folder && *folder ? folder : "/tmp") / "mpcactl-XXXXXX").string();
        if (!mkdtemp(pattern.data()))
            throw Usage_Error("no temporary folder can be made: " + pattern);
        _temporary_root = pattern;
        root = pattern;
    }
    char error[4096] = "";
    if (function<decltype(vlnsim_make_host_root)>("vlnsim_make_host_root")(root.c_str(), error,
                                                                           sizeof error) != 0)
        throw Usage_Error(error);
}

// The libraries stay loaded: threads of a module may still be on their way out of them.
Simulation::~Simulation() {
    std::error_code error;
    if (!_temporary_root.empty())
        fs::remove_all(_temporary_root, error);
    if (_lock >= 0)
        close(_lock);
}

void Simulation::set_value(const std::string& port, const std::string& table,
                           const std::string& name, const std::string& value) {
    const bool is_json = value == "null" || value.starts_with("{");
    const std::string json =
        is_json ? value
                : host::Json(value).dump(-1, ' ', true, host::Json::error_handler_t::replace);
    char error[4096] = "";
    if (function<decltype(vlnsim_set_value)>("vlnsim_set_value")(
            port.c_str(), table.c_str(), name.c_str(), json.c_str(), error, sizeof error) != 0)
        throw Usage_Error(error);
}

std::string Simulation::platform() const {
    return function<decltype(vlnsim_platform)>("vlnsim_platform")();
}

void Simulation::reboot() {
    function<decltype(vlnsim_reboot)>("vlnsim_reboot")();
}

void Simulation::act(const std::string& port, vlnsim_action action) {
    char error[4096] = "";
    if (function<decltype(vlnsim_act)>("vlnsim_act")(port.c_str(), action, error, sizeof error) !=
        0)
        throw Usage_Error(error);
}

void Simulation::log(const std::string& line) {
    if (function<decltype(vlnsim_log)>("vlnsim_log")(line.c_str()) != 0)
        throw Usage_Error("the log of the host cannot be written");
}

void Simulation::write_firmware(const std::string& file, const std::string& model,
                                const std::string& version, std::size_t size) {
    char error[4096] = "";
    if (function<decltype(vlnsim_write_firmware)>("vlnsim_write_firmware")(
            file.c_str(), model.c_str(), version.c_str(), size, error, sizeof error) != 0)
        throw Usage_Error(error);
}

std::vector<std::string> Simulation::violations(std::size_t from) const {
    auto* const count = function<decltype(vlnsim_violations)>("vlnsim_violations");
    auto* const text_of = function<decltype(vlnsim_violation)>("vlnsim_violation");
    std::vector<std::string> texts;
    for (size_t i = from, n = count(); i < n; ++i) {
        char text[512] = "";
        if (text_of(i, text, sizeof text) == 0)
            texts.emplace_back(text);
    }
    return texts;
}

} // namespace mpcactl
