#include "tools/mpcactl/print.h"

#include "host/path_text.h"
#include "host/scalar_text.h"
#include "host/text.h"
#include "host/value_json.h"

#include <algorithm>
#include <numeric>

namespace mpcactl {

namespace {

constexpr std::size_t CELL_WIDTH = 40;
constexpr std::size_t GAP = 2;

std::string scalar_to_cell(const host::Value& value, const std::string& name_space) {
    if (value.is_null())
        return "NULL";
    if (const host::ObjectPath* path = value.as_reference())
        return host::path_to_text(*path, name_space);
    if (value.as_instance())
        return host::to_json(value, name_space)
            .dump(-1, ' ', false, host::Json::error_handler_t::replace);
    if (!std::holds_alternative<std::string>(value.data))
        return host::number_to_text(value);
    return to_line(value.as_text());
}

bool any_has(const std::vector<const host::Instance*>& instances, const std::string& property) {
    return std::any_of(instances.begin(), instances.end(), [&](const host::Instance* one) {
        return one->property(property) != nullptr;
    });
}

// Columns in their order: those asked for, or keys and then what any instance has. A class that has
// nothing of what was asked for, one of several, shows the keys.
std::vector<std::string> choose_columns(const Print_Context& context, const host::Class& known,
                                        const std::vector<const host::Instance*>& instances) {
    std::vector<std::string> columns;
    for (const std::string& name : context.columns)
        if (const host::Property* property = known.find_property(name))
            columns.push_back(property->name);
    if (!columns.empty())
        return columns;
    for (const bool keys : {true, false})
        for (const host::Property& property : known.properties)
            if (property.key == keys && (keys || context.columns.empty()) &&
                any_has(instances, property.name))
                columns.push_back(property.name);
    return columns;
}

// A property that was asked for and is not there is null.
std::string cell_of(const Print_Context& context, const host::Class& known,
                    const host::Instance& instance, const std::string& column) {
    const host::Value* value = instance.property(column);
    if (!value)
        return context.columns.empty() ? "" : "NULL";
    return to_cell(context, known.find_property(column), *value);
}

std::string padded(const std::string& text, std::size_t width) {
    const std::size_t length = host::utf8_length(text);
    return text + std::string(length < width ? width - length : 0, ' ');
}

std::string trimmed_line(std::string line) {
    line.erase(line.find_last_not_of(' ') + 1);
    return line + "\n";
}

using Rows = std::vector<std::vector<std::string>>;

std::string rows_to_text(const Rows& rows, const std::vector<std::size_t>& widths) {
    std::string text;
    for (const auto& row : rows) {
        std::string line;
        for (std::size_t i = 0; i < row.size(); ++i)
            line += padded(row[i], widths[i]) + std::string(GAP, ' ');
        text += trimmed_line(std::move(line));
    }
    return text;
}

// A line for each property, a blank line between instances.
std::string to_list(const Print_Context& context, const host::Class& known,
                    const std::vector<std::string>& columns,
                    const std::vector<const host::Instance*>& instances) {
    std::size_t width = 0;
    for (const std::string& column : columns)
        width = std::max(width, column.size());
    std::string text;
    for (const host::Instance* instance : instances) {
        text += text.empty() ? "" : "\n";
        for (const std::string& column : columns)
            if (instance->property(column))
                text += trimmed_line(padded(column, width + GAP) +
                                     cell_of(context, known, *instance, column));
    }
    return text;
}

} // namespace

std::optional<std::string> wanted_word(const Print_Context& context, const host::Slot_Type* slot,
                                       const host::Value& value) {
    const auto word = context.words && slot ? host::word_of(*slot, value) : std::nullopt;
    return word ? std::optional(to_line(*word)) : std::nullopt;
}

std::string to_line(const std::string& text) {
    // The escapes of a quoted text, without its quotes and without escaped quotes and backslashes.
    std::string line;
    for (char c : text) {
        const std::string quoted = host::quote(std::string(1, c));
        line += c == '"' || c == '\\' ? std::string(1, c) : quoted.substr(1, quoted.size() - 2);
    }
    return line;
}

std::string to_cell(const Print_Context& context, const host::Slot_Type* slot,
                    const host::Value& value) {
    const auto one = [&](const host::Value& scalar) {
        const auto word = wanted_word(context, slot, scalar);
        return scalar_to_cell(scalar, context.name_space) + (word ? " (" + *word + ")" : "");
    };
    if (!value.is_array() || value.is_null())
        return one(value);
    std::string cell;
    for (const host::Value& element : value.as_array())
        cell += (&element == &value.as_array().front() ? "" : ", ") + one(element);
    return cell;
}

std::string cut(const std::string& text, std::size_t width) {
    if (host::utf8_length(text) <= width)
        return text;
    std::size_t end = 0;
    for (std::size_t length = 0; end < text.size(); ++end) {
        length += (static_cast<unsigned char>(text[end]) & 0xc0) != 0x80;
        if (length == width)
            break;
    }
    return text.substr(0, end) + "…";
}

std::string to_table(const Print_Context& context, const host::Class& known,
                     const std::vector<const host::Instance*>& instances) {
    if (instances.empty())
        return "";
    const std::vector<std::string> columns = choose_columns(context, known, instances);
    if (columns.empty()) { // not even keys: their paths are all there is
        std::string text;
        for (const host::Instance* instance : instances)
            text += host::path_to_text(instance->path, context.name_space) + "\n";
        return text;
    }
    Rows rows = {columns};
    for (const host::Instance* instance : instances) {
        rows.emplace_back();
        for (const std::string& column : columns) {
            const std::string cell = cell_of(context, known, *instance, column);
            rows.back().push_back(context.cut_cells ? cut(cell, CELL_WIDTH) : cell);
        }
    }
    std::vector<std::size_t> widths(columns.size(), 0);
    for (const auto& row : rows)
        for (std::size_t i = 0; i < row.size(); ++i)
            widths[i] = std::max(widths[i], host::utf8_length(row[i]));
    const std::size_t total =
        std::accumulate(widths.begin(), widths.end(), columns.size() * GAP) - GAP;
    // Columns that were asked for stand side by side however wide they are.
    if (context.columns.empty() && total > context.width)
        return to_list(context, known, columns, instances);
    return rows_to_text(rows, widths);
}

} // namespace mpcactl
