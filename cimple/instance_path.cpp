// Model paths: an instance's class and keys as one line of text, and back.
//
// The text comes from outside, so reading it trusts nothing: every cursor stops at the terminating
// zero, numbers are range-checked, and the depth of quoted paths is bounded.
#include "cimple/instance.h"

#include "cimple/buffer.h"
#include "cimple/instance_detail.h"
#include "cimple/value_text.h"

#include <charconv>
#include <cstring>
#include <limits>
#include <string>
#include <type_traits>

namespace cimple {

using namespace detail;

namespace {

constexpr int DEEPEST_PATH = 8; // quoted paths within quoted paths

Instance* read_path(const Meta_Class* meta_class, const char* path, int depth);

// ---- Reading. Each function moves the cursor behind what it took, or answers false. ----

bool is_name_char(char c) {
    return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c >= '0' && c <= '9') || c == '_' ||
           static_cast<unsigned char>(c) >= 0x80;
}

// A name and the separator behind it.
bool read_name(const char*& cursor, char separator, String& name) {
    const char* p = cursor;
    while (is_name_char(*p))
        ++p;
    if (p == cursor || *p != separator)
        return false;
    name.assign(cursor, static_cast<std::size_t>(p - cursor));
    cursor = p + 1;
    return true;
}

// End of an unquoted value.
const char* value_end(const char* cursor) {
    return cursor + std::strcspn(cursor, ",");
}

bool read_magnitude(const char* p, const char* end, int base, uint64& magnitude) {
    const auto result = std::from_chars(p, end, magnitude, base);
    return result.ec == std::errc() && result.ptr == end;
}

template <class T>
bool read_integer(const char*& cursor, T& value) {
    const char* end = value_end(cursor);
    const char* p = cursor;
    const bool negative = std::is_signed_v<T> && *p == '-';
    if (negative)
        ++p;
    uint64 magnitude = 0;
    if (!read_magnitude(p, end, 10, magnitude)) {
        if (p[0] == '0' && (p[1] == 'x' || p[1] == 'X'))
            p += 2;
        if (!read_magnitude(p, end, 16, magnitude))
            return false;
    }
    const uint64 largest = static_cast<uint64>(std::numeric_limits<T>::max());
    if (magnitude > largest + (negative ? 1 : 0))
        return false;
    value = static_cast<T>(negative ? 0 - magnitude : magnitude);
    cursor = end;
    return true;
}

template <class T>
bool read_real(const char*& cursor, T& value) {
    const char* end = value_end(cursor);
    const auto result = std::from_chars(cursor, end, value);
    cursor = end;
    return result.ec == std::errc() && result.ptr == end;
}

bool read_boolean(const char*& cursor, boolean& value) {
    const char* end = value_end(cursor);
    const String word(cursor, static_cast<std::size_t>(end - cursor));
    cursor = end;
    value = equali(word, "true");
    return value || equali(word, "false");
}

// 'c', or the number where the character has no such form.
bool read_char16(const char*& cursor, char16& value) {
    if (*cursor != '\'') {
        uint16 code;
        if (!read_integer(cursor, code))
            return false;
        value = code;
        return true;
    }
    const auto c = static_cast<unsigned char>(cursor[1]);
    if (c == '\0' || c >= 0x80 || cursor[2] != '\'')
        return false;
    value = c;
    cursor += 3;
    return true;
}

// A string in double quotes. A back-slash makes any character behind it plain.
bool read_string(const char*& cursor, std::string& text) {
    if (*cursor != '"')
        return false;
    for (++cursor; *cursor != '"'; ++cursor) {
        if (*cursor == '\\')
            ++cursor;
        if (*cursor == '\0')
            return false;
        text += *cursor;
    }
    ++cursor;
    return true;
}

// A path in double quotes. Only its own double quotes were given a back-slash; the back-slashes
// that it has itself were not doubled, so they stay.
bool read_quoted_path(const char*& cursor, std::string& path) {
    if (*cursor != '"')
        return false;
    for (++cursor; *cursor != '"'; ++cursor) {
        if (cursor[0] == '\\' && cursor[1] == '"')
            ++cursor;
        if (*cursor == '\0')
            return false;
        path += *cursor;
    }
    ++cursor;
    return true;
}

bool read_text_property(const char*& cursor, Instance* instance, const Meta_Property* p) {
    std::string text;
    if (!read_string(cursor, text))
        return false;
    if (p->type == TYPE_DATETIME)
        return member_as<Datetime>(instance, p->offset).set(text.c_str());
    member_as<String>(instance, p->offset).assign(text.data(), text.size());
    return true;
}

bool read_property(const char*& cursor, Instance* instance, const Meta_Property* p) {
    switch (p->type) {
    case TYPE_BOOLEAN:
        return read_boolean(cursor, member_as<boolean>(instance, p->offset));
    case TYPE_UINT8:
        return read_integer(cursor, member_as<uint8>(instance, p->offset));
    case TYPE_SINT8:
        return read_integer(cursor, member_as<sint8>(instance, p->offset));
    case TYPE_UINT16:
        return read_integer(cursor, member_as<uint16>(instance, p->offset));
    case TYPE_SINT16:
        return read_integer(cursor, member_as<sint16>(instance, p->offset));
    case TYPE_UINT32:
        return read_integer(cursor, member_as<uint32>(instance, p->offset));
    case TYPE_SINT32:
        return read_integer(cursor, member_as<sint32>(instance, p->offset));
    case TYPE_UINT64:
        return read_integer(cursor, member_as<uint64>(instance, p->offset));
    case TYPE_SINT64:
        return read_integer(cursor, member_as<sint64>(instance, p->offset));
    case TYPE_REAL32:
        return read_real(cursor, member_as<real32>(instance, p->offset));
    case TYPE_REAL64:
        return read_real(cursor, member_as<real64>(instance, p->offset));
    case TYPE_CHAR16:
        return read_char16(cursor, member_as<char16>(instance, p->offset));
    default:
        return read_text_property(cursor, instance, p);
    }
}

bool read_reference(const char*& cursor, Instance* instance, const Meta_Reference* r, int depth) {
    std::string path;
    if (depth >= DEEPEST_PATH || !read_quoted_path(cursor, path))
        return false;
    Ref<Instance> target(read_path(r->meta_class, path.c_str(), depth + 1));
    if (!target || !is_subclass(r->meta_class, target->__meta_class))
        return false;
    reference(instance, r) = target.release();
    return true;
}

// One key=value pair. A key that has a value already was given twice.
bool read_key(const char*& cursor, Instance* instance, int depth) {
    String name;
    if (!read_name(cursor, '=', name))
        return false;
    const Meta_Feature* key =
        find_feature(instance->__meta_class, name.c_str(), FLAG_PROPERTY | FLAG_REFERENCE);
    if (!key || !is_key(key) || !is_null(instance, key))
        return false;
    if (key->flags & FLAG_REFERENCE)
        return as_reference(key)->subscript == 0 &&
               read_reference(cursor, instance, as_reference(key), depth);
    if (as_property(key)->subscript != 0 || !read_property(cursor, instance, as_property(key)))
        return false;
    *null_flag(instance, key) = 0;
    return true;
}

Instance* read_path(const Meta_Class* meta_class, const char* path, int depth) {
    String class_name;
    if (!read_name(path, '.', class_name))
        return nullptr;
    const Meta_Class* found = find_class_in_tree(meta_class, class_name.c_str());
    if (!found)
        return nullptr;
    Ref<Instance> instance(create_model(found, nullptr));
    for (uint32 count = 1; read_key(path, instance.get(), depth); ++count, ++path) {
        if (*path == '\0')
            return count == found->num_keys ? instance.release() : nullptr;
        if (*path != ',')
            return nullptr;
    }
    return nullptr;
}

// ---- Writing ----

// In double quotes, with a back-slash before each of the given characters.
void append_escaped(Buffer& out, const char* text, const char* escaped) {
    out.append('"');
    for (; *text; ++text) {
        if (std::strchr(escaped, *text))
            out.append('\\');
        out.append(*text);
    }
    out.append('"');
}

void append_property(Buffer& out, const Instance* instance, const Meta_Property* p) {
    if (p->type == TYPE_STRING) {
        append_escaped(out, member_as<String>(instance, p->offset).c_str(), "\"\\");
    } else if (p->type == TYPE_DATETIME) {
        append_escaped(out, member_as<Datetime>(instance, p->offset).ascii().c_str(), "");
    } else if (p->type == TYPE_CHAR16) {
        const char16 c = member_as<char16>(instance, p->offset);
        if (c > 0 && c < 0x80)
            out.format("'%c'", static_cast<char>(c));
        else
            append_number(out, TYPE_CHAR16, &c);
    } else {
        append_number(out, p->type, member(instance, p->offset));
    }
}

bool append_path(Buffer& out, const Instance* instance) {
    out.append(instance->__meta_class->name);
    char separator = '.';
    for (const Meta_Feature* feature : features(instance)) {
        if (!is_key(feature) || (feature->flags & FLAG_METHOD))
            continue;
        const bool is_reference = (feature->flags & FLAG_REFERENCE) != 0;
        if (is_reference && as_reference(feature)->subscript != 0)
            continue;
        if (is_null(instance, feature) || (!is_reference && as_property(feature)->subscript != 0))
            return false;
        out.append(separator);
        out.append(feature->name);
        out.append('=');
        if (is_reference) {
            Buffer path;
            if (!append_path(path, reference(instance, as_reference(feature))))
                return false;
            append_escaped(out, path.data(), "\"");
        } else {
            append_property(out, instance, as_property(feature));
        }
        separator = ',';
    }
    return separator == ',';
}

} // namespace

Instance* model_path_to_instance(const Meta_Class* meta_class, const char* path) {
    return meta_class && path ? read_path(meta_class, path, 0) : nullptr;
}

int instance_to_model_path(const Instance* instance, String& out) {
    Buffer path;
    if (!append_path(path, instance))
        return -1;
    out.assign(path.data(), path.size());
    return 0;
}

} // namespace cimple
