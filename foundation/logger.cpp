#include "foundation/logger.h"

#include "cimple/buffer.h"
#include "cimple/thread.h"
#include "foundation/common.h"
#include "foundation/host_paths.h"

#include <algorithm>
#include <cerrno>
#include <climits>
#include <cstdarg>
#include <cstdlib>
#include <cstring>
#include <new>
#include <string>
#include <unistd.h>

namespace cimple {

constinit std::atomic<uint32> log_interest{0};

namespace {

// The system logger has the lines of a disabled logger, so it is known apart from the list.
constinit std::atomic<VLN_SysLogger*> known_syslog{nullptr};

// A number as strtol reads it, held to 32 bits. False for a missing token or one without a number.
bool read_number(const char* token, sint32& value) {
    if (!token)
        return false;
    char* end = nullptr;
    long number = std::strtol(token, &end, 10);
    if (end == token)
        return false;
    value = static_cast<sint32>(std::clamp<long>(number, INT_MIN, INT_MAX));
    return true;
}

} // namespace

void log_line(sint32 level, const char* file, uint32 line, const char* format, ...) noexcept {
    const No_Cancellation whole_line;
    std::va_list arguments;
    va_start(arguments, format);
    try {
        Buffer text;
        text.vformat(format, arguments);
        CLogger::instance().write(level, file, line, text.data());
    } catch (...) {
        // A line that cannot be written is lost; its caller must not be.
    }
    va_end(arguments);
}

uint32 VLN_LoggerInterface::interest(sint32 mode) const {
    return m_anyLevels | (mode_has_file(mode) ? m_fileLevels : 0U) |
           (mode_has_ring(mode) ? m_ringLevels : 0U);
}

bool VLN_LoggerInterface::wants(sint32 level) const {
    return level >= VLN_INVALID && level <= VLN_DBG &&
           (interest(CLogger::instance().get_mode()) >> level & 1U) != 0;
}

CLogger& CLogger::instance() {
    alignas(CLogger) static unsigned char storage[sizeof(CLogger)];
    static CLogger* const logger = new (storage) CLogger;
    return *logger;
}

sint32 CLogger::add_logger(VLN_LoggerInterface* logger) {
    Auto_Mutex lock(m_lock);
    if (std::find(m_loggers.begin(), m_loggers.end(), logger) != m_loggers.end())
        return 0;
    m_loggers.push_back(logger);
    if (auto* syslogger = dynamic_cast<VLN_SysLogger*>(logger))
        known_syslog = syslogger;
    refresh_interest();
    return 1;
}

sint32 CLogger::remove_logger(VLN_LoggerInterface* logger) {
    Auto_Mutex lock(m_lock);
    auto found = std::find(m_loggers.begin(), m_loggers.end(), logger);
    if (found == m_loggers.end())
        return 0;
    m_loggers.erase(found);
    if (known_syslog.load() == logger)
        known_syslog = nullptr;
    refresh_interest();
    return 1;
}

void CLogger::set_enabled_flag(sint32 value) {
    Auto_Mutex lock(m_lock);
    enabled.store(value, std::memory_order_relaxed);
    refresh_interest();
}

void CLogger::set_level(sint32 value) {
    if (value >= VLN_CRIT && value <= VLN_DBG)
        level.store(value, std::memory_order_relaxed);
}

void CLogger::set_mode(sint32 value) {
    Auto_Mutex lock(m_lock);
    mode.store(value, std::memory_order_relaxed);
    refresh_interest();
}

void CLogger::apply_mode(sint32 value) {
    Auto_Mutex lock(m_lock);
    mode.store(value, std::memory_order_relaxed);
    for (VLN_LoggerInterface* logger : m_loggers) {
        if (value != LOG_MODE_NONE)
            logger->open();
        else
            logger->close();
    }
    refresh_interest();
}

void CLogger::clear_all() {
    Auto_Mutex lock(m_lock);
    for (VLN_LoggerInterface* logger : m_loggers)
        logger->clear();
    refresh_interest();
}

void CLogger::write(sint32 lineLevel, const char* file, uint32 line, const char* text) {
    VLN_SysLogger* syslogger = known_syslog.load();
    if (!is_enabled() && syslogger) {
        syslogger->log(lineLevel, file, line, text);
        return;
    }
    Auto_Mutex lock(m_lock);
    for (VLN_LoggerInterface* logger : m_loggers)
        logger->log(lineLevel, file, line, text);
}

void CLogger::refresh_interest() {
    uint32 levels = 0;
    const sint32 present = get_mode();
    const VLN_SysLogger* syslogger = known_syslog.load();
    if (!is_enabled() && syslogger) {
        levels = syslogger->interest(present);
    } else {
        for (const VLN_LoggerInterface* logger : m_loggers)
            levels |= logger->interest(present);
    }
    log_interest.store(levels, std::memory_order_relaxed);
}

void CLogger::reset() {
    Auto_Mutex lock(m_lock);
    std::vector<VLN_LoggerInterface*>().swap(m_loggers);
    known_syslog = nullptr;
    mode = LOG_MODE_NONE;
    level = 0;
    enabled = 0;
    ffdc = false;
    dump_path_set = 0;
    dump_path = String();
    refresh_interest();
}

VLN_FileLogger* CLogger::file_logger() const {
    for (VLN_LoggerInterface* logger : m_loggers)
        if (auto* file = dynamic_cast<VLN_FileLogger*>(logger))
            return file;
    return nullptr;
}

// Worked out once: whether the root file system is read-only does not change while we run.
const char* CLogger::config_path() {
    if (!dump_path_set) {
        Host_File file =
            VLN_Common::IsReadOnlyFS() ? Host_File::LOG_SETTINGS_VAR : Host_File::LOG_SETTINGS;
        dump_path = host_path(file).c_str();
        dump_path_set = 1;
    }
    return dump_path.c_str();
}

void CLogger::save_config() {
    File_Handle stream(std::fopen(config_path(), "we"));
    if (!stream) {
        VLN_LOG(VLN_ERR, "Unable to open dump file\n");
        return;
    }
    const VLN_FileLogger* file = file_logger();
    std::fprintf(stream.get(), "%d,%d,%d\n%s", get_mode(), get_level(), is_enabled() ? 1 : 0,
                 file ? file->get_path().c_str() : "");
}

bool CLogger::config_readable() {
    if (access(config_path(), R_OK) == 0)
        return true;
    VLN_LOG(VLN_CRIT, "File access failed with %s", std::strerror(errno));
    return false;
}

void CLogger::load_config() {
    if (!config_readable())
        return;
    const char* path = config_path();
    File_Handle stream(std::fopen(path, "re"));
    if (!stream) {
        VLN_LOG(VLN_ERR, "Unable to open config data file - %s", path);
        return;
    }
    char line[20 + 1];
    if (!std::fgets(line, sizeof line, stream.get()))
        line[0] = '\0';
    if (parse_settings(line, path) && mode_has_file(get_mode()))
        load_trace_path(stream.get());
}

// Each field is stored as soon as it is found good, so a bad one keeps those before it.
bool CLogger::parse_settings(const char* line, const char* path) {
    std::string text(line);
    char* place = text.data();
    sint32 value = 0;

    if (!read_number(VLN_Common::nextToken(place, ",", &place), value)) {
        VLN_LOG(VLN_ERR, "Unable to read Log Mode from config data file - %s", path);
        return false;
    }
    if (static_cast<uint32>(value) > LOG_MODE_BOTH) {
        VLN_LOG(VLN_ERR, "Invalid value for Log Mode from config data file -%s-%u", path,
                static_cast<uint32>(value));
        return false;
    }
    set_mode(value);

    if (!read_number(VLN_Common::nextToken(nullptr, ",", &place), value)) {
        VLN_LOG(VLN_ERR, "Unable to read Log Level from config data file - %s", path);
        return false;
    }
    if (static_cast<uint32>(value) > VLN_DBG) {
        VLN_LOG(VLN_ERR, "Invalid value for Log Level from config data file -%s-%u", path,
                static_cast<uint32>(value));
        return false;
    }
    level.store(value, std::memory_order_relaxed);

    if (!read_number(VLN_Common::nextToken(nullptr, ",", &place), value)) {
        VLN_LOG(VLN_ERR, "Unable to read Log Enabled from config data file - %s", path);
        return false;
    }
    if (value < 0) {
        VLN_LOG(VLN_ERR, "Invalid value for Log Enabled from config data file - %s", path);
        return false;
    }
    set_enabled_flag(value);
    return true;
}

void CLogger::load_trace_path(std::FILE* stream) {
    VLN_FileLogger* file = file_logger();
    char path[256 + 1];
    if (!file || !std::fgets(path, sizeof path, stream))
        return;
    std::size_t length = std::strlen(path);
    if (length > 0 && path[length - 1] == '\n')
        path[--length] = '\0';
    if (length > 0 && path[length - 1] == '\r')
        path[--length] = '\0';
    if (file->validateAndSetPath(path, false) != 0)
        VLN_LOG(VLN_ERR, "validateAndSetPath() failed");
}

Provider_Loggers::Provider_Loggers() {
    CLogger& logger = CLogger::instance();
    logger.add_logger(&m_file);
    logger.add_logger(&m_ring);
    logger.add_logger(&m_syslog);
}

Provider_Loggers::~Provider_Loggers() {
    CLogger::instance().reset();
}

void Provider_Loggers::start() {
    CLogger& logger = CLogger::instance();
    logger.load_config();
    if (logger.config_readable()) {
        VLN_LOG(VLN_CRIT, " Continuing logs in Vorlan log provider. ");
        return;
    }
    VLN_LOG(VLN_CRIT, " Please see the default log: %s", host_path(Host_File::FFDC_LOG).c_str());
    logger.set_ffdc();
    logger.set_enabled();
    logger.set_mode(LOG_MODE_FILE);
    use_default_file();
}

bool Provider_Loggers::use_default_file() {
    if (m_file.validateAndSetPath(host_path(Host_File::FFDC_LOG).c_str(), true) == 0)
        return true;
    VLN_LOG(VLN_ERR, "validateAndSetPath() failed");
    return false;
}

} // namespace cimple
