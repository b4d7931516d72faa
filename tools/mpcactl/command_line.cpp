#include "tools/mpcactl/failure.h"
#include "tools/mpcactl/help.h"
#include "tools/mpcactl/settings.h"

#include "host/text.h"

#include <CLI/CLI.hpp>

#include <algorithm>
#include <optional>

namespace mpcactl {

namespace {

void add_session_options(CLI::App& app, Session_Settings& session) {
    app.add_option("--module", session.module, "Provider module to load")->type_name("PATH");
    app.add_option("--registration", session.registration,
                   "Registration of the module: which class is served in which namespace")
        ->type_name("FILE");
    app.add_option("--simulate", session.scenario,
                   "Simulated host: a scenario file, or the name of one of the simulator's")
        ->type_name("SCENARIO");
    app.add_option("--keep", session.keep,
                   "With --simulate: keep what changes of the simulated host in this folder, for "
                   "the next call")
        ->type_name("DIR");
    app.add_option("--host-root", session.host_root,
                   "With --simulate: keep the files of the simulated host in this folder, and "
                   "nothing of its hardware")
        ->type_name("DIR");
    app.add_option("--platform", session.platform,
                   "JSON file with instances of the platform's own classes, for up-calls")
        ->type_name("FILE");
    app.add_option("--mof", session.mof, "Class catalogue instead of the installed one")
        ->type_name("FILE");
    app.add_option("--answer-limit", session.answer_limit,
                   "Refuse answers that have more bytes as CIM-XML, as an object manager would; 0: "
                   "none")
        ->type_name("BYTES")
        ->capture_default_str();
    app.add_flag("--trace-calls", session.trace_calls,
                 "Write calls, up-calls and simulated library calls to standard error");
}

Format format_of(const std::string& word) {
    constexpr std::pair<std::string_view, Format> formats[] = {
        {"table", Format::table}, {"json", Format::json}, {"mof", Format::mof}};
    for (const auto& [name, format] : formats)
        if (word == name)
            return format;
    throw CLI::ValidationError("--format",
                               shown(word) + " is no format; known are table, json and mof");
}

void add_common_options(CLI::App& app, Command& command) {
    app.add_option("--namespace", command.name_space, "Namespace of the request")
        ->type_name("NS")
        ->take_last()
        ->capture_default_str();
    app.add_option_function<std::string>(
           "--format", [&command](const std::string& word) { command.format = format_of(word); },
           "Form of the output: table, json or mof")
        ->type_name("FORMAT")
        ->take_last();
    app.add_flag("--wide", command.wide, "Tables with whole cells, however long their rows");
    app.add_flag("--words", command.words,
                 "Beside a value the word that it stands for, in tables and MOF");
}

// The options of the program, which each of its commands takes as well.
std::string common_options(const CLI::App& app) {
    const CLI::Formatter formatter;
    std::vector<const CLI::Option*> options;
    for (const CLI::Option* option : app.get_options())
        if (option != app.get_help_ptr())
            options.push_back(option);
    return formatter.make_group("Common options", false, options);
}

// Adds the commands to a parser, which calls back here: it lives as long.
class Commands {
public:
    Commands(CLI::App& app, Command& command) : _app(app), _command(command) {}

    void add_all() {
        add_class_commands();
        add_object_commands();
        add_association_commands();
        add_method_command();
        add_hardware_command();
        add_hand_commands();
        add_system_log_command();
        add_firmware_commands();
    }

    void add_run() {
        CLI::App& run = add("run", "Run the commands of a file, one a line, in one process");
        run.add_option("FILE", _command.script, "The file; - is standard input")
            ->required()
            ->type_name("");
        run.add_flag("--stop", _command.stop, "End at the first line that fails");
        run.add_flag("--quiet", _command.quiet, "Do not write the lines before their output");
    }

private:
    CLI::App& add(const std::string& name, const std::string& what) {
        CLI::App* command = _app.add_subcommand(name, what);
        command->fallthrough();
        command->footer(""); // not that of the program
        command->footer([this, name] { return common_options(_app) + "\n" + examples_of(name); });
        command->callback([this, name] { _command.name = name; });
        return *command;
    }

    void required(CLI::App& command, const std::string& name, std::string& value,
                  const std::string& what) {
        command.add_option(name, value, what)->required()->type_name("");
    }

    void class_argument(CLI::App& command) {
        required(command, "CLASS", _command.class_name, "Name of a class");
    }

