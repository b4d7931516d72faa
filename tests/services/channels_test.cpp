// Channels of links, as a client sees and sets them.
#include "tests/road/properties.h"
#include "tests/services/texts.h"

using host::Named_Values;
using host::Value;
using road::expect_properties;
using road::find;
using road::Road;
using road::text_of;
using services::inputs_of;

namespace {

constexpr std::uint64_t MORE_THAN_THE_CACHE = 11ull * 60 * 1000000;

// A card of one link for each way in which channels are managed.
constexpr const char* LINKS = R"({"include": ")" VLN_SCENARIOS R"(/parts/cna.json", "cards": [
  {"use": ["cna"], "functions": [{"use": "nic"}, {"use": "nic"}], "features": {"GMC": 1},
   "channelManagement": {"version": 2, "type": 3, "modes": [1, 3, 4]},
   "channels": {"changeable": ["type", "bandwidth", "lpvid"], "list": [
     {"mac": "02:56:4C:00:00:00", "lpvid": 10, "minBandwidth": 40, "name": {"bytes": "76FF"}},
     {"mac": "02:56:4C:00:00:01", "number": 1, "type": "fcoe", "minBandwidth": 60},
     {"mac": "02:56:4C:00:00:02", "number": 2, "lpvid": 20, "up": false}]}},
  {"use": "cna", "functions": [{"use": "nic"}], "features": {"GMC": 1},
   "channelManagement": {"type": 2, "modes": [2]},
   "channels": {"changeable": ["innerLPVID"], "list": [
     {"mac": "02:56:4C:01:00:00"}, {"mac": "02:56:4C:01:00:01"}, {"mac": "02:56:4C:01:00:02"}]}},
  {"use": "cna", "functions": [{"use": "nic"}], "features": {"GMC": 1},
   "channelManagement": {"type": 4},
   "channels": {"changeable": ["bandwidth"], "list": [{"mac": "02:56:4C:02:00:00"}]}},
  {"use": "cna", "functions": [{"use": "nic"}], "features": {"GMC": 1},
   "channelManagement": {"type": 16},
   "channels": {"changeable": ["bandwidth"], "list": [
     {"mac": "02:56:4C:03:00:00", "type": "nic+roce", "maxBandwidth": 0},
     {"mac": "02:56:4C:03:00:01", "minBandwidth": 100}]}},
  {"use": "cna", "functions": [{"use": "nic"}], "features": {"GMC": 1},
   "channelManagement": {"type": 3, "on": false},
   "channels": {"list": [{"mac": "02:56:4C:04:00:00"}]}},
  {"use": "cna", "functions": [{"use": "nic"}], "features": {"GMC": 1},
   "channelManagement": {"type": 1},
   "channels": {"list": [{"mac": "02:56:4C:05:00:00"}, {"mac": "02:56:4C:05:00:01"},
                         {"mac": "02:56:4C:05:00:02"}]}},
  {"use": "cna", "functions": [{"use": "nic"}],
   "channelManagement": {"type": 5},
   "channels": {"changeable": ["lpvid"], "list": [{"mac": "02:56:4C:06:00:00"}]}},
  {"use": "cna", "functions": [{"use": "nic"}],
   "channelManagement": {"type": 5, "on": false},
   "channels": {"changeable": ["lpvid"], "list": [{"mac": "02:56:4C:07:00:00"}]}},
  {"use": "cna", "functions": [{"use": "nic"}], "features": {"Multichannel": 1},
   "channelManagement": {"type": 3}, "channels": {"list": [{"mac": "02:56:4C:08:00:00"}]}},
  {"use": "cna", "functions": [{"use": "nic"}], "features": {"ProfileManagement": 1, "GMC": 1},
   "channelManagement": {"type": 3}, "channels": {"list": [{"mac": "02:56:4C:09:00:00"}]}}]})";

enum Link { FREE, INNER, FIXED, WHOLE, OFF, BARE, OLDER, OLDER_OFF, VIRTUAL, PROFILED, LINK_COUNT };

struct Fault {
    const char* function = nullptr;
    unsigned call = 1;
    std::uint64_t status = 190;
};

struct Row {
    Link link;
    const char* inputs; // beside the target
    std::uint64_t value;
    const char* line;
    Fault fault = {};
};

