#include "tools/mpcactl/failure.h"
#include "tools/mpcactl/settings.h"

#include "host/text.h"

#include <CLI/CLI.hpp>

#include <algorithm>
#include <map>

namespace mpcactl {

namespace {

constexpr const char* EXAMPLES = R"(Examples:
  mpcactl --simulate two-port-cna census
  mpcactl --simulate two-port-cna enum VLNMPCA_EthernetPort -p DeviceID,Speed
  mpcactl --simulate two-port-cna names VLNMPCA_Card
  mpcactl get 'VLNMPCA_Card.CreationClassName="VLNMPCA_Card",Tag="VLN0123456789"' --format json

Exit status: 0 done; 1 a CIM error (its CMPI word stands on standard error) or faults of the provider;
2 wrong usage.)";

void add_common_options(CLI::App& app, Settings& settings) {
    app.add_option("--module", settings.module, "Provider module to load")->type_name("PATH");
    app.add_option("--simulate", settings.scenario,
                   "Simulated host: a scenario file, or the name of one in simulator/scenarios")
        ->type_name("SCENARIO");
    app.add_option("--host-root", settings.host_root,
                   "With --simulate: keep the files of the simulated host in this folder")
        ->type_name("DIR");
    app.add_option("--namespace", settings.name_space, "Namespace of the requests")
        ->type_name("NS")
        ->capture_default_str();
    app.add_option("--platform", settings.platform,
                   "JSON file with instances of the platform's own classes, for up-calls")
        ->type_name("FILE");
    app.add_option("--mof", settings.mof, "Class catalogue instead of the installed one")
        ->type_name("FILE");
    const std::map<std::string, Format> formats = {
        {"table", Format::table}, {"json", Format::json}, {"mof", Format::mof}};
    app.add_option("--format", settings.format, "Form of the output: table, json or mof")
        ->type_name("FORMAT")
        ->transform(CLI::CheckedTransformer(formats).description(""));
    app.add_flag("--trace-calls", settings.trace_calls,
                 "Write calls, up-calls and simulated library calls to standard error");
}

class Commands {
public:
    Commands(CLI::App& app, Settings& settings) : _app(app), _settings(settings) {}

    void add_all() {
        add_class_commands();
        add_object_commands();
        add_association_commands();
        add_method_command();
    }

private:
    CLI::App& add(const std::string& name, const std::string& what, const std::string& example) {
        CLI::App* command = _app.add_subcommand(name, what);
        command->fallthrough();
        command->footer("Example:\n  mpcactl " + example);
        command->callback([this, name] { _settings.command = name; });
        return *command;
    }

    void class_argument(CLI::App& command) {
        command.add_option("CLASS", _settings.class_name, "Name of a class")
            ->required()
            ->type_name("");
    }

    void path_argument(CLI::App& command) {
        command
            .add_option("PATH", _settings.path,
                        "Object path as `names` prints it: Class.Key=\"value\",Other=5")
            ->required()
            ->type_name("");
    }

    void property_option(CLI::App& command) {
        command
            .add_option("-p,--properties", _settings.properties,
                        "Only these properties, separated by commas")
            ->delimiter(',')
            ->expected(1)
            ->take_all()
            ->type_name("A,B");
    }

    void assignments(CLI::App& command, const std::string& of) {
        command
            .add_option("NAME=VALUE", _settings.assignments,
                        of + ". Arrays: a,b,c or JSON. References: a path. Embedded objects: "
                             "{\"class\": ..., \"properties\": {...}}. A NAME without = is null")
            ->type_name("");
    }

    void add_class_commands() {
        CLI::App& classes = add("classes", "List the classes that the module serves",
                                "classes --all --format json");
        classes.add_flag("--all", _settings.all, "All known classes, served or not");
        CLI::App& enumerate = add("enum", "List the instances of a class",
                                  "enum VLNMPCA_EthernetPort -p DeviceID,Speed");
        class_argument(enumerate);
        property_option(enumerate);
        class_argument(add("names", "List the object paths of the instances of a class",
                           "names VLNMPCA_Card"));
        add("census", "Count the instances of every class of the module",
            "--simulate two-port-cna census");
    }

