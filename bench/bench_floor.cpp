// Whether the floor is one: the providers written by hand answer what the library answers, property
// by property. Otherwise the one is no measure for the other. Prints what differs, and returns 1.
#include "bench/bench_program.h"
#include "host/manager.h"
#include "host/path_text.h"

#include <algorithm>
#include <cstdio>
#include <cstdlib>

namespace {

struct Compared {
    const char* class_name;
    std::string scenario;
};

host::Instance first_instance(const char* module, const char* class_name) {
    host::Options options;
    options.strict = false;
    host::Manager manager(options);
    const host::Status status = manager.load(module);
    if (!status.ok())
        fail(status.message);
    const auto reply = manager.enumerate(class_name);
    if (reply.value.empty())
        fail(std::string("no instance of ") + class_name);
    return reply.value.front();
}

std::string text_of(const host::Value* value) {
    if (!value)
        return "not set";
    std::string text;
    if (value->is_array())
        for (const host::Value& element : value->as_array())
            text += (text.empty() ? "" : ", ") + host::scalar_to_text(element, "");
    else
        text = host::scalar_to_text(*value, "");
    return text + " (type " + std::to_string(value->type) + ")";
}

bool differs(const char* class_name, const host::Named_Value& one, const host::Instance& other) {
    const host::Value* value = other.property(one.name);
    if (value && *value == one.value)
        return false;
    std::printf("%s.%s: %s, and on the other side %s\n", class_name, one.name.c_str(),
                text_of(&one.value).c_str(), text_of(value).c_str());
    return true;
}

// The number of properties that are not alike.
std::size_t differences(const Compared& compared) {
    simulate(compared.scenario);
    setenv("VLN_FLOOR_INSTANCES", "1", 1);
    const auto library = first_instance(VLN_BENCH_MODULE, compared.class_name);
    const auto floor = first_instance(VLN_FLOOR_MODULE, compared.class_name);
    const auto count = [&](const host::Instance& one, const host::Instance& other) {
        return std::count_if(one.properties.begin(), one.properties.end(), [&](const auto& value) {
            return differs(compared.class_name, value, other);
        });
    };
    return static_cast<std::size_t>(count(library, floor) + count(floor, library)) +
           (library.path == floor.path ? 0 : 1);
}

} // namespace

int main() {
    const Compared classes[] = {
        {"VLNMPCA_EthernetPort", read_scenario("two-port-cna.json")},
        {"VLNMPCA_StorageVolume", one_target(1)},
    };
    std::size_t bad = 0;
    for (const Compared& compared : classes)
        bad += differences(compared);
    return bad != 0;
}
