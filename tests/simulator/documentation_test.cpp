// docs/simulator.md: its examples are scenarios that load, and it names every key that there is.
#include "tests/simulator/simulated.h"

#include <fstream>
#include <sstream>

namespace {

std::string documentation() {
    std::ifstream file(VLN_SIMULATOR_DOC);
    std::ostringstream text;
    text << file.rdbuf();
    return text.str();
}

TEST_F(Simulated, DocumentedExamplesAreScenarios) {
    const std::string text = documentation();
    const std::string fence = "```json\n";
    int examples = 0;
    for (std::size_t at = text.find(fence); at != std::string::npos; at = text.find(fence, at)) {
        at += fence.size();
        const std::string example = text.substr(at, text.find("```", at) - at);
        char error[512];
        EXPECT_EQ(0, vlnsim_load_scenario_text(example.c_str(), VLN_SCENARIOS "/example.json",
                                               error, sizeof error))
            << error << "\n"
            << example;
        ++examples;
    }
    EXPECT_GE(examples, 7);
}

TEST_F(Simulated, EveryKeyIsDocumented) {
    const std::string text = documentation();
    // Objects with a key that nobody knows: the message lists those that are known.
    const char* const objects[] = {
        R"({"?": 0})",
        R"({"libraries": {"?": 0}})",
        R"({"libraries": {"local": {"?": 0}}})",
        R"({"libraries": {"versions": {"?": 0}}})",
        R"({"server": {"?": 0}})",
        R"({"faults": [{"?": 0}]})",
        R"({"cards": [{"?": 0}]})",
        R"({"adapterAttributes": {"?": 0}})",
        R"({"portAttributes": {"?": 0}})",
        R"({"statistics": {"?": 0}})",
        R"({"features": {"?": 0}})",
        R"({"pci": {"?": 0}})",
        R"({"sff": {"?": 0}})",
        R"({"initiator": {"?": 0}})",
        R"({"initiator": {"authentication": "?"}})",
        R"({"initiator": {"loginOptions": {"?": 0}}})",
        R"({"network": {"?": 0}})",
        R"({"arpTable": [{"?": 0}]})",
        R"({"routeTable": [{"?": 0}]})",
        R"({"hba": {"?": 0}})",
        R"({"driverParameters": [{"?": 0}]})",
        R"({"qos": {"?": 0}})",
        R"({"virtualFunctions": {"?": 0}})",
        R"({"unitPriorities": [{"?": 0}]})",
        R"({"unitPriorities": [{"target": "5000024500000001", "option": "?"}]})",
        R"({"dumps": {"?": 0}})",
        R"({"dumps": {"logType": "?"}})",
        R"({"dumps": {"modules": [{"?": 0}]}})",
        R"({"dumps": {"modules": [{"name": "m", "ram": {"?": 0}}]}})",
        R"({"bridging": {"?": 0}})",
        R"({"bridging": {"dcbx": {"?": 0}}})",
        R"({"bridging": {"lldp": {"?": 0}}})",
        R"({"bridging": {"switch": {"?": 0}}})",
        R"({"bridging": {"configured": {"pg": {"?": 0}}}})",
        R"({"bridging": {"configured": {"applications": [{"?": 0}]}}})",
        R"({"fip": {"?": 0}})",
        R"({"fip": {"forwarders": [{"?": 0}]}})",
        R"({"nameManagement": {"?": 0}})",
        R"({"nameManagement": {"can": "?"}})",
        R"({"nameManagement": {"factory": {"?": 0}}})",
        R"({"virtualPorts": [{"?": 0}]})",
        R"({"virtualPorts": [{"wwpn": "2000024500000001", "machine": {"?": 0}}]})",
        R"({"portConfig": {"?": 0}})",
        R"({"portConfig": {"flags": "?"}})",
        R"({"portConfig": {"ports": [{"?": 0}]}})",
        R"({"portConfig": {"ports": [{"functions": [{"?": 0}]}]}})",
        R"({"portConfig": {"ports": [{"functions": [{"protocol": "?"}]}]}})",
        R"({"channelManagement": {"?": 0}})",
        R"({"channels": {"?": 0}})",
        R"({"channels": {"changeable": "?"}})",
        R"({"channels": {"list": [{"?": 0}]}})",
        R"({"channels": {"list": [{"type": "?"}]}})",
        R"({"personality": {"?": 0}})",
        R"({"personality": {"current": "?"}})",
        R"({"targets": {"?": 0}})",
        R"({"targets": {"type": "?"}})",
        R"({"targets": {"luns": {"?": 0}}})",
        R"({"targets": {"luns": {"identifier": {"?": 0}}}})",
        R"({"targets": {"luns": {"responses": {"?": 0}}}})",
        R"({"iscsiNetwork": {"?": 0}})",
        R"({"iscsiNetwork": {"portals": {"?": 0}}})",
        R"({"iscsiNetwork": {"hosts": {"?": 0}}})",
        R"({"iscsiStatistics": {"?": 0}})",
        R"({"isns": {"?": 0}})",
        R"({"iscsiTargets": {"?": 0}})",
        R"({"iscsiTargets": {"luns": {"?": 0}}})",
        R"({"iscsiTargets": {"sessions": {"?": 0}}})",
        R"({"iscsiTargets": {"sessions": {"state": "?"}}})",
        R"({"iscsiTargets": {"sessions": {"type": "?"}}})",
        R"({"iscsiTargets": {"sessions": {"connectionState": "?"}}})",
        R"({"iscsiTargets": {"sessions": {"counters": {"?": 0}}}})",
    };
    for (std::string object : objects) {
        const bool is_top = object.starts_with("{\"?\"") || object.starts_with("{\"libraries") ||
                            object.starts_with("{\"server") || object.starts_with("{\"faults") ||
                            object.starts_with("{\"cards") || object.starts_with("{\"iscsiNetwork");
        if (!is_top)
            object = R"({"cards": [{"type": "fcoe", "wwpn": "1000024500000001", "functions": [)" +
                     object + "]}]}";
        char error[8192];
        ASSERT_EQ(1, vlnsim_load_scenario_text(object.c_str(), "t", error, sizeof error));
        std::string known = error;
        const std::string mark = "known are: ";
        ASSERT_NE(std::string::npos, known.find(mark)) << object << ": " << error;
        std::istringstream names(known.substr(known.find(mark) + mark.size()));
        for (std::string name; std::getline(names >> std::ws, name, ',');) {
            EXPECT_TRUE(text.find('`' + name + '`') != std::string::npos ||
                        text.find('"' + name + '"') != std::string::npos)
                << name << " of " << object;
        }
    }
}

} // namespace
