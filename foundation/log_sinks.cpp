#include "foundation/log_file.h"
#include "foundation/logger.h"
#include "foundation/utf8.h"

#include <cerrno>
#include <cstring>
#include <pthread.h>
#include <string>
#include <sys/stat.h>
#include <syslog.h>
#include <unistd.h>

namespace cimple {

namespace {

constexpr uint32 bit(sint32 level) {
    return 1U << level;
}

constexpr uint32 FFDC_LEVELS = bit(VLN_CRIT) | bit(VLN_ERR);
constexpr uint32 FILE_LEVELS = bit(VLN_DBG + 1) - 1;
constexpr uint32 RING_LEVELS = bit(VLN_INFO) - 1;
// Meant: the provider's levels start at 1, so none of its lines floods the host's system log.
constexpr uint32 SYSLOG_LEVELS = bit(VLN_INVALID);

} // namespace

const char* level_word(sint32 level) {
    static constexpr const char* WORDS[] = {"VLN_INVALID", "VLN_CRIT", "VLN_WARN",
                                            "VLN_ERR",     "VLN_INFO", "VLN_DBG"};
    return level >= VLN_CRIT && level <= VLN_DBG ? WORDS[level] : WORDS[VLN_INVALID];
}

// The file.

VLN_FileLogger::VLN_FileLogger() {
    m_anyLevels = 0;
}

VLN_FileLogger::~VLN_FileLogger() {
    CLogger::instance().remove_logger(this);
}

void VLN_FileLogger::set_stream(File_Handle opened) {
    stream = std::move(opened);
    m_fileLevels = !stream ? 0 : ffdc ? FFDC_LEVELS : FILE_LEVELS;
}

void VLN_FileLogger::log(sint32 level, const char* file, uint32 line, const char* text) {
    if (!wants(level))
        return;
    // The "l" after the thread's number is a letter of the line, known to those who parse it.
    std::fprintf(stream.get(), "[threadid =%ul] [%s] [%s:%u][%s] %s\n",
                 static_cast<unsigned>(pthread_self()), Datetime::now().readable().c_str(), file,
                 line, level_word(level), text);
    std::fflush(stream.get());
}

void VLN_FileLogger::open() {
    if (!mode_has_file(CLogger::instance().get_mode()))
        return;
    set_stream(nullptr);
    set_stream(open_log_file(path.c_str()));
}

void VLN_FileLogger::close() {
    set_stream(nullptr);
    path = String();
}

void VLN_FileLogger::clear() {
    set_stream(open_log_file(path.c_str()));
    if (stream && ftruncate(fileno(stream.get()), 0) != 0)
        VLN_FileLogger::set_stream(nullptr);
}

sint32 VLN_FileLogger::validateAndSetPath(const char* newPath, bool isFfdc) {
    if (!newPath)
        return -1;
    struct stat status;
    if (stat(newPath, &status) == 0) {
        if (!S_ISREG(status.st_mode) || !(status.st_mode & S_IWUSR))
            return -1;
    } else if (errno != ENOENT) {
        return -1;
    }
    File_Handle opened = open_log_file(newPath);
    if (!opened)
        return -1;

    CLogger& logger = CLogger::instance();
    Auto_Mutex lock(logger.list_lock());
    path = newPath;
    ffdc = isFfdc;
    set_stream(std::move(opened));
    logger.refresh_interest();
    return 0;
}

// The system log.

VLN_SysLogger::VLN_SysLogger() {
    m_anyLevels = SYSLOG_LEVELS;
    openlog("[VLN][CIM][MPCA]", LOG_NDELAY | LOG_NOWAIT, LOG_USER);
    CLogger::instance().add_logger(this);
}

VLN_SysLogger::~VLN_SysLogger() {
    CLogger::instance().remove_logger(this);
    closelog();
}

void VLN_SysLogger::log(sint32 level, const char*, uint32, const char* text) {
    if (!wants(level) || !text)
        return;
    const std::string line = std::string("[") + text + "]\n";
    // Meant for two chatty callers. With the bracket in front it holds back nothing.
    if (line.compare(0, 15, "GetInterfaceState", 15) == 0 ||
        line.compare(0, 13, "GetIPAddressType", 13) == 0)
        return;
    constexpr int NO_PRIORITY = -1; // of what is no level
    // Through "%s": a percent sign in the text of a device must not become a directive.
    syslog(NO_PRIORITY, "%s", line.c_str());
}

// The ring.

VLN_CIMLogger::VLN_CIMLogger() {
    m_anyLevels = 0;
    m_ringLevels = RING_LEVELS;
}

void VLN_CIMLogger::log(sint32 level, const char*, uint32, const char* text) {
    if (!text || !wants(level))
        return;
    VLN_CIMLogEntry entry{static_cast<uint32>(level), Datetime::now(), {}};
    const std::string whole = to_utf8(std::string("[") + text + "]");
    const std::string_view shown = utf8_prefix(whole, sizeof entry.message - 1);
    shown.copy(entry.message, shown.size());
    ++next;
    if (m_entries.size() >= capacity)
        m_entries[next % capacity] = entry;
    else
        m_entries.push_back(entry);
}

void VLN_CIMLogger::clear() {
    m_entries.clear();
    next = 0xFFFFFFFFU;
}

std::vector<VLN_CIMLogEntry> VLN_CIMLogger::entries() const {
    Auto_Mutex lock(CLogger::instance().list_lock());
    return m_entries;
}

} // namespace cimple
