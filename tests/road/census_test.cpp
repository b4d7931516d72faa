// How many instances of which class a host shows: a table a scenario, in the folder census.
//
// A table holds what `mpcactl --simulate SCENARIO census` prints, without the classes that have no
// instance. A change of it wants a reason.
#include "tests/road/road.h"

#include <fstream>
#include <sstream>

using road::Road;

namespace {

using Census = std::map<std::string, std::size_t>;

std::vector<std::string> counted_scenarios() {
    std::vector<std::string> names;
    for (const auto& file : std::filesystem::directory_iterator(VLN_CENSUS))
        names.push_back(file.path().stem());
    std::sort(names.begin(), names.end());
    return names;
}

Census table_of(const std::string& scenario) {
    std::ifstream file(std::string(VLN_CENSUS "/") + scenario + ".tsv");
    Census census;
    for (std::string line; std::getline(file, line);) {
        std::istringstream row(line.substr(0, line.find('#')));
        std::string name;
        std::size_t count = 0;
        if (row >> name >> count)
            census[name] = count;
    }
    return census;
}

// "class: expected, found" of the classes where the two differ.
std::string difference(const Census& expected, const Census& found) {
    std::ostringstream text;
    Census all = expected;
    all.insert(found.begin(), found.end());
    const auto count = [](const Census& census, const std::string& name) {
        const auto row = census.find(name);
        return row == census.end() ? 0 : row->second;
    };
    for (const auto& [name, either] : all)
        if (count(expected, name) != count(found, name))
            text << name << ": " << count(expected, name) << ", " << count(found, name) << "\n";
    return text.str();
}

class Counted : public testing::TestWithParam<std::string> {};

TEST_P(Counted, EachClassHasItsInstances) {
    Road road({.scenario = GetParam() + ".json"});
    const Census expected = table_of(GetParam());
    ASSERT_FALSE(expected.empty());
    EXPECT_EQ(difference(expected, road.census()), "") << "class: expected, found";
}

INSTANTIATE_TEST_SUITE_P(Census, Counted, testing::ValuesIn(counted_scenarios()),
                         [](const auto& info) {
                             std::string name = info.param;
                             std::replace(name.begin(), name.end(), '-', '_');
                             return name;
                         });

TEST(Census, AllClassesOfTheCatalogueAreServed) {
    Road road;
    EXPECT_EQ(road.manager().provider_classes().size(), 299u);
}

TEST(Census, TheOldRecordCallShowsTheSameHost) {
    EXPECT_EQ(difference(table_of("two-port-cna"), Road({.scenario = "old-records.json"}).census()),
              "");
}

// Consoles list settings and capabilities by their ElementName.
TEST(Census, SettingsAndCapabilitiesHaveNames) {
    for (const std::string& scenario : counted_scenarios()) {
        Road road({.scenario = scenario + ".json"});
        const host::ClassRepository& classes = road.manager().classes();
        for (const host::Class* known : road.manager().provider_classes()) {
            if (!known->is_a(classes.find("CIM_SettingData")) &&
                !known->is_a(classes.find("CIM_Capabilities")))
                continue;
            for (const host::Instance& instance : road.enumerate(known->name))
                EXPECT_NE(road::text_of(instance, "ElementName"), "-") << known->name;
        }
    }
}

// Lines at the highest level are for faults: an administrator who looks for one finds no others.
TEST(Census, AHealthyHostLogsNothingAtLevelOne) {
    for (const auto& file : std::filesystem::directory_iterator(VLN_SCENARIOS)) {
        if (file.path().extension() != ".json" || file.path().stem() == "flaky")
            continue;
        Road road({.scenario = file.path().filename(), .log = true});
        road.census();
        road.close();
        EXPECT_EQ(road.faults_in_log(), "") << file.path().filename();
    }
}

} // namespace
