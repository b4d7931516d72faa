#include "tools/mpcactl/session.h"

#include "tools/mpcactl/failure.h"

#include "host/installation.h"

#include <cstdio>

namespace mpcactl {

namespace {

std::string module_path(const Session_Settings& settings) {
    if (!settings.module.empty())
        return settings.module.find('/') == std::string::npos ? "./" + settings.module
                                                              : settings.module;
    if (!settings.scenario.empty())
        return Simulation::module_path();
    return host::module_path();
}

host::Options host_options(const Session_Settings& settings, const std::string& name_space) {
    host::Options options;
    options.mof_path = settings.mof;
    options.platform_path = settings.platform;
    options.registration_path = settings.registration;
    if (settings.registration.empty() && settings.module.empty())
        options.registration_path = host::registration_path();
    options.name_space = name_space;
    options.answer_limit = settings.answer_limit;
    options.more_name_spaces.push_back("root/vorlan");
    if (settings.trace_calls)
        options.trace = [](const std::string& line) { std::fprintf(stderr, "%s\n", line.c_str()); };
    return options;
}

} // namespace

Session::Session(const Session_Settings& settings, const std::string& name_space) {
    for (const auto& [name, value] :
         {std::pair("--host-root", &settings.host_root), std::pair("--keep", &settings.keep)})
        if (!value->empty() && settings.scenario.empty())
            throw Usage_Error(std::string(name) + " goes with --simulate");
    if (!settings.host_root.empty() && !settings.keep.empty())
        throw Usage_Error("--keep has the host's files in DIR/root; leave out --host-root");
    if (!settings.scenario.empty())
        _simulation = std::make_unique<Simulation>(settings);
    host::Options options = host_options(settings, name_space);
    if (_simulation && options.platform_path.empty())
        options.platform_path = _simulation->platform();
    try {
        _manager = std::make_unique<host::Manager>(std::move(options));
    } catch (const host::Setup_Error& error) {
        throw Usage_Error(error.what());
    }
    if (const host::Status status = _manager->load(module_path(settings)); !status.ok())
        throw Usage_Error("the module cannot be loaded: " + status.message);
}

Simulation& Session::simulation() {
    if (!_simulation)
        throw Usage_Error("there is no simulated hardware without --simulate");
    return *_simulation;
}

const host::Class& Session::known_class(const std::string& name) const {
    const host::Class* known = classes().find(name);
    if (!known)
        throw Usage_Error("unknown class " + shown(name) +
                          host::did_you_mean(name, classes().names()) +
                          "\nmpcactl classes lists those of the module");
    return *known;
}

const host::Class& Session::known_association(const std::string& name) const {
    const host::Class& known = known_class(name);
    if (known.is_association)
        return known;
    std::vector<std::string> associations;
    for (const auto& candidate : classes().classes())
        if (candidate->is_association)
            associations.push_back(candidate->name);
    throw Usage_Error(known.name + " is no association" + host::did_you_mean(name, associations));
}

const host::Method& Session::known_method(const host::Class& known, const std::string& name) const {
    if (const host::Method* method = known.find_method(name))
        return *method;
    std::vector<std::string> names;
    for (const host::Method& method : known.methods)
        names.push_back(method.name);
    throw Usage_Error(
        known.name + " has no method " + shown(name) + host::did_you_mean(name, names) +
        (names.empty() ? "\nIt has no methods." : "\nIts methods: " + host::join_or(names)));
}

host::ObjectPath Session::path(const Command& command) const {
    host::Parsed_Path parsed = host::parse_path(classes(), command.path, command.name_space);
    if (!parsed.error.empty())
        throw Usage_Error("object path: " + parsed.error);
    return std::move(parsed.path);
}

int Session::report() {
    int status = EXIT_FINE;
    std::fflush(stdout);
    if (const std::size_t count = _manager->fault_count(); count > 0) {
        status = EXIT_CIM;
        std::fprintf(stderr, "%zu provider fault%s:\n", count, count == 1 ? "" : "s");
        const std::vector<host::Fault> faults = _manager->faults();
        for (const host::Fault& fault : faults)
            std::fprintf(stderr, "  %s\n", host::to_string(fault).c_str());
        if (faults.size() < count)
            std::fprintf(stderr, "  and %zu more\n", count - faults.size());
        _manager->clear_faults();
    }
    const std::vector<std::string> breaches =
        _simulation ? _simulation->violations(_breaches_told) : std::vector<std::string>();
    if (!breaches.empty()) {
        status = EXIT_CIM;
        _breaches_told += breaches.size();
        std::fprintf(stderr, "%zu breach%s of the libraries' contract:\n", breaches.size(),
                     breaches.size() == 1 ? "" : "es");
        for (const std::string& breach : breaches)
            std::fprintf(stderr, "  %s\n", breach.c_str());
    }
    return status;
}

int Session::finish() {
    _manager->close();
    if (_simulation)
        _simulation->keep();
    return report();
}

} // namespace mpcactl
