#include "agent/class_groups.h"

#include "cimple/guard.h"
#include "foundation/log.h"

namespace cimple {

namespace {

void tell(const Group_Line& line) {
    if (line.text)
        VLN_LOG(line.level, "%s", line.text);
}

uint32 create(const Class_Group& group, const Map_Scope& scope) {
    tell(group.before);
    if (group.clear)
        group.clear(scope.agent);
    const uint32 status = group.create(scope);
    tell(status == MAP_OK ? group.done : group.failed);
    return status;
}

uint32 create_guarded(const Class_Group& group, const Map_Scope& scope) {
    if (!group.thrown.text)
        return create(group, scope);
    uint32 status = MAP_OK;
    if (run_guarded([&] { status = create(group, scope); }))
        return status;
    if (group.clear)
        group.clear(scope.agent);
    tell(group.thrown);
    return MAP_OK;
}

} // namespace

uint32 make_class_groups(Group_Place place, const Map_Scope& scope) {
    for (const Class_Group& group : class_groups)
        if (group.place == place && create_guarded(group, scope) == END_PASS)
            return END_PASS;
    return MAP_OK;
}

} // namespace cimple
