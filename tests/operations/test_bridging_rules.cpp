// The rules of bridging, which stand alone here: each refusal in its words, and requests by the
// hundred thousand against what a port must look like afterwards.
#include "operations/bridging_rules.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <bit>
#include <functional>
#include <map>
#include <random>
#include <set>

using namespace cimple;

namespace {

constexpr int REQUESTS = 100'000;
constexpr Port_Functions NIC{.nicOnly = true};
constexpr Port_Functions FCOE{.fcoe = true};
constexpr Port_Functions ISCSI{.iscsi = true};
constexpr Port_Functions CNA{.iscsi = true, .fcoe = true, .roce = true, .bridging = true};

// FCoE is alone in group 1, iSCSI is in group 0 with all others.
AX_CEE_Params good_record() {
    AX_CEE_Params record{};
    record.dcbx = {1, 0};
    record.lldp = {1, 1, 1, 1, 1, 1};
    record.maxSupportedPG = 4;
    AX_CEE_Settings& settings = record.configured;
    settings.pfc.enabled = 1;
    settings.pfcBitmap = 1 << 3;
    settings.groupBitmap[0] = 0xF7;
    settings.groupBitmap[1] = 1 << 3;
    place_application(settings.application, Application::FCOE, 1 << 3);
    place_application(settings.application, Application::ISCSI, 1 << 4);
    return record;
}

// ---- Each refusal ----

using Edit = std::function<void(AX_CEE_Params&)>;
void unchanged(AX_CEE_Params&) {}

TEST(Bridging_Rules, EachRefusalOfAParameterHasItsWords) {
    const Edit transmit_off = [](AX_CEE_Params& record) { record.lldp.txState = 0; };
    const Edit flow_control_off = [](AX_CEE_Params& r) { r.configured.pfc.enabled = 0; };
    const Edit three_groups = [](AX_CEE_Params& r) { r.configured.groupBitmap[7] = 1; };
    const struct {
        const char* name;
        uint32 value;
        Port_Functions port;
        AX_STATUS status;
        const char* line;
        Edit edit = unchanged;
    } rows[] = {
        {"txstate", 1, NIC, 1, "ERROR: Cannot set DCB parameters on a NIC adapter."},
        {"pfcpriority", 8, ISCSI, 1, "ERROR: Cannot set PFC parameters on a NIC or iSCSI port."},
        {"fcoepriority", 1, ISCSI, 1, "ERROR: Cannot set fcoepriority on iSCSI or NIC port."},
        {"iscsipriority", 1, FCOE, 1, "ERROR: Cannot set iscsipriority on FCoE or NIC port."},
        {"nicpriority", 1, FCOE, 1, "ERROR: Cannot set nicpriority on FCoE or iSCSI port."},
        {"dcbxstate", 1, FCOE, 1,
         "ERROR: Cannot enable dcbxstate when transmit(txstate) is disabled.", transmit_off},
        {"dcbxstate", 0, FCOE, 0, "", transmit_off},
        {"txstate", 0, FCOE, 1,
         "ERROR: Cannot (disable or be disabled) txstate when DCBX is enabled."},
        {"rxstate", 0, FCOE, 1,
         "ERROR: Cannot (disable or be disabled) rxstate when DCBX is enabled."},
        {"rxstate", 0, FCOE, 0, "", [](AX_CEE_Params& record) { record.dcbx.state = 0; }},
        {"pfcpriority", 8, FCOE, 1, "ERROR: Cannot set pfcpriority when PFC is disabled.",
         flow_control_off},
        {"pfcpriority", 4, FCOE, 1, "ERROR: Fcoepriority is not enabled in new pfcpriority."},
        {"pfcpriority", 12, FCOE, 4,
         "ERROR: Only one PFC priority can be configured on this adapter."},
        {"pfcpriority", 14, CNA, 4,
         "ERROR: Only two PFC priorities can be configured on this adapter."},
        {"pfcpriority", 12, CNA, 0, ""},
        {"pfcpriority", 0, {.iscsi = true, .bridging = true}, 0, ""},
        {"txsyscap", 1, FCOE, 1,
         "ERROR: Cannot set transmit properties when transmit state is disabled.", transmit_off},
        {"txstate", 1, FCOE, 0, "", transmit_off},
        {"fcoepriority", 8, FCOE, 1, "ERROR: Same fcoepriority. No change made to fcoepriority."},
        {"iscsipriority", 16, CNA, 1,
         "ERROR: Same iscsipriority. No change made to iscsipriority."},
        {"fcoepriority", 4, FCOE, 1, "ERROR: More than 2 priority groups have priorities.",
         three_groups},
        {"rocepriority", 2, CNA, 0, "", three_groups},
    };
    for (const auto& row : rows) {
        AX_CEE_Params record = good_record();
        row.edit(record);
        const std::string name = row.name;
        const Refusal refusal = check_parameter({name, row.value, true, row.port, record});
        EXPECT_EQ(refusal.status, row.status) << row.name << " " << row.line;
        EXPECT_STREQ(refusal.line, row.line);
        EXPECT_EQ(refusal.advice != nullptr,
                  name == "fcoepriority" && row.value == 4 && row.port.fcoe);
    }
}

TEST(Bridging_Rules, NamesAndValuesAreToldApart) {
    const AX_CEE_Params record = good_record();
    const struct {
        const char* name;
        AX_STATUS status;
        const char* value = "1";
        AX_STATUS parsed = 0;
        uint32 bitmap = 1;
    } rows[] = {
        {"PFCENABLE", 0},
        {"pfcenabled", 0, "2", 4},
        {"pgEnable", 4},
        {"tlvenable", 4},
        {"pfcwilling", 4, "5", 4},
        {"pgadvertise", 4},
        {"nicpriority", 4},
        {"", 4, "", 4},
        {"fcoepriority", 0, "7", 0, 128},
        {"fcoepriority", 0, "8", 1},
        {"iscsipriority", 0, "-1", 1},
        {"iscsipriority", 0, "", 1},
        {"rocepriority", 0, "1", 0, 2},
        {"rocepriority", 0, "2", 4},
        {"pfcpriority", 0, "3, 5 ,3", 0, 40},
        {"pfcpriority", 0, " - ", 0, 0},
        {"pfcpriority", 0, "3,8", 4},
        {"pfcpriority", 0, ", ", 4},
        {"pfcpriority", 0, "3;4", 4},
    };
    for (const auto& row : rows) {
        const std::string name = bridging_parameter_name(row.name);
        EXPECT_EQ(check_parameter_name({name, 1, true, CNA, record}).status, row.status) << name;
        uint32 value = 0;
        EXPECT_EQ(parse_bridging_value(name, row.value, value).status, row.parsed) << row.value;
        EXPECT_TRUE(row.parsed != 0 || value == row.bitmap) << row.value;
    }
    EXPECT_EQ(bridging_parameter_name(std::string(70, 'A').c_str()), std::string(63, 'a'));
    for (const char* name : {"fcoepriority", "iscsipriority", "rocepriority"})
        EXPECT_EQ(check_parameter_name({name, 1, true, NIC, record}).status, 4u) << name;
}

// What no console can ask for, since it names two priorities at the most.
TEST(Bridging_Rules, ThreePrioritiesUnderFlowControlAreTooMany) {
    const AX_CEE_Params record = good_record();
    Priority_Groups groups;
    const auto line = [&](uint32 bitmap, const Port_Functions& port) {
        return std::string(check_priorities({bitmap, groups, true, port, record}).line);
    };
    EXPECT_EQ(line(7, CNA), "ERROR: Only two PFC priorities can be configured on this adapter.");
    EXPECT_EQ(line(7, {.nicOnly = true, .bridging = true}),
              "ERROR: Only one PFC priority can be configured on this adapter.");
}

// ---- By the hundred thousand ----

// Which group each priority is in; a list, since a request may say anything.
using Membership = std::map<uint32, std::vector<uint32>>;

Membership members(const std::vector<std::pair<uint32, uint32>>& groups) {
    Membership found;
    for (const auto& [id, bitmap] : groups)
        for (uint32 priority = 0; priority < 32; ++priority)
            if (bitmap >> priority & 1)
                found[priority].push_back(id);
    return found;
}

class Random {
public:
    uint32 below(uint32 limit) { return static_cast<uint32>(_engine() % limit); }
    bool once_in(uint32 times) { return below(times) == 0; }

