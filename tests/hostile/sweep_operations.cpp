// What is swept, and by which statuses.
#include "tests/hostile/sweep.h"

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <sstream>

namespace sweep {

namespace {

namespace fs = std::filesystem;

// Of the files with that ending.
std::vector<std::string> names_in(const char* folder, const char* ending) {
    std::vector<std::string> names;
    for (const auto& file : fs::directory_iterator(folder))
        if (file.path().extension() == ending)
            names.push_back(file.path().stem());
    std::sort(names.begin(), names.end());
    return names;
}

// By class the scenario in whose census it stands, the smallest host first.
std::map<std::string, std::string> scenarios_by_class() {
    std::map<unsigned long, std::map<std::string, std::string>> by_size;
    for (const std::string& scenario : names_in(VLN_CENSUS, ".tsv")) {
        std::ifstream file(std::string(VLN_CENSUS "/") + scenario + ".tsv");
        std::map<std::string, std::string> classes;
        unsigned long size = 0;
        for (std::string line; std::getline(file, line);) {
            std::istringstream row(line.substr(0, line.find('#')));
            std::string name;
            unsigned long count = 0;
            if (row >> name >> count)
                classes[name] = scenario + ".json";
            size += count;
        }
        by_size[size].merge(classes);
    }
    std::map<std::string, std::string> scenarios;
    for (auto& [size, classes] : by_size)
        scenarios.merge(classes);
    return scenarios;
}

std::vector<std::string> served_classes() {
    std::vector<std::string> names;
    std::ifstream file(VLN_REGISTRATION);
    for (std::string word; file >> word;)
        if (word.starts_with("["))
            names.push_back(word.substr(1, word.size() - 2));
    return names;
}

bool is_wanted(const std::string& name, const std::vector<std::string>& words) {
    return words.empty() || std::any_of(words.begin(), words.end(), [&](const std::string& word) {
               return name.find(word) != std::string::npos;
           });
}

// Does for each of its units what WITH_TARGETS does for a few: a share of its points is enough.
constexpr std::string_view MANY_UNITS = "san-4096-luns";
constexpr std::size_t SOME = 500;

} // namespace

std::vector<Operation> all_operations(const std::vector<std::string>& words) {
    std::vector<Operation> all;
    const auto scenarios = scenarios_by_class();
    for (const std::string& name : served_classes()) {
        const auto row = scenarios.find(name);
        all.push_back({.name = "look/" + name,
                       .scenario = row == scenarios.end() ? "two-port-cna.json" : row->second,
                       .class_name = name});
    }
    for (const hostile::Change& row : hostile::read_changes())
        all.push_back({.name = row.what, .scenario = row.scenario, .row = row});
    for (const std::string& scenario : names_in(VLN_SCENARIOS, ".json"))
        all.push_back({.name = "refresh/" + scenario,
                       .scenario = scenario + ".json",
                       .most = scenario == MANY_UNITS ? SOME : ALL});
    all.push_back({.name = "refresh/with-targets", .scenario = WITH_TARGETS, .is_judged = true});
    all.push_back({.name = "refresh/with-log", .scenario = "two-port-cna.json", .log = true});
    std::erase_if(all, [&](const Operation& one) { return !is_wanted(one.name, words); });
    std::stable_sort(all.begin(), all.end(), [](const Operation& a, const Operation& b) {
        return std::pair(a.log, a.scenario) < std::pair(b.log, b.scenario);
    });
    return all;
}

} // namespace sweep
