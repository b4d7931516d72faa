// The engine's own message log, off unless the administrator turns it on.
//
// The folder that CIMPLE_HOME names may hold ".cimplerc" with LOG_LEVEL=word; the log is then
// ".cimple/messages" there. It is meant for those who debug the binding to an object manager; the
// provider's own logs are elsewhere. Several processes may share one log: each line is written
// under a file lock. The environment is read once, at the first message.
#ifndef CIMPLE_LOG_H
#define CIMPLE_LOG_H

namespace cimple {

enum Log_Level { LL_FATAL = 0, LL_ERR = 1, LL_WARN = 2, LL_INFO = 3, LL_DBG = 4 };

__attribute__((format(printf, 4, 5))) void log_msg(Log_Level level, const char* file, int line,
                                                   const char* format, ...);

// Gates the conversion warnings. -1 if it has the value already, else 0.
int set_log_enabled(bool flag);
bool log_enabled();

} // namespace cimple

#define CIMPLE_ERR(...) ::cimple::log_msg(::cimple::LL_ERR, __FILE__, __LINE__, __VA_ARGS__)
// Conversion messages: these two are gated by log_enabled.
#define CIMPLE_WARN(...)                                                                           \
    (::cimple::log_enabled()                                                                       \
         ? ::cimple::log_msg(::cimple::LL_WARN, __FILE__, __LINE__, __VA_ARGS__)                   \
         : static_cast<void>(0))
#define CIMPLE_INFO(...)                                                                           \
    (::cimple::log_enabled()                                                                       \
         ? ::cimple::log_msg(::cimple::LL_INFO, __FILE__, __LINE__, __VA_ARGS__)                   \
         : static_cast<void>(0))
#define CIMPLE_DBG(...) ::cimple::log_msg(::cimple::LL_DBG, __FILE__, __LINE__, __VA_ARGS__)

#endif // CIMPLE_LOG_H
