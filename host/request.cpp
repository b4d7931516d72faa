#include "host/request.h"

namespace host {

namespace {

template <class B>
B* body(typename B::Cmpi* object) {
    return static_cast<B*>(reinterpret_cast<Object*>(object)->body);
}

} // namespace

Request::Request(Core& core, const Class& known, const char* operation,
                 const std::string& name_space)
    : _call(core, known.name, operation), _name_space(name_space) {
    core.calls.fetch_add(1, std::memory_order_relaxed);
    core.trace("call " + known.name + " " + operation);
    ContextBody entries;
    entries.entries = {{CMPIInvocationFlags, Value::unsigned_number(CMPI_uint32, 0)},
                       {CMPIPrincipal, Value::text(core.options.principal)},
                       {CMPIInitNameSpace, Value::text(name_space)}};
    _context = make(core, std::move(entries), Owner::parameter);
}

CMPIObjectPath* Request::path(ObjectPath path) {
    if (path.name_space.empty())
        path.name_space = _name_space;
    return make(_call.core, to_body(_call.core, std::move(path)), Owner::parameter);
}

CMPIInstance* Request::instance(const Instance& instance) {
    InstanceBody body = to_body(_call.core, instance);
    if (body.path.name_space.empty())
        body.path.name_space = _name_space;
    return make(_call.core, std::move(body), Owner::parameter);
}

CMPIArgs* Request::args(Named_Values values, const Method* outputs_of) {
    ArgsBody contents;
    contents.values = std::move(values);
    contents.outputs_of = outputs_of;
    CMPIArgs* made = make(_call.core, std::move(contents), Owner::parameter);
    if (outputs_of)
        _outputs = body<ArgsBody>(made);
    return made;
}

CMPIResult* Request::result(Answer answer, const Class* of_class, const Slot_Type* data_type) {
    ResultBody contents;
    contents.answer = answer;
    contents.name_space = _name_space;
    contents.of_class = of_class;
    contents.data_type = data_type;
    CMPIResult* made = make(_call.core, std::move(contents), Owner::parameter);
    _result = body<ResultBody>(made);
    return made;
}

const char** Request::property_list(const Property_List& properties) {
    if (!properties)
        return nullptr;
    for (const std::string& name : *properties)
        _names.push_back(name.c_str());
    _names.push_back(nullptr);
    return _names.data();
}

Status Request::finish(CMPIStatus status) {
    Status result{status.rc, ""};
    if (status.msg)
        if (const StringBody* text = body_of<StringBody>(status.msg, "the text of a status"))
            result.message = text->text;
    _call.core.trace(
        "     " + _call.class_name + " " + _call.operation + ": " + rc_name(result.rc) +
        (_result
             ? ", " + std::to_string(_result->instances.size() + _result->paths.size()) + " answers"
             : ""));
    return result;
}

} // namespace host
