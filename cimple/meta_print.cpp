// The printed form of classes, close to the language they are declared in.
#include "cimple/meta.h"

#include "cimple/assert.h"
#include "cimple/value_text.h"

#include <cstdio>

namespace cimple {

namespace {

constexpr uint32 FIRST_QUALIFIER_BIT = 4; // those below tell the kind of record
constexpr const char* RETURN_VALUE = "return_value";

enum class Role { CLASS, MEMBER, PARAMETER };

void indent(Buffer& out, uint32 level) {
    out.append(level * INDENT, ' ');
}

// ---- Values ----

bool holds_text(uint32 type) {
    return type == TYPE_STRING || type == TYPE_DATETIME;
}

void append_value(Buffer& out, uint32 type, const void* value) {
    if (holds_text(type)) {
        const char* text = *static_cast<const char* const*>(value);
        append_quoted(out, text ? text : "");
    } else if (type == TYPE_CHAR16) {
        append_char16(out, *static_cast<const char16*>(value));
    } else {
        append_number(out, type, value);
    }
}

void append_meta_value(Buffer& out, uint32 type, bool array, const Meta_Value* value) {
    if (!value) {
        out.append("NULL");
        return;
    }
    if (!array) {
        append_value(out, type, value);
        return;
    }
    const std::size_t size = holds_text(type) ? sizeof(char*) : type_size(type);
    out.append('{');
    for (uint32 i = 0; i < value->array_value.num_elements; ++i) {
        if (i > 0)
            out.append(", ");
        append_value(out, type, static_cast<const char*>(value->array_value.elements) + i * size);
    }
    out.append('}');
}

// ---- Qualifiers ----

class Qualifier_List {
public:
    Qualifier_List(Buffer& out, uint32 level) : _out(out), _level(level) {}

    void begin_item() {
        if (_any)
            _out.append(",\n");
        indent(_out, _level);
        _out.append(_any ? ' ' : '[');
        _any = true;
    }
    void end() {
        if (_any)
            _out.append("]\n");
    }

private:
    Buffer& _out;
    uint32 _level;
    bool _any = false;
};

// Two flags say something even when they are clear: what a parameter without In means, or a
// property without Read, is not obvious to a reader.
bool always_printed(uint32 bit, const Meta_Feature* feature, Role role) {
    return (role == Role::PARAMETER && (1u << bit) == FLAG_IN) ||
           (role == Role::MEMBER && (feature->flags & FLAG_PROPERTY) && (1u << bit) == FLAG_READ);
}

void append_qualifiers(Buffer& out, const Meta_Feature* feature, Role role, uint32 level) {
    Qualifier_List list(out, level);
    for (uint32 bit = FIRST_QUALIFIER_BIT; bit < 32; ++bit) {
        const bool set = (feature->flags & (1u << bit)) != 0;
        if (!set && !always_printed(bit, feature, role))
            continue;
        list.begin_item();
        out.append(flag_name(bit));
        if (!set)
            out.append("(False)");
    }
    for (uint32 i = 0; i < feature->num_meta_qualifiers; ++i) {
        const Meta_Qualifier* qualifier = feature->meta_qualifiers[i];
        if (!qualifier->value && flag_by_name(qualifier->name) != 0)
            continue;
        list.begin_item();
        out.append(qualifier->name);
        if (!qualifier->value)
            continue;
        out.append('(');
        append_meta_value(out, qualifier->type, qualifier->array != 0, qualifier->value);
        out.append(')');
    }
    list.end();
}

// ---- Features ----

void append_subscript(Buffer& out, sint16 subscript) {
    if (subscript > 0)
        out.format("[%d]", subscript);
    else if (subscript < 0)
        out.append("[]");
}

void append_property(Buffer& out, const Meta_Property* property, Role role) {
    out.format("%s %s", type_name(property->type), property->name);
    append_subscript(out, property->subscript);
    if (role == Role::PARAMETER)
        return;
    out.append(" = ");
    append_meta_value(out, property->type, property->subscript != 0, property->value);
}

void append_reference(Buffer& out, const Meta_Reference* reference) {
    out.format("%s ref %s", reference->meta_class->name, reference->name);
    append_subscript(out, reference->subscript);
}

void append_feature(Buffer& out, const Meta_Feature* feature, Role role, uint32 level,
                    const Print_Options& options);

void append_method(Buffer& out, const Meta_Method* mm, uint32 level, const Print_Options& options) {
    CIMPLE_ASSERT(mm->num_meta_features > 0);
    out.format("%s %s(", type_name(mm->return_type), mm->name);
    bool first = true;
    for (uint32 i = 0; i < mm->num_meta_features; ++i) {
        const Meta_Feature* parameter = mm->meta_features[i];
        if (name_equal(parameter->name, RETURN_VALUE))
            continue;
        out.append(first ? "\n" : ",\n");
        append_feature(out, parameter, Role::PARAMETER, level + 1, options);
        first = false;
    }
    out.append(')');
}

void append_feature(Buffer& out, const Meta_Feature* feature, Role role, uint32 level,
                    const Print_Options& options) {
    if (options.qualifiers)
        append_qualifiers(out, feature, role, level);
    indent(out, level);
    if (feature->flags & FLAG_PROPERTY)
        append_property(out, static_cast<const Meta_Property*>(feature), role);
    else if (feature->flags & FLAG_REFERENCE)
        append_reference(out, static_cast<const Meta_Reference*>(feature));
    else if (feature->flags & FLAG_METHOD)
        append_method(out, static_cast<const Meta_Method*>(feature), level, options);
}

} // namespace

void print(const Meta_Class* meta_class, const Print_Options& options) {
    Buffer out;
    if (options.qualifiers)
        append_qualifiers(out, meta_class, Role::CLASS, 0);
    if (meta_class->super_meta_class)
        out.format("class %s : %s\n", meta_class->name, meta_class->super_meta_class->name);
    else
        out.format("class %s\n", meta_class->name);
    out.append("{\n");
    for (uint32 i = 0; i < meta_class->num_meta_features; ++i) {
        if (options.local_only && meta_class->locals && !meta_class->locals[i])
            continue;
        append_feature(out, meta_class->meta_features[i], Role::MEMBER, 1, options);
        out.append(";\n");
    }
    out.append("};\n");
    std::fwrite(out.data(), 1, out.size(), stdout);
}

} // namespace cimple
