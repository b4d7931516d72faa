// What an adapter keeps of its firmware's dumps, and what its firmware traces.
#include "simulator/call.h"
#include "simulator/scenario.h"

#include <algorithm>

namespace vlnsim {
namespace {

constexpr std::uint64_t max_modules = 4096;
constexpr std::string_view modes[] = {"ram", "uart", "nvram", "tftp"}; // by AX_LOG_MODE_
constexpr std::uint32_t default_level = 9;

AX_EventLogMode read_mode(const Node& values) {
    values.expect_object({"level", "portMask", "pciFuncMask"});
    return {1, values.number32("level", default_level), values.number32("portMask", 0xF),
            values.number32("pciFuncMask", 0xFF)};
}

AX_EventLogModule read_module(const Node& values) {
    AX_EventLogModule module{};
    const auto name = values.member("name");
    if (!name)
        values.fail("\"name\" is wanted");
    const std::string text = values.wild_text("name", "");
    if (text.size() > sizeof module.name)
        name->fail("longer than " + std::to_string(sizeof module.name) + " bytes");
    std::copy(text.begin(), text.end(), module.name);
    for (std::size_t mode = 0; mode < AX_LOG_MODES; ++mode)
        if (const auto node = values.member(modes[mode]))
            module.mode[mode] = read_mode(*node);
    return module;
}

Trace_Settings read_modules(const Node& values) {
    Trace_Settings settings;
    for (const Node& row : values.items()) {
        row.expect_object({"count", "name", "ram", "uart", "nvram", "tftp"});
        const std::uint64_t count = row.number("count", 1, max_modules);
        for (std::uint64_t i = 0; i < count; ++i) {
            const Scope scope = row.scope().with("module", settings.size());
            settings.push_back(read_module(Node(row.value(), scope)));
        }
    }
    return settings;
}

std::uint32_t read_log_type(const Node& values) {
    std::uint32_t bits = 0;
    for (const Node& node : values.items_or_self()) {
        const std::string word = node.text();
        const auto found = std::find(std::begin(modes), std::end(modes), word);
        if (found == std::end(modes))
            node.fail("unknown kind \"" + word + "\"; " + known_list(modes));
        bits |= 1U << (found - std::begin(modes));
    }
    return bits;
}

} // namespace

Dumps read_dumps(const Node& values) {
    values.expect_object({"directory", "retention", "stored", "coreDump", "maxLogEntries",
                          "logEntrySize", "logType", "modules"});
    Dumps dumps;
    dumps.directory = values.text("directory", "/var/log/vorlan/dump");
    if (dumps.directory.size() >= AX_DUMP_DIRECTORY_SIZE)
        values.member("directory")->fail("too long");
    dumps.retention = values.number32("retention", 10);
    dumps.stored = values.number32("stored", 0);
    dumps.core_dump = values.number32("coreDump", AX_STATUS_OK);
    dumps.log.maxLogEntries = values.number32("maxLogEntries", 4096);
    dumps.log.logEntrySize = values.number32("logEntrySize", 64);
    const auto type = values.member("logType");
    dumps.log.logType = type ? read_log_type(*type) : 1U << AX_LOG_MODE_RAM;
    if (const auto modules = values.member("modules"))
        dumps.modules = read_modules(*modules);
    dumps.factory = dumps.modules;
    return dumps;
}

} // namespace vlnsim
