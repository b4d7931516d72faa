// The rows of logical units that the targets of all kinds of functions are made of, and the types
// of the units.
#include "simulator/scenario.h"

#include <algorithm>

namespace vlnsim {
namespace {

constexpr std::uint64_t max_luns = 16384; // what two bytes of a LUN address

struct Device_Type {
    std::string_view name;
    std::uint8_t number;
    bool has_capacity;
};
constexpr Device_Type device_types[] = {
    {"disk", 0, true},       {"tape", 1, false},       {"printer", 2, false},
    {"processor", 3, false}, {"worm", 4, true},        {"cd", 5, true},
    {"scanner", 6, false},   {"optical", 7, true},     {"changer", 8, false},
    {"array", 12, false},    {"enclosure", 13, false}, {"simpleDisk", 14, true},
    {"unknown", 31, false},
};

std::uint8_t read_type_value(const Node& node) {
    if (node.is(Value::Kind::number))
        return static_cast<std::uint8_t>(node.number(31));
    const std::string name = node.text();
    std::vector<std::string_view> names;
    for (const Device_Type& type : device_types) {
        if (type.name == name)
            return type.number;
        names.push_back(type.name);
    }
    node.fail("unknown device type \"" + name + "\"; a number below 32 is known, and " +
              known_list(names));
}

} // namespace

std::vector<std::string_view> joined_keys(std::span<const std::string_view> keys,
                                          std::initializer_list<std::string_view> own) {
    std::vector<std::string_view> known(own);
    known.insert(known.end(), keys.begin(), keys.end());
    return known;
}

std::uint8_t read_device_type(const Node& values, std::uint64_t lun) {
    if (const auto type = values.member("type"))
        return read_type_value(*type);
    const auto types = values.member("types");
    if (!types)
        return 0;
    const std::vector<Node> list = types->items();
    if (list.empty())
        types->fail("a list with at least one type is wanted");
    return read_type_value(list[static_cast<std::size_t>(lun % list.size())]);
}

bool has_capacity(std::uint8_t type) {
    return std::any_of(std::begin(device_types), std::end(device_types),
                       [&](const auto& row) { return row.number == type && row.has_capacity; });
}

void read_unit_rows(const Node& target_values, std::span<const std::string_view> unit_keys,
                    const Add_Unit& add) {
    Value base = target_values.value();
    std::erase_if(base.members, [&](const Member& member) {
        return std::find(unit_keys.begin(), unit_keys.end(), member.first) == unit_keys.end();
    });
    const auto luns = target_values.member("luns");
    Value one;
    one.kind = Value::Kind::object;
    std::vector<Node> rows;
    const bool is_count = luns && !luns->is(Value::Kind::list) && !luns->is(Value::Kind::object);
    if (luns && !is_count)
        rows = luns->items_or_self();
    else
        rows.emplace_back(one, target_values.scope());
    std::uint64_t next = 0;
    for (const Node& row : rows) {
        row.expect_object(joined_keys(unit_keys, {"count", "number"}));
        const std::uint64_t count =
            is_count ? luns->number(max_luns) : row.number("count", 1, max_luns);
        next = row.number("number", next, max_luns - 1);
        if (next + count > max_luns)
            row.fail("logical unit numbers end at " + std::to_string(max_luns - 1));
        const Value values = merged(base, row.value());
        for (std::uint64_t i = 0; i < count; ++i, ++next) {
            const Scope scope = target_values.scope().with("lun", next);
            add(row, Node(values, scope), next);
        }
    }
}

} // namespace vlnsim
