#include "tools/mpcactl/print.h"

#include "host/path_text.h"
#include "host/value_json.h"

#include <cstdio>

namespace mpcactl {

namespace {

void write(const std::string& text) {
    std::fwrite(text.data(), 1, text.size(), stdout);
}

void write_json(const host::Json& json) {
    write(json.dump(2, ' ', false, host::Json::error_handler_t::replace) + "\n");
}

} // namespace

void print_instances(const Print_Context& context, const std::vector<host::Instance>& instances) {
    if (context.format == Format::json) {
        host::Json list = host::Json::array();
        for (const host::Instance& instance : instances)
            list.push_back(host::to_json(instance, context.name_space));
        write_json(list);
        return;
    }
    if (context.format == Format::mof) {
        for (const host::Instance& instance : instances)
            write(to_mof(context, instance));
        return;
    }
    // Associations answer several classes: a table for each, in the order of first appearance.
    std::vector<std::pair<const host::Class*, std::vector<const host::Instance*>>> groups;
    for (const host::Instance& instance : instances) {
        const host::Class* known = context.classes.find(instance.class_name());
        auto group = groups.begin();
        while (group != groups.end() && group->first != known)
            ++group;
        if (group == groups.end())
            group = groups.insert(group, {known, {}});
        group->second.push_back(&instance);
    }
    for (const auto& [known, members] : groups) {
        if (groups.size() > 1)
            write((known == groups.front().first ? "" : "\n") + known->name + "\n");
        write(to_table(context, *known, members));
    }
}

void print_instance(const Print_Context& context, const host::Instance& instance) {
    if (context.format == Format::json)
        write_json(host::to_json(instance, context.name_space));
    else
        print_instances(context, {instance});
}

void print_paths(const Print_Context& context, const std::vector<host::ObjectPath>& paths) {
    if (context.format != Format::json) {
        for (const host::ObjectPath& path : paths)
            print_path(context, path);
        return;
    }
    host::Json list = host::Json::array();
    for (const host::ObjectPath& path : paths)
        list.push_back(host::path_to_text(path, context.name_space));
    write_json(list);
}

void print_path(const Print_Context& context, const host::ObjectPath& path) {
    const std::string text = host::path_to_text(path, context.name_space);
    if (context.format == Format::json)
        write_json(text);
    else
        write(text + "\n");
}

void print_method_result(const Print_Context& context, const host::Method& method,
                         const host::Method_Result& result) {
    if (context.format == Format::json) {
        host::Json outputs = host::Json::object();
        for (const host::Named_Value& output : result.outputs)
            outputs[output.name] = host::to_json(output.value, context.name_space);
        write_json({{"returnValue", host::to_json(result.value, context.name_space)},
                    {"outputs", outputs}});
        return;
    }
    constexpr const char* return_value = "ReturnValue";
    std::size_t width = std::string(return_value).size();
    for (const host::Named_Value& output : result.outputs)
        width = std::max(width, output.name.size());
    const auto line = [&](const std::string& name, const host::Slot_Type* slot,
                          const host::Value& value) {
        write(name + std::string(width - name.size() + 2, ' ') + to_cell(context, slot, value) +
              "\n");
    };
    line(return_value, &method.result, result.value);
    for (const host::Named_Value& output : result.outputs)
        line(output.name, method.find(output.name), output.value);
}

} // namespace mpcactl
