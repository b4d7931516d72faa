// When an update routine is due, and what they all read in the same way.

#include "agent/status/dynamic_status.h"

#include "agent/provider_agent.h"

#include <iterator>

namespace cimple {

namespace {

struct Update_Rule {
    const char* entry;   // or null
    const char* not_yet; // logged within the limit; or null
    uint64 limit;        // microseconds; the cache time-out of the refresh has no part in it
};

constexpr uint64 SLOW = 10 * Datetime::SECOND;
constexpr uint64 FAST = 5 * Datetime::SECOND;

// By Dynamic_Update.
constexpr Update_Rule UPDATE_RULES[] = {
    {"PERF: UpdateEthernetPortStatus: Entry", "PERF: Refresh Not yet required", SLOW},
    {"PERF: UpdateFCoEPortStatus: Entry", "PERF: Refresh Not yet required", SLOW},
    {"Entering GetFCoEPortStats()", "GetFCoEPortStats() :Refresh Not yet required", SLOW},
    {"UpdatePhyLinkDownReason(): Entry", "UpdatePhyLinkDownReason:Refresh Not yet required", FAST},
    {"UpdateBoardTemp(): Entry", "UpdateBoardTemp refresh Not yet required", SLOW},
    {nullptr, nullptr, FAST}, // what it calls tells enough
};
static_assert(std::size(UPDATE_RULES) == NUM_DYNAMIC_UPDATES);

} // namespace

// A clock that was set back gives a difference beyond every limit, so nothing waits for it.
bool update_due(ProviderAgent& agent, Dynamic_Update update) {
    const Update_Rule& rule = UPDATE_RULES[update];
    if (rule.entry)
        VLN_LOG(VLN_DBG, "%s", rule.entry);
    const Datetime now = Datetime::now();
    Datetime& last = agent.m_LastUpdates[update];
    if (now.usec() - last.usec() < rule.limit) {
        if (rule.not_yet)
            VLN_LOG(VLN_DBG, "%s", rule.not_yet);
        return false;
    }
    last = now;
    return true;
}

} // namespace cimple