class Channels : public testing::Test {
protected:
    Channels() : road({.scenario = LINKS, .log = true}) {
        service = road.enumerate("VLNMPCA_ChannelMgmtService").at(0).path;
        for (int link = FREE; link < LINK_COUNT; ++link)
            targets.push_back(Value::reference(channel(link, 0).path));
        road.wait_for_refreshes(1);
    }

    static std::string mac(int link, int number) {
        char text[32];
        std::snprintf(text, sizeof text, "02-56-4c-%02x-00-%02x", link, number);
        return text;
    }
    host::Instance channel(int link, int number) {
        return find(road, "VLNMPCA_ChannelSettingData", "MACAddress", mac(link, number));
    }
    host::Instance ethernet_port(const char* id) {
        return find(road, "VLNMPCA_EthernetPort", "DeviceID", id);
    }

    void expect(const char* method, const Named_Values& inputs, std::uint64_t value,
                const char* line, const Fault& fault = {}) {
        if (fault.function)
            vlnsim_fault(fault.function, fault.call, VLNSIM_STATUS, fault.status);
        const std::size_t before = road.log_text().size();
        const auto reply = road.manager().invoke(service, method, inputs);
        const std::string log = road.log_text().substr(before);
        EXPECT_TRUE(reply.ok()) << method << ": " << line;
        EXPECT_EQ(reply.value.value.as_unsigned(), value) << method << ": " << line << "\n" << log;
        EXPECT_NE(log.find(line), std::string::npos) << method << ": " << line << "\n" << log;
        vlnsim_clear_faults();
    }
    void expect_each(const char* method, std::initializer_list<Row> rows) {
        for (const Row& row : rows) {
            Named_Values inputs = inputs_of(row.inputs);
            inputs.push_back({"Target", targets[row.link]});
            expect(method, inputs, row.value, row.line, row.fault);
        }
    }

    Road road;
    host::ObjectPath service;
    std::vector<Value> targets; // the first channel of each link
};

TEST_F(Channels, ShowWhatTheLibraryTells) {
    expect_properties(channel(FREE, 0),
                      {{"InstanceID", "VLN:MPCA ChannelSettingData:100002564C000000:"
                                      "02-56-4c-00-00-00"},
                       {"Adapter", "100002564C000000"},
                       {"ChannelType", "1"},
                       {"LPVId", "10"},
                       {"MinBandwidth", "40"},
                       {"MaxBandwidth", "100"},
                       {"ManagementType", "3"},
                       {"ConfiguredMgmtType", "3"},
                       {"AvailableMgmtTypes", "{1, 3, 4}"},
                       {"ChannelMgmtVersion", "2"},
                       {"UpdateMask", "28"},
                       {"VNICName", "v\xEF\xBF\xBD"},
                       {"CurrentState", "1"}});
    expect_properties(channel(FREE, 2), {{"ChannelState", "0"}, {"FunctionNumber", "2"}});
    EXPECT_EQ(road.enumerate("VLNMPCA_ChannelSettingData").size(), 3u + 3 + 1 + 2 + 1 + 3 + 4)
        << "functions of one link tell the same channels";
    EXPECT_EQ(road.count_in_log("Channel details already filled for: 100002564C000001"), 1u);
}

TEST_F(Channels, EachMethodWantsItsServiceAndItsTarget) {
    host::ObjectPath absent = *targets[FREE].as_reference();
    host::set(absent.keys, "InstanceID", Value::text("another"));
    const Value unknown = Value::reference(absent);
    const std::pair<const char*, const char*> rows[] = {
        {"SetCMMode", "CMMode=3"},
        {"SetCMChannelType", "ChannelType1=1 ChannelType2=4"},
        {"SetCMBandwidths", "MinBWValues=0 MaxBWValues=0"},
        {"SetCMLPVIDs", "LPVIDValues=2"},
    };
    const host::ObjectPath known = service;
    for (const auto& [method, inputs] : rows) {
        const auto with = [text = inputs](const Value& target) {
            Named_Values all = inputs_of(text);
            all.push_back({"Target", target});
            return all;
        };
        constexpr const char* UNKNOWN = "Invalid instance of VLNMPCA_ChannelSettingData";
        service = known;
        expect(method, inputs_of(inputs), 32968, "is passed");
        expect(method, with(unknown), 33068, UNKNOWN);
        host::set(service.keys, "Name", Value::text("another"));
        expect(method, with(targets[FREE]), 33068,
               "Invalid instance of VLNMPCA_ChannelMgmtService");
    }
}

