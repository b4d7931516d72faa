#include "schema/mof_parser/mof.h"

#include <algorithm>

namespace mof {

namespace {

const char* kind_word(Feature_Kind kind) {
    switch (kind) {
    case Feature_Kind::property:
        return "property";
    case Feature_Kind::reference:
        return "reference";
    default:
        return "method";
    }
}

// ---- Qualifiers against their declarations ----

using Declarations = std::map<std::string, const Qualifier_Declaration*, Name_Less>;

bool value_fits(const Value& value, const Qualifier_Declaration& declaration) {
    using Kind = Value::Kind;
    if ((value.kind == Kind::array) != (declaration.array != scalar))
        return value.kind == Kind::null;
    Kind kind = value.kind;
    if (kind == Kind::array) {
        if (value.elements.empty())
            return true;
        kind = value.elements.front().kind;
    }
    switch (declaration.type) {
    case Type::boolean:
        return kind == Kind::boolean;
    case Type::string:
        return kind == Kind::text || kind == Kind::null;
    default:
        return kind == Kind::integer || kind == Kind::real || kind == Kind::null;
    }
}

class Qualifier_Check {
public:
    explicit Qualifier_Check(const Document& document) {
        for (const Qualifier_Declaration& declaration : document.qualifiers)
            if (!_declarations.emplace(declaration.name, &declaration).second)
                throw Error(declaration.position,
                            "qualifier '" + declaration.name + "' declared twice");
    }

    void check(const Class& declared) const {
        if (_declarations.empty())
            return;
        check(declared.qualifiers,
              is_true(declared.qualifiers, "Association") ? "association" : "class");
        for (const Feature& feature : declared.features) {
            check(feature.qualifiers, kind_word(feature.kind));
            for (const Parameter& parameter : feature.parameters)
                check(parameter.qualifiers, "parameter");
        }
    }

private:
    void check(const Qualifiers& qualifiers, const char* scope) const {
        for (const Qualifier& qualifier : qualifiers) {
            auto found = _declarations.find(qualifier.name);
            if (found == _declarations.end())
                throw Error(qualifier.position, "unknown qualifier '" + qualifier.name + "'");
            if (!value_fits(qualifier.value, *found->second))
                throw Error(qualifier.position,
                            "the value of '" + qualifier.name + "' is not of its type");
            if (!in_scope(*found->second, scope))
                throw Error(qualifier.position,
                            "'" + qualifier.name + "' does not belong on a " + scope);
        }
    }

    static bool in_scope(const Qualifier_Declaration& declaration, std::string_view scope) {
        // An association is a class, and every scope word "any" admits all.
        return std::any_of(declaration.scopes.begin(), declaration.scopes.end(),
                           [&](const std::string& each) {
                               return same_name(each, scope) || same_name(each, "any") ||
                                      (scope == "association" && same_name(each, "class")) ||
                                      (scope == "class" && same_name(each, "indication"));
                           });
    }

