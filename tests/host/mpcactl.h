// mpcactl as its users see it: a child process, its output, its words about errors, its status.
#ifndef TESTS_HOST_MPCACTL_H
#define TESTS_HOST_MPCACTL_H

#include <cstdlib>
#include <fstream>
#include <sstream>
#include <string>
#include <sys/wait.h>
#include <vector>

struct Outcome {
    int status; // -1: it died
    std::string out;
    std::string err;
};

inline std::string contents(const std::string& name) {
    std::ostringstream text;
    text << std::ifstream(name).rdbuf();
    return text.str();
}

inline void write_text(const std::string& name, const std::string& text) {
    std::ofstream(name) << text;
}

// A command of a shell that finds mpcactl.
inline Outcome run_shell(const std::string& command) {
    const std::string folder = std::string(MPCACTL).substr(0, std::string(MPCACTL).rfind('/'));
    setenv("PATH", (folder + ":/usr/bin:/bin").c_str(), 1);
    write_text("command.sh", command + "\n");
    const int status = std::system("sh command.sh >mpcactl.out 2>mpcactl.err");
    const bool ended = WIFEXITED(status) && WEXITSTATUS(status) < 128;
    return {ended ? WEXITSTATUS(status) : -1, contents("mpcactl.out"), contents("mpcactl.err")};
}

inline std::string shell_word(const std::string& text) {
    std::string word = "'";
    for (char c : text)
        word += c == '\'' ? std::string("'\\''") : std::string(1, c);
    return word + "'";
}

inline Outcome run_bare(const std::vector<std::string>& arguments) {
    std::string line = "mpcactl";
    for (const std::string& argument : arguments)
        line += " " + shell_word(argument);
    return run_shell(line + " </dev/null");
}

// With the classes and a provider of the tests.
inline Outcome run(std::vector<std::string> arguments, const std::string& module = GOOD_PROVIDER) {
    const std::vector<std::string> common = {"--mof", TEST_MOF,      "--module",
                                             module,  "--namespace", "root/test"};
    arguments.insert(arguments.begin(), common.begin(), common.end());
    return run_bare(arguments);
}

#endif // TESTS_HOST_MPCACTL_H