TEST_F(Channels, ModesAreSetForTheNextStart) {
    expect_each(
        "SetCMMode",
        {{FREE, "", 32968, "Invalid input for CMMode argument "},
         {FREE, "CMMode=3", 0, "Need not set the CM mode since same management type exists"},
         {FREE, "CMMode=2", 40002, "Unsupported channel management mode: 2"},
         {FREE, "CMMode=6", 40002, "Not a recognized channel management mode: 6 "},
         {FREE, "CMMode=255", 40002, "::SetCMMode failed for target VLN:MPCA ChannelSettingData:"},
         {INNER, "CMMode=1", 40002, "Unsupported channel management mode: 1"},
         {OLDER, "CMMode=1", 0, "Final parameters: ConfiguredMgmtType:1, ConfiguredState: 1"},
         {VIRTUAL, "CMMode=1", 40001, "SR-IOV is enabled on at least one of the ports"},
         {PROFILED, "CMMode=1", 40251, "::SetCMMode failed for target"},
         {FREE, "CMMode=4", 40190, "SetChannelMgmtCNAInfo", {"AX_SetChannelMgmtCNAInfo"}},
         {FREE, "CMMode=4", 40190, "Unable to determine", {"AX_GetHBAFeature"}},
         // The change is made, whatever becomes of the look at it: the first call is the method's.
         {FREE, "CMMode=4", 0, "not be read anew", {"AX_GetChannelMgmtCNAInfo", 2}},
         {INNER, "CMMode=0", 0, "Final parameters: ConfiguredMgmtType:0, ConfiguredState: 0"}});
    expect_properties(channel(INNER, 0), {{"ConfiguredMgmtType", "0"},
                                          {"ConfiguredState", "0"},
                                          {"ManagementType", "2"},
                                          {"CurrentState", "1"}});
    vlnsim_reboot();
    vlnsim_advance(MORE_THAN_THE_CACHE);
    road.enumerate("VLNMPCA_Card");
    road.wait_for_refreshes(2);
    expect_properties(channel(INNER, 0), {{"ManagementType", "0"}, {"CurrentState", "0"}});
    expect_properties(channel(FREE, 0), {{"ManagementType", "4"}, {"CurrentState", "1"}});
}

TEST_F(Channels, TypesOfTheFirstTwoAreSet) {
    constexpr const char
        *NIC_ISCSI = "ChannelType1=1 ChannelType2=2",
        *FIXED_TYPES = " Cannot set channel protocols for the configured channel management mode: ";
    expect_each(
        "SetCMChannelType",
        {{FREE, "ChannelType1=2 ChannelType2=2", 32968, "passed. ChannelType1: 2, ChannelType2: 2"},
         {FREE, "", 32968, "Invalid Parameters passed. ChannelType1: 0, ChannelType2: 0"},
         {OLDER, NIC_ISCSI, 40002, "The remote host is running an older version of Netquill"},
         {OFF, NIC_ISCSI, 40070, "CM is disabled VLN:MPCA ChannelSettingData:100002564C040000"},
         {OFF, NIC_ISCSI, 40070, ":: Enable CM and reboot the system. "},
         {INNER, NIC_ISCSI, 40002, FIXED_TYPES},
         {FIXED, NIC_ISCSI, 40002, FIXED_TYPES},
         {WHOLE, NIC_ISCSI, 40032, ":: The port has 2 channels only."},
         {BARE, NIC_ISCSI, 40001, ":: Channel protocols cannot be changed for this port."},
         {FREE, "ChannelType1=1 ChannelType2=4", 0, "::Specified settings match the exisiting"},
         {FREE, NIC_ISCSI, 40190, "SetChannelMgmtPortInfo exited", {"AX_SetChannelMgmtPortInfo"}},
         {FREE, NIC_ISCSI, 40190, "GetChannelMgmtPortInfo exited", {"AX_GetChannelMgmtPortInfo"}},
         {FREE, "ChannelType1=1 ChannelType2=3", 40144, "exited with the error code 144"}});
    EXPECT_EQ(vlnsim_calls("AX_SetChannelMgmtPortInfo"), 2u) << "what is in force needs no call";
    expect_each("SetCMChannelType",
                {{FREE, "ChannelType1=1 ChannelType2=1", 0, "No of channels: 3, Version: 2"}});
    EXPECT_EQ(text_of(channel(FREE, 1), "ChannelType"), "1");
    expect_each("SetCMChannelType", {{FREE,
                                      "ChannelType1=8 ChannelType2=2",
                                      32769,
                                      "But updation in the maps failed.",
                                      {"AX_GetChannelMgmtPortInfo", 2}}});
}

