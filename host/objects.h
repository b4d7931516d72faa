// The CMPI objects of this object manager, a body and a function table for each kind.
//
// A table function may be handed anything by a provider: it examines the pointer first, and a bad
// one is a fault of the provider and CMPI_RC_ERR_INVALID_HANDLE. Running out of memory ends the
// process.
#ifndef HOST_OBJECTS_H
#define HOST_OBJECTS_H

#include "host/class_repository.h"
#include "host/faults.h"
#include "host/object_store.h"
#include "host/value.h"

#include <optional>
#include <string>
#include <vector>

namespace host {

class Core;

struct StringBody : Body {
    static constexpr Kind kind = Kind::string;
    using Cmpi = CMPIString;
    static const CMPIStringFT table;
    void poison() override;
    explicit StringBody(std::string value) : text(std::move(value)) {}
    StringBody(const StringBody&) = default;

    std::string text;
};

struct ArrayBody : Body {
    static constexpr Kind kind = Kind::array;
    using Cmpi = CMPIArray;
    static const CMPIArrayFT table;

    // Some object managers keep the object that an element was set from: it must live on.
    struct Held {
        const Object* object = nullptr;
        std::uint64_t serial = 0;
    };
    CMPIType element_type = CMPI_null;
    std::vector<Value> elements;
    std::vector<Held> held; // as long as elements
};

struct DateTimeBody : Body {
    static constexpr Kind kind = Kind::datetime;
    using Cmpi = CMPIDateTime;
    static const CMPIDateTimeFT table;

    std::string text; // 25 characters
};

struct ObjectPathBody : Body {
    static constexpr Kind kind = Kind::object_path;
    using Cmpi = CMPIObjectPath;
    static const CMPIObjectPathFT table;

    ObjectPath path;
    std::string host_name;
    const Class* known = nullptr; // null: the schema has no class of that name
};

struct InstanceBody : Body {
    static constexpr Kind kind = Kind::instance;
    using Cmpi = CMPIInstance;
    static const CMPIInstanceFT table;

    ObjectPath path; // keys as given with the path; key properties go before them
    const Class* known = nullptr;
    std::vector<std::optional<Value>> values; // one for each property of the class
    std::optional<std::vector<bool>> wanted;  // after setPropertyFilter
};

struct ArgsBody : Body {
    static constexpr Kind kind = Kind::args;
    using Cmpi = CMPIArgs;
    static const CMPIArgsFT table;

    Named_Values values;
    const Method* outputs_of = nullptr; // the method that this takes the outputs of, if known
};

// What a call into a provider may answer.
enum class Answer { nothing, instances, paths, data };

struct ResultBody : Body {
    static constexpr Kind kind = Kind::result;
    using Cmpi = CMPIResult;
    static const CMPIResultFT table;

    Answer answer = Answer::nothing;
    std::string name_space;          // for paths that name none
    const Class* of_class = nullptr; // what is answered must be of this class; null: any
    const Slot_Type* data_type = nullptr;
    std::vector<Instance> instances;
    std::vector<ObjectPath> paths;
    std::optional<Value> data;
    bool done = false;
};

struct EnumerationBody : Body {
    static constexpr Kind kind = Kind::enumeration;
    using Cmpi = CMPIEnumeration;
    static const CMPIEnumerationFT table;

    CMPIType element_type = CMPI_instance;
    std::vector<Value> elements;
    std::size_t next = 0;
};

struct ContextBody : Body {
    static constexpr Kind kind = Kind::context;
    using Cmpi = CMPIContext;
    static const CMPIContextFT table;

    Named_Values entries;
    bool for_thread = false; // made by prepareAttachThread
    bool attached = false;
};

struct SelectExpBody : Body {
    static constexpr Kind kind = Kind::select_expression;
    using Cmpi = CMPISelectExp;
    static const CMPISelectExpFT table;

    std::string query;
    std::string language;
};

// Who frees an object.
enum class Owner {
    call,      // the end of the present call, or the provider before that
    caller,    // the provider: what clone returns
    parameter, // the end of the present call only
};

// The arena for a new object; outside any call that is a fault of the provider.
Arena& arena_for(Core& core, Owner owner);

// What an object contains goes with it, and is nobody's to release, as object managers have it that
// hand out their own data.
inline Arena& contents_of(const void* object) {
    return static_cast<const Object*>(object)->body->contents;
}

template <class B>
typename B::Cmpi* make(Core& core, B body, Owner owner = Owner::call) {
    Object* object = create_object(core, B::kind, &B::table, std::make_unique<B>(std::move(body)),
                                   arena_for(core, owner));
    object->parameter = owner == Owner::parameter;
    return reinterpret_cast<typename B::Cmpi*>(object);
}

// Examines a pointer that a provider handed in. Null, after a fault was recorded, if it is not a
// live object of the kind; use names the function for the report.
Object* examine_use(const void* pointer, Kind kind, const char* use);

template <class B>
B* body_of(const typename B::Cmpi* pointer, const char* use) {
    Object* object = examine_use(pointer, B::kind, use);
    return object ? static_cast<B*>(object->body) : nullptr;
}

// The core that made the object; the pointer was examined before.
inline Core& core_of(const void* object) {
    return *static_cast<const Object*>(object)->core;
}

// ---- What the tables have in common ----

CMPIStatus release_object(void* pointer, Kind kind) noexcept;

template <class B>
CMPIStatus release(typename B::Cmpi* pointer) noexcept {
    return release_object(pointer, B::kind);
}

inline void put(CMPIStatus* status, CMPIrc rc = CMPI_RC_OK) {
    if (status)
        *status = {rc, nullptr};
}
inline CMPIStatus answer(CMPIrc rc) {
    return {rc, nullptr};
}

template <class B>
typename B::Cmpi* clone(const typename B::Cmpi* pointer, CMPIStatus* status) noexcept {
    const B* body = body_of<B>(pointer, "clone");
    put(status, body ? CMPI_RC_OK : CMPI_RC_ERR_INVALID_HANDLE);
    return body ? make(core_of(pointer), B(*body), Owner::caller) : nullptr;
}

// A text of the object manager's as a string object of the call.
CMPIString* new_string(Core& core, std::string text);

// ---- Between host values and CMPI data ----

// A value with an object for everything that is one. Keys are flagged as such, and
// integers among them come in their widest form, as many object managers hand them over.
CMPIData to_data(Core& core, const Value& value); // the provider's to release
CMPIData to_data_in(const void* container, const Value& value);
CMPIData to_key_data_in(const void* container, const Value& value);
CMPIData missing_data(CMPIType type = CMPI_null);

// Reads what a provider gave. Nothing for a type that cannot be given or an object that is not
// usable; a fault is recorded then.
std::optional<Value> from_cmpi(Core& core, const CMPIValue* value, CMPIType type, const char* use);

// The contents of an instance object, path and properties in the order of the class; with the
// class's defaults where a property that is wanted was left null, if told so.
Instance to_instance(const InstanceBody& body, bool with_defaults = false);
InstanceBody to_body(Core& core, const Instance& instance);
ObjectPathBody to_body(Core& core, ObjectPath path);

} // namespace host

#endif // HOST_OBJECTS_H
