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

// The instance of a class whose property has the value; the test fails if there is none.
inline host::Instance find(Road& road, const std::string& class_name, const char* property,
                           const std::string& value) {
    for (host::Instance& instance : road.enumerate(class_name))
        if (text_of(instance, property) == value)
            return std::move(instance);
    ADD_FAILURE() << "no " << class_name << " with " << property << " " << value;
    return {};
}

// A property of the first instance of a class.
inline std::string first(Road& road, const char* class_name, const char* property) {
    const auto instances = road.enumerate(class_name);
    return instances.empty() ? "no instance" : text_of(instances[0], property);
}

struct Count {
    const char* what;
    std::size_t count;
};

// How many instances there are of each class.
inline void expect_counts(Road& road, std::initializer_list<Count> rows) {
    for (const Count& row : rows)
        EXPECT_EQ(road.enumerate(row.what).size(), row.count) << row.what;
}

// How often each text stands in the log of a host that ends.
inline void expect_lines(Road& road, std::initializer_list<Count> rows) {
    road.close();
    for (const Count& row : rows)
        EXPECT_EQ(road.count_in_log(row.what), row.count) << row.what;
}

// Changes a value of the running host, as vlnsim_set_value.
inline void set_value(const char* wwn, const char* table, const char* name, const char* value) {
    char error[256] = "";
    EXPECT_EQ(vlnsim_set_value(wwn, table, name, value, error, sizeof error), 0) << error;
}

// What a walk from an instance along an association finds.
inline std::vector<host::Instance> walk(Road& road, const host::Instance& from, const char* via) {
    auto reply = road.manager().associators(from.path, {via, "", "", ""});
    EXPECT_TRUE(reply.ok()) << via;
    return std::move(reply.value);
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
