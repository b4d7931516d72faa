#include "tests/cimple/fake_broker.h"

#include <algorithm>
#include <atomic>
#include <mutex>

// What the engine does not call is left out of the tables.
#pragma GCC diagnostic ignored "-Wmissing-field-initializers"

namespace fake {

// Every CMPI object is a pair of pointers; this one knows the rest.
struct Broker::Handle {
    void* hdl;
    const void* table;
    Broker* owner;
    Data_Ref data;
    bool parameter;
    std::size_t position = 0; // of an enumeration
};

namespace {

using Handle = Broker::Handle;

constexpr CMPIStatus OK = {CMPI_RC_OK, nullptr};
constexpr CMPIStatus FAILED = {CMPI_RC_ERR_FAILED, nullptr};

std::recursive_mutex the_mutex; // the engine may call from several threads

const Handle* handle(const void* object) {
    return static_cast<const Handle*>(object);
}
Handle* handle(void* object) {
    return static_cast<Handle*>(object);
}
Broker& owner(const void* object) {
    return *handle(object)->owner;
}
Data& data(const void* object) {
    return *handle(object)->data;
}

void set(CMPIStatus* status, CMPIStatus value) {
    if (status)
        *status = value;
}

bool is_object(CMPIType type) {
    return (type & CMPI_ARRAY) || type >= CMPI_instance;
}

template <class Object>
CMPIStatus release(Object* object) {
    const std::lock_guard guard(the_mutex);
    owner(object).free(handle(object));
    return OK;
}

// ---- Values in and out of containers ----

Value store(const CMPIValue* value, CMPIType type) {
    Value stored;
    stored.type = type;
    if (!value) {
        stored.state = CMPI_nullValue;
        return stored;
    }
    if (type == CMPI_chars)
        return text(reinterpret_cast<const char*>(value)); // which it is
    if (is_object(type))
        stored.object = handle(static_cast<void*>(value->inst))->data;
    else
        stored.scalar = *value;
    return stored;
}

extern CMPIInstanceFT instance_table;
extern CMPIObjectPathFT path_table;
extern CMPIArgsFT args_table;
extern CMPIStringFT string_table;
extern CMPIArrayFT array_table;
extern CMPIDateTimeFT datetime_table;
extern CMPIEnumerationFT enumeration_table;
extern CMPIContextFT context_table;
extern CMPIResultFT result_table;

const void* table_for(CMPIType type) {
    if (type & CMPI_ARRAY)
        return &array_table;
    switch (type) {
    case CMPI_instance:
        return &instance_table;
    case CMPI_ref:
        return &path_table;
    case CMPI_dateTime:
        return &datetime_table;
    default:
        return &string_table;
    }
}

// What a container hands out goes with it, and is not the engine's to release.
CMPIData load(Broker& broker, const Value& value, bool contained = true) {
    CMPIData loaded{};
    loaded.type = value.type;
    loaded.state = value.state;
    loaded.value = value.scalar;
    if (value.object)
        loaded.value.inst = reinterpret_cast<CMPIInstance*>(
            broker.make(table_for(value.type), value.object, contained));
    return loaded;
}

CMPIString* make_string(Broker& broker, std::string text) {
    auto made = std::make_shared<Data>();
    made->text = std::move(text);
    return reinterpret_cast<CMPIString*>(broker.make(&string_table, made));
}

CMPIStatus set_member(const void* container, const char* function, const char* name,
                      const CMPIValue* value, CMPIType type) {
    const std::lock_guard guard(the_mutex);
    if (owner(container).fails(function))
        return FAILED;
    Data& held = data(container);
    if (held.filter) {
        const auto wanted = [name](const std::string& n) { return n == name; };
        if (std::none_of(held.filter->begin(), held.filter->end(), wanted))
            return OK;
    }
    held.members.emplace_back(name, store(value, type));
    return OK;
}

CMPIData get_member(const void* container, const char* function, const char* name,
                    CMPIStatus* status) {
    const std::lock_guard guard(the_mutex);
    const Value* value = data(container).find(name);
    if (owner(container).fails(function) || !value) {
        set(status, FAILED);
        return {};
    }
    return load(owner(container), *value);
}

CMPIData get_member_at(const void* container, const char* function, CMPICount index,
                       CMPIString** name, CMPIStatus* status) {
    const std::lock_guard guard(the_mutex);
    const Data& held = data(container);
    if (owner(container).fails(function) || index >= held.members.size()) {
        set(status, FAILED);
        return {};
    }
    if (name)
        *name = make_string(owner(container), held.members[index].first);
    return load(owner(container), held.members[index].second);
}

// A getter that the test may make fail.
template <class Get>
auto get(const void* object, const char* function, CMPIStatus* status, Get value) {
    const std::lock_guard guard(the_mutex);
    if (!owner(object).fails(function))
        return value(data(object));
    set(status, FAILED);
    return decltype(value(data(object))){};
}

CMPICount count_members(const void* container, const char* function, CMPIStatus* status) {
    const std::lock_guard guard(the_mutex);
    if (owner(container).fails(function))
        set(status, FAILED);
    return static_cast<CMPICount>(data(container).members.size());
}

// ---- Tables of objects ----

CMPIInstanceFT instance_table = {
    .ftVersion = CMPICurrentVersion,
    .release = release<CMPIInstance>,
    .getPropertyAt =
        [](const CMPIInstance* i, CMPICount index, CMPIString** name, CMPIStatus* status) {
            return get_member_at(i, "getPropertyAt", index, name, status);
        },
    .getPropertyCount =
        [](const CMPIInstance* i, CMPIStatus* status) {
            return count_members(i, "getPropertyCount", status);
        },
    .setProperty = [](const CMPIInstance* i, const char* name, const CMPIValue* value,
                      CMPIType type) { return set_member(i, "setProperty", name, value, type); },
    .getObjectPath =
        [](const CMPIInstance* i, CMPIStatus* status) {
            return get(i, "getObjectPath", status, [i](const Data& held) {
                return reinterpret_cast<CMPIObjectPath*>(owner(i).make(&path_table, held.path));
            });
        },
    .setPropertyFilter =
        [](CMPIInstance* i, const char** properties, const char** keys) {
            std::vector<std::string> names;
            for (const char** list : {properties, keys})
                for (; list && *list; list++)
                    names.emplace_back(*list);
            data(i).filter = names;
            return OK;
        },
};

CMPIObjectPathFT path_table = {
    .ftVersion = CMPICurrentVersion,
    .release = release<CMPIObjectPath>,
    .getNameSpace =
        [](const CMPIObjectPath* p, CMPIStatus* status) {
            return get(p, "getNameSpace", status,
                       [p](const Data& held) { return make_string(owner(p), held.name_space); });
        },
    .getClassName =
        [](const CMPIObjectPath* p, CMPIStatus* status) {
            return get(p, "getClassName", status,
                       [p](const Data& held) { return make_string(owner(p), held.text); });
        },
    .addKey = [](CMPIObjectPath* p, const char* name, const CMPIValue* value,
                 CMPIType type) { return set_member(p, "addKey", name, value, type); },
    .getKey = [](const CMPIObjectPath* p, const char* name,
                 CMPIStatus* status) { return get_member(p, "getKey", name, status); },
    .getKeyAt =
        [](const CMPIObjectPath* p, CMPICount index, CMPIString** name, CMPIStatus* status) {
            return get_member_at(p, "getKeyAt", index, name, status);
        },
    .getKeyCount = [](const CMPIObjectPath* p,
                      CMPIStatus* status) { return count_members(p, "getKeyCount", status); },
};

CMPIArgsFT args_table = {
    .ftVersion = CMPICurrentVersion,
    .release = release<CMPIArgs>,
    .addArg = [](const CMPIArgs* a, const char* name, const CMPIValue* value,
                 CMPIType type) { return set_member(a, "addArg", name, value, type); },
    .getArgAt =
        [](const CMPIArgs* a, CMPICount index, CMPIString** name, CMPIStatus* status) {
            return get_member_at(a, "getArgAt", index, name, status);
        },
    .getArgCount = [](const CMPIArgs* a,
                      CMPIStatus* status) { return count_members(a, "getArgCount", status); },
};

CMPIStringFT string_table = {
    .ftVersion = CMPICurrentVersion,
    .release = release<CMPIString>,
    .getCharPtr =
        [](const CMPIString* s, CMPIStatus* status) {
            return get(s, "getCharPtr", status, [](const Data& held) { return held.text.c_str(); });
        },
};

CMPIArrayFT array_table = {
    .ftVersion = CMPICurrentVersion,
    .release = release<CMPIArray>,
    .getSize =
        [](const CMPIArray* a, CMPIStatus* status) {
            const std::lock_guard guard(the_mutex);
            if (owner(a).fails("getSize"))
                set(status, FAILED);
            return static_cast<CMPICount>(data(a).elements.size());
        },
    .getElementAt = [](const CMPIArray* a, CMPICount index, CMPIStatus* status) -> CMPIData {
        const std::lock_guard guard(the_mutex);
        if (owner(a).fails("getElementAt") || index >= data(a).elements.size()) {
            set(status, FAILED);
            return {};
        }
        return load(owner(a), data(a).elements[index]);
    },
    .setElementAt =
        [](CMPIArray* a, CMPICount index, const CMPIValue* value, CMPIType type) {
            const std::lock_guard guard(the_mutex);
            if (owner(a).fails("setElementAt") || index >= data(a).elements.size())
                return FAILED;
            data(a).elements[index] = store(value, type);
            if (value && is_object(type))
                owner(a).keep(handle(static_cast<void*>(value->inst)));
            return OK;
        },
};

CMPIDateTimeFT datetime_table = {
    .ftVersion = CMPICurrentVersion,
    .release = release<CMPIDateTime>,
    .getStringFormat =
        [](const CMPIDateTime* d, CMPIStatus* status) {
            return get(d, "getStringFormat", status,
                       [d](const Data& held) { return make_string(owner(d), held.text); });
        },
};

CMPIEnumerationFT enumeration_table = {
    .ftVersion = CMPICurrentVersion,
    .release = release<CMPIEnumeration>,
    .getNext = [](const CMPIEnumeration* e, CMPIStatus* status) -> CMPIData {
        const std::lock_guard guard(the_mutex);
        if (owner(e).fails("getNext"))
            set(status, FAILED);
        Handle* state = const_cast<Handle*>(handle(e));
        return load(owner(e), data(e).elements[state->position++]);
    },
    .hasNext = [](const CMPIEnumeration* e, CMPIStatus*) -> CMPIBoolean {
        return handle(e)->position < data(e).elements.size();
    },
};

CMPIContextFT context_table = {
    .ftVersion = CMPICurrentVersion,
    .release = release<CMPIContext>,
    .getEntry = [](const CMPIContext*, const char*, CMPIStatus* status) -> CMPIData {
        set(status, {CMPI_RC_ERR_NOT_FOUND, nullptr}); // it has none
        return {};
    },
};

CMPIResultFT result_table = {
    .ftVersion = CMPICurrentVersion,
    .release = release<CMPIResult>,
    .returnData =
        [](const CMPIResult* r, const CMPIValue* value, CMPIType type) {
            owner(r).returned_data.push_back(store(value, type));
            return OK;
        },
    .returnInstance =
        [](const CMPIResult* r, const CMPIInstance* i) {
            const std::lock_guard guard(the_mutex);
            owner(r).returned_instances.push_back(handle(i)->data);
            return OK;
        },
    .returnObjectPath =
        [](const CMPIResult* r, const CMPIObjectPath* p) {
            const std::lock_guard guard(the_mutex);
            owner(r).returned_paths.push_back(handle(p)->data);
            return OK;
        },
    .returnDone =
        [](const CMPIResult* r) {
            owner(r).done++;
            return OK;
        },
};

// ---- Tables of the broker ----

Broker& self(const CMPIBroker* broker) {
    return *static_cast<Broker*>(broker->hdl);
}

template <class Object>
Object* make_new(const CMPIBroker* broker, const char* function, const void* table, Data_Ref made,
                 CMPIStatus* status) {
    const std::lock_guard guard(the_mutex);
    if (self(broker).fails(function)) {
        set(status, FAILED);
        return nullptr;
    }
    return reinterpret_cast<Object*>(self(broker).make(table, std::move(made)));
}

// Notes an up-call and answers the scripted status.
CMPIStatus upcall(const CMPIBroker* broker, const std::string& name, const CMPIObjectPath* path) {
    const std::lock_guard guard(the_mutex);
    Broker& fake = self(broker);
    fake.upcalls.push_back(path ? name + " " + data(path).name_space + ":" + data(path).text
                                : name);
    return {fake.upcall_status, nullptr};
}

CMPIBrokerFT broker_table = {
    .brokerCapabilities = 0,
    .brokerVersion = CMPICurrentVersion,
    .brokerName = "fake",
    .prepareAttachThread = [](const CMPIBroker* b, const CMPIContext*) -> CMPIContext* {
        if (self(b).fails("prepareAttachThread"))
            return nullptr;
        upcall(b, "prepareAttachThread", nullptr);
        return make_new<CMPIContext>(b, "", &context_table, std::make_shared<Data>(), nullptr);
    },
    .attachThread = [](const CMPIBroker* b,
                       const CMPIContext*) { return upcall(b, "attachThread", nullptr); },
    .detachThread =
        [](const CMPIBroker* b, const CMPIContext* c) {
            const CMPIStatus status = upcall(b, "detachThread", nullptr);
            release(const_cast<CMPIContext*>(c));
            return status;
        },
    .deliverIndication =
        [](const CMPIBroker* b, const CMPIContext*, const char* ns, const CMPIInstance* i) {
            self(b).indications.emplace_back(ns, handle(i)->data);
            return OK;
        },
    .getInstance = [](const CMPIBroker* b, const CMPIContext*, const CMPIObjectPath* p,
                      const char**, CMPIStatus* status) -> CMPIInstance* {
        set(status, upcall(b, "getInstance", p));
        if (self(b).upcall_instances.empty())
            return nullptr;
        return make_new<CMPIInstance>(b, "", &instance_table, self(b).upcall_instances[0], nullptr);
    },
    .createInstance = [](const CMPIBroker* b, const CMPIContext*, const CMPIObjectPath* p,
                         const CMPIInstance* i, CMPIStatus* status) -> CMPIObjectPath* {
        set(status, upcall(b, "createInstance", p));
        self(b).upcall_instances.push_back(handle(i)->data);
        return nullptr;
    },
    .modifyInstance =
        [](const CMPIBroker* b, const CMPIContext*, const CMPIObjectPath* p, const CMPIInstance* i,
           const char**) {
            self(b).upcall_instances.push_back(handle(i)->data);
            return upcall(b, "modifyInstance", p);
        },
    .deleteInstance = [](const CMPIBroker* b, const CMPIContext*,
                         const CMPIObjectPath* p) { return upcall(b, "deleteInstance", p); },
    .enumerateInstances =
        [](const CMPIBroker* b, const CMPIContext*, const CMPIObjectPath* p, const char**,
           CMPIStatus* status) {
            set(status, upcall(b, "enumInstances", p));
            auto made = std::make_shared<Data>();
            for (const Data_Ref& instance : self(b).upcall_instances)
                made->elements.push_back(object(CMPI_instance, instance));
            return make_new<CMPIEnumeration>(b, "", &enumeration_table, made, nullptr);
        },
    .invokeMethod = [](const CMPIBroker* b, const CMPIContext*, const CMPIObjectPath* p,
                       const char* method, const CMPIArgs* in, CMPIArgs* out,
                       CMPIStatus* status) -> CMPIData {
        set(status, upcall(b, std::string("invokeMethod ") + method, p));
        auto arguments = std::make_shared<Data>(data(in));
        self(b).upcall_instances.push_back(arguments);
        data(out).members = self(b).method_outputs;
        return load(self(b), self(b).method_result, false);
    },
};

CMPIBrokerEncFT object_table = {
    .ftVersion = CMPICurrentVersion,
    .newInstance =
        [](const CMPIBroker* b, const CMPIObjectPath* p, CMPIStatus* status) {
            auto made = std::make_shared<Data>();
            made->path = handle(p)->data;
            return make_new<CMPIInstance>(b, "newInstance", &instance_table, made, status);
        },
    .newObjectPath =
        [](const CMPIBroker* b, const char* ns, const char* cn, CMPIStatus* status) {
            return make_new<CMPIObjectPath>(b, "newObjectPath", &path_table, path_data(ns, cn),
                                            status);
        },
    .newArgs =
        [](const CMPIBroker* b, CMPIStatus* status) {
            return make_new<CMPIArgs>(b, "newArgs", &args_table, std::make_shared<Data>(), status);
        },
    .newString =
        [](const CMPIBroker* b, const char* chars, CMPIStatus* status) {
            auto made = std::make_shared<Data>();
            made->text = chars;
            return make_new<CMPIString>(b, "newString", &string_table, made, status);
        },
    .newArray =
        [](const CMPIBroker* b, CMPICount size, CMPIType type, CMPIStatus* status) {
            auto made = std::make_shared<Data>();
            made->elements.resize(size, null(type));
            return make_new<CMPIArray>(b, "newArray", &array_table, made, status);
        },
    .newDateTimeFromChars =
        [](const CMPIBroker* b, const char* chars, CMPIStatus* status) {
            auto made = std::make_shared<Data>();
            made->text = chars;
            return make_new<CMPIDateTime>(b, "newDateTimeFromChars", &datetime_table, made, status);
        },
};

} // namespace

// ---- Broker ----

Broker::Broker() : broker{this, &broker_table, &object_table, nullptr} {}

Broker::~Broker() = default;

Broker::Handle* Broker::make(const void* table, Data_Ref made, bool parameter) {
    _handles.push_back(std::make_unique<Handle>());
    Handle* handle = _handles.back().get();
    *handle = {handle, table, this, std::move(made), parameter};
    _live += !parameter;
    return handle;
}

void Broker::free(Handle* handle) {
    if (handle->parameter) {
        released_parameters++;
        return;
    }
    const auto same = [handle](const std::unique_ptr<Handle>& h) { return h.get() == handle; };
    _handles.erase(std::find_if(_handles.begin(), _handles.end(), same));
    _live--;
}

void Broker::keep(Handle* handle) {
    handle->parameter = true;
    _live--;
}

void Broker::end_call() {
    const std::lock_guard guard(the_mutex);
    std::erase_if(_handles, [](const std::unique_ptr<Handle>& h) { return !h->parameter; });
    _live = 0;
}

CMPIObjectPath* Broker::path(const Data_Ref& data) {
    return reinterpret_cast<CMPIObjectPath*>(make(&path_table, data, true));
}
CMPIObjectPath* Broker::path(const char* name_space, const char* class_name, Members keys) {
    return path(path_data(name_space, class_name, std::move(keys)));
}
CMPIInstance* Broker::instance(const Data_Ref& data) {
    return reinterpret_cast<CMPIInstance*>(make(&instance_table, data, true));
}
CMPIArgs* Broker::args(Members members) {
    auto data = std::make_shared<Data>();
    data->members = std::move(members);
    return reinterpret_cast<CMPIArgs*>(make(&args_table, data, true));
}
CMPIContext* Broker::context() {
    return reinterpret_cast<CMPIContext*>(make(&context_table, std::make_shared<Data>(), true));
}
CMPIResult* Broker::result() {
    return reinterpret_cast<CMPIResult*>(make(&result_table, std::make_shared<Data>(), true));
}

const Data& Broker::data(const void* object) {
    return *handle(object)->data;
}

void Broker::clear_results() {
    returned_paths.clear();
    returned_instances.clear();
    returned_data.clear();
    indications.clear();
    upcalls.clear();
    done = 0;
}

bool Broker::fails(const char* function) {
    const auto failure = failures.find(function);
    if (failure == failures.end())
        return false;
    return failure->second == 0 || --failure->second == 0;
}

} // namespace fake
