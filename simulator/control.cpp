// The control interface: scenario, faults, counts, records.
#include "simulator/call.h"
#include "simulator/firmware_image.h"
#include "simulator/host_files.h"
#include "simulator/scenario.h"
#include "simulator/state.h"

#include <algorithm>
#include <set>

namespace {

using namespace vlnsim;

int fail(const std::string& what, char* error, std::size_t size) {
    if (error)
        copy_text(what, error, size);
    return 1;
}

int load(const std::string& text, std::string name, char* error, std::size_t size) {
    Host host = read_scenario(text, name);
    Simulator& simulator = Simulator::instance();
    std::lock_guard lock(simulator.mutex);
    simulator.replace_host(std::move(host), std::move(name));
    if (error)
        copy_text("", error, size);
    return 0;
}

// Runs an action that answers 0 or 1; what it throws becomes 1 and a text.
template <class Action>
int guarded(char* error, std::size_t size, Action action) {
    try {
        return action();
    } catch (const std::exception& e) {
        return fail(e.what(), error, size);
    }
}

// action(host, function) of the running host, under its lock.
template <class Action>
int for_function(const char* wwn, char* error, std::size_t size, Action action) {
    const auto number = wwn ? parse_number("0x" + std::string(wwn)) : std::nullopt;
    Simulator& simulator = Simulator::instance();
    std::lock_guard lock(simulator.mutex);
    simulator.choose_scenario();
    Function* function = number ? simulator.find_function(*number) : nullptr;
    if (!function)
        return fail("unknown WWN " + shown(wwn), error, size);
    action(simulator.host, *function);
    return 0;
}

int copy_line(const std::vector<std::string>& lines, std::size_t index, char* text,
              std::size_t size) {
    if (index >= lines.size() || !text)
        return 1;
    copy_text(lines[index], text, size);
    return 0;
}

// Replaces the file at once, so that a process that is killed leaves the state before it.
void write_file(const std::string& path, const std::string& text) {
    const std::string fresh = path + ".new";
    std::unique_ptr<std::FILE, int (*)(std::FILE*)> file(std::fopen(fresh.c_str(), "wb"),
                                                         &std::fclose);
    const bool written = file &&
                         std::fwrite(text.data(), 1, text.size(), file.get()) == text.size() &&
                         std::fflush(file.get()) == 0;
    file.reset();
    if (!written || std::rename(fresh.c_str(), path.c_str()) != 0)
        throw Scenario_Error(path, 1, "", "cannot be written");
}

// The text stays for ever once it was handed out, so it is kept once per folder.
const std::string* host_root = nullptr;
std::mutex host_root_mutex;

} // namespace

int vlnsim_load_scenario(const char* path, char* error, size_t size) {
    return guarded(error, size, [&] { return load(read_file(path), path, error, size); });
}

int vlnsim_load_scenario_text(const char* text, const char* name, char* error, size_t size) {
    return guarded(error, size, [&] { return load(text, name, error, size); });
}

void vlnsim_restart(void) {
    guarded(nullptr, 0, [] {
        Simulator& simulator = Simulator::instance();
        {
            std::lock_guard lock(simulator.mutex);
            if (!simulator.scenario_name.empty()) {
                simulator.restart();
                return 0;
            }
        }
        return load("{}", "nothing", nullptr, 0);
    });
}

void vlnsim_reset(void) {
    vlnsim_use_system_clock();
    vlnsim_set_host_root(nullptr);
    Simulator& simulator = Simulator::instance();
    std::lock_guard lock(simulator.mutex);
    simulator.replace_host(Host{}, "");
    simulator.scenario_chosen = false;
    simulator.trace = nullptr;
    simulator.recording = false;
}

int vlnsim_save_state(const char* path, char* error, size_t size) {
    return guarded(error, size, [&] {
        Simulator& simulator = Simulator::instance();
        std::lock_guard lock(simulator.mutex);
        write_file(path, state_text(simulator.host, simulator.described, simulator.scenario_name));
        return 0;
    });
}

int vlnsim_load_state(const char* path, char* error, size_t size) {
    return guarded(error, size, [&] {
        const std::string text = read_file(path);
        Simulator& simulator = Simulator::instance();
        std::lock_guard lock(simulator.mutex);
        Host changed = simulator.host;
        apply_state(changed, text, path, simulator.scenario_name);
        simulator.host = std::move(changed);
        return 0;
    });
}

int vlnsim_set_value(const char* wwn, const char* table, const char* name, const char* value,
                     char* error, size_t size) {
    return guarded(error, size, [&] {
        const Value source = value ? parse_source(value, name) : Value{};
        const Scope scope;
        const Node node(source, scope);
        return for_function(wwn, error, size, [&](Host&, Function& function) {
            set_value(function, table, name, node);
        });
    });
}

