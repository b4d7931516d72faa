// What is wrong with a scenario is told with file, line and path.
#include "tests/simulator/simulated.h"

#include <fstream>

namespace {

struct Bad_Scenario {
    const char* text;
    const char* message; // all of it up to where it lists what is known
};

// A function that is complete, so that the rest of a card can be what is wrong.
#define NIC "\"type\": \"nic\", \"wwpn\": \"1000024500000001\""

const Bad_Scenario bad_scenarios[] = {
    // Not JSON.
    {"", "f.json:1: syntax error"},
    {"{\n \"cards\": [\n  {]\n}", "f.json:3: cards[0]: syntax error"},
    {"{\n \"cards\": 12\n", "f.json:2: syntax error"},
    {"{\"description\": \"\\x\"}", "f.json:1: syntax error"},
    // Another shape than is wanted.
    {"[]", "f.json:1: an object is wanted, not a list"},
    {"{\n\"cards\": {}}", "f.json:2: cards: a list is wanted, not an object"},
    {"{\"cards\": [\n3]}", "f.json:2: cards[0]: an object is wanted, not a number"},
    {"{\"cards\": [{" NIC ",\n\"model\": 7, \"functions\": [{}]}]}",
     "f.json:2: cards[0].model: a text is wanted, not a number"},
    {"{\"libraries\": {\"local\":\n{\"present\": 1}}}",
     "f.json:2: libraries.local.present: true or false is wanted, not a number"},
    // Names that nobody knows, or one twice.
    {"{\n\n\"card\": []}", "f.json:3: card: unknown key; known are: description, include,"},
    {"{\"cards\": [{" NIC ", \"functions\": [{\n\"port\": 1}]}]}",
     "f.json:2: cards[0].functions[0].port: unknown key; known are: type,"},
    {"{\"cards\": [], \n\n\"cards\": []}", "f.json:3: cards: given twice, first in line 1"},
    {"{\"cards\": [{" NIC ", \"functions\": [{\"adapterAttributes\":\n {\"Serial\": \"x\"}}]}]}",
     "f.json:2: cards[0].functions[0].adapterAttributes.Serial: unknown name; a number below "
     "65536"},
    {"{\"cards\": [{\"use\":\n\"nic\", \"functions\": [{}]}]}",
     "f.json:2: cards[0].use: unknown template \"nic\"; none is known here"},
    {"{\"cards\": [{" NIC ", \"model\":\n \"{slot}\", \"functions\": [{}]}]}",
     "f.json:2: cards[0].model: unknown placeholder {slot}; known are: card, port, function,"},
    {"{\"cards\": [{\"type\": \"fc\", \"wwpn\": \"1000024500000001\", \"functions\": [{}]}]}",
     "f.json:1: cards[0].type: unknown type \"fc\"; known are: nic, iscsi, fcoe, none"},
    // Values that cannot be.
    {"{\"cards\": [{\"type\": \"nic\", \"wwpn\":\n\"10000245\", \"functions\": [{}]}]}",
     "f.json:2: cards[0].wwpn: 8 bytes are wanted, not 4"},
    {"{\"cards\": [{\"type\": \"nic\", \"wwpn\": \"100002450000000G\", \"functions\": [{}]}]}",
     "f.json:1: cards[0].wwpn: \"100002450000000G\" is not a row of bytes in hexadecimal digits"},
    {"{\"cards\": [{" NIC ", \"subAdapter\": 65536, \"functions\": [{}]}]}",
     "f.json:1: cards[0].subAdapter: a number from 0 to 65535 is wanted"},
    {"{\"cards\": [{" NIC ", \"sff\": {\"a0\":\n{\"256\": \"x\"}}, \"functions\": [{}]}]}",
     "f.json:2: cards[0].sff.a0.256: \"256\" is no offset below 256"},
    {"{\"cards\": [{" NIC ", \"sff\": {\"a2\": {\"255\": \"xy\"}}, \"functions\": [{}]}]}",
     "f.json:1: cards[0].sff.a2.255: reaches past the end of the page of 256 bytes"},
    {"{\"cards\": [{" NIC ", \"flags\": -1, \"functions\": [{}]}]}",
     "f.json:1: cards[0].flags: a number from 0 to 4294967295 is wanted"},
    {"{\"cards\": [{" NIC ", \"flags\": \"seven\", \"functions\": [{}]}]}",
     "f.json:1: cards[0].flags: \"seven\" is not a number"},
    {"{\"server\": {\"address\": \"2001:db8::7\"}}",
     "f.json:1: server.address: \"2001:db8::7\" is not an IPv4 address"},
    {"{\"cards\": [{" NIC ", \"network\": {\"address\": \"300.1.2.3\"}, \"functions\": [{}]}]}",
     "f.json:1: cards[0].network.address: \"300.1.2.3\" is not an IPv4 or IPv6 address"},
    {"{\"cards\": [{" NIC ", \"vpd\": {\"PNX\": \"1\"}, \"functions\": [{}]}]}",
     "f.json:1: cards[0].vpd.PNX: a tag of two characters is wanted"},
    // What is missing, or there twice.
    {"{\"cards\": [\n{" NIC "}]}",
     "f.json:2: cards[0]: \"functions\" is wanted: what the card does"},
    {"{\"cards\": [{\"type\": \"nic\", \"functions\": [\n{}]}]}",
     "f.json:2: cards[0].functions[0]: \"wwpn\" is wanted"},
    {"{\"cards\": [{" NIC ", \"ports\": 2, \"functions\": [\n{}]}]}",
     "f.json:2: cards[0].functions[0]: \"wwpn\" is that of another function"},
    {"{\"cards\": [{\"type\": \"fcoe\", \"wwpn\": \"1000024500000001\", \"functions\": [{}],\n"
     "\"targets\": {\"luns\": [{\"count\": 2}, {\"number\":1}]}}]}",
     "f.json:2: cards[0].targets.luns[1]: logical unit 1 is there already"},
    // Templates that use themselves.
    {"{\"templates\": {\"a\": {\"use\":\n\"a\"}}, \"cards\": [{\"use\": \"a\", \"functions\": "
     "[{}]}]}",
     "f.json:2: templates.a.use: templates use one another too deeply"},
    // Faults.
    {"{\"faults\": [{\"function\": \"AX_Nothing\", \"status\": 1}]}",
     "f.json:1: faults[0].function: unknown function \"AX_Nothing\""},
    {"{\"faults\": [\n{\"function\": \"AX_GetVPD\"}]}",
     "f.json:2: faults[0]: one of \"status\", \"delay\", \"tooSmall\", \"missing\" and \"absent\""},
    {"{\"faults\": [{\"function\": \"*\", \"missing\": \"FunctionType\"}]}",
     "f.json:1: faults[0].missing: \"FunctionType\" names several attributes; write its number"},
    {"{\"libraries\": {\"local\": {\"missing\": [\n\"LAX_Nothing\"]}}}",
     "f.json:2: libraries.local.missing[0]: no library exports \"LAX_Nothing\""},
};

TEST_F(Simulated, BadScenariosAreToldWithTheirPlace) {
    for (const Bad_Scenario& bad : bad_scenarios) {
        char error[1024];
        EXPECT_EQ(1, vlnsim_load_scenario_text(bad.text, "f.json", error, sizeof error))
            << bad.text;
        EXPECT_TRUE(std::string(error).starts_with(bad.message)) << bad.text << "\n" << error;
    }
}

TEST_F(Simulated, ABadScenarioLeavesTheHostAsItWas) {
    start_text(small_scenario);
    EXPECT_EQ(1, vlnsim_load_scenario_text("{]", "f.json", nullptr, 0));
    EXPECT_EQ(1u, LOCAL(AX_GetNumberOfLocalAdapters)());
    char tiny[8];
    EXPECT_EQ(1, vlnsim_load_scenario_text("{]", "f.json", tiny, sizeof tiny));
    EXPECT_STREQ("f.json:", tiny);
}

TEST_F(Simulated, ErrorsInAnIncludedFileNameThatFile) {
    std::ofstream("included.json") << "{\n\"templates\": {\"t\": {\"wwpn\":\n \"12\"}}}";
    std::ofstream("outer.json") << R"({"include": "included.json",
        "cards": [{"use": "t", "type": "nic", "functions": [{}]}]})";
    char error[512];
    EXPECT_EQ(1, vlnsim_load_scenario("outer.json", error, sizeof error));
    EXPECT_STREQ("included.json:3: templates.t.wwpn: 8 bytes are wanted, not 1", error);
    std::ofstream("outer.json") << "{\n\"include\": \"nowhere.json\"}";
    EXPECT_EQ(1, vlnsim_load_scenario("outer.json", error, sizeof error));
    EXPECT_STREQ("outer.json:2: include: cannot read nowhere.json", error);
    EXPECT_EQ(1, vlnsim_load_scenario("nowhere.json", error, sizeof error));
    EXPECT_STREQ("nowhere.json:1: cannot be read", error);
    std::ofstream("outer.json") << "{\"include\": \"outer.json\"}";
    EXPECT_EQ(1, vlnsim_load_scenario("outer.json", error, sizeof error));
    EXPECT_STREQ("outer.json:1: include: files include one another too deeply", error);
}

} // namespace
