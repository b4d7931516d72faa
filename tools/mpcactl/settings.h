// What the command line or a line of a script says, read but not yet looked at.
#ifndef MPCACTL_SETTINGS_H
#define MPCACTL_SETTINGS_H

#include <string>
#include <vector>

namespace mpcactl {

enum class Format { table, json, mof };

// Of a run of the program.
struct Session_Settings {
    std::string module;       // "": the one beside the program
    std::string registration; // "": the one beside the program, for its module
    std::string scenario;     // "": no simulation
    std::string keep;
    std::string host_root;
    std::string platform;
    std::string mof;
    std::size_t answer_limit = 10'000'000; // bytes as CIM-XML; 0: any number
    bool trace_calls = false;
};

struct Command {
    std::string name; // "": none was given

    // For every command; a line of a script may differ from the command line
    std::string name_space = "root/vorlan";
    Format format = Format::table;
    bool wide = false;
    bool words = false;

    // Of single commands
    std::string class_name;
    std::string path;
    std::string method;
    std::vector<std::string> assignments; // name=value
    std::vector<std::string> properties;
    bool all = false;
    bool check = false;
    std::string via, role, result_role, result_class;
    std::string script;
    bool stop = false;
    bool quiet = false;
    std::string port, table, value_name, value;
    std::string file, model, version;
    std::size_t size = 4096; // of a firmware image, without its head
};

struct Settings {
    Session_Settings session;
    Command command;
};

// Reads the arguments of main. Prints help and answers false if that was asked for. Throws
// Usage_Error.
bool read_command_line(int argc, char** argv, Settings& settings);
// The same for a line of a script, whose command has the defaults of the command line.
bool read_line(std::vector<std::string> words, const Command& defaults, Command& command);
// The commands that a line may have.
std::vector<std::string> command_names();

} // namespace mpcactl

#endif // MPCACTL_SETTINGS_H