    void add_object_commands() {
        CLI::App& get = add("get", "Show one instance", "get 'VLNMPCA_Card.Tag=\"A\",...'");
        path_argument(get);
        property_option(get);
        CLI::App& create = add("create", "Create an instance and print its object path",
                               "create VLNMPCA_ARPEntry MACAddress=0090FA942779");
        class_argument(create);
        assignments(create, "Value of a property");
        CLI::App& modify =
            add("modify", "Change properties of an instance",
                "modify 'VLNMPCA_ProviderConfigSetting.InstanceID=\"A\"' CacheTimeout=5");
        path_argument(modify);
        assignments(modify, "New value of a property");
        path_argument(add("delete", "Delete an instance",
                          "delete 'VLNMPCA_ARPEntry.MACAddress=\"0090FA942779\",...'"));
    }

    void add_association_command(const std::string& name, const std::string& what, bool results,
                                 bool names) {
        CLI::App& command = add(name, what, name + " 'VLNMPCA_Card.Tag=\"A\",...'");
        path_argument(command);
        command
            .add_option("--via", _settings.via,
                        "Ask this association class only (default: every one that can have the "
                        "instance at an end)")
            ->type_name("ASSOC");
        command.add_option("--role", _settings.role, "Role of the instance given")
            ->type_name("NAME");
        if (results) {
            command.add_option("--result-role", _settings.result_role, "Role of the results")
                ->type_name("NAME");
            command.add_option("--result-class", _settings.result_class, "Class of the results")
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
            add("invoke", "Call a method of an instance; prints its result and its outputs",
                "invoke 'VLNMPCA_EthernetPort.DeviceID=\"A\",...' RequestStateChange "
                "RequestedState=2");
        path_argument(invoke);
        invoke.add_option("METHOD", _settings.method, "Name of the method")
            ->required()
            ->type_name("");
        assignments(invoke, "Value of an input");
    }

    CLI::App& _app;
    Settings& _settings;
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

// The first argument that is neither an option nor the value of one: where a command should stand.
std::string first_word(const CLI::App& app, int argc, char** argv) {
    for (int i = 1; i < argc; ++i) {
        const std::string argument = argv[i];
        if (argument.empty() || argument[0] != '-')
            return argument;
        const CLI::Option* option = app.get_option_no_throw(argument);
        if (option && option->get_expected_max() > 0)
            ++i;
    }
    return "";
}

// The parser's words, and what is known in place of what was not.
std::string explain(const CLI::App& app, int argc, char** argv, const CLI::ParseError& error) {
    const std::string text = error.what();
    const std::string commands = "\nCommands: " + host::join_or(command_names(app));
    if (app.get_subcommands().empty()) {
        const std::string word = first_word(app, argc, argv);
        const std::vector<std::string> known = command_names(app);
        if (!word.empty() && std::find(known.begin(), known.end(), word) == known.end())
            return "unknown command " + word + host::did_you_mean(word, known) + commands;
        return dynamic_cast<const CLI::RequiredError*>(&error) ? text + commands : text;
    }
    for (int i = 1; i < argc && dynamic_cast<const CLI::ExtrasError*>(&error); ++i) {
        const std::string argument = argv[i], name = argument.substr(0, argument.find('='));
        if (argument.rfind("--", 0) == 0 && text.find(argument) != std::string::npos)
            return "unknown option " + name + host::did_you_mean(name, option_names(app));
    }
    return text;
}

} // namespace

bool read_command_line(int argc, char** argv, Settings& settings) {
    CLI::App app("Asks the provider module anything, as an object manager would.", "mpcactl");
    app.footer(EXAMPLES);
    app.require_subcommand(1);
    add_common_options(app, settings);
    Commands commands(app, settings);
    commands.add_all();
    try {
        app.parse(argc, argv);
    } catch (const CLI::CallForHelp& help) {
        app.exit(help);
        return false;
    } catch (const CLI::ParseError& error) {
        throw Usage_Error(explain(app, argc, argv, error) + "\nTry mpcactl --help.");
    }
    return true;
}

} // namespace mpcactl
