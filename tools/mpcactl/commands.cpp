#include "tools/mpcactl/commands.h"

#include <algorithm>
#include <limits>
#include <sys/ioctl.h>
#include <unistd.h>

namespace mpcactl {

namespace {

int change_hardware(Session& session, const Command& command) {
    session.simulation().set_value(command.port, command.table, command.value_name, command.value);
    return EXIT_FINE;
}

int start_anew(Session& session, const Command&) {
    session.simulation().reboot();
    return EXIT_FINE;
}

template <vlnsim_action action>
int act(Session& session, const Command& command) {
    session.simulation().act(command.port, action);
    return EXIT_FINE;
}

int write_system_log(Session& session, const Command& command) {
    session.simulation().log(command.value);
    return EXIT_FINE;
}

int write_firmware(Session& session, const Command& command) {
    session.simulation().write_firmware(command.file, command.model, command.version, command.size);
    return EXIT_FINE;
}

struct Row {
    const char* name;
    int (*run)(Session& session, const Command& command);
};

constexpr Row COMMANDS[] = {
    {"classes", list_classes},
    {"class", show_class},
    {"enum", enumerate},
    {"names", list_names},
    {"census", census},
    {"get", get},
    {"create", create},
    {"modify", modify},
    {"delete", remove},
    {"assoc", associators},
    {"assoc-names", associator_names},
    {"refs", references},
    {"ref-names", reference_names},
    {"invoke", invoke},
    {"hardware", change_hardware},
    {"reboot", start_anew},
    {"reset", act<VLNSIM_RESET_ADAPTER>},
    {"pull", act<VLNSIM_PULL_CABLE>},
    {"plug", act<VLNSIM_PLUG_CABLE>},
    {"system-log", write_system_log},
    {"simulate-firmware", write_firmware},
};

} // namespace

Print_Context print_context(const Session& session, const Command& command) {
    constexpr std::size_t for_a_file = 160;
    constexpr std::size_t without_end = std::numeric_limits<std::size_t>::max();
    const bool terminal = isatty(STDOUT_FILENO) != 0;
    std::size_t width = command.wide ? without_end : for_a_file;
    winsize size{};
    if (terminal && !command.wide && ioctl(STDOUT_FILENO, TIOCGWINSZ, &size) == 0 &&
        size.ws_col > 0)
        width = size.ws_col;
    const bool cut_cells = terminal && !command.wide;
    return {session.classes(), command.format, command.name_space, command.properties, width,
            cut_cells,         command.words};
}

host::Property_List properties(const Command& command,
                               const std::vector<const host::Class*>& classes,
                               const std::string& none_has) {
    if (command.properties.empty())
        return std::nullopt;
    for (const std::string& name : command.properties) {
        if (std::any_of(classes.begin(), classes.end(),
                        [&](const host::Class* one) { return one->find_property(name); }))
            continue;
        std::vector<std::string> known;
        for (const host::Class* one : classes)
            for (const std::string& property : one->property_names())
                if (std::find(known.begin(), known.end(), property) == known.end())
                    known.push_back(property);
        throw Usage_Error(none_has + " property " + shown(name) + host::did_you_mean(name, known));
    }
    return command.properties;
}

int run_command(Session& session, const Command& command) {
    for (const Row& row : COMMANDS)
        if (command.name == row.name)
            return row.run(session, command);
    throw Usage_Error("unknown command " + command.name);
}

} // namespace mpcactl
