#include "tests/hostile/consoles.h"

#include "host/path_text.h"
#include "tests/hostile/footprint.h"

#include <cstdlib>
#include <mutex>
#include <thread>

namespace hostile {

std::size_t wanted_operations() {
    constexpr std::size_t IN_THE_SUITE = 10000;
    const char* text = std::getenv("VLN_OPERATIONS");
    const std::size_t number = text ? std::strtoul(text, nullptr, 10) : 0;
    return number ? number : IN_THE_SUITE;
}

bool tells_progress() {
    return std::getenv("VLN_OPERATIONS") != nullptr;
}

std::vector<std::string> changed_hosts() {
    std::set<std::string> names;
    for (const Change& change : read_changes())
        names.insert(change.scenario);
    return {names.begin(), names.end()};
}

Names all_names(road::Road& road) {
    Names names;
    for (const host::Class* known : road.manager().provider_classes())
        for (const host::ObjectPath& path : road.manager().enumerate_names(known->name).value)
            names[known->name].insert(host::path_to_text(path, ""));
    return names;
}

void wait_for_refresh() {
#if defined(__SANITIZE_THREAD__)
    constexpr std::ptrdiff_t LEFT = 3; // the sanitizer has one of its own
#else
    constexpr std::ptrdiff_t LEFT = 2;
#endif
    while (Footprint::now().threads > LEFT)
        std::this_thread::yield();
}

// ---- The host ----

Known_Host::Known_Host(road::Road& road, const std::vector<Change>& rows)
    : manager(road.manager()) {
    for (const Change& row : rows) {
        try {
            changes.emplace_back(road, row);
        } catch (const std::runtime_error&) {
            // This host has no such instance.
        }
    }
    for (const host::Class* known : manager.provider_classes()) {
        classes.push_back(known->name);
        _in_use[known->name];
        if (known->is_association)
            links.push_back(known->name);
        for (host::ObjectPath& path : manager.enumerate_names(known->name).value)
            paths.push_back(std::move(path));
    }
}

bool Known_Host::unload(const std::string& class_name) {
    const std::unique_lock walked(_walked, std::try_to_lock);
    const std::unique_lock used(_in_use.at(class_name), std::try_to_lock);
    if (!walked || !used)
        return false;
    EXPECT_TRUE(manager.cleanup(class_name, true).ok()) << class_name;
    return true;
}

// ---- A console ----

const Console::Kind Console::KINDS[] = {
    {34, &Console::enumerate}, {15, &Console::list_names}, {15, &Console::get},
    {10, &Console::get_some},  {12, &Console::walk_names}, {3, &Console::walk_all_names},
    {1, &Console::walk_all},   {6, &Console::change},      {3, &Console::let_time_pass},
    {1, &Console::unload},
};

void Console::make_request() {
    std::vector<unsigned> weights;
    for (const Kind& kind : KINDS)
        weights.push_back(kind.weight);
    std::discrete_distribution<std::size_t> choose(weights.begin(), weights.end());
    (this->*KINDS[choose(_random)].make)();
}

void Console::enumerate() {
    const std::string& name = any(_host.classes);
    const auto held = _host.request(name);
    _host.manager.enumerate(name);
}

void Console::list_names() {
    const std::string& name = any(_host.classes);
    const auto held = _host.request(name);
    _host.manager.enumerate_names(name);
}

void Console::get() {
    const host::ObjectPath& path = any(_host.paths);
    const auto held = _host.request(path.class_name);
    _host.manager.get(path);
}

void Console::get_some() {
    const host::ObjectPath& path = any(_host.paths);
    const auto held = _host.request(path.class_name);
    _host.manager.get(path, {{"InstanceID", "DeviceID", "ElementName"}});
}

void Console::walk_names() {
    host::Association_Filter filter;
    filter.via = any(_host.links);
    const auto held = _host.walk();
    _host.manager.associator_names(any(_host.paths), filter);
}

void Console::walk_all_names() {
    const auto held = _host.walk();
    _host.manager.reference_names(any(_host.paths));
}

void Console::walk_all() {
    const auto held = _host.walk();
    _host.manager.associators(any(_host.paths));
}

void Console::change() {
    if (_host.changes.empty())
        return;
    const Prepared_Change& change = any(_host.changes);
    const auto held = _host.request(change.class_name());
    change.make();
}

void Console::let_time_pass() {
    vlnsim_advance(std::uniform_int_distribution<std::uint64_t>(1, MORE_THAN_THE_CACHE)(_random));
}

void Console::unload() {
    _unloads += _host.unload(any(_host.classes));
}

} // namespace hostile
