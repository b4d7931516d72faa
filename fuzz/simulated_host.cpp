#include "fuzz/simulated_host.h"

#include "fuzz/fuzz.h"
#include "simulator/vlnsim.h"

#include <filesystem>

namespace fuzz {

namespace {

constexpr std::uint64_t START = 1400000000ull * 1000000; // 2014-05-13, in microseconds
constexpr std::uint64_t STALE = 11ull * 60 * 1000000;    // beyond the cache time-out
constexpr std::size_t FIRMWARE_SIZE = 1000;              // bytes behind the head of the image

host::Options options() {
    host::Options options;
    options.registration_path = VLN_REGISTRATION;
    options.class_defaults = false;
    options.answer_limit = 0;
    return options;
}

[[noreturn]] void give_up(const std::string& text) {
    std::fprintf(stderr, "broken: %s\n", text.c_str());
    std::abort();
}

bool has_any(std::string_view text, std::initializer_list<std::string_view> parts) {
    for (const std::string_view part : parts)
        if (text.find(part) != std::string_view::npos)
            return true;
    return false;
}

// A function that changes nothing, by its name.
bool is_question(std::string_view function) {
    return !has_any(function, {"Set", "Add", "Remove", "Delete", "Create"}) &&
           has_any(function,
                   {"Get", "Read", "List", "Status", "Version", "InitLib", "ExitLib", "Valid",
                    "IsLocal", "Open", "Close", "LoadLib", "Send", "Inquiry", "Refresh", "Traces"});
}

// A modification answers with the path that the client gave, whatever else stands in it.
bool is_echo(const host::Fault& fault) {
    return fault.kind == host::FaultKind::bad_path && fault.operation == "modifyInstance" &&
           fault.text.starts_with("returnObjectPath");
}

// What no answer of the library excuses.
bool is_plain_breach(std::string_view text) {
    return has_any(text, {" is null", "has no end", "not zeroed", "reserved", "too long"});
}

void load(const std::string& scenario, const std::string& root) {
    char error[512] = "";
    vlnsim_reset();
    vlnsim_use_virtual_clock(START);
    vlnsim_set_host_root(root.c_str());
    if (vlnsim_load_scenario(scenario.c_str(), error, sizeof error) != 0 ||
        vlnsim_open_libraries(error, sizeof error) != 0)
        give_up(error);
}

} // namespace

Simulated_Host::Simulated_Host(const std::string& module, const std::string& scenario)
    : _root(folder() + "/root"), _manager(options()), _core(*host::Core::any()) {
    prepare_root();
    load(scenario, _root);
    if (const host::Status status = _manager.load(module); !status.ok())
        give_up(status.message);
    settle();
    for (const host::Class* known : _manager.provider_classes())
        _stock.push_back({known, _manager.enumerate(known->name).value});
    restart();
}

const std::vector<host::Instance>* Simulated_Host::stock_of(const std::string& class_name) const {
    for (const Stocked_Class& stocked : _stock)
        if (stocked.known->name == class_name)
            return &stocked.instances;
    return nullptr;
}

void Simulated_Host::outdate() {
    vlnsim_advance(STALE);
}

void Simulated_Host::settle() {
    _manager.enumerate("VLNMPCA_EthernetPort");
    _manager.enumerate("VLNMPCA_StorageVolume"); // waits for the pass over the SAN
}

void Simulated_Host::check(bool lenient) {
    for (const host::Fault& fault : _manager.faults())
        if (!is_echo(fault))
            give_up(host::to_string(fault));
    _manager.clear_faults();
    char text[256];
    for (std::size_t i = 0; vlnsim_violation(i, text, sizeof text) == 0; ++i)
        if (!lenient || is_plain_breach(text))
            give_up(text);
}

void Simulated_Host::restart() {
    _manager.cleanup(true);
    if (_manager.live_object_count() > 0)
        give_up(std::to_string(_manager.live_object_count()) + " objects left");
    vlnsim_restart();
    prepare_root();
    settle();
    vlnsim_clear_calls();
}

bool Simulated_Host::is_changed() const {
    bool changed = false;
    vlnsim_each_call(
        [](void* context, const char* function, unsigned long) {
            if (!is_question(function))
                *static_cast<bool*>(context) = true;
        },
        &changed);
    return changed;
}

void Simulated_Host::prepare_root() const {
    char error[256] = "";
    std::error_code ignored;
    std::filesystem::remove_all(_root, ignored);
    std::filesystem::create_directory(_root, ignored);
    if (vlnsim_make_host_root(_root.c_str(), error, sizeof error) != 0 ||
        vlnsim_write_firmware((_root + "/new.img").c_str(), "VMC-2210", "10.4.255.3", FIRMWARE_SIZE,
                              error, sizeof error) != 0)
        give_up(error);
}

} // namespace fuzz
