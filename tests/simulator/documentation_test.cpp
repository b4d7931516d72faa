// docs/simulator.md: its examples are scenarios that load, and it names every key that there is.
#include "tests/simulator/simulated.h"

#include <nlohmann/json.hpp>

#include <algorithm>
#include <fstream>
#include <set>
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

// Objects with a key that nobody knows, or with a word that none is: the message lists what is
// known.
// "[]" is a list, what stands in parentheses a key that has to be there.
constexpr const char* UNKNOWN =
    "? libraries/? libraries/local/? libraries/versions/? server/? faults[]/? cards[]/? "
    "adapterAttributes/? portAttributes/? statistics/? features/? pci/? sff/? initiator/? "
    "initiator/authentication=? initiator/loginOptions/? network/? arpTable[]/? "
    "routeTable[]/? hba/? driverParameters[]/? qos/? virtualFunctions/? "
    "unitPriorities[]/? unitPriorities[](target=5000024500000001)/option=? dumps/? "
    "dumps/logType=? dumps/modules[]/? dumps/modules[](name=m)/ram/? bridging/? "
    "bridging/dcbx/? bridging/lldp/? bridging/switch/? bridging/configured/pg/? "
    "bridging/configured/applications[]/? fip/? fip/forwarders[]/? nameManagement/? "
    "nameManagement/can=? nameManagement/factory/? virtualPorts[]/? "
    "virtualPorts[](wwpn=2000024500000001)/machine/? portConfig/? portConfig/flags=? "
    "portConfig/ports[]/? portConfig/ports[]/functions[]/? "
    "portConfig/ports[]/functions[]/protocol=? channelManagement/? channels/? "
    "channels/changeable=? channels/list[]/? channels/list[]/type=? personality/? "
    "personality/current=? targets/? targets/type=? targets/luns/? "
    "targets/luns/identifier/? targets/luns/responses/? iscsiNetwork/? "
    "iscsiNetwork/portals/? iscsiNetwork/hosts/? iscsiStatistics/? isns/? iscsiTargets/? "
    "iscsiTargets/luns/? iscsiTargets/sessions/? iscsiTargets/sessions/state=? "
    "iscsiTargets/sessions/type=? iscsiTargets/sessions/connectionState=? "
    "iscsiTargets/sessions/counters/? ";

using Json = nlohmann::json;

const std::set<std::string> OF_THE_HOST = {"?",      "libraries", "server",
                                           "faults", "cards",     "iscsiNetwork"};

Json object_of(const std::string& path) {
    const std::size_t slash = path.find('/'), first = std::min(slash, path.size());
    std::string name = path.substr(0, first);
    if (name.ends_with("=?"))
        return {{name.substr(0, name.size() - 2), "?"}};
    if (slash == std::string::npos)
        return {{name, 0}};
    Json inner = object_of(path.substr(slash + 1));
    if (const std::size_t at = name.find('('); at != std::string::npos) {
        const std::size_t sign = name.find('=', at);
        inner[name.substr(at + 1, sign - at - 1)] = name.substr(sign + 1, name.size() - sign - 2);
        name.resize(at);
    }
    if (!name.ends_with("[]"))
        return {{name, inner}};
    return {{name.substr(0, name.size() - 2), Json::array({inner})}};
}

TEST_F(Simulated, EveryKeyIsDocumented) {
    const std::string text = documentation();
    std::istringstream paths(UNKNOWN);
    for (std::string path; paths >> path;) {
        Json object = object_of(path);
        if (!OF_THE_HOST.contains(object.begin().key())) {
            const Json function = {{"type", "fcoe"},
                                   {"wwpn", "1000024500000001"},
                                   {"functions", Json::array({object})}};
            object = {{"cards", Json::array({function})}};
        }
        char error[8192];
        ASSERT_EQ(1, vlnsim_load_scenario_text(object.dump().c_str(), "t", error, sizeof error));
        std::string known = error;
        const std::string mark = "known are: ";
        ASSERT_NE(std::string::npos, known.find(mark)) << object << ": " << error;
        std::istringstream names(known.substr(known.find(mark) + mark.size()));
        for (std::string name; std::getline(names >> std::ws, name, ',');)
            EXPECT_TRUE(text.find('`' + name + '`') != std::string::npos ||
                        text.find('"' + name + '"') != std::string::npos)
                << name << " of " << object;
    }
}

} // namespace