    Port_Functions port() {
        Port_Functions port{
            .iscsi = once_in(2), .fcoe = once_in(2), .roce = once_in(3), .bridging = once_in(2)};
        port.nicOnly = !port.iscsi && !port.fcoe && !port.roce;
        return port;
    }
    // A port as an adapter has it: each priority is in one group.
    AX_CEE_Params record() {
        AX_CEE_Params record{};
        record.dcbx.state = below(2);
        record.lldp.txState = record.dcbx.state | below(2);
        record.maxSupportedPG = below(9);
        AX_CEE_Settings& settings = record.configured;
        settings.pfc.enabled = !once_in(4);
        settings.pfcBitmap = below(3) ? 1U << below(8) : below(256);
        const uint32 groups = 1 + below(3);
        for (uint32 priority = 0; priority < 8; ++priority)
            settings.groupBitmap[once_in(8) ? 15 : below(groups)] |= 1U << priority;
        for (const Application each : {Application::FCOE, Application::ISCSI})
            if (!once_in(8))
                place_application(settings.application, each, 1U << below(8));
        return record;
    }

private:
    std::mt19937 _engine{20140315};
};

bool one_group_each(const AX_PGPriorityBitmaps& groups, uint32 unlimited) {
    std::vector<std::pair<uint32, uint32>> all = {{15, unlimited}};
    for (uint32 id = 0; id < 8; ++id)
        all.emplace_back(id, groups.group[id]);
    const Membership found = members(all);
    return found.size() == 8 && std::all_of(found.begin(), found.end(), [](const auto& each) {
               return each.first < 8 && each.second.size() == 1;
           });
}

// Whether the request may be made, said without regard to order and words.
bool lawful(const Parameter_Request& request) {
    const auto& [name, value, validate, port, record] = request;
    const AX_CEE_Settings& now = record.configured;
    const bool fcoe = name == "fcoepriority", iscsi = name == "iscsipriority";
    const std::set<std::string> sent = {"txportdesc", "txsysdesc", "txsysname", "txsyscap"};
    const auto at = [&](Application each) { return application_bitmap(now.application, each); };
    std::set<uint32> used;
    for (uint32 id = 0; id < 8; ++id)
        if (now.groupBitmap[id])
            used.insert(id);
    return (!port.nicOnly || port.bridging) && (!fcoe || port.fcoe) && (!iscsi || port.iscsi) &&
           (name.rfind("pfc", 0) != 0 || port.fcoe || port.bridging) &&
           (name != "dcbxstate" || value == 0 || record.lldp.txState) &&
           ((name != "txstate" && name != "rxstate") || value != 0 || !record.dcbx.state) &&
           (!sent.count(name) || record.lldp.txState) &&
           (name != "pfcpriority" ||
            (now.pfc.enabled && std::popcount(value) <= (port.bridging ? 2 : 1) &&
             (!port.fcoe || (at(Application::FCOE) & ~value) == 0))) &&
           (!(fcoe || iscsi) || !validate ||
            (used.size() <= 2 && value != at(fcoe ? Application::FCOE : Application::ISCSI)));
}

// The port after the request, as an adapter makes it of the writes: one that leaves a priority in
// two groups or none is refused.
void expect_sound_move(const Parameter_Request& request) {
    const AX_CEE_Settings& now = request.record.configured;
    const uint32 old =
        application_bitmap(now.application, bridging_parameter(request.name).application);
    const uint32 flow_control = needs_flow_control(request) ? request.value : now.pfcBitmap;
    ASSERT_TRUE((flow_control & request.value) ||
                (request.name != "fcoepriority" && !request.port.bridging))
        << "the application under flow control";
    AX_PGPriorityBitmaps groups;
    std::copy_n(now.groupBitmap, 8, groups.group);
    uint32 unlimited = now.groupBitmap[15];
    const auto alone = [&](uint32 bitmap) {
        return std::count(std::begin(groups.group), std::end(groups.group), bitmap) == 1;
    };
    const bool was_alone = old && alone(old);
    const Group_Move move = plan_group_move(now, request.value, old);
    for (const Group_Write& write : move.writes) {
        uint32 left = unlimited;
        for (const uint32 bitmap : write.bitmaps.group)
            left &= ~bitmap;
        if (!one_group_each(write.bitmaps, left)) {
            ASSERT_FALSE(move.swap) << "a single write";
            continue;
        }
        groups = write.bitmaps;
        unlimited = left;
    }
    ASSERT_TRUE(one_group_each(groups, unlimited)) << "each priority in one group";
    const bool had_limit = old != 0 && !(now.groupBitmap[15] & old);
    ASSERT_FALSE(had_limit && (unlimited & request.value)) << "in a group with a limit, as before";
    ASSERT_TRUE(!was_alone || alone(request.value)) << "in a group for itself, as before";
}

// With the rules off, or for another parameter, groups and flow control stay as they are: nothing
// promises then that they fit the application.
TEST(Bridging_Property, AcceptedParametersLeaveThePortSound) {
    const std::vector<std::string> names = {
        "dcbxstate", "dcbxmode",   "txstate",     "rxstate",      "txportdesc",    "txsysname",
        "txsyscap",  "pfcenabled", "pfcpriority", "fcoepriority", "iscsipriority", "rocepriority"};
    Random random;
    int accepted = 0, moved = 0;
    for (int i = 0; i < REQUESTS; ++i) {
        const std::string& name = names[random.below(2) ? 8 + random.below(3) : random.below(12)];
        const AX_CEE_Params record = random.record();
        const bool application = bridging_parameter(name).kind == Bridging_Kind::APP;
        const uint32 value =
            application ? 1U << random.below(8)
            : name == "pfcpriority"
                ? (random.below(2) ? record.configured.pfcBitmap : 0) | 1U << random.below(8)
                : random.below(2);
        const Parameter_Request request{name, value, !random.once_in(4), random.port(), record};
        const bool refused = static_cast<bool>(check_parameter(request));
        ASSERT_EQ(refused, !lawful(request)) << name << " " << value << " request " << i;
        accepted += !refused;
        if (!refused && moves_priority(request)) {
            ++moved;
            ASSERT_NO_FATAL_FAILURE(expect_sound_move(request)) << "request " << i;
        }
    }
    EXPECT_GT(accepted, REQUESTS / 10);
    EXPECT_GT(moved, REQUESTS / 100);
}

// That every priority has a group is the adapter's rule, not one of these: a request may leave some
// out. Nor do they ask for the application under flow control: only that no group is mixed.
TEST(Bridging_Property, AcceptedGroupsAreSound) {
    Random random;
    int accepted = 0;
    for (int i = 0; i < REQUESTS; ++i) {
        const AX_CEE_Params record = random.record();
        const Port_Functions port = random.port();
        const bool validate = !random.once_in(4);
        Priority_Groups groups;
        std::vector<std::set<uint32>> said(9);
        // As the adapter has them, and then some of it otherwise.
        for (uint32 priority = 0; priority < 8; ++priority)
            for (uint32 g = 0; g < 9; ++g)
                if (record.configured.groupBitmap[g == 8 ? 15 : g] >> priority & 1)
                    said[g].insert(priority);
        for (uint32 change = random.below(3); change > 0; --change)
            said[random.below(9)].insert(random.once_in(8) ? random.below(255) : random.below(8));
        for (uint32 g = 0; g < 9; ++g)
            std::copy(said[g].begin(), said[g].end(), groups.group[g].begin());
        const uint32 pfc = random.below(3) ? record.configured.pfcBitmap : random.below(16);
        const bool refused =
            static_cast<bool>(check_priorities({pfc, groups, validate, port, record}));

        std::multiset<uint32> all;
        bool known = true, mixed = false;
        for (const auto& group : said) {
            all.insert(group.begin(), group.end());
            std::set<bool> controlled;
            for (const uint32 priority : group) {
                known = known && priority < 8;
                controlled.insert((pfc >> (priority & 31) & 1) != 0);
            }
            mixed = mixed || controlled.size() == 2;
        }
        const auto used = std::count_if(said.begin(), said.begin() + 8,
                                        [](const auto& group) { return !group.empty(); });
        const uint32 application = application_bitmap(
            record.configured.application, port.fcoe ? Application::FCOE : Application::ISCSI);
        const std::set<uint32> own = {static_cast<uint32>(std::countr_zero(application))};
        const bool disjoint = std::adjacent_find(all.begin(), all.end()) == all.end();
        const bool alone = port.nicOnly || application == 0 ||
                           std::count(said.begin(), said.begin() + 8, own) == 1;
        const int most = port.bridging && !port.nicOnly ? 2 : 1;
        const bool expected = used <= static_cast<int>(record.maxSupportedPG) && known &&
                              (!(port.fcoe || port.bridging) || std::popcount(pfc) <= most) &&
                              (!validate || (disjoint && alone && !(port.fcoe && mixed)));
        ASSERT_EQ(refused, !expected) << "request " << i;
        if (refused)
            continue;
        ++accepted;
        const AX_PGPriorityBitmapsExt bitmaps = group_bitmaps(groups);
        for (uint32 g = 0; g < 9; ++g)
            for (uint32 priority = 0; priority < 8; ++priority)
                ASSERT_EQ((g == 8 ? bitmaps.groupFifteen : bitmaps.group[g]) >> priority & 1,
                          said[g].count(priority));
    }
    EXPECT_GT(accepted, REQUESTS / 20);
}

TEST(Bridging_Property, AcceptedBandwidthsAreTheWholeLink) {
    Random random;
    int accepted = 0;
    for (int i = 0; i < REQUESTS; ++i) {
        Group_Bandwidths bandwidths{};
        for (uint32 left = 100, step = 0; left > 0; left -= step) {
            step = std::min(left, 1 + random.below(60));
            bandwidths[random.below(8)] += step;
        }
        if (random.once_in(2)) // wraps around as well
            bandwidths[random.below(8)] += random.once_in(2) ? random.below(3) - 1 : 1U << 31;
        if (random.once_in(4))
            bandwidths[random.below(8)] += 1U << 31;
        double sum = 0;
        for (const uint32 percent : bandwidths)
            sum += percent;
        const Refusal refusal = check_bandwidths(bandwidths);
        ASSERT_EQ(refusal.status, sum == 100 ? 0u : 4u) << sum;
        accepted += !refusal;
    }
    EXPECT_GT(accepted, REQUESTS / 5);
}

TEST(Bridging_Property, AcceptedListsAreThePrioritiesInThem) {
    constexpr std::string_view LETTERS = "0123456789,,,,    -;";
    Random random;
    int accepted = 0;
    for (int i = 0; i < REQUESTS; ++i) {
        std::string text, blank;
        for (uint32 length = random.below(8); length > 0; --length)
            text += LETTERS[random.below(random.once_in(4) ? 20 : 18)];
        for (const char c : text)
            blank += c == ',' ? ' ' : c;
        uint32 expected = 0;
        bool valid = true;
        std::istringstream tokens(blank);
        for (std::string token; tokens >> token;) {
            const std::size_t digit = token.find_first_not_of('0');
            const std::string rest = digit == token.npos ? "0" : token.substr(digit);
            valid = valid && rest.size() == 1 && rest[0] >= '0' && rest[0] <= '7';
            expected |= valid ? 1U << (rest[0] - '0') : 0;
        }
        valid = (valid && expected != 0) || text == " - ";
        uint32 value = 0;
        ASSERT_EQ(parse_bridging_value("pfcpriority", text.c_str(), value).status, valid ? 0u : 4u)
            << "\"" << text << "\"";
        ASSERT_TRUE(!valid || value == (text == " - " ? 0 : expected)) << text;
        accepted += valid;
    }
    EXPECT_GT(accepted, REQUESTS / 10);
}

} // namespace
