// Properties and ends of what a client gets, as texts.
#ifndef TESTS_ROAD_PROPERTIES_H
#define TESTS_ROAD_PROPERTIES_H

#include "tests/road/road.h"

namespace road {

struct Property_Text {
    const char* property;
    const char* value; // as text_of gives it
};

inline void expect_properties(const host::Instance& instance,
                              std::initializer_list<Property_Text> rows) {
    for (const Property_Text& row : rows)
        EXPECT_EQ(text_of(instance, row.property), row.value) << row.property;
}

// A key of an end of an association; "-" if there is none.
inline std::string end_of(const host::Instance& association, const char* role, const char* key) {
    const host::Value* value = association.property(role);
    const host::ObjectPath* end = value ? value->as_reference() : nullptr;
    const host::Value* found = end ? end->key(key) : nullptr;
    return found ? found->as_text() : "-";
}

} // namespace road

#endif // TESTS_ROAD_PROPERTIES_H
