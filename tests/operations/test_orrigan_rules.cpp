// The rules over configurations, held against a statement of their own: ports are words of one
// letter for each function, N NIC, R RoCE, I iSCSI, F FCoE and - none.
#include "operations/orrigan_rules.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <map>
#include <random>
#include <string>
#include <vector>

using namespace cimple;

namespace {

constexpr std::string_view LETTERS = "-NIFR"; // by protocol
constexpr uint32 ABILITY[] = {16, 1, 4, 8, 2};

struct Split {
    std::vector<std::string> ports;
    std::vector<std::string> lacking; // for each function the letter that it can't be, or a blank
    int type = 0, configured = -1;
    unsigned pid = 0;
    bool sriov = false, concurrent = false, partitions = false;
};

template <class Wanted>
bool any(const std::vector<std::string>& ports, Wanted wanted) {
    return std::any_of(ports.begin(), ports.end(), wanted);
}

// The ports where the part of the word from that place on has one of the letters.
auto has(const char* letters, std::size_t from = 0, std::size_t size = std::string::npos) {
    return [=](const std::string& port) {
        return port.size() > from &&
               port.substr(from, size).find_first_of(letters) != std::string::npos;
    };
}

auto has_twice(const char* letters) {
    return [=](const std::string& port) {
        for (const char* letter = letters; *letter; ++letter)
            if (port.find(*letter) != port.rfind(*letter))
                return true;
        return false;
    };
}

// The number of the first rule that is broken, 0 for none.
int broken_rule(const Split& split) {
    const auto& ports = split.ports;
    const int effective = split.configured == -1 ? split.type : split.configured;
    const bool divided = effective >= 1 && effective <= 5;
    const bool roce = any(ports, has("R")), nic_only = !any(ports, has("RIF"));
    if (!has("NR", 0, 1)(ports[0]) || any(ports, has("IF", 0, 1)))
        return 1;
    if (roce && (any(ports, has("IF", 1, 3)) || split.pid <= 15 || split.pid >= 100))
        return 2;
    if (!roce && (nic_only ? split.sriov && split.pid == 0 : split.pid > 0))
        return 3;
    if (any(ports, has_twice("IF")))
        return 4;
    if (effective == 2 && any(ports, [](const std::string& port) { return port.size() >= 5; }))
        return 5;
    if (split.partitions && !divided && any(ports, has("-IF")))
        return 6;
    if (effective == 2 && ports.size() == 1)
        return 7;
    const bool idle = (effective > 0 && effective < 5) || split.configured == 0;
    for (std::size_t port = 0; port < ports.size(); ++port)
        for (std::size_t i = 0; i < ports[port].size(); ++i)
            if (split.lacking[port][i] == ports[port][i] && !(ports[port][i] == '-' && idle))
                return 8;
    if (!split.concurrent &&
        any(ports, [](const std::string& port) { return has("I")(port) && has("F")(port); }))
        return 9;
    if (roce && divided)
        return 10;
    return split.configured == 0 && any(ports, has_twice("NRIF")) ? 11 : 0;
}

AX_AdapterPortConfig record_of(const Split& split) {
    AX_AdapterPortConfig config{};
    config.portCount = static_cast<uint32>(split.ports.size());
    config.mcType = split.type;
    config.configuredMCType = split.configured;
    config.pid = static_cast<uint8>(split.pid);
    config.adapterFlags = split.concurrent ? 4 : 0;
    for (std::size_t port = 0; port < split.ports.size(); ++port) {
        AX_PortConfig& to = config.port[port];
        to.functionCount = static_cast<uint32>(split.ports[port].size());
        for (std::size_t i = 0; i < split.ports[port].size(); ++i) {
            to.function[i].protocol = static_cast<uint32>(LETTERS.find(split.ports[port][i]));
            const std::size_t lacks = LETTERS.find(split.lacking[port][i]);
            to.function[i].flags = lacks == LETTERS.npos ? 31 : 31 & ~ABILITY[lacks];
        }
        // What stands beyond the functions that there are is not looked at.
        for (std::size_t i = split.ports[port].size(); i < AX_CONFIG_FUNCTIONS; ++i)
            to.function[i].protocol = AX_PROTOCOL_FCOE;
    }
    return config;
}

uint32 answered_rule(const Split& split) {
    const AX_AdapterPortConfig config = record_of(split);
    const Refused refused = firstBrokenRule(
        {config, orriganFacts(config), split.sriov, split.partitions ? 0x10u : 0x0Fu});
    EXPECT_TRUE(!refused || refused->line[0] != '\0');
    return refused ? refused->number : 0;
}

class Random_Splits {
public:
    Split next() {
        // Each draws from a few letters, else hardly any would get past the first rules.
        static constexpr const char* ALPHABETS[] = {"N",      "NN-",  "NR",    "NNNI",  "NNNF",
                                                    "NNNNI-", "NNIF", "-NIFR", "NNNNR-"};
        Split split;
        const std::string letters = ALPHABETS[below(9)];
        split.ports.resize(1 + below(4));
        for (std::string& port : split.ports) {
            for (std::size_t i = below(4) ? 1 + below(5) : 1 + below(16); i != 0; --i)
                port += letters[below(letters.size())];
            if (below(5))
                port[0] = below(3) || letters.find('R') == letters.npos ? 'N' : 'R';
            split.lacking.emplace_back(port.size(), ' ');
        }
        if (below(3) == 0) {
            std::string& lacking = split.lacking[below(split.lacking.size())];
            lacking[below(lacking.size())] = LETTERS[below(5)];
        }
        split.type = static_cast<int>(below(8)) - 1;
        split.configured = static_cast<int>(below(8)) - 1;
        constexpr unsigned PIDS[] = {0, 0, 0, 15, 16, 40, 99, 100};
        split.pid = PIDS[below(8)];
        split.sriov = below(2);
        split.concurrent = below(2);
        split.partitions = below(4) == 0;
        return split;
    }

private:
    std::size_t below(std::size_t end) { return _random() % end; }
    std::mt19937 _random{20260715};
};

TEST(Orrigan_Rules, AreAsTheirOtherStatementHasThem) {
    Random_Splits splits;
    std::map<uint32, unsigned> seen;
    for (int i = 0; i < 15000; ++i) {
        const Split split = splits.next();
        const uint32 answered = answered_rule(split);
        ++seen[answered];
        std::string shown;
        for (const std::string& port : split.ports)
            shown += port + " ";
        ASSERT_EQ(answered, static_cast<uint32>(broken_rule(split)))
            << shown << "types " << split.type << " " << split.configured << " PID " << split.pid
            << (split.sriov ? " SRIOV" : "") << (split.partitions ? " NPAR" : "");
    }
    for (uint32 rule = 0; rule <= 11; ++rule)
        EXPECT_GT(seen[rule], 20u) << "rule " << rule << " is hardly ever the first that is broken";
}

} // namespace
