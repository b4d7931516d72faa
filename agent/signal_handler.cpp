#include "agent/signal_handler.h"

#include <cstdlib>

#include <execinfo.h>
#include <signal.h>
#include <syslog.h>

namespace cimple {

namespace {

constexpr int MAX_FRAMES = 16;

// Reports where the process was, in the system log, and ends it.
void signalHandler(int, siginfo_t*, void*) {
    void* frames[MAX_FRAMES];
    const int count = backtrace(frames, MAX_FRAMES);
    char** lines = backtrace_symbols(frames, count);
    syslog(LOG_INFO, "Signal in CIM Provider");
    syslog(LOG_INFO, "Back Trace Execution Path:");
    for (int i = 0; lines && i < count; ++i)
        syslog(LOG_INFO, "Trace message [bt] %s", lines[i]);
    std::exit(1);
}

} // namespace

void prepareSignalAction() {
    struct sigaction action {};
    sigemptyset(&action.sa_mask);
    action.sa_flags = SA_SIGINFO;
    action.sa_sigaction = signalHandler;
}

} // namespace cimple