int vlnsim_act(const char* wwn, enum vlnsim_action action, char* error, size_t size) {
    return guarded(error, size, [&] {
        return for_function(wwn, error, size, [&](Host& host, Function& function) {
            if (action == VLNSIM_RESET_ADAPTER)
                reset_adapter(host, function);
            else
                set_cable(host, function, action == VLNSIM_PLUG_CABLE);
        });
    });
}

const char* vlnsim_platform(void) {
    Simulator& simulator = Simulator::instance();
    std::lock_guard lock(simulator.mutex);
    return simulator.host.platform.c_str();
}

void vlnsim_reboot(void) {
    Simulator& simulator = Simulator::instance();
    std::lock_guard lock(simulator.mutex);
    reboot(simulator.host);
    write_files(simulator.host, false);
}

int vlnsim_log(const char* line) {
    return line && append_lines(system_log, {line}) ? 0 : 1;
}

int vlnsim_write_firmware(const char* path, const char* model, const char* version, size_t size,
                          char* error, size_t error_size) {
    return guarded(error, error_size, [&] {
        write_file(path, firmware_image(model, version, size));
        return 0;
    });
}

void vlnsim_set_host_root(const char* folder) {
    static std::set<std::string>* const folders = new std::set<std::string>;
    {
        std::lock_guard lock(host_root_mutex);
        host_root = folder && *folder ? &*folders->insert(folder).first : nullptr;
    }
    Simulator& simulator = Simulator::instance();
    std::lock_guard lock(simulator.mutex);
    write_files(simulator.host, true);
}

const char* vlnsim_host_root(void) {
    std::lock_guard lock(host_root_mutex);
    return host_root ? host_root->c_str() : "";
}

int vlnsim_fault(const char* function, unsigned nth, enum vlnsim_fault_kind kind, uint64_t value) {
    if (!function || kind < VLNSIM_STATUS || kind > VLNSIM_HOLD)
        return 1;
    const std::string name = function;
    if (name != "*" && !(kind == VLNSIM_ABSENT ? is_symbol_name(name) : is_entry_name(name)))
        return 1;
    Simulator& simulator = Simulator::instance();
    std::lock_guard lock(simulator.mutex);
    simulator.choose_scenario();
    simulator.faults.push_back(Fault{name, nth, kind, value});
    return 0;
}

void vlnsim_clear_faults(void) {
    Simulator& simulator = Simulator::instance();
    std::lock_guard lock(simulator.mutex);
    simulator.forget_faults();
}

size_t vlnsim_held(void) {
    Simulator& simulator = Simulator::instance();
    std::lock_guard lock(simulator.mutex);
    return simulator.held;
}

unsigned long vlnsim_calls(const char* function) {
    Simulator& simulator = Simulator::instance();
    std::lock_guard lock(simulator.mutex);
    unsigned long count = 0;
    for (unsigned i = 0; i < entry_count; ++i)
        if (!function || std::string_view(function) == entry_name(static_cast<Entry>(i)))
            count += simulator.calls[i];
    return count;
}

void vlnsim_each_call(void (*visit)(void* context, const char* function, unsigned long count),
                      void* context) {
    Simulator& simulator = Simulator::instance();
    std::map<std::string_view, unsigned long> counts;
    {
        std::lock_guard lock(simulator.mutex);
        for (unsigned i = 0; i < entry_count; ++i)
            if (simulator.calls[i])
                counts[entry_name(static_cast<Entry>(i))] = simulator.calls[i];
    }
    for (const auto& [name, count] : counts)
        visit(context, name.data(), count);
}

void vlnsim_clear_calls(void) {
    Simulator& simulator = Simulator::instance();
    std::lock_guard lock(simulator.mutex);
    simulator.forget_calls();
}

void vlnsim_trace(FILE* stream) {
    Simulator& simulator = Simulator::instance();
    std::lock_guard lock(simulator.mutex);
    simulator.trace = stream;
}

void vlnsim_record_calls(int on) {
    Simulator& simulator = Simulator::instance();
    std::lock_guard lock(simulator.mutex);
    simulator.recording = on != 0;
}

size_t vlnsim_recorded_calls(void) {
    Simulator& simulator = Simulator::instance();
    std::lock_guard lock(simulator.mutex);
    return simulator.recorded.size();
}

int vlnsim_recorded_call(size_t index, char* text, size_t size) {
    Simulator& simulator = Simulator::instance();
    std::lock_guard lock(simulator.mutex);
    return copy_line(simulator.recorded, index, text, size);
}

size_t vlnsim_violations(void) {
    Simulator& simulator = Simulator::instance();
    std::lock_guard lock(simulator.mutex);
    return simulator.violations.size();
}

int vlnsim_violation(size_t index, char* text, size_t size) {
    Simulator& simulator = Simulator::instance();
    std::lock_guard lock(simulator.mutex);
    return copy_line(simulator.violations, index, text, size);
}

size_t vlnsim_open_handles(void) {
    Simulator& simulator = Simulator::instance();
    std::lock_guard lock(simulator.mutex);
    return simulator.handles.size();
}
