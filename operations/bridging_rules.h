// What may be set of data centre bridging, and how: the rules alone, without the library, the log
// or a lock beside them. They answer which rule a request breaks first; who asks does the rest.
#ifndef OPERATIONS_BRIDGING_RULES_H
#define OPERATIONS_BRIDGING_RULES_H

#include "cimple/types.h"
#include "device/library/axapi.h"

#include <array>
#include <string>
#include <vector>

namespace cimple {

inline constexpr uint32 NUM_PRIORITIES = 8;
inline constexpr AX_STATUS BRIDGING_NOT_OFFERED = 2;
// What a caller has that names a priority beyond the last.
inline constexpr uint32 NO_PRIORITY_BITMAP = 0xFFFFFFFF;

// What a port does, and whether its card takes bridging settings even without storage functions.
struct Port_Functions {
    bool nicOnly = false;
    bool iscsi = false;
    bool fcoe = false;
    bool roce = false;
    bool bridging = false;

    bool takesBridging() const { return !nicOnly || bridging; }
    bool takesFlowControl() const { return fcoe || bridging; }
};

// The rule that is broken: what the operation answers and says. Status 0: none is.
struct Refusal {
    AX_STATUS status = AX_STATUS_OK;
    char line[160];
    const char* advice = nullptr; // a line behind it
    bool console = false;         // the line goes to standard output, not to the log

    Refusal() { line[0] = '\0'; }
    explicit operator bool() const { return status != AX_STATUS_OK; }
};

// ---- Applications ----

enum class Application : uint8 { ISCSI, FCOE, ROCE };

// The lowest priority of the application's traffic as a bitmap, 0 where the table has none.
uint32 application_bitmap(const AX_ApplicationTable& table, Application application);
// Puts the bitmap into each entry of the application, or else into a free one; false if there is
// none.
bool place_application(AX_ApplicationTable& table, Application application, uint32 bitmap);

// ---- One parameter, by name ----

enum class Bridging_Kind : uint8 { NONE = 0, DCBX = 1, LLDP = 2, PFC = 4, GROUPS = 8, APP = 16 };

struct Bridging_Parameter {
    const char* name;
    Bridging_Kind kind;
    std::size_t offset = 0; // DCBX, LLDP, PFC: of the word in the library's record
    Application application = Application::FCOE; // APP
};

// The name as the tables have it: in lower case, and "...enable" as "...enabled".
std::string bridging_parameter_name(const char* given);
// For a name of no kind, one of the kind NONE.
const Bridging_Parameter& bridging_parameter(const std::string& name);

// Priorities become a bitmap.
Refusal parse_bridging_value(const std::string& name, const char* text, uint32& value);

struct Parameter_Request {
    const std::string& name;
    uint32 value = 0;
    bool validate = true;
    Port_Functions port;
    const AX_CEE_Params& record; // as the adapter has it

    Bridging_Kind kind() const { return bridging_parameter(name).kind; }
};

// The names that may be set here, and on which port.
Refusal check_parameter_name(const Parameter_Request& request);
Refusal check_parameter(const Parameter_Request& request);
// Whether the priority of an application is changed with the rules on: then groups follow it.
bool moves_priority(const Parameter_Request& request);
// Whether the new priority has to be put under flow control first.
bool needs_flow_control(const Parameter_Request& request);

// How the groups follow an application from one priority to another: what is written to the
// adapter, in this order. Nothing when the new priority has a group for itself already.
struct Group_Write {
    AX_PGPriorityBitmaps bitmaps;
    uint32 group; // the one that the line of the log is about
};
struct Group_Move {
    // Two groups change places, in one write. Otherwise writes follow one another, and one that
    // fails does not keep back the next.
    bool swap = false;
    std::vector<Group_Write> writes;
};
Group_Move plan_group_move(const AX_CEE_Settings& settings, uint32 newBitmap, uint32 oldBitmap);

// ---- Priority groups and flow control together ----

// The priorities of each group in bytes; the last group is AX_UNLIMITED_GROUP.
struct Priority_Groups {
    static constexpr uint8 FILLER = 255;
    static constexpr std::size_t ROOM = 32;
    static constexpr std::size_t GROUPS = AX_PRIORITY_GROUPS + 1;
    using Group = std::array<uint8, ROOM>;

    std::array<Group, GROUPS> group;

    Priority_Groups() {
        for (Group& each : group)
            each.fill(FILLER);
    }
};

// Priorities beyond the last are in no bitmap.
AX_PGPriorityBitmapsExt group_bitmaps(const Priority_Groups& groups);

struct Priority_Request {
    uint32 pfcBitmap = 0;
    const Priority_Groups& groups;
    bool validate = true;
    Port_Functions port;
    const AX_CEE_Params& record;
};

Refusal check_priorities(const Priority_Request& request);

// ---- Bandwidths ----

// In percent of the link, for the groups from 0 to 7.
using Group_Bandwidths = std::array<uint32, AX_PRIORITY_GROUPS>;
Refusal check_bandwidths(const Group_Bandwidths& bandwidths);

} // namespace cimple

#endif // OPERATIONS_BRIDGING_RULES_H
