// What must hold for the whole model, whatever classes it has: the instances, their names and their
// associations tell one story, from whichever end they are asked.
#include "host/path_text.h"
#include "tests/road/hosts.h"
#include "tests/road/road.h"

#include <algorithm>
#include <set>

using road::PLATFORM;
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

const host::ObjectPath& path_of(const host::ObjectPath& path) {
    return path;
}
const host::ObjectPath& path_of(const host::Instance& instance) {
    return instance.path;
}

template <class List>
std::vector<std::string> texts(const List& list) {
    std::vector<std::string> all;
    for (const auto& item : list)
        all.push_back(text(path_of(item)));
    return all;
}

template <class List>
std::vector<std::string> names(const List& list) {
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
        for (const host::Class* known : road.manager().provider_classes()) {
            rows.push_back({known, road.enumerate(known->name)});
            EXPECT_EQ(texts(road.manager().enumerate_names(known->name).value),
                      texts(rows.back().instances));
        }
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
    // Every instance, and every end of an association that is none of the module's: in its own
    // namespace, and in the module's, where a client asks for what it is associated with.
    Paths everything() const {
        Paths all;
        std::set<std::string> strangers;
        for (const Class_Row& row : rows) {
            for (const host::Instance& instance : row.instances) {
                all.push_back(instance.path);
                for (const host::Named_Value& property : instance.properties) {
                    const host::ObjectPath* end = property.value.as_reference();
                    if (!end || serves(*end) || !strangers.insert(text(*end)).second)
                        continue;
                    all.push_back(*end);
                    all.push_back({"root/vorlan", end->class_name, end->keys});
                }
            }
        }
        return all;
    }
};

// An end is the source of a query if its place accepts the source's class and it has all of the
// source's keys.
bool is_source(const host::ObjectPath& source, const host::Class* source_class,
               const host::Property& place, const host::ObjectPath& end) {
    return (!place.target || source_class->is_a(place.target)) &&
           std::all_of(source.keys.begin(), source.keys.end(), [&](const host::Named_Value& key) {
               const host::Value* value = end.key(key.name);
               return value && *value == key.value;
           });
}

// What the enumerations say about one source: its associations and the ends opposite.
struct Expected {
    Paths references;
    Paths ends;
};

Expected expect_of(const host::Manager& manager, const Model& model,
                   const host::ObjectPath& source) {
    const host::Class* source_class = model.classes.find(source.class_name);
    Expected expected;
    for (const Model::Class_Row& row : model.rows) {
        if (!row.known->is_association || !manager.serves(*row.known, source.name_space))
            continue;
        for (const host::Instance& association : row.instances) {
            std::vector<const host::ObjectPath*> others;
            bool found = false;
            for (const host::Named_Value& property : association.properties) {
                const host::ObjectPath* end = property.value.as_reference();
                if (!end)
                    continue;
                const host::Property* place = row.known->find_property(property.name);
                if (place && is_source(source, source_class, *place, *end))
                    found = true;
                else
                    others.push_back(end);
            }
            if (!found)
                continue;
            expected.references.push_back(association.path);
            for (const host::ObjectPath* end : others)
                expected.ends.push_back(*end);
        }
    }
    return expected;
}

void check_source(Road& road, const Model& model, const host::ObjectPath& source) {
    SCOPED_TRACE(text(source));
    host::Manager& manager = road.manager();
    const Expected expected = expect_of(manager, model, source);
    EXPECT_EQ(names(manager.reference_names(source).value), names(expected.references));
    EXPECT_EQ(texts(manager.associator_names(source).value), texts(expected.ends));

    const auto references = manager.references(source);
    EXPECT_EQ(names(references.value), names(expected.references));
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
    EXPECT_EQ(names(associators), names(served));
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

// Units of every kind behind two ports, one of them seen by both.
const std::string SMALL_SAN = road::card(R"({"use": "nic"}, {"use": "fcoe", "targets": [
      {"wwpn": "50:25:64:C0:3B:20:00:0{port}", "luns": 5,
       "types": ["disk", "tape", "processor", 17, "cd"], "serial": "P{port}L{lun}"},
      {"wwpn": "50:25:64:C0:3B:20:00:0F", "luns": 1, "serial": "SHARED"}]})",
                                         R"("ports": 2, )");

struct Scenario {
    const char* name;
    std::string text; // as Setup wants it
};

const Scenario SCENARIOS[] = {
    {"TwoPorts", "two-port-cna.json"},
    {"Blade", "blade-16-functions.json"},
    {"FCoE", "fcoe-pair.json"},
    {"ISCSI", "iscsi-sessions.json"},
    {"SmallSAN", SMALL_SAN},
    {"Diagnostics", "diagnostics.json"},
    {"SplitCards", "split-cards.json"},
    {"ISCSIEmpty", "iscsi-empty.json"},
    {"IPTables", "ip-tables.json"},
    {"DriverParameters", "driver-parameters.json"},
    {"RecordLogs", "record-logs.json"},
    {"VirtualPorts", "virtual-ports.json"},
    {"Everything", "everything.json"},
};

