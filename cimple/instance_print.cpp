// The printed form of instances.
#include "cimple/instance.h"

#include "cimple/buffer.h"
#include "cimple/instance_detail.h"
#include "cimple/value_text.h"

namespace cimple {

using namespace detail;

namespace {

void append_block(Buffer& out, const Instance* instance, bool keys_only, std::size_t level);

void append_value(Buffer& out, uint32 type, const void* value) {
    if (type == TYPE_STRING)
        append_quoted(out, static_cast<const String*>(value)->c_str());
    else if (type == TYPE_DATETIME)
        append_quoted(out, static_cast<const Datetime*>(value)->ascii().c_str());
    else if (type == TYPE_CHAR16)
        append_char16(out, *static_cast<const char16*>(value));
    else
        append_number(out, type, value);
}

void append_property(Buffer& out, const Instance* instance, const Meta_Property* p) {
    out.format("%s %s = ", type_name(p->type), p->name);
    if (is_null(instance, p)) {
        out.append("NULL");
        return;
    }
    if (p->subscript == 0) {
        append_value(out, p->type, member(instance, p->offset));
        return;
    }
    const Array_Base& array = member_as<Array_Base>(instance, p->offset);
    const char* element = static_cast<const char*>(array.data());
    out.append('{');
    for (uint32 i = 0; i < array.size(); ++i, element += type_size(p->type)) {
        out.append(i > 0 ? ", " : " ");
        append_value(out, p->type, element);
    }
    out.append(" }");
}

void append_target(Buffer& out, const Instance* target, bool keys_only, std::size_t level) {
    if (target)
        append_block(out, target, keys_only, level);
    else
        out.append("NULL");
}

void append_reference(Buffer& out, const Instance* instance, const Meta_Reference* r,
                      bool keys_only, std::size_t level) {
    out.format("%s %s = ", r->meta_class->name, r->name);
    if (r->subscript == 0) {
        append_target(out, reference(instance, r), keys_only, level);
        return;
    }
    if (is_null(instance, r)) {
        out.append("NULL");
        return;
    }
    const Array<Instance*>& targets = references(instance, r);
    out.append('{');
    for (uint32 i = 0; i < targets.size(); ++i) {
        out.append(i > 0 ? ", " : " ");
        append_target(out, targets[i], keys_only, level);
    }
    out.append(" }");
}

// From the class name to the closing brace; the line ends with the caller.
void append_block(Buffer& out, const Instance* instance, bool keys_only, std::size_t level) {
    out.format("%s\n", instance->__meta_class->name);
    out.append(level * INDENT, ' ');
    out.append("{\n");
    const std::size_t inner = level + 1;
    if (!instance->__name_space.empty()) {
        out.append(inner * INDENT, ' ');
        out.format("string __name_space = \"%s\";\n", instance->__name_space.c_str());
    }
    for (const Meta_Feature* feature : features(instance)) {
        if ((feature->flags & FLAG_METHOD) || (keys_only && !is_key(feature)))
            continue;
        out.append(inner * INDENT, ' ');
        if (feature->flags & FLAG_PROPERTY)
            append_property(out, instance, as_property(feature));
        else
            append_reference(out, instance, as_reference(feature), keys_only, inner);
        out.append(";\n");
    }
    out.append(level * INDENT, ' ');
    out.append('}');
}

} // namespace

void print(const Instance* instance, std::FILE* stream, bool keys_only) {
    Buffer out;
    append_block(out, instance, keys_only, 0);
    out.append('\n');
    std::fwrite(out.data(), 1, out.size(), stream);
}

} // namespace cimple
