#include "cimple/fold.h"
#include "schema/generator/cpp_text.h"
#include "schema/generator/generator.h"

#include <bit>
#include <set>
#include <sstream>

namespace generator {

namespace {

using mof::Feature_Kind;

// The records of the features that a class declares itself: two arrays of the class, and one record
// per method in the method's structure. Inherited features point to the ancestor's records.
struct Class_Records {
    std::vector<const mof::Schema_Feature*> properties;
    std::vector<const mof::Schema_Feature*> references;
    std::vector<const mof::Schema_Feature*> methods;

    explicit Class_Records(const mof::Schema_Class& schema_class) {
        for (const mof::Schema_Feature& feature : schema_class.features) {
            if (!feature.local)
                continue;
            if (feature.kind() == Feature_Kind::method)
                methods.push_back(&feature);
            else if (is_pointer(*feature.feature))
                references.push_back(&feature);
            else
                properties.push_back(&feature);
        }
    }
};

std::size_t index_of(const std::vector<const mof::Schema_Feature*>& records,
                     const mof::Schema_Feature& feature) {
    for (std::size_t i = 0; i < records.size(); i++)
        if (records[i]->feature == feature.feature)
            return i;
    throw std::logic_error("no record of " + feature.name());
}

std::string record_address(const mof::Schema_Feature& feature) {
    const mof::Schema_Class& owner = *feature.owner;
    if (feature.kind() == Feature_Kind::method)
        return "&" + method_type(owner.name(), *feature.feature) + "::static_meta_class";
    Class_Records records(owner);
    bool pointer = is_pointer(*feature.feature);
    std::size_t index = index_of(pointer ? records.references : records.properties, feature);
    return "&" + owner.name() + (pointer ? "_references[" : "_properties[") +
           std::to_string(index) + "]";
}

std::string records_header(const Catalogue& catalogue) {
    std::ostringstream out;
    out << BANNER << "// The feature records that the tables share.\n"
        << "#ifndef META_RECORDS_H\n#define META_RECORDS_H\n\n#include \"cimple/meta.h\"\n\n"
        << "namespace cimple {\n\n";
    for (const auto& schema_class : catalogue.schema.classes()) {
        Class_Records records(*schema_class);
        if (!records.properties.empty())
            out << "extern const Meta_Property " << schema_class->name() << "_properties["
                << records.properties.size() << "];\n";
        if (!records.references.empty())
            out << "extern const Meta_Reference " << schema_class->name() << "_references["
                << records.references.size() << "];\n";
    }
    out << "\n} // namespace cimple\n\n#endif\n";
    return out.str();
}

// "{0, FLAG_PROPERTY, "Name", nullptr, 0}": no class of ours has named qualifiers.
std::string head(const std::string& flags, const std::string& name) {
    return "{0, " + flags + ", " + literal(name) + ", nullptr, 0}";
}

std::string offset(const std::string& structure, const std::string& member) {
    return "__builtin_offsetof(" + structure + ", " + member + ")";
}

// Writes the table of one class; a member each for what belongs together.
class Table {
public:
    Table(std::ostream& out, const mof::Schema_Class& schema_class)
        : _out(out), _class(schema_class), _name(schema_class.name()), _records(schema_class) {}

    void write() {
        _out << "// ---- " << _name << "\n\n";
        defaults();
        properties();
        references();
        for (const mof::Schema_Feature* method : _records.methods)
            this->method(*method->feature, feature_flags(*method));
        feature_list();
        locals();
        key_list();
        class_record();
    }

private:
    void defaults();
    void properties();
    void references();
    void method(const mof::Feature& method, const std::string& flags);
    void parameters(const mof::Feature& method, const std::string& structure);
    void feature_list();
    void locals();
    void key_list();
    void class_record();

    void property_record(const mof::Declaration& declaration, const std::string& flags,
                         const std::string& structure, const std::string& value) {
        _out << "    {" << head(flags, declaration.name) << ", " << type_code(declaration.type)
             << ", " << declaration.array << ", " << offset(structure, declaration.name) << ", "
             << value << "},\n";
    }
    void reference_record(const mof::Declaration& declaration, const std::string& flags,
                          const std::string& structure) {
        _out << "    {" << head(flags, declaration.name) << ", " << declaration.array << ", &"
             << pointee(declaration) << "::static_meta_class, "
             << offset(structure, declaration.name) << "},\n";
    }
    std::string default_name(const mof::Schema_Feature& property) const {
        return _name + "_" + property.name() + "_default";
    }