TEST_F(Channels, BandwidthsAddUp) {
    constexpr const char *FAILED = "::SetCMBandwidths call method failed",
                         *NEITHER = "::TotalBW should be either 0 or 100",
                         *FIXED_BANDWIDTHS = " Cannot set channel bandwidths for the configured "
                                             "channel management mode. ",
                         *NONE = "MinBWValues=0 MaxBWValues=0",
                         *NONE_OF_3 = "MinBWValues=0,0,0 MaxBWValues=0,0,0",
                         *CHANGE = "MinBWValues=10,20,70 MaxBWValues=100,90,80";
    std::string zeros = "0";
    for (int i = 1; i < 100000; ++i)
        zeros += ",0";
    const std::string huge = "MinBWValues=" + zeros + " MaxBWValues=" + zeros;
    expect_each(
        "SetCMBandwidths",
        {{FREE, "", 32968, "values improper: MinBW Size: [ 0 ], MaxBW Size: [ 0 ]"},
         {FREE, "MinBWValues=1,2 MaxBWValues=1", 32968, "MinBW Size: [ 2 ], MaxBW Size: [ 1 ]"},
         {FREE, huge.c_str(), 32968, ":: The port has 3 channels, not 100000"},
         {OFF, NONE, 40070, ":: Enable CM and reboot the system. "},
         {INNER, NONE_OF_3, 40001, FIXED_BANDWIDTHS},
         {FIXED, NONE, 40001, FIXED_BANDWIDTHS},
         {BARE, NONE_OF_3, 40001, "::Channel Bandwidths cannot be configured for this port."},
         {WHOLE, "MinBWValues=1,99 MaxBWValues=1,99", 32968, "For NIC+RoCE channels, the minimum"},
         {WHOLE, "MinBWValues=0,0 MaxBWValues=0,100", 32968, "::TotalBW should be 100"},
         {WHOLE, "MinBWValues=0,100 MaxBWValues=0,100", 0, "::Need not set the bandwidths since"},
         {FREE, "MinBWValues=51,49,0 MaxBWValues=50,100,0", 32968, FAILED},
         {FREE, "MinBWValues=0,0,0 MaxBWValues=100,101,0", 32968, FAILED},
         {FREE, "MinBWValues=50,49,0 MaxBWValues=50,100,0", 32968, NEITHER},
         {FREE, "MinBWValues=50,49,2 MaxBWValues=50,100,2", 32968, NEITHER},
         {FREE, CHANGE, 40190, FAILED, {"AX_SetChannelMgmtPortInfo"}},
         {FREE, "MinBWValues=0,0,0 MaxBWValues=100,100,0", 0, "SetChannelMgmtPortInfo"}});
    EXPECT_EQ(text_of(channel(FREE, 0), "MinBandwidth"), "0");
    expect_each("SetCMBandwidths", {{FREE, CHANGE, 0, "SetChannelMgmtPortInfo"}});
    expect_properties(channel(FREE, 1), {{"MinBandwidth", "20"}, {"MaxBandwidth", "90"}});
    expect_properties(channel(FREE, 2), {{"MinBandwidth", "70"}, {"MaxBandwidth", "80"}});
    EXPECT_EQ(text_of(channel(INNER, 1), "MinBandwidth"), "0");
}

