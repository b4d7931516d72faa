#include "host/class_repository.h"

#include <algorithm>
#include <limits>

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

// A text qualifier's value.
std::string text_of(const mof::Qualifier* qualifier) {
    return qualifier ? qualifier->value.text : "";
}

// Null where nothing is said, as of most base classes. Find gives a qualifier by its name.
template <class Find>
std::shared_ptr<const Meaning> meaning_of(mof::Type type, Find find) {
    Meaning meaning{text_of(find("Description")), text_of(find("PUnit")),
                    mof::Word_Map::read(find("ValueMap"), find("Values"), type),
                    mof::Word_Map::read(find("BitMap"), find("BitValues"), type)};
    if (meaning.description.empty() && meaning.unit.empty() && !meaning.words && !meaning.bits)
        return nullptr;
    return std::make_shared<const Meaning>(std::move(meaning));
}

std::shared_ptr<const Meaning> meaning_of(const mof::Schema_Feature& feature) {
    return meaning_of(feature.feature->type,
                      [&](const char* name) { return mof::Schema::qualifier(feature, name); });
}

std::shared_ptr<const Meaning> inherited(const Class& from, const std::string& name) {
    const Property* property = from.superclass->find_property(name);
    return property ? property->meaning : from.superclass->find_method(name)->result.meaning;
}

std::shared_ptr<const Meaning> meaning_of(const mof::Parameter& parameter) {
    return meaning_of(parameter.type,
                      [&](const char* name) { return mof::find(parameter.qualifiers, name); });
}

// "One, Other"; nothing where no bit has a word. Bits that mean the same are told once.
std::optional<std::string> words_of_bits(const mof::Word_Map& bits, std::uint64_t value) {
    std::vector<std::string> words;
    for (int bit = 0; bit < 64; ++bit) {
        const std::string* word = (value >> bit & 1) != 0 ? bits.find(std::int64_t{bit}) : nullptr;
        if (word && std::find(words.begin(), words.end(), *word) == words.end())
            words.push_back(*word);
    }
    std::string text;
    for (const std::string& word : words)
        text += (text.empty() ? "" : ", ") + word;
    return words.empty() ? std::nullopt : std::optional(text);
}

Value to_value(CMPIType type, const mof::Value& value) {
    using Kind = mof::Value::Kind;
    switch (value.kind) {
    case Kind::boolean:
        return Value::boolean(value.boolean);
    case Kind::integer:
        if (is_signed(type))
            return Value::signed_number(
                type,
                static_cast<std::int64_t>(value.negative ? 0 - value.magnitude : value.magnitude));
        [[fallthrough]];
    case Kind::character:
        return Value::unsigned_number(type, value.magnitude);
    case Kind::real:
        return Value::real(type, value.real);
    case Kind::text:
        return type == CMPI_dateTime ? Value::datetime(value.text) : Value::text(value.text);
    case Kind::array: {
        const auto element = static_cast<CMPIType>(type & ~CMPI_ARRAY);
        Value::Array elements;
        for (const mof::Value& each : value.elements)
            elements.push_back(to_value(element, each));
        return Value::array(element, std::move(elements));
    }
    default:
        return Value::null(type);
    }
}

} // namespace

std::optional<std::string> word_of(const Slot_Type& slot, const Value& value) {
    if (!slot.meaning || value.is_null() || value.is_array())
        return std::nullopt;
    if (slot.meaning->bits)
        return words_of_bits(*slot.meaning->bits, value.as_unsigned());
    if (!slot.meaning->words)
        return std::nullopt;
    const mof::Word_Map& words = *slot.meaning->words;
    constexpr std::uint64_t largest = std::numeric_limits<std::int64_t>::max();
    const std::string* word = nullptr;
    if (value.type == CMPI_string)
        word = words.find(value.as_text());
    else if (is_unsigned(value.type))
        word = words.find(static_cast<std::int64_t>(std::min(value.as_unsigned(), largest)));
    else if (is_signed(value.type))
        word = words.find(value.as_signed());
    return word ? std::optional(*word) : std::nullopt;
}

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

Slot_Type ClassRepository::slot_of(const mof::Declaration& declaration) const {
    return {cmpi_type(declaration), declaration.is_embedded(), find(declaration.target)};
}

Method ClassRepository::method_of(const mof::Feature& declared, Slot_Type result) const {
    Method method{
        declared.name, std::move(result), mof::is_true(declared.qualifiers, "Static"), {}};
    for (const mof::Parameter& each : declared.parameters) {
        Slot_Type slot = slot_of(each);
        slot.meaning = meaning_of(each);
        method.parameters.push_back({std::move(slot), each.name, each.is_in(), each.is_out()});
    }
    return method;
}

void ClassRepository::fill(Class& target, const mof::Schema_Class& source) {
    target.is_association = source.is_association;
    target.text = source.declaration->text;
    target.description = text_of(mof::find(source.qualifiers(), "Description"));
    for (const mof::Schema_Feature& feature : source.features) {
        Slot_Type slot = slot_of(*feature.feature);
        // What is inherited as it is means what it means above.
        slot.meaning = feature.local ? meaning_of(feature) : inherited(target, feature.name());
        if (feature.kind() == mof::Feature_Kind::method) {
            target.methods.push_back(method_of(*feature.feature, std::move(slot)));
            continue;
        }
        if (feature.key)
            target.keys.push_back(target.properties.size());
        target.index.emplace(feature.name(), target.properties.size());
        Value value = feature.default_value ? to_value(slot.type, *feature.default_value)
                                            : Value::null(slot.type);
        target.properties.push_back(
            {std::move(slot), feature.name(), feature.key, std::move(value)});
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