    void path_argument(CLI::App& command) {
        required(command, "PATH", _command.path,
                 "Object path as `names` prints it: Class.Key=\"value\",Other=5, in single quotes");
    }

    void property_option(CLI::App& command) {
        command
            .add_option("-p,--properties", _command.properties,
                        "Only these properties, separated by commas")
            ->delimiter(',')
            ->expected(1)
            ->take_all()
            ->type_name("A,B");
    }

    void assignments(CLI::App& command, const std::string& of) {
        command
            .add_option("NAME=VALUE", _command.assignments,
                        of + ". Arrays: a,b,\"c,d\" or JSON; @FILE gives a uint8 array the bytes "
                             "of a file. References: a path. Embedded objects: {\"class\": ..., "
                             "\"properties\": {...}}. A NAME without = is null")
            ->type_name("");
    }

    void add_class_commands() {
        CLI::App& classes = add("classes", "List the classes that the module serves");
        classes.add_flag("--all", _command.all, "All known classes, served or not");
        class_argument(
            add("class", "Show a class: bases, keys, properties and methods, and what they mean"));
        CLI::App& enumerate = add("enum", "List the instances of a class and its subclasses");
        class_argument(enumerate);
        property_option(enumerate);
        class_argument(
            add("names", "List the object paths of the instances of a class and its subclasses"));
        add("census", "Count the instances of every class of the module");
    }

    void add_object_commands() {
        CLI::App& get = add("get", "Show one instance");
        path_argument(get);
        property_option(get);
        CLI::App& create = add("create", "Create an instance and print its object path");
        class_argument(create);
        assignments(create, "Value of a property");
        CLI::App& modify = add("modify", "Change properties of an instance");
        path_argument(modify);
        assignments(modify, "New value of a property");
        path_argument(add("delete", "Delete an instance"));
    }

    void add_association_command(const std::string& name, const std::string& what, bool results,
                                 bool names) {
        CLI::App& command = add(name, what);
        path_argument(command);
        command
            .add_option("--via", _command.via,
                        "Ask this association class only (default: every one that can have the "
                        "instance at an end)")
            ->type_name("ASSOC");
        command.add_option("--role", _command.role, "Role of the instance given")
            ->type_name("NAME");
        if (results) {
            command.add_option("--result-role", _command.result_role, "Role of the results")
                ->type_name("NAME");
            command.add_option("--result-class", _command.result_class, "Class of the results")
                ->type_name("CLASS");
        }
        if (!names)
            property_option(command);
    }

    void add_association_commands() {
        add_association_command("assoc", "Show the instances associated with an instance", true,
                                false);
        add_association_command("assoc-names", "List the paths of the associated instances", true,
                                true);
        add_association_command("refs", "Show the association instances that refer to an instance",
                                false, false);
        add_association_command("ref-names", "List the paths of the association instances", false,
                                true);
    }

    void add_method_command() {
        CLI::App& invoke =
            add("invoke", "Call a method of an instance; prints its result and its outputs");
        path_argument(invoke);
        required(invoke, "METHOD", _command.method, "Name of the method");
        assignments(invoke, "Value of an input");
        invoke.add_flag("--check", _command.check, "Fail with status 1 if it does not return 0");
    }

    void port_argument(CLI::App& command) {
        required(command, "PORT", _command.port, "Port WWN, 16 hexadecimal digits");
    }

    void add_hardware_command() {
        CLI::App& hardware =
            add("hardware", "With --simulate: change a value of the simulated hardware");
        port_argument(hardware);
        required(hardware, "TABLE", _command.table,
                 "adapterAttributes, portAttributes, statistics, features, driverParameters or "
                 "globalDriverParameters");
        required(hardware, "NAME", _command.value_name, "Name or number in the table");
        required(hardware, "VALUE", _command.value, "New value; null takes it away");
    }

    void add_system_log_command() {
        CLI::App& log = add("system-log", "With --simulate: write a line to the host's log");
        required(log, "LINE", _command.value, "As a driver writes it");
    }

    // What is done to the hardware of a host from outside.
    void add_hand_commands() {
        add("reboot", "With --simulate: start the simulated host anew");
        port_argument(add("reset", "With --simulate: reset the adapter of a port"));
        port_argument(
            add("pull", "With --simulate: pull the cable of a port, whose link goes down"));
        port_argument(add("plug", "With --simulate: plug the cable of a port in again"));
    }