class Oracle : public testing::TestWithParam<Scenario> {};

TEST_P(Oracle, TheModelTellsOneStory) {
    for (const char* platform : {"", PLATFORM}) {
        Road road({.scenario = GetParam().text, .platform = platform});
        const Model model(road);
        ASSERT_FALSE(model.by_name.empty());
        check_instances(road, model);
        for (const host::ObjectPath& source : model.everything())
            check_source(road, model, source);
    }
}

// ---- After runs of diagnostic tests ----

// Of the diagnostics model, also what only a run makes.
constexpr const char* DIAGNOSTIC_ASSOCIATIONS[] = {
    "VLNMPCA_AffectedJobElement",
    "VLNMPCA_AvailableDiagnosticService",
    "VLNMPCA_DiagElementCapabilities",
    "VLNMPCA_DiagElementSoftwareIdentity",
    "VLNMPCA_DiagHostedService",
    "VLNMPCA_ElementSettingData",
    "VLNMPCA_HostedService",
    "VLNMPCA_LogManagesRecord",
    "VLNMPCA_OwningJobElement",
    "VLNMPCA_RecordAppliesToElement",
    "VLNMPCA_ServiceAffectsElement",
    "VLNMPCA_ServiceAvailableToElement",
    "VLNMPCA_ServiceConformsToProfile",
    "VLNMPCA_UseOfLog",
};

void run_every_test(Road& road) {
    for (const host::Instance& link : road.enumerate("VLNMPCA_AvailableDiagnosticService")) {
        const host::ObjectPath* test = link.property("ServiceProvided")->as_reference();
        const auto reply = road.manager().invoke(
            *test, "RunDiagnosticService", {{"ManagedElement", *link.property("UserOfService")}});
        EXPECT_TRUE(reply.ok()) << text(*test);
    }
}

TEST(Oracle_After, DiagnosticRunsTheModelTellsOneStory) {
    Road road({.scenario = "diagnostics.json"});
    run_every_test(road);
    const Model model(road);
    check_instances(road, model);
    const auto census = road.census();
    for (const char* association : DIAGNOSTIC_ASSOCIATIONS)
        EXPECT_TRUE(census.contains(association)) << association;
    for (const host::ObjectPath& source : model.everything())
        check_source(road, model, source);
}

// Elements that conform to a profile, by any association of that kind.
std::set<std::string> conforming_to(Road& road, const host::ObjectPath& profile) {
    std::set<std::string> elements;
    for (const host::Class* known : road.manager().provider_classes())
        if (known->is_a(road.manager().classes().find("CIM_ElementConformsToProfile")))
            for (const auto& path :
                 road.manager()
                     .associator_names(profile, {known->name, "", "", "ManagedElement"})
                     .value)
                elements.insert(text(path));
    return elements;
}

// Where the system is the provider's own, every profile leads to something. A platform's system
// conforms to what the platform says: these profiles are left with nothing then, since nothing else
// of the host conforms to them.
TEST_P(Oracle, EveryProfileLeadsToAnElement) {
    const std::set<std::string> of_the_system = {"Record Log", "Storage HBA", "iSCSI Initiator"};
    const std::map<std::string, const char*> of_a_class = {
        {"FCoE Initiator Ports", "VLNMPCA_FCPort"},
        {"iSCSI Initiator Ports", "VLNMPCA_SCSIProtocolController"}};
    for (const char* platform : {"", PLATFORM}) {
        Road road({.scenario = GetParam().text, .platform = platform});
        const auto profiles =
            road.manager().enumerate("VLNMPCA_RegisteredProfile", std::nullopt, "root/pg_interop");
        ASSERT_GE(profiles.value.size(), 13u);
        for (const host::Instance& profile : profiles.value) {
            const std::string registered = road::text_of(profile, "RegisteredName");
            const auto only = of_a_class.find(registered);
            const bool has_elements =
                *platform == '\0' ||
                (!of_the_system.count(registered) &&
                 (only == of_a_class.end() || !road.enumerate(only->second).empty()));
            EXPECT_EQ(!conforming_to(road, profile.path).empty(), has_elements)
                << registered << (*platform ? " on a platform" : "");
        }
    }
}

INSTANTIATE_TEST_SUITE_P(Scenarios, Oracle, testing::ValuesIn(SCENARIOS),
                         [](const auto& info) { return std::string(info.param.name); });

} // namespace
