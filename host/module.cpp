#include "host/module.h"

#include "host/core.h"
#include "host/request.h"

#include <dlfcn.h>

namespace host {

Module::~Module() {
    close();
}

std::string Module::open(const std::string& path, const ClassRepository& classes) {
    if (_library)
        return "a module is loaded already";
    _library = dlopen(path.c_str(), RTLD_NOW | RTLD_LOCAL);
    if (!_library) {
        const char* why = dlerror();
        return why ? why : path + ": cannot be loaded";
    }
    for (const auto& known : classes.classes()) {
        if (symbol(*known, "Instance"))
            _served.insert(known.get());
        if (known->is_association && symbol(*known, "Association"))
            _associations.insert(known.get());
    }
    return "";
}

void Module::close() {
    _providers.clear();
    _served.clear();
    _associations.clear();
    if (_library)
        dlclose(_library);
    _library = nullptr;
}

void* Module::symbol(const Class& known, const char* kind) const {
    const std::string name = known.name + "_Provider_Create_" + kind + "MI";
    return _library ? dlsym(_library, name.c_str()) : nullptr;
}

Provider& Module::provider(const Class& known) {
    const std::lock_guard lock(_mutex);
    std::unique_ptr<Provider>& slot = _providers[&known];
    if (!slot)
        slot = std::make_unique<Provider>();
    return *slot;
}

namespace {

Status no_provider(const Class& known, const char* kind) {
    return {CMPI_RC_ERR_NOT_SUPPORTED, "the module has no provider for this kind of request (" +
                                           std::string(kind) + ") to " + known.name};
}

// The tables must be of this level, as every slot is called without further ado.
template <class MI>
bool is_usable(Core& core, const Class& known, const MI* made) {
    const char* wrong = !made->ft                              ? "without a function table"
                        : made->ft->ftVersion < CMPIVersion100 ? "with a table below level 1.00"
                        : !made->ft->cleanup                   ? "without a cleanup function"
                                                               : nullptr;
    if (wrong)
        report(&core, FaultKind::interface, known.name + ": an interface " + wrong);
    return !wrong;
}

} // namespace

static ProviderBroker& new_broker(Core& core, const Class& known) {
    const std::lock_guard lock(core.brokers_mutex);
    return core.brokers.emplace_back(core, known.name);
}

template <class MI>
MI* Module::interface(Core& core, const Class& known, MI* Provider::*member, const char* kind,
                      Status& status) {
    Provider& mine = provider(known);
    if (mine.is_leaving) {
        status = {CMPI_RC_ERR_FAILED, "the provider of " + known.name + " is being unloaded"};
        return nullptr;
    }
    const std::lock_guard lock(mine.mutex);
    if (mine.*member)
        return mine.*member;
    using Factory = MI* (*)(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
    const auto factory = reinterpret_cast<Factory>(symbol(known, kind));
    if (!factory) {
        status = no_provider(known, kind);
        return nullptr;
    }
    Request request(core, known, "factory", core.options.name_space);
    CMPIStatus cmpi_status = {CMPI_RC_OK, nullptr};
    if (!mine.broker)
        mine.broker = &new_broker(core, known);
    MI* made = factory(&mine.broker->cmpi, request.context(), &cmpi_status);
    status = request.finish(cmpi_status);
    if (status.ok() && (!made || !is_usable(core, known, made)))
        status = {CMPI_RC_ERR_FAILED, "the factory of " + known.name + " made no interface"};
    if (!status.ok())
        return nullptr;
    return mine.*member = made;
}

CMPIInstanceMI* Module::instance(Core& core, const Class& known, Status& status) {
    return interface(core, known, &Provider::instance, "Instance", status);
}

CMPIAssociationMI* Module::association(Core& core, const Class& known, Status& status) {
    return interface(core, known, &Provider::association, "Association", status);
}

CMPIMethodMI* Module::method(Core& core, const Class& known, Status& status) {
    return interface(core, known, &Provider::method, "Method", status);
}

template <class MI>
void Module::cleanup_one(Core& core, const Class& known, Provider& mine, MI* Provider::*member,
                         bool terminating, Status& first) {
    if (!(mine.*member))
        return;
    Request request(core, known, "cleanup", core.options.name_space);
    const CMPIStatus cmpi_status =
        (mine.*member)->ft->cleanup(mine.*member, request.context(), terminating);
    const Status status = request.finish(cmpi_status);
    if (status.ok() || terminating)
        mine.*member = nullptr;
    if (first.ok() && !status.ok())
        first = status;
}

Status Module::cleanup(Core& core, bool terminating, const Class* only) {
    Status first;
    std::vector<std::pair<const Class*, Provider*>> all;
    {
        const std::lock_guard lock(_mutex);
        for (const auto& known : core.classes.classes())
            if (const auto found = _providers.find(known.get());
                found != _providers.end() && (!only || only == known.get()))
                all.emplace_back(known.get(), found->second.get());
    }
    for (const auto& [known, mine] : all) {
        mine->is_leaving = true;
        const std::lock_guard lock(mine->mutex);
        cleanup_one(core, *known, *mine, &Provider::instance, terminating, first);
        cleanup_one(core, *known, *mine, &Provider::association, terminating, first);
        cleanup_one(core, *known, *mine, &Provider::method, terminating, first);
        if (mine->broker && !mine->instance && !mine->association && !mine->method) {
            mine->broker->is_dead = true;
            mine->broker = nullptr;
        }
        mine->is_leaving = false;
    }
    return first;
}

} // namespace host
