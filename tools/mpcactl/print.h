// Results in their three forms. Everything goes to standard output.
#ifndef MPCACTL_PRINT_H
#define MPCACTL_PRINT_H

#include "host/manager.h"
#include "tools/mpcactl/settings.h"

#include <optional>
#include <string>
#include <vector>

namespace mpcactl {

struct Print_Context {
    const host::ClassRepository& classes;
    Format format;
    std::string name_space;           // references in it are written without it
    std::vector<std::string> columns; // asked for, in this order; empty: what there is
    std::size_t width;                // of a row, in characters
    bool cut_cells;                   // texts are shortened to the width of a cell
    bool words;                       // beside the values that stand for one; not in JSON
};

// JSON: a list. Tables: one for each class, keys first; instances that are too wide for a row are
// written as a list of names and values.
void print_instances(const Print_Context& context, const std::vector<host::Instance>& instances);
void print_instance(const Print_Context& context, const host::Instance& instance);
// One path a line, JSON: a list of texts.
void print_paths(const Print_Context& context, const std::vector<host::ObjectPath>& paths);
void print_path(const Print_Context& context, const host::ObjectPath& path);
void print_method_result(const Print_Context& context, const host::Method& method,
                         const host::Method_Result& result);

// ---- Parts, used by the above ----

// The instance as MOF: "instance of Class {...};".
std::string to_mof(const Print_Context& context, const host::Instance& instance);
// The word for a scalar on one line, where words are wanted and the slot, which may be null, has
// one.
std::optional<std::string> wanted_word(const Print_Context& context, const host::Slot_Type* slot,
                                       const host::Value& value);
// A text on one line, safe for a terminal: control characters are escaped.
std::string to_line(const std::string& text);
// A value on one line, with its word.
std::string to_cell(const Print_Context& context, const host::Slot_Type* slot,
                    const host::Value& value);
// Cuts a text to so many characters, with an ellipsis.
std::string cut(const std::string& text, std::size_t width);
std::string to_table(const Print_Context& context, const host::Class& known,
                     const std::vector<const host::Instance*>& instances);

} // namespace mpcactl

#endif // MPCACTL_PRINT_H
