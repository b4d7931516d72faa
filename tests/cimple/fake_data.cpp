// Values and data as tests write them.
#include "tests/cimple/fake_broker.h"

#include <strings.h>

namespace fake {

const Value* Data::find(const std::string& name) const {
    for (const auto& [member, value] : members)
        if (strcasecmp(member.c_str(), name.c_str()) == 0)
            return &value;
    return nullptr;
}

std::string Data::string(const std::string& name) const {
    const Value* value = find(name);
    return value && value->object ? value->object->text : "(none)";
}

Value text(const char* chars) {
    auto data = std::make_shared<Data>();
    data->text = chars;
    return object(CMPI_string, data);
}

Value number(CMPIType type, unsigned long long value) {
    Value made;
    made.type = type;
    made.scalar.uint64 = value;
    return made;
}

Value object(CMPIType type, Data_Ref data) {
    Value made;
    made.type = type;
    made.object = std::move(data);
    return made;
}

Value null(CMPIType type) {
    Value made;
    made.type = type;
    made.state = CMPI_nullValue;
    return made;
}

Value array(CMPIType element_type, std::vector<Value> elements) {
    auto data = std::make_shared<Data>();
    data->elements = std::move(elements);
    return object(static_cast<CMPIType>(element_type | CMPI_ARRAY), data);
}

Data_Ref path_data(const char* name_space, const char* class_name, Members keys) {
    auto data = std::make_shared<Data>();
    data->name_space = name_space;
    data->text = class_name;
    data->members = std::move(keys);
    return data;
}

Data_Ref instance_data(Data_Ref path, Members properties) {
    auto data = std::make_shared<Data>();
    data->path = std::move(path);
    data->members = std::move(properties);
    return data;
}

} // namespace fake
