#include "host/core.h"

#include "host/installation.h"

#include <algorithm>
#include <chrono>

namespace host {

namespace {

std::mutex managers_mutex; // guards the list
std::vector<Core*>& managers() {
    static std::vector<Core*>& list = *new std::vector<Core*>;
    return list;
}

std::string mof_path(const Options& options) {
    return options.mof_path.empty() ? catalogue_path() : options.mof_path;
}

} // namespace

Core::Core(Options given) try : options(std::move(given)), classes(mof_path(options)) {
    if (!options.platform_path.empty())
        platform.read(options.platform_path, classes);
    if (!options.registration_path.empty())
        registration.read(options.registration_path);
    const std::lock_guard lock(managers_mutex);
    managers().push_back(this);
} catch (const mof::Error& error) {
    throw Setup_Error(error.what());
}

Core::~Core() {
    destroy_all(clones);
    destroy_all(contexts);
    destroy_all(strays);
    const std::lock_guard lock(managers_mutex);
    std::erase(managers(), this);
}

Core* Core::any() {
    if (const Call* call = Call::top())
        return &call->core;
    const std::lock_guard lock(managers_mutex);
    return managers().empty() ? nullptr : managers().back();
}

std::uint64_t Core::now() const {
    if (options.clock)
        return options.clock();
    const auto since = std::chrono::system_clock::now().time_since_epoch();
    return static_cast<std::uint64_t>(
        std::chrono::duration_cast<std::chrono::microseconds>(since).count());
}

bool Core::is_provider_name_space(std::string_view name_space) const {
    if (!registration.is_empty())
        return registration.has_name_space(name_space);
    const auto& more = options.more_name_spaces;
    return same_name(name_space, options.name_space) ||
           std::any_of(more.begin(), more.end(),
                       [&](const std::string& known) { return same_name(known, name_space); });
}

Status Core::check_platform(const Class& known, const std::string& name_space) const {
    if (platform.has_name_space(name_space) &&
        (registration.is_empty() || platform.serves(name_space, known, classes)))
        return {};
    if (!registration.is_empty())
        return is_provider_name_space(name_space) || platform.has_name_space(name_space)
                   ? class_not_found(known.name, name_space)
                   : registration.unknown_name_space(name_space);
    if (is_provider_name_space(name_space))
        return {CMPI_RC_ERR_NOT_SUPPORTED, "no provider serves " + known.name};
    return {CMPI_RC_ERR_INVALID_NAMESPACE, "unknown namespace " + name_space};
}

namespace {

// "2 CMPIString", one text for each kind.
std::vector<std::string> count_kinds(std::initializer_list<const Arena*> arenas) {
    Live_Counts counts{};
    for (const Arena* arena : arenas)
        for (const Object* object = arena->first; object; object = object->next)
            ++counts[static_cast<std::size_t>(object->kind)];
    std::vector<std::string> texts;
    for (std::size_t kind = 0; kind < KIND_COUNT; ++kind)
        if (counts[kind] > 0)
            texts.push_back(std::to_string(counts[kind]) + " " +
                            to_string(static_cast<Kind>(kind)));
    return texts;
}

} // namespace

void Core::end_thread(Arena& arena) {
    for (const std::string& text : count_kinds({&arena}))
        report(this, FaultKind::left_at_detach, text);
    left += destroy_all(arena, true);
}

void Core::report_leaks() {
    if (const int threads = attached_threads.load(); threads > 0)
        report(this, FaultKind::leak, std::to_string(threads) + " threads still attached");
    for (const std::string& text : count_kinds({&clones, &contexts, &strays}))
        report(this, FaultKind::leak,
               text + (text.starts_with("1 ") ? " was" : " were") + " never released");
    destroy_all(clones);
    destroy_all(contexts);
    destroy_all(strays);
}

void report(Core* core, FaultKind kind, std::string text) {
    if (!core)
        core = Core::any();
    if (!core)
        return;
    const Call* call = Call::top();
    Fault fault{kind, call ? call->class_name : "", call ? call->operation : "", std::move(text)};
    core->trace("fault: " + to_string(fault));
    core->faults.add(std::move(fault));
}

} // namespace host