    void add_firmware_commands() {
        CLI::App& firmware =
            add("simulate-firmware", "With --simulate: write a firmware image for its adapters");
        required(firmware, "FILE", _command.file, "The file to write");
        required(firmware, "MODEL", _command.model, "Model of the adapters that it is for");
        required(firmware, "VERSION", _command.version, "Version that they run then");
        firmware.add_option("--size", _command.size, "Bytes behind the image's head")
            ->type_name("BYTES")
            ->capture_default_str();
    }

    CLI::App& _app;
    Command& _command;
};

std::vector<std::string> command_names(const CLI::App& app) {
    std::vector<std::string> names;
    for (const CLI::App* command : app.get_subcommands([](const CLI::App*) { return true; }))
        names.push_back(command->get_name());
    return names;
}

std::vector<std::string> option_names(const CLI::App& app) {
    std::vector<std::string> names;
    std::vector<const CLI::App*> apps = {&app};
    for (const CLI::App* command : app.get_subcommands())
        apps.push_back(command);
    for (const CLI::App* one : apps)
        for (const CLI::Option* option : one->get_options())
            for (const std::string& name : option->get_lnames())
                names.push_back("--" + name);
    return names;
}

// The first word that is neither an option nor the value of one: where a command should stand.
std::optional<std::string> first_word(const CLI::App& app, const std::vector<std::string>& words) {
    for (std::size_t i = 0; i < words.size(); ++i) {
        if (words[i].empty() || words[i][0] != '-')
            return words[i];
        const CLI::Option* option = app.get_option_no_throw(words[i]);
        if (option && option->get_expected_max() > 0)
            ++i;
    }
    return std::nullopt;
}

// The parser's words, and what is known in place of what was not.
std::string explain(const CLI::App& app, const std::vector<std::string>& words,
                    const CLI::ParseError& error) {
    const std::string text = error.what();
    if (app.get_subcommands().empty()) {
        const std::optional<std::string> word = first_word(app, words);
        const std::vector<std::string> known = command_names(app);
        if (word && std::find(known.begin(), known.end(), *word) == known.end())
            return "unknown command " + shown(*word) + host::did_you_mean(*word, known) +
                   "\nCommands: " + host::join_or(known);
    }
    if (dynamic_cast<const CLI::ExtrasError*>(&error))
        for (const std::string& word : words) {
            const std::string name = word.substr(0, word.find('='));
            if (word.starts_with("--") && text.find(word) != std::string::npos)
                return "unknown option " + name + host::did_you_mean(name, option_names(app));
        }
    return text;
}

// "Name, Other" gives two names, "A,,B" as well.
void trim_names(std::vector<std::string>& names) {
    for (std::string& name : names) {
        name.erase(name.find_last_not_of(" \t") + 1);
        name.erase(0, name.find_first_not_of(" \t"));
    }
    std::erase(names, "");
}

bool parse(CLI::App& app, std::vector<std::string> words, Command& command,
           const std::string& advice) {
    try {
        app.parse(std::vector<std::string>(words.rbegin(), words.rend()));
    } catch (const CLI::CallForHelp& help) {
        app.exit(help);
        return false;
    } catch (const CLI::ParseError& error) {
        throw Usage_Error(explain(app, words, error) + advice);
    }
    trim_names(command.properties);
    return true;
}

} // namespace

bool read_command_line(int argc, char** argv, Settings& settings) {
    CLI::App app("Asks the provider module anything, as an object manager would.", "mpcactl");
    app.footer(examples_of(""));
    app.require_subcommand(0, 1);
    add_session_options(app, settings.session);
    add_common_options(app, settings.command);
    Commands commands(app, settings.command);
    commands.add_all();
    commands.add_run();
    return parse(app, {argv + std::min(argc, 1), argv + argc}, settings.command,
                 "\nTry mpcactl --help.");
}

bool read_line(std::vector<std::string> words, const Command& defaults, Command& command) {
    if (words.front() == "help") {
        words.erase(words.begin());
        words.emplace_back("--help");
    }
    command = defaults;
    command.name.clear();
    CLI::App app("A line is a command as it stands behind mpcactl in a shell.", "");
    app.footer("help [COMMAND] shows this, quit ends.");
    app.require_subcommand(1);
    add_common_options(app, command);
    Commands commands(app, command);
    commands.add_all();
    return parse(app, std::move(words), command, "\nTry help.");
}

std::vector<std::string> command_names() {
    Command command;
    CLI::App app;
    Commands(app, command).add_all();
    return command_names(app);
}

} // namespace mpcactl
