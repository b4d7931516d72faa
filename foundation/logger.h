// The provider's logger and its sinks: a text file, syslog, and a ring in memory that the console
// reads as CIM records.
//
// One CLogger fans each line out to its list of sinks. The list lock serialises all writes, so a
// sink must never log. Lines come in through VLN_LOG (log.h).
#ifndef FOUNDATION_LOGGER_H
#define FOUNDATION_LOGGER_H

#include "cimple/datetime.h"
#include "cimple/string.h"
#include "cimple/thread.h"
#include "foundation/file_handle.h"
#include "foundation/log.h"

#include <memory>
#include <vector>

namespace cimple {

class VLN_FileLogger;
class VLN_SysLogger;

// What the console chooses as the target of the log.
enum VLN_LogMode : sint32 {
    LOG_MODE_NONE = 0,
    LOG_MODE_RING = 1,
    LOG_MODE_FILE = 2,
    LOG_MODE_OTHER = 3, // accepted, and no writer's
    LOG_MODE_BOTH = 4,
};

inline bool mode_has_file(sint32 mode) {
    return mode == LOG_MODE_FILE || mode == LOG_MODE_BOTH;
}
inline bool mode_has_ring(sint32 mode) {
    return mode == LOG_MODE_RING || mode == LOG_MODE_BOTH;
}

// The word of a level in a record: "VLN_ERR".
const char* level_word(sint32 level);

// A sink. All operations are called with the list lock held.
class VLN_LoggerInterface {
public:
    virtual ~VLN_LoggerInterface() = default;
    virtual void log(sint32 level, const char* file, uint32 line, const char* text) = 0;
    virtual void open() = 0;
    virtual void close() = 0;
    virtual void clear() = 0;

    // The levels (bit n: level n) that log() would write in the given mode: the one filter. A sink
    // of a test may claim more than it writes, never less.
    uint32 interest(sint32 mode) const;

protected:
    // Whether log() writes a line of the level, in the logger's mode.
    bool wants(sint32 level) const;

    VLN_LoggerInterface() = default;
    VLN_LoggerInterface(const VLN_LoggerInterface&) = delete;
    VLN_LoggerInterface& operator=(const VLN_LoggerInterface&) = delete;

    static constexpr uint32 ALL_LEVELS = 0xFFFFFFFFU;

    // Set by the derived class: the levels for a mode with a file, with the ring, and for any mode.
    uint32 m_fileLevels = 0;
    uint32 m_ringLevels = 0;
    uint32 m_anyLevels = ALL_LEVELS;
};

class CLogger {
public:
    // Made on first use and never destroyed, so that a late line finds it; reset() empties it.
    static CLogger& instance();

    // The list does not own the sinks. add: 1 if added, 0 if it was there; remove: 1 if removed.
    sint32 add_logger(VLN_LoggerInterface* logger);
    sint32 remove_logger(VLN_LoggerInterface* logger);

    void set_enabled() { set_enabled_flag(1); }
    void clear_enabled() { set_enabled_flag(0); }
    bool is_enabled() const { return enabled.load(std::memory_order_relaxed) != 0; }

    // Stored, shown and saved; no writer filters on it. Values outside 1 to 5 are ignored.
    void set_level(sint32 value);
    sint32 get_level() const { return level.load(std::memory_order_relaxed); }

    void set_mode(sint32 value);
    sint32 get_mode() const { return mode.load(std::memory_order_relaxed); }

    void set_ffdc() { ffdc.store(true, std::memory_order_relaxed); }
    void clear_ffdc() { ffdc.store(false, std::memory_order_relaxed); }
    bool is_ffdc() const { return ffdc.load(std::memory_order_relaxed); }

    // Stores the mode, then opens all sinks, or closes them if it is 0.
    void apply_mode(sint32 value);
    void clear_all();

    // The log settings file. Failures are logged and leave what was not read yet as it is.
    void load_config();
    void save_config();
    bool config_readable();

    // What VLN_LOG ends in.
    void write(sint32 level, const char* file, uint32 line, const char* text);

    // Forgets the sinks and all settings. Only while no other thread logs.
    void reset();

    Mutex& list_lock() { return m_lock; }
    void refresh_interest(); // with the list lock held

private:
    CLogger() = default;
    void set_enabled_flag(sint32 value);
    const char* config_path();
    bool parse_settings(const char* line, const char* path);
    void load_trace_path(std::FILE* stream);
    VLN_FileLogger* file_logger() const;

    std::atomic<sint32> mode{LOG_MODE_NONE};
    std::atomic<sint32> level{0};
    std::atomic<sint32> enabled{0};
    std::atomic<bool> ffdc{false};
    std::vector<VLN_LoggerInterface*> m_loggers;
    sint32 dump_path_set = 0;
    String dump_path;

    Mutex m_lock{false, 0, "CLogger"};
};

class VLN_FileLogger : public VLN_LoggerInterface {
public:
    VLN_FileLogger();
    ~VLN_FileLogger() override;

    void log(sint32 level, const char* file, uint32 line, const char* text) override;
    void open() override;
    void close() override; // the path is forgotten
    void clear() override;

    // Opens `newPath` for appending and makes it the log (log_file.h). With `isFfdc` the file keeps
    // critical and error records only. 0, or -1 with the former file kept. Takes the list lock.
    sint32 validateAndSetPath(const char* newPath, bool isFfdc);
    const String& get_path() const { return path; }

private:
    void set_stream(File_Handle opened);

    String path;
    File_Handle stream;
    bool ffdc = false;
};

// Has the lines of a disabled logger to itself.
class VLN_SysLogger : public VLN_LoggerInterface {
public:
    VLN_SysLogger(); // opens the system log and adds itself to the list
    ~VLN_SysLogger() override;

    void log(sint32 level, const char* file, uint32 line, const char* text) override;
    void open() override {}
    void close() override {}
    void clear() override {}
};

struct VLN_CIMLogEntry {
    uint32 level;
    Datetime time;
    char message[200]; // bracketed, as UTF-8, cut to fit behind a character
};

class VLN_CIMLogger : public VLN_LoggerInterface {
public:
    static constexpr uint32 capacity = 1024;

    VLN_CIMLogger();

    void log(sint32 level, const char* file, uint32 line, const char* text) override;
    void open() override {}
    void close() override {}
    void clear() override;

    // The entries by slot. Takes the list lock.
    std::vector<VLN_CIMLogEntry> entries() const;

private:
    uint32 next = 0xFFFFFFFFU; // slot of the newest record; -1, raised before use
    std::vector<VLN_CIMLogEntry> m_entries;
};

// The three sinks of the provider, in the logger's list from construction to destruction.
class Provider_Loggers {
public:
    Provider_Loggers();
    ~Provider_Loggers(); // leaves the logger as new

    // Takes over the saved settings. A system that was never configured gets a small log of
    // critical and error records.
    void start();

    // Makes the small default log the file. False, with a line of the log, if it cannot be opened.
    bool use_default_file();

    VLN_FileLogger& file() { return m_file; }
    VLN_CIMLogger& ring() { return m_ring; }

private:
    VLN_FileLogger m_file;
    VLN_CIMLogger m_ring;
    VLN_SysLogger m_syslog;
};

} // namespace cimple

#endif // FOUNDATION_LOGGER_H
