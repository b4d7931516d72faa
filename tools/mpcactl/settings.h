// What the command line says, read but not yet looked at.
#ifndef MPCACTL_SETTINGS_H
#define MPCACTL_SETTINGS_H

#include <string>
#include <vector>

namespace mpcactl {

enum class Format { table, json, mof };

struct Settings {
    // For every command
    std::string module;   // "": the one beside the program
    std::string scenario; // "": no simulation
    std::string host_root;
    std::string name_space = "root/vorlan";
    std::string platform;
    std::string mof;
    Format format = Format::table;
    bool trace_calls = false;

    // Of single commands
    std::string command;
    std::string class_name;
    std::string path;
    std::string method;
    std::vector<std::string> assignments; // name=value
    std::vector<std::string> properties;
    bool all = false;
    std::string via, role, result_role, result_class;
};

// Reads the arguments of main. Prints help and answers false if that was asked for. Throws
// Usage_Error.
bool read_command_line(int argc, char** argv, Settings& settings);

} // namespace mpcactl

#endif // MPCACTL_SETTINGS_H
