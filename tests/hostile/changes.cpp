#include "tests/hostile/changes.h"

#include "tools/mpcactl/assignment.h"

#include <fstream>
#include <sstream>
#include <utility>

namespace hostile {

std::vector<Change> read_changes() {
    std::vector<Change> changes, before;
    std::ifstream file(VLN_CHANGES);
    for (std::string line; std::getline(file, line);) {
        std::istringstream fields(line);
        Change change;
        std::getline(fields, change.scenario, '\t');
        std::getline(fields, change.what, '\t');
        for (std::string value; std::getline(fields, value, '\t');)
            change.values.push_back(value);
        const bool is_first_step = change.what.starts_with('&');
        if (is_first_step)
            change.what.erase(0, 1);
        else
            change.before = std::exchange(before, {});
        (is_first_step ? before : changes).push_back(std::move(change));
    }
    return changes;
}

Prepared_Change::Prepared_Change(road::Road& road, const Change& change) : _road(road) {
    for (const Change& step : change.before)
        _before.emplace_back(road, step);
    constexpr std::size_t SMALL = 1000; // bytes
    char error[256] = "";
    EXPECT_EQ(vlnsim_write_firmware((road.root() / "new.img").c_str(), "VMC-2210", "10.4.255.3",
                                    SMALL, error, sizeof error),
              0)
        << error;
    _kind = change.what.at(0);
    const std::string what = change.what.substr(_kind == '+' || _kind == '-');
    const std::size_t dot = what.find('.');
    if (_kind == '+')
        _instance.path.class_name = what;
    else
        _instance = road::instance_of(road, what.substr(0, dot));
    const host::ClassRepository& classes = road.manager().classes();
    const host::Class* known = classes.find(_instance.path.class_name);
    std::vector<std::string> values;
    for (const std::string& value : change.values)
        values.push_back(road::filled_in(road, value));
    if (dot == std::string::npos) {
        _values = mpcactl::read_properties(classes, *known, values, "root/vorlan");
        return;
    }
    _method = what.substr(dot + 1);
    const host::Method* method = known->find_method(_method);
    if (!method)
        throw std::runtime_error("no method " + change.what);
    _values = mpcactl::read_inputs(classes, *method, values, "root/vorlan");
}

void Prepared_Change::make_ready() const {
    for (const Prepared_Change& change : _before)
        EXPECT_EQ(change.make(), "CMPI_RC_OK 0");
}

std::string Prepared_Change::make() const {
    if (_method.empty())
        return make_of_instance();
    const auto reply = _road.manager().invoke(_instance.path, _method, _values);
    return host::rc_name(reply.status.rc) +
           (reply.ok() ? " " + std::to_string(reply.value.value.as_unsigned()) : "");
}

std::string Prepared_Change::make_of_instance() const {
    if (_kind == '-')
        return host::rc_name(_road.manager().remove(_instance.path).rc);
    host::Instance changed = _instance;
    std::vector<std::string> names;
    for (const host::Named_Value& value : _values) {
        host::set(changed.properties, value.name, value.value);
        names.push_back(value.name);
    }
    if (_kind == '+')
        return host::rc_name(_road.manager().create(changed).status.rc);
    return host::rc_name(_road.manager().modify(changed, names).rc);
}

} // namespace hostile
