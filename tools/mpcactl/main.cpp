// mpcactl: loads the provider module into an object manager of its own and asks it.

#include "tools/mpcactl/failure.h"
#include "tools/mpcactl/script.h"
#include "tools/mpcactl/session.h"

#include <csignal>
#include <cstdio>
#include <poll.h>
#include <unistd.h>

namespace {

using namespace mpcactl;

int run(int argc, char** argv) {
    Settings settings;
    if (!read_command_line(argc, argv, settings))
        return EXIT_FINE;
    const Command& command = settings.command;
    if (command.name.empty() && !isatty(STDIN_FILENO)) {
        std::vector<std::string> names = command_names();
        names.emplace_back("run");
        throw Usage_Error("a command is wanted; run - reads commands from standard input\n"
                          "Commands: " +
                          host::join_or(names) + "\nTry mpcactl --help.");
    }
    Session session(settings.session, command.name_space);
    int status = EXIT_FINE;
    if (command.name.empty())
        status = run_prompt(session, command);
    else if (command.name == "run")
        status = run_script(session, command);
    else
        status = run_guarded(session, command);
    const int at_the_end = session.finish();
    return status == EXIT_FINE ? at_the_end : status;
}

// Whether the output went all the way. A reader that has seen enough is no failure, a full disk is.
int flushed(int status) {
    pollfd output = {STDOUT_FILENO, 0, 0};
    const bool fine = std::fflush(stdout) == 0 && !std::ferror(stdout);
    if (fine || (poll(&output, 1, 0) == 1 && (output.revents & POLLERR) != 0))
        return status;
    std::fprintf(stderr, "mpcactl: the output cannot be written\n");
    return EXIT_CIM;
}

} // namespace

int main(int argc, char** argv) {
    // Output that nobody reads any more must not end a run before it has cleaned up.
    std::signal(SIGPIPE, SIG_IGN);
    try {
        return flushed(run(argc, argv));
    } catch (const Usage_Error& error) {
        std::fflush(stdout);
        std::fprintf(stderr, "mpcactl: %s\n", error.what());
        return EXIT_USAGE;
    } catch (const std::exception& error) {
        std::fflush(stdout);
        std::fprintf(stderr, "mpcactl: unexpected: %s\n", error.what());
        return EXIT_CIM;
    }
}
