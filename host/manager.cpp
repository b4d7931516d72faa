#include "host/manager.h"

#include "host/answer_size.h"
#include "host/core.h"
#include "host/operations.h"

#include <numeric>

namespace host {

namespace {

// An answer as it goes to a client: whole, or not at all if it is larger than may be sent.
template <class T, class Size_Of>
Reply<std::vector<T>> limited(Core& core, Reply<std::vector<T>> reply, Size_Of size_of) {
    const std::size_t limit = core.options.strict ? core.options.answer_limit : 0;
    if (limit == 0)
        return reply;
    std::size_t size = 0;
    for (const T& object : reply.value)
        size += size_of(object);
    std::size_t peak = core.answer_peak;
    while (size > peak && !core.answer_peak.compare_exchange_weak(peak, size)) {
    }
    if (size > limit)
        return {{CMPI_RC_ERR_FAILED, "an answer of " + std::to_string(size) + " bytes, where " +
                                         std::to_string(limit) + " may be sent: ask for less"},
                {}};
    return reply;
}

Reply<std::vector<Instance>> limited(Core& core, Reply<std::vector<Instance>> reply,
                                     const Property_List& properties, Path_Form form) {
    return limited(core, std::move(reply), [&](const Instance& instance) {
        return xml_size(instance, properties ? nullptr : core.classes.find(instance.class_name()),
                        form);
    });
}

Reply<std::vector<ObjectPath>> limited(Core& core, Reply<std::vector<ObjectPath>> reply,
                                       Path_Form form) {
    return limited(core, std::move(reply),
                   [&](const ObjectPath& path) { return xml_size(path, form); });
}

} // namespace

Manager::Manager(Options options) : _core(std::make_shared<Core>(std::move(options))) {}

Manager::~Manager() {
    close();
}

Status Manager::load(const std::string& module_path) {
    const std::string wrong = _core->module.open(module_path, _core->classes);
    return wrong.empty() ? Status{} : Status{CMPI_RC_ERR_FAILED, wrong};
}

Status Manager::cleanup(bool terminating) {
    return _core->module.cleanup(*_core, terminating);
}

Status Manager::cleanup(const std::string& class_name, bool terminating) {
    const Class* known = _core->classes.find(class_name);
    if (!known)
        return {CMPI_RC_ERR_INVALID_CLASS, "unknown class " + class_name};
    return _core->module.cleanup(*_core, terminating, known);
}

void Manager::abandon() {
    _core->module.close();
}

void Manager::close() {
    if (_core->module.is_open()) {
        cleanup(true);
        _core->module.close();
    }
    _core->report_leaks();
}

const Options& Manager::options() const {
    return _core->options;
}

const ClassRepository& Manager::classes() const {
    return _core->classes;
}

std::vector<const Class*> Manager::provider_classes() const {
    std::vector<const Class*> served;
    for (const auto& known : _core->classes.classes())
        if (_core->module.serves(*known))
            served.push_back(known.get());
    return served;
}

bool Manager::serves(const Class& known) const {
    return _core->module.serves(known);
}

bool Manager::serves(const Class& known, const std::string& name_space) const {
    const auto& registration = _core->registration;
    return _core->module.serves(known) &&
           registration.check(known.name, Interface::instance, name_space).ok() &&
           (!known.is_association ||
            registration.check(known.name, Interface::association, name_space).ok());
}

Parsed_Path Manager::parse_path(std::string_view text) const {
    return host::parse_path(_core->classes, text, _core->options.name_space);
}

Reply<std::vector<Instance>> Manager::enumerate(const std::string& class_name,
                                                const Property_List& properties,
                                                const std::string& name_space) {
    Target target;
    if (Status status = find_target(*_core, class_name, name_space, Interface::instance, target);
        !status.ok())
        return {status, {}};
    return limited(*_core, host::enumerate(*_core, target, properties), properties,
                   Path_Form::keys);
}

Reply<std::vector<ObjectPath>> Manager::enumerate_names(const std::string& class_name,
                                                        const std::string& name_space) {
    Target target;
    if (Status status = find_target(*_core, class_name, name_space, Interface::instance, target);
        !status.ok())
        return {status, {}};
    return limited(*_core, host::enumerate_names(*_core, target), Path_Form::keys);
}

namespace {

// Completes the namespace, and finds who is asked.
Status prepare(Core& core, ObjectPath& path, Target& target, Interface kind = Interface::instance) {
    Status status = find_target(core, path.class_name, path.name_space, kind, target);
    path.name_space = target.name_space;
    return status;
}

} // namespace

Reply<Instance> Manager::get(const ObjectPath& path, const Property_List& properties) {
    ObjectPath complete = path;
    Target target;
    Status status = prepare(*_core, complete, target);
    if (status.ok())
        status = check_complete(*_core, complete);
    if (!status.ok())
        return {status, {}};
    return host::get(*_core, target, complete, properties);
}

Reply<ObjectPath> Manager::create(const Instance& instance) {
    Instance fitted = instance;
    Target target;
    Status status = prepare(*_core, fitted.path, target);
    if (status.ok())
        status = check_instance(*_core, fitted, false);
    if (!status.ok())
        return {status, {}};
    return host::create(*_core, target, fitted);
}

Status Manager::modify(const Instance& instance, const Property_List& properties) {
    Instance fitted = instance;
    Target target;
    Status status = prepare(*_core, fitted.path, target);
    if (status.ok())
        status = check_instance(*_core, fitted, true);
    return status.ok() ? host::modify(*_core, target, fitted, properties) : status;
}

Status Manager::remove(const ObjectPath& path) {
    ObjectPath complete = path;
    Target target;
    Status status = prepare(*_core, complete, target);
    if (status.ok())
        status = check_complete(*_core, complete);
    return status.ok() ? host::remove(*_core, target, complete) : status;
}

Reply<std::vector<Instance>> Manager::associators(const ObjectPath& path,
                                                  const Association_Filter& filter,
                                                  const Property_List& properties) {
    return limited(*_core, walk(*_core, path, Walk::associators, filter, properties), properties,
                   Path_Form::complete);
}

Reply<std::vector<ObjectPath>> Manager::associator_names(const ObjectPath& path,
                                                         const Association_Filter& filter) {
    return limited(*_core, walk_names(*_core, path, Walk::associators, filter),
                   Path_Form::complete);
}

Reply<std::vector<Instance>> Manager::references(const ObjectPath& path,
                                                 const Association_Filter& filter,
                                                 const Property_List& properties) {
    const Association_Filter own{filter.via, "", filter.role, ""};
    return limited(*_core, walk(*_core, path, Walk::references, own, properties), properties,
                   Path_Form::complete);
}

Reply<std::vector<ObjectPath>> Manager::reference_names(const ObjectPath& path,
                                                        const Association_Filter& filter) {
    const Association_Filter own{filter.via, "", filter.role, ""};
    return limited(*_core, walk_names(*_core, path, Walk::references, own), Path_Form::complete);
}

Reply<Method_Result> Manager::invoke(const ObjectPath& path, const std::string& method,
                                     const Named_Values& inputs) {
    ObjectPath complete = path;
    Named_Values fitted = inputs;
    Target target;
    Status status = prepare(*_core, complete, target, Interface::method);
    if (status.ok())
        status = check_inputs(*_core, *target.known, method, fitted);
    if (status.ok() && !(complete.keys.empty() && target.known->find_method(method)->is_static))
        status = check_complete(*_core, complete);
    if (!status.ok())
        return {status, {}};
    return host::invoke(*_core, target, complete, method, fitted);
}

std::vector<Fault> Manager::faults() const {
    return _core->faults.all();
}

std::size_t Manager::fault_count() const {
    return _core->faults.count();
}

void Manager::clear_faults() {
    _core->faults.clear();
}

Live_Counts Manager::live_objects() const {
    return _core->counters.snapshot();
}

std::size_t Manager::live_object_count() const {
    const Live_Counts counts = live_objects();
    return std::accumulate(counts.begin(), counts.end(), std::size_t{0});
}

Statistics Manager::statistics() const {
    return {_core->calls, _core->up_calls,      _core->counters.created,
            _core->left,  _core->counters.peak, _core->answer_peak};
}

void Manager::restart_peak() {
    _core->counters.peak = _core->counters.alive.load();
    _core->answer_peak = 0;
}

std::vector<Indication> Manager::indications() const {
    const std::lock_guard lock(_core->records_mutex);
    return _core->indications;
}

std::vector<Log_Message> Manager::log_messages() const {
    const std::lock_guard lock(_core->records_mutex);
    return _core->messages;
}

} // namespace host
