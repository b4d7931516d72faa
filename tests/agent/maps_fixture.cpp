#include "tests/agent/maps_fixture.h"

#include "device/ip_interface.h"
#include "device/library/runtime_loader.h"

#include <cstdlib>

namespace cimple {

namespace {

// A kernel without network interfaces: the machine's own are not the tests' concern.
constexpr IP_Calls NO_INTERFACES = {
    [](int, int, int) { return -1; },
    [](int, unsigned long, void*) { return -1; },
    [](int) { return 0; },
};

} // namespace

void Maps_Test::SetUp() {
    Agent_Test::SetUp();
    VLN_IPInterfaceConfig::setCalls(&NO_INTERFACES);
    VLN_Runtime_Loader::setCalls(nullptr); // the simulator's libraries are loaded already
}

void Maps_Test::TearDown() {
    Agent_Test::TearDown();
    VLN_IPInterfaceConfig::setCalls(nullptr);
    vlnsim_close_libraries();
    EXPECT_EQ(vlnsim_violations(), 0u);
}

void Maps_Test::load(const std::string& functions, const std::string& more) {
    char error[256] = "";
    const std::string text =
        R"({"description": "A test", "include": "parts/cna.json", "cards": [
        {"use": "cna", "ports": 2, )" +
        more + R"("functions": [)" + functions + "]}]}";
    const int status =
        vlnsim_load_scenario_text(text.c_str(), VLN_SCENARIOS "/test.json", error, sizeof error);
    ASSERT_EQ(status, 0) << error;
    ASSERT_EQ(vlnsim_open_libraries(error, sizeof error), 0) << error;
}

std::vector<std::string> lines_of(const Instance* instance) {
    char* text = nullptr;
    std::size_t size = 0;
    std::FILE* stream = open_memstream(&text, &size);
    print(instance, stream);
    std::fclose(stream);
    std::vector<std::string> lines;
    const std::string all(text, size);
    std::free(text);
    for (std::size_t at = 0, end; (end = all.find('\n', at)) != std::string::npos; at = end + 1) {
        std::string line = all.substr(at, end - at);
        line.erase(0, line.find_first_not_of(' '));
        if (line.find(" = ") != std::string::npos && line.find(" = NULL;") == std::string::npos)
            lines.push_back(line);
    }
    return lines;
}

std::string value_of(const Instance* instance, const std::string& property) {
    for (const std::string& line : lines_of(instance)) {
        const auto name = line.find(' ') + 1;
        const auto equals = line.find(" = ");
        if (line.substr(name, equals - name) == property)
            return line.substr(equals + 3, line.size() - equals - 4);
    }
    return "";
}

void expect_counts(ProviderAgent& agent, std::initializer_list<Count> counts) {
    for (const Count& row : counts)
        EXPECT_EQ(agent.store(row.store).size(), row.count) << store_table[row.store].name;
}

} // namespace cimple