    Declarations _declarations;
};

// ---- Features ----

bool has_target(const Declaration& declaration) {
    return !declaration.target.empty();
}

void check_same_shape(const Feature& feature, const Schema_Feature& inherited) {
    const Feature& old = *inherited.feature;
    if (old.kind != feature.kind || old.type != feature.type || old.array != feature.array ||
        old.is_embedded() != feature.is_embedded())
        throw Error(feature.position, "'" + feature.name + "' is not of the type that " +
                                          inherited.owner->name() + " gives it");
}

void check_override(const Feature& feature, const Schema_Feature* inherited,
                    const Schema_Class& owner) {
    const Qualifier* over = find(feature.qualifiers, "Override");
    if (over && !same_name(over->value.text, feature.name))
        throw Error(over->position, "Override must name '" + feature.name + "' itself");
    if (over && !inherited)
        throw Error(feature.position,
                    "no superclass of " + owner.name() + " has '" + feature.name + "' to override");
    if (inherited && !over)
        throw Error(feature.position, "'" + feature.name + "' of " + inherited->owner->name() +
                                          " is redeclared without Override");
    if (inherited)
        check_same_shape(feature, *inherited);
}

void check_key(const Feature& feature) {
    if (is_true(feature.qualifiers, "Key") && feature.kind == Feature_Kind::method)
        throw Error(feature.position, "a method cannot be a key");
}

void add_feature(Schema_Class& schema_class, const Feature& feature) {
    auto found = std::find_if(
        schema_class.features.begin(), schema_class.features.end(),
        [&](const Schema_Feature& each) { return same_name(each.name(), feature.name); });
    bool inherited = found != schema_class.features.end();
    if (inherited && found->local)
        throw Error(feature.position, "'" + feature.name + "' twice in one class");
    check_override(feature, inherited ? &*found : nullptr, schema_class);
    check_key(feature);

    Schema_Feature entry;
    if (inherited)
        entry = *found;
    entry.feature = &feature;
    entry.owner = &schema_class;
    entry.local = true;
    entry.key = is_true(feature.qualifiers, "Key", entry.key);
    if (feature.default_value)
        entry.default_value =
            feature.default_value->kind == Value::Kind::null ? nullptr : &*feature.default_value;
    if (inherited) {
        *found = entry;
        return;
    }
    entry.origin = &schema_class;
    entry.first = &feature;
    schema_class.features.push_back(entry);
}

std::unique_ptr<const Schema_Class> resolve(const Class& declared, const Schema_Class* superclass,
                                            std::size_t number) {
    auto resolved = std::make_unique<Schema_Class>();
    resolved->declaration = &declared;
    resolved->superclass = superclass;
    resolved->number = number;
    resolved->is_association =
        is_true(declared.qualifiers, "Association") || (superclass && superclass->is_association);
    if (superclass)
        resolved->features = superclass->features;
    for (Schema_Feature& feature : resolved->features)
        feature.local = false;
    for (const Feature& feature : declared.features)
        add_feature(*resolved, feature);
    resolved->num_keys = static_cast<std::uint32_t>(
        std::count_if(resolved->features.begin(), resolved->features.end(),
                      [](const Schema_Feature& feature) { return feature.key; }));
    return resolved;
}

// Targets may be declared later than they are named, so this follows when all classes are known.
void check_targets(const Schema& schema, const Schema_Class& schema_class) {
    auto known = [&](const Declaration& declaration) {
        if (has_target(declaration) && !schema.find(declaration.target))
            throw Error(declaration.position, "there is no class '" + declaration.target + "'");
    };
    for (const Feature& feature : schema_class.declaration->features) {
        known(feature);
        for (const Parameter& parameter : feature.parameters)
            known(parameter);
        if (feature.kind != Feature_Kind::reference || !schema_class.superclass)
            continue;
        const Schema_Feature* inherited = schema_class.superclass->find(feature.name);
        if (inherited && !schema.is_subclass(inherited->feature->target, feature.target))
            throw Error(feature.position, "'" + feature.target + "' is no subclass of " +
                                              inherited->feature->target + ", to which '" +
                                              feature.name + "' of " + inherited->owner->name() +
                                              " refers");
    }
}

} // namespace

const Schema_Feature* Schema_Class::find(std::string_view name) const {
    auto found = std::find_if(features.begin(), features.end(), [&](const Schema_Feature& each) {
        return same_name(each.name(), name);
    });
    return found == features.end() ? nullptr : &*found;
}

Schema::Schema(Document document) : _document(std::make_unique<Document>(std::move(document))) {
    Qualifier_Check qualifiers(*_document);
    for (const Class& declared : _document->classes) {
        qualifiers.check(declared);
        if (find(declared.name))
            throw Error(declared.position, "class '" + declared.name + "' declared twice");
        const Schema_Class* superclass = nullptr;
        if (!declared.superclass.empty()) {
            superclass = find(declared.superclass);
            if (!superclass)
                throw Error(declared.superclass_position,
                            "superclass '" + declared.superclass + "' is not declared before");
        }
        _classes.push_back(resolve(declared, superclass, _classes.size()));
        _by_name.emplace(declared.name, _classes.back().get());
    }
    for (const auto& schema_class : _classes)
        check_targets(*this, *schema_class);
}

const Schema_Class* Schema::find(std::string_view name) const {
    auto found = _by_name.find(name);
    return found == _by_name.end() ? nullptr : found->second;
}

const Qualifier* Schema::qualifier(const Schema_Feature& feature, std::string_view name) {
    const Schema_Feature* at = &feature;
    while (at) {
        if (const Qualifier* found = mof::find(at->feature->qualifiers, name))
            return found;
        const Schema_Class* above = at->owner->superclass;
        at = above ? above->find(feature.name()) : nullptr;
    }
    return nullptr;
}

bool Schema::is_subclass(const Schema_Class* ancestor, const Schema_Class* descendant) {
    for (; descendant; descendant = descendant->superclass)
        if (descendant == ancestor)
            return ancestor != nullptr;
    return false;
}

bool Schema::is_subclass(std::string_view ancestor, std::string_view descendant) const {
    return is_subclass(find(ancestor), find(descendant));
}

} // namespace mof