    std::ostream& _out;
    const mof::Schema_Class& _class;
    const std::string& _name;
    Class_Records _records;
};

void Table::defaults() {
    for (const mof::Schema_Feature* property : _records.properties) {
        if (!property->default_value)
            continue;
        const mof::Value& value = *property->default_value;
        mof::Type type = property->feature->type;
        std::string name = default_name(*property);
        if (value.kind == mof::Value::Kind::array) {
            std::string elements = "nullptr";
            if (!value.elements.empty()) {
                elements = name + "_elements";
                _out << "constexpr " << element_type(type) << " " << elements << "[] = {";
                for (const mof::Value& element : value.elements)
                    _out << element_literal(element, type) << ", ";
                _out << "};\n";
            }
            _out << "constexpr Meta_Value " << name << " = {.array_value = {" << elements << ", "
                 << value.elements.size() << "}};\n";
        } else {
            _out << "constexpr Meta_Value " << name << " = {" << scalar_initializer(value, type)
                 << "};\n";
        }
    }
}

void Table::properties() {
    if (_records.properties.empty())
        return;
    _out << "constinit const Meta_Property " << _name << "_properties[] = {\n";
    for (const mof::Schema_Feature* property : _records.properties)
        property_record(*property->feature, feature_flags(*property), _name,
                        property->default_value ? "&" + default_name(*property) : "nullptr");
    _out << "};\n";
}

void Table::references() {
    if (_records.references.empty())
        return;
    _out << "constinit const Meta_Reference " << _name << "_references[] = {\n";
    for (const mof::Schema_Feature* reference : _records.references)
        reference_record(*reference->feature, feature_flags(*reference), _name);
    _out << "};\n";
}

// The parameters, and behind them the return value, which every method has.
void Table::parameters(const mof::Feature& method, const std::string& structure) {
    std::ostringstream list;
    std::size_t num_properties = 0;
    std::size_t num_references = 0;
    _out << "constinit const Meta_Property " << structure << "_properties[] = {\n";
    for (const mof::Parameter& parameter : method.parameters)
        if (!is_pointer(parameter))
            property_record(parameter, parameter_flags(parameter), structure, "nullptr");
    mof::Declaration result;
    result.name = "return_value";
    result.type = method.type;
    property_record(result, "FLAG_PROPERTY | FLAG_OUT", structure, "nullptr");
    _out << "};\n";
    for (const mof::Parameter& parameter : method.parameters) {
        if (!is_pointer(parameter)) {
            list << "    &" << structure << "_properties[" << num_properties++ << "],\n";
            continue;
        }
        if (num_references == 0)
            _out << "constinit const Meta_Reference " << structure << "_references[] = {\n";
        reference_record(parameter, parameter_flags(parameter), structure);
        list << "    &" << structure << "_references[" << num_references++ << "],\n";
    }
    if (num_references > 0)
        _out << "};\n";
    list << "    &" << structure << "_properties[" << num_properties << "],\n";
    _out << "constexpr const Meta_Feature* " << structure << "_features[] = {\n"
         << list.str() << "};\n";
}

void Table::method(const mof::Feature& method, const std::string& flags) {
    std::string structure = method_type(_name, method);
    parameters(method, structure);
    _out << "constinit const Meta_Method " << structure << "::static_meta_class = {\n    {"
         << head(flags, method.name) << ", " << structure << "_features, "
         << method.parameters.size() + 1 << ", sizeof(" << structure << ")},\n    "
         << type_code(method.type) << "};\n";
}

void Table::feature_list() {
    if (_class.features.empty())
        return;
    _out << "constexpr const Meta_Feature* " << _name << "_features[] = {\n";
    for (const mof::Schema_Feature& feature : _class.features)
        _out << "    " << record_address(feature) << ",\n";
    _out << "};\n";
}

void Table::locals() {
    if (_class.features.empty())
        return;
    _out << "constexpr uint8 " << _name << "_locals[] = {";
    std::size_t column = 0;
    for (const mof::Schema_Feature& feature : _class.features)
        _out << (column++ % 32 == 0 ? "\n    " : " ") << (feature.local ? "1," : "0,");
    _out << "\n};\n";
}

void Table::key_list() {
    if (_class.num_keys == 0)
        return;
    _out << "constexpr Meta_Key " << _name << "_keys[] = {\n";
    for (std::size_t i = 0; i < _class.features.size(); ++i)
        if (_class.features[i].key)
            _out << "    {key_name_hash(\"" << _class.features[i].name() << "\"), " << i << "},\n";
    _out << "};\n";
}

void Table::class_record() {
    bool empty = _class.features.empty();
    _out << "constinit const Meta_Class " << _name << "::static_meta_class = {\n    {"
         << head(class_flags(_class), _name) << ", " << (empty ? "nullptr" : _name + "_features")
         << ", " << _class.features.size() << ", sizeof(" << _name << ")},\n    "
         << (empty ? "nullptr" : _name + "_locals") << ", "
         << (_class.superclass ? "&" + _class.superclass->name() + "::static_meta_class"
                               : std::string("nullptr"))
         << ", " << _class.num_keys << ", &meta_repository, "
         << (_class.num_keys == 0 ? "nullptr" : _name + "_keys") << "};\n\n";
}

// Headers that the table of a class needs: its own (which brings its ancestors') and its targets'.
void add_headers(std::set<std::string>& headers, const mof::Schema_Class& schema_class) {
    headers.insert(schema_class.name());
    auto add = [&](const mof::Declaration& declaration) {
        if (is_pointer(declaration) && !declaration.target.empty())
            headers.insert(declaration.target);
    };
    for (const mof::Feature& feature : schema_class.declaration->features) {
        add(feature);
        for (const mof::Parameter& parameter : feature.parameters)
            add(parameter);
    }
}

std::string tables(const Catalogue& catalogue, Span span) {
    const auto& classes = catalogue.schema.classes();
    std::ostringstream out;
    std::set<std::string> headers;
    for (std::size_t i = span.begin; i < span.end; i++)
        add_headers(headers, *classes[i]);
    out << BANNER << "#include \"meta_records.h\"\n#include \"meta_repository.h\"\n\n";
    for (const std::string& name : headers)
        out << "#include \"classes/" << name << ".h\"\n";
    // The structures derive from one another, so offsetof is conditionally supported only; both
    // compilers that we build with support it.
    out << "\n#pragma GCC diagnostic ignored \"-Winvalid-offsetof\"\n\nnamespace cimple {\n\n";
    for (std::size_t i = span.begin; i < span.end; i++)
        Table(out, *classes[i]).write();
    out << "} // namespace cimple\n";
    return out.str();
}

// The table that finds a class by its name: half full, so that few names meet.
std::vector<std::size_t> name_slots(const Catalogue& catalogue) {
    const auto& classes = catalogue.schema.classes();
    std::vector<std::size_t> slots(std::bit_ceil(2 * classes.size()));
    for (std::size_t i = 0; i < classes.size(); i++) {
        const auto count = static_cast<std::uint32_t>(slots.size());
        std::size_t slot = cimple::name_slot(classes[i]->name().c_str(), count);
        while (slots[slot] != 0)
            slot = (slot + 1) % slots.size();
        slots[slot] = i + 1;
    }
    return slots;
}

std::string repository(const Catalogue& catalogue) {
    std::ostringstream out;
    out << BANNER << "#include \"meta_repository.h\"\n\n";
    for (const auto& schema_class : catalogue.schema.classes())
        out << "#include \"classes/" << schema_class->name() << ".h\"\n";
    out << "\nnamespace cimple {\n\nconstexpr const Meta_Class* all[] = {\n";
    for (const auto& schema_class : catalogue.schema.classes())
        out << "    &" << schema_class->name() << "::static_meta_class,\n";
    const std::vector<std::size_t> slots = name_slots(catalogue);
    out << "};\n\nconstexpr uint16 name_slots[] = {";
    for (std::size_t i = 0; i < slots.size(); i++)
        out << (i % 16 == 0 ? "\n    " : " ") << slots[i] << ",";
    out << "\n};\n\nconstinit const Meta_Repository meta_repository = {all, "
        << catalogue.schema.classes().size() << ", name_slots, " << slots.size()
        << "};\n\n} // namespace cimple\n";
    return out.str();
}

} // namespace

void write_meta_tables(const Catalogue& catalogue, const Output& output, std::size_t parts) {
    output.write("meta_records.h", records_header(catalogue));
    output.write("meta_repository.h", std::string(BANNER) +
                                          "// Every class of the catalogue, in its order.\n"
                                          "#ifndef META_REPOSITORY_H\n#define META_REPOSITORY_H\n\n"
                                          "#include \"cimple/meta.h\"\n\nnamespace cimple {\n\n"
                                          "extern const Meta_Repository meta_repository;\n\n"
                                          "} // namespace cimple\n\n#endif\n");
    output.write("meta_repository.cpp", repository(catalogue));
    for (std::size_t part = 0; part < parts; part++)
        output.write(part_name("meta", part, ".cpp"),
                     tables(catalogue, part_of(catalogue.schema.classes().size(), part, parts)));
}

} // namespace generator