TEST_F(Channels, EachNicHasAVlanOfItsOwn) {
    expect_each(
        "SetCMLPVIDs",
        {{FREE, "", 32968, "No LPVIDs are passed"},
         {FREE, "LPVIDValues=2,0", 32968, ":: The port has 3 channels, not 2"},
         {WHOLE, "LPVIDValues=0,2", 40001, ":: GMC/SIMode/vNIC1 not supported: 16"},
         {OLDER_OFF, "LPVIDValues=2", 40001, ":: GMC/SIMode/vNIC1 not supported: 0"},
         {OFF, "LPVIDValues=2", 40070, ":: Enable GMC and reboot the system. "},
         {BARE, "LPVIDValues=2,3,4", 40001, ":: LPVIDs cannot be configured for this port."},
         {FREE, "LPVIDValues=1,0,3", 32968, "::Invalid LPVID [ 1 ]"},
         {FREE, "LPVIDValues=4095,0,3", 32968, "::Invalid LPVID [ 4095 ]"},
         {FREE, "LPVIDValues=2,0,0", 32968, "::Invalid LPVID [ 0 ]"},
         {FREE, "LPVIDValues=7,0,7", 32968, "LPVID found: 7 at indexes: [ 0 ] and [ 2 ]"},
         {FREE, "LPVIDValues=7,8,9", 32968, "Channels should be zero. User has passed 8"},
         {FREE, "LPVIDValues=7,0,8", 40190, "SetChannelMgmt", {"AX_SetChannelMgmtPortInfo"}},
         {FREE, "LPVIDValues=2,0,4094", 0, "::Update mask for Outer VLAN Ids"},
         {OLDER, "LPVIDValues=2", 0, "::Update mask for Outer VLAN Ids"},
         {INNER, "LPVIDValues=0,4094,0", 0, "::Update mask for Inner VLAN Ids"}});
    expect_properties(channel(FREE, 2), {{"LPVId", "4094"}, {"InnerLPVId", "0"}});
    expect_properties(channel(INNER, 1), {{"LPVId", "4094"}, {"InnerLPVId", "4094"}});
}

TEST_F(Channels, TheAggregatorOfAPortIsSwitched) {
    const Value port = Value::reference(ethernet_port("100002564C090000").path);
    const Value without = Value::reference(ethernet_port("100002564C000000").path);
    const Named_Values on = {{"Target", port}, {"EnableState", Value::boolean(true)}};
    constexpr const char* NO_PORT = "Invalid Port is passed, Cannot Enable/Disable VEPA";
    const char* method = "SetVEPAState";
    expect(method, {on[1]}, 32968, NO_PORT);
    host::ObjectPath absent = *port.as_reference();
    host::set(absent.keys, "DeviceID", Value::text("100002564CFFFFFF"));
    expect(method, {{"Target", Value::reference(absent)}, on[1]}, 32968, NO_PORT);
    expect(method, {on[0]}, 32968, "Invalid input for EnableState argument ");
    expect(method, {{"Target", without}, on[1]}, 40251, "VEPA not supported on this adapter");
    expect(method, on, 40190, "Unable to determine if adapter supports VEPA.",
           {"AX_GetHBAFeature"});
    expect(method, on, 40190, "VEPA State has not been set", {"AX_SetAdapterAttribute"});
    expect(method, on, 0, "VLN_MethodWrapper::SetVEPAState");
    EXPECT_EQ(text_of(ethernet_port("100002564C090000"), "VEPAState"), "1");
    host::set(service.keys, "Name", Value::text("another"));
    expect(method, on, 33068, "Invalid instance of VLNMPCA_ChannelMgmtService");
}

// A channel is found by its ASIC and its function.
TEST(Channels_Of_Ports, EachPortTellsWhichItIs) {
    const auto expect = [](const char* scenario, const char* id, const char* type,
                           const char* identities) {
        Road road({.scenario = scenario});
        expect_properties(find(road, "VLNMPCA_EthernetPort", "DeviceID", id),
                          {{"OtherPortType", type}, {"OtherIdentifyingInfo", identities}});
    };
    expect("split-cards.json", "100002564C000000", "-",
           "{VR10420117:00, VR10420117:0, VR10420117, 0, NotSupported}");
    expect("split-cards.json", "100002564C010101", "vNIC",
           "{VR10420118:00, VR10420118:1, VR10420118, 1, 1}");
}

} // namespace
