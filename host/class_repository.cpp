#include "host/class_repository.h"

namespace host {

namespace {

constexpr CMPIType CMPI_TYPES[] = {
    CMPI_boolean, CMPI_uint8,  CMPI_sint8,  CMPI_uint16,   CMPI_sint16,
    CMPI_uint32,  CMPI_sint32, CMPI_uint64, CMPI_sint64,   CMPI_real32,
    CMPI_real64,  CMPI_char16, CMPI_string, CMPI_dateTime, CMPI_ref,
};
static_assert(std::size(CMPI_TYPES) == static_cast<std::size_t>(mof::Type::reference) + 1);

CMPIType cmpi_type(const mof::Declaration& declaration) {
    const CMPIType type = CMPI_TYPES[static_cast<std::size_t>(declaration.type)];
    return declaration.array == mof::scalar ? type : static_cast<CMPIType>(type | CMPI_ARRAY);
}

} // namespace

const Parameter* Method::find(std::string_view wanted) const {
    for (const Parameter& parameter : parameters)
        if (same_name(parameter.name, wanted))
            return &parameter;
    return nullptr;
}

std::size_t Class::index_of(std::string_view property) const {
    const auto found = index.find(property);
    return found == index.end() ? npos : found->second;
}

const Property* Class::find_property(std::string_view wanted) const {
    const std::size_t at = index_of(wanted);
    return at == npos ? nullptr : &properties[at];
}

const Method* Class::find_method(std::string_view wanted) const {
    for (const Method& method : methods)
        if (same_name(method.name, wanted))
            return &method;
    return nullptr;
}

bool Class::is_a(const Class* ancestor) const {
    for (const Class* at = this; at; at = at->superclass)
        if (at == ancestor)
            return true;
    return false;
}

std::vector<std::string> Class::property_names() const {
    std::vector<std::string> names;
    for (const Property& property : properties)
        names.push_back(property.name);
    return names;
}

ClassRepository::ClassRepository(const std::string& mof_path) {
    const mof::Schema schema = mof::load_schema(mof_path);
    // All classes first: a reference may lead to a class that comes later.
    for (const auto& source : schema.classes()) {
        const Class* superclass = source->superclass ? find(source->superclass->name()) : nullptr;
        append(source->name(), superclass);
    }
    for (std::size_t i = 0; i < _classes.size(); ++i)
        fill(*_classes[i], *schema.classes()[i]);
}

Class& ClassRepository::append(std::string name, const Class* superclass) {
    auto made = std::make_unique<Class>();
    made->name = std::move(name);
    made->superclass = superclass;
    _by_name.emplace(made->name, made.get());
    _classes.push_back(std::move(made));
    return *_classes.back();
}

void ClassRepository::fill(Class& target, const mof::Schema_Class& source) {
    const auto slot = [this](const mof::Declaration& declaration) {
        return Slot_Type{cmpi_type(declaration), declaration.is_embedded(),
                         find(declaration.target)};
    };
    target.is_association = source.is_association;
    target.text = source.declaration->text;
    for (const mof::Schema_Feature& feature : source.features) {
        if (feature.kind() == mof::Feature_Kind::method) {
            Method method{feature.name(),
                          slot(*feature.feature),
                          mof::is_true(feature.feature->qualifiers, "Static"),
                          {}};
            for (const mof::Parameter& parameter : feature.feature->parameters)
                method.parameters.push_back(
                    {slot(parameter), parameter.name, parameter.is_in(), parameter.is_out()});
            target.methods.push_back(std::move(method));
            continue;
        }
        if (feature.key)
            target.keys.push_back(target.properties.size());
        target.index.emplace(feature.name(), target.properties.size());
        target.properties.push_back({slot(*feature.feature), feature.name(), feature.key});
    }
}

std::optional<std::string> ClassRepository::add(const Extra_Class& extra) {
    if (find(extra.name))
        return "class " + extra.name + " exists already";
    const Class* superclass = nullptr;
    if (!extra.superclass.empty()) {
        superclass = find(extra.superclass);
        if (!superclass)
            return "unknown superclass " + extra.superclass +
                   did_you_mean(extra.superclass, names());
    }
    Class& made = append(extra.name, superclass);
    if (superclass) {
        made.properties = superclass->properties;
        made.methods = superclass->methods;
        made.keys = superclass->keys;
        made.is_association = superclass->is_association;
        made.index = superclass->index;
    }
    return std::nullopt;
}

const Class* ClassRepository::find(std::string_view name) const {
    const auto found = _by_name.find(name);
    return found == _by_name.end() ? nullptr : found->second;
}

std::vector<std::string> ClassRepository::names() const {
    std::vector<std::string> names;
    for (const auto& known : _classes)
        names.push_back(known->name);
    return names;
}

} // namespace host
