#include "host/platform.h"

#include "host/located_json.h"
#include "host/manager.h"
#include "host/value_check.h"
#include "host/value_json.h"

#include <algorithm>

namespace host {

namespace {

// Looks at one list item; what it asks for is there and has the right kind, or the reading ends.
class Item {
public:
    Item(const Located_Json& file, std::string path, const Json& json)
        : _file(file), _path(std::move(path)), _json(json) {
        if (!json.is_object())
            fail("", "an object expected");
    }

    [[noreturn]] void fail(const std::string& part, const std::string& text) const {
        const std::string separator = part.empty() || _path.empty() ? "" : "/";
        _file.fail(_path + separator + part, text);
    }

    void allow_only(const std::vector<std::string>& names) const {
        for (const auto& [name, value] : _json.items())
            if (std::find(names.begin(), names.end(), name) == names.end())
                fail(name, "unknown; known here are " + join_or(names));
    }

    std::string text(const std::string& name) const {
        if (!_json.contains(name))
            fail(name, "is missing");
        if (!_json[name].is_string() || _json[name].get<std::string>().empty())
            fail(name, "a text expected");
        return _json[name].get<std::string>();
    }

    const Json* part(const std::string& name) const {
        return _json.contains(name) ? &_json[name] : nullptr;
    }

    const Json& list(const std::string& name) const {
        static const Json empty = Json::array();
        const Json* found = part(name);
        if (found && !found->is_array())
            fail(name, "a list expected");
        return found ? *found : empty;
    }

private:
    const Located_Json& _file;
    std::string _path;
    const Json& _json;
};

void read_class(const Item& item, ClassRepository& classes) {
    item.allow_only({"name", "superclass"});
    const std::string name = item.text("name");
    const bool has_superclass = item.part("superclass") != nullptr;
    const auto wrong = classes.add({name, has_superclass ? item.text("superclass") : ""});
    if (wrong)
        item.fail(has_superclass && !classes.find(name) ? "superclass" : "name", *wrong);
}

Instance read_instance(const Item& item, const ClassRepository& classes) {
    item.allow_only({"namespace", "class", "properties"});
    Instance instance;
    instance.path.name_space = item.text("namespace");
    const std::string class_name = item.text("class");
    const Class* known = classes.find(class_name);
    if (!known)
        item.fail("class",
                  "unknown class " + class_name + did_you_mean(class_name, classes.names()));
    instance.path.class_name = known->name;
    const Json* properties = item.part("properties");
    if (!properties)
        item.fail("properties", "is missing");
    try {
        instance.properties =
            properties_from_json(classes, *known, *properties, instance.path.name_space);
    } catch (const Json_Complaint& wrong) {
        item.fail(wrong.path.empty() ? "properties" : "properties/" + wrong.path, wrong.text);
    }
    for (std::size_t index : known->keys) {
        const std::string& key = known->properties[index].name;
        if (const Value* value = instance.property(key))
            instance.path.keys.push_back({key, *value});
    }
    if (Complaint wrong = check_path(classes, instance.path))
        item.fail("properties", *wrong);
    return instance;
}

} // namespace

void Platform::read(const std::string& path, ClassRepository& classes) {
    const auto text = mof::read_file(path);
    if (!text)
        throw Setup_Error(path + ": cannot be read");
    read_text(*text, path, classes);
}

void Platform::read_text(std::string_view text, const std::string& name, ClassRepository& classes) {
    const Located_Json file = parse_located_json(text, name);
    const Json* instances = &file.value;
    std::string prefix;
    if (!file.value.is_array()) {
        const Item top(file, "", file.value);
        top.allow_only({"classes", "instances"});
        std::size_t number = 0;
        for (const Json& json : top.list("classes"))
            read_class(Item(file, "classes/" + std::to_string(number++), json), classes);
        instances = &top.list("instances");
        prefix = "instances/";
    }
    std::size_t number = 0;
    for (const Json& json : *instances) {
        const Item item(file, prefix + std::to_string(number++), json);
        Instance instance = read_instance(item, classes);
        if (find(instance.path))
            item.fail("", "an instance with these keys stands above");
        _instances.push_back(std::move(instance));
    }
}

bool Platform::has_name_space(std::string_view name_space) const {
    return std::any_of(_instances.begin(), _instances.end(), [&](const Instance& instance) {
        return same_name(instance.path.name_space, name_space);
    });
}

bool Platform::serves(std::string_view name_space, const Class& known,
                      const ClassRepository& classes) const {
    return std::any_of(_instances.begin(), _instances.end(), [&](const Instance& instance) {
        return same_name(instance.path.name_space, name_space) &&
               classes.find(instance.class_name())->is_a(&known);
    });
}

std::vector<Instance> Platform::instances(std::string_view name_space, const Class& known,
                                          const ClassRepository& classes) const {
    std::vector<Instance> found;
    for (const Instance& instance : _instances)
        if (same_name(instance.path.name_space, name_space) &&
            classes.find(instance.class_name())->is_a(&known))
            found.push_back(instance);
    return found;
}

const Instance* Platform::find(const ObjectPath& path) const {
    const auto found =
        std::find_if(_instances.begin(), _instances.end(),
                     [&](const Instance& instance) { return instance.path == path; });
    return found == _instances.end() ? nullptr : &*found;
}

} // namespace host
