// The dormant crash reporter.
#ifndef VLN_AGENT_SIGNAL_HANDLER_H
#define VLN_AGENT_SIGNAL_HANDLER_H

namespace cimple {

// Fills a signal action that would install the crash reporter, and drops it: a library must not
// change the signal dispositions of the process that it lives in.
void prepareSignalAction();

} // namespace cimple

#endif // VLN_AGENT_SIGNAL_HANDLER_H
