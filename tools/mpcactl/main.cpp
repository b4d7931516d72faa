// mpcactl: loads the provider module into an object manager of its own and asks it one thing.

#include "tools/mpcactl/commands.h"
#include "tools/mpcactl/failure.h"
#include "tools/mpcactl/session.h"

#include <algorithm>
#include <cstdio>

namespace {

using namespace mpcactl;

int run(int argc, char** argv) {
    Settings settings;
    if (!read_command_line(argc, argv, settings))
        return EXIT_FINE;
    Session session(settings);
    int status = EXIT_FINE;
    try {
        status = run_command(session);
    } catch (const Cim_Error& error) {
        std::fprintf(stderr, "mpcactl: %s\n", error.what());
        status = EXIT_CIM;
    }
    std::fflush(stdout);
    return std::max(status, session.finish());
}

} // namespace

int main(int argc, char** argv) {
    try {
        return run(argc, argv);
    } catch (const Usage_Error& error) {
        std::fprintf(stderr, "mpcactl: %s\n", error.what());
        return EXIT_USAGE;
    } catch (const std::exception& error) {
        std::fprintf(stderr, "mpcactl: unexpected: %s\n", error.what());
        return EXIT_CIM;
    }
}
