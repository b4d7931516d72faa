// What must hold for the whole model, whatever classes it has: the instances, their names and their
// associations tell one story, from whichever end they are asked.
#include "host/path_text.h"
#include "tests/road/road.h"

#include <algorithm>
#include <functional>
#include <set>

using road::Road;

namespace {

using Paths = std::vector<host::ObjectPath>;
using Instances = std::vector<host::Instance>;

std::string text(const host::ObjectPath& path) {
    return host::path_to_text(path, "");
}

// The same without its namespace: the module shows an instance in whatever namespace it is asked
// in, while an end is named in the one where clients look for it.
std::string name(host::ObjectPath path) {
    path.name_space.clear();
    return text(path);
}

std::vector<std::string> texts(const Paths& paths) {
    std::vector<std::string> all;
    for (const host::ObjectPath& path : paths)
        all.push_back(text(path));
    return all;
}

template <class Path_Of, class List>
std::vector<std::string> names(const List& list, Path_Of path_of) {
    std::vector<std::string> all;
    for (const auto& item : list)
        all.push_back(name(path_of(item)));
    return all;
}

// Everything that the module shows, by enumeration: what the other operations are held against.
struct Model {
    struct Class_Row {
        const host::Class* known;
        Instances instances;
    };
    const host::ClassRepository& classes;
    std::vector<Class_Row> rows; // in the order of the catalogue
    std::map<std::string, const host::Instance*> by_name;

    explicit Model(Road& road) : classes(road.manager().classes()) {
        for (const host::Class* known : road.manager().provider_classes())
            rows.push_back({known, road.enumerate(known->name)});
        for (const Class_Row& row : rows)
            for (const host::Instance& instance : row.instances)
                EXPECT_TRUE(by_name.emplace(name(instance.path), &instance).second)
                    << "two instances of one name: " << text(instance.path);
    }
    bool serves(const host::ObjectPath& path) const {
        return std::any_of(rows.begin(), rows.end(), [&](const Class_Row& row) {
            return host::same_name(row.known->name, path.class_name);
        });
    }
    // Every instance, and every end of an association that is none of the module's.
    Paths everything() const {
        Paths all;
        std::set<std::string> strangers;
        for (const Class_Row& row : rows) {
            for (const host::Instance& instance : row.instances) {
                all.push_back(instance.path);
                for (const host::Named_Value& property : instance.properties) {
                    const host::ObjectPath* end = property.value.as_reference();
                    if (end && !serves(*end) && strangers.insert(text(*end)).second)
                        all.push_back(*end);
                }
            }
        }
        return all;
    }
};

// An end is the source of a query if its place accepts the source's class and it has all of the
// source's keys.
bool is_source(const Model& model, const host::ObjectPath& source, const host::Class& association,
               const host::Named_Value& end) {
    const host::Property* place = association.find_property(end.name);
    if (!place || (place->target && !model.classes.find(source.class_name)->is_a(place->target)))
        return false;
    const host::ObjectPath& path = *end.value.as_reference();
    return std::all_of(source.keys.begin(), source.keys.end(), [&](const host::Named_Value& key) {
        const host::Value* value = path.key(key.name);
        return value && *value == key.value;
    });
}

// What the enumerations say about one source: its associations and the ends opposite.
struct Expected {
    Paths references;
    Paths ends;
};

Expected expect_of(const Model& model, const host::ObjectPath& source) {
    Expected expected;
    for (const Model::Class_Row& row : model.rows) {
        if (!row.known->is_association)
            continue;
        for (const host::Instance& association : row.instances) {
            Paths others;
            bool found = false;
            for (const host::Named_Value& property : association.properties) {
                if (!property.value.as_reference())
                    continue;
                if (is_source(model, source, *row.known, property))
                    found = true;
                else
                    others.push_back(*property.value.as_reference());
            }
            if (!found)
                continue;
            expected.references.push_back(association.path);
            expected.ends.insert(expected.ends.end(), others.begin(), others.end());
        }
    }
    return expected;
}

void check_source(Road& road, const Model& model, const host::ObjectPath& source) {
    SCOPED_TRACE(text(source));
    const Expected expected = expect_of(model, source);
    host::Manager& manager = road.manager();
    EXPECT_EQ(names(manager.reference_names(source).value, std::identity{}),
              names(expected.references, std::identity{}));
    EXPECT_EQ(texts(manager.associator_names(source).value), texts(expected.ends));

    const auto references = manager.references(source);
    const auto path_of = [](const host::Instance& instance) { return instance.path; };
    EXPECT_EQ(names(references.value, path_of), names(expected.references, std::identity{}));
    for (host::Instance reference : references.value) {
        const auto known = model.by_name.find(name(reference.path));
        if (known != model.by_name.end())
            reference.path.name_space = known->second->path.name_space;
        EXPECT_TRUE(known != model.by_name.end() && *known->second == reference)
            << text(reference.path);
    }

    Paths served;
    for (const host::ObjectPath& end : expected.ends)
        if (model.serves(end))
            served.push_back(end);
    auto associators = manager.associators(source).value;
    std::erase_if(associators, [&](const host::Instance& i) { return !model.serves(i.path); });
    EXPECT_EQ(names(associators, path_of), names(served, std::identity{}));
}

void check_instances(Road& road, const Model& model) {
    for (const auto& [path, instance] : model.by_name) {
        const auto got = road.manager().get(instance->path);
        EXPECT_TRUE(got.ok()) << path << ": " << host::rc_name(got.status.rc);
        EXPECT_TRUE(got.value == *instance) << path;
        for (const host::Named_Value& property : instance->properties) {
            const host::ObjectPath* end = property.value.as_reference();
            if (!end || !model.serves(*end))
                continue;
            EXPECT_TRUE(model.by_name.count(name(*end)) && road.manager().get(*end).ok())
                << path << ": " << property.name << " names " << text(*end)
                << ", which is not there";
        }
    }
}

constexpr const char* PLATFORM = R"([
  {"namespace": "root/ibmse", "class": "IBMSD_ComputerSystem",
   "properties": {"CreationClassName": "IBMSD_ComputerSystem", "Name": "rack7-node3"}},
  {"namespace": "root/ibmse", "class": "IBMSD_Chassis",
   "properties": {"CreationClassName": "IBMSD_Chassis", "Tag": "chassis 12"}}
])";

class Oracle : public testing::TestWithParam<const char*> {};

TEST_P(Oracle, TheModelTellsOneStory) {
    for (const char* platform : {"", PLATFORM}) {
        Road road({.scenario = GetParam(), .platform = platform});
        const Model model(road);
        ASSERT_FALSE(model.by_name.empty());
        check_instances(road, model);
        for (const host::ObjectPath& source : model.everything())
            check_source(road, model, source);
    }
}

INSTANTIATE_TEST_SUITE_P(Scenarios, Oracle,
                         testing::Values("two-port-cna.json", "blade-16-functions.json"),
                         [](const auto& info) {
                             const std::string file = info.param;
                             return file.starts_with("two") ? "TwoPorts" : "Blade";
                         });

} // namespace
