#include "cimple/log.h"

#include "cimple/buffer.h"
#include "cimple/datetime.h"
#include "cimple/thread.h"

#include <atomic>
#include <cerrno>
#include <cstdarg>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <exception>
#include <fcntl.h>
#include <strings.h>
#include <sys/stat.h>
#include <unistd.h>

namespace cimple {

namespace {

const char* const LEVEL_WORDS[] = {"FATAL", "ERR", "WARN", "INFO", "DBG"};

constexpr int LEVEL_OFF = -1;
constexpr int LEVEL_UNKNOWN = 100; // the environment has not been read: every message looks
constexpr int MAX_RC_LINE = 1024;

constinit Process_Wide<Mutex> log_mutex(false, LOCK_RANK_LOG, "log"); // guards what follows
std::atomic<int> log_level{LEVEL_UNKNOWN};
std::FILE* log_stream = nullptr;
int lock_file = -1;

std::atomic<bool> enabled{true};

// A lock that other processes see. Closing the descriptor would drop it, so the file stays open.
void set_file_lock(short type) {
    struct flock request;
    std::memset(&request, 0, sizeof(request));
    request.l_type = type;
    request.l_whence = SEEK_SET;
    while (fcntl(lock_file, F_SETLKW, &request) == -1 && errno == EINTR)
        continue;
}

void trim_end(char* line) {
    std::size_t size = std::strlen(line);
    while (size > 0 && std::strchr(" \t\r\n", line[size - 1]))
        line[--size] = '\0';
}

const char* skip_blanks(const char* text) {
    return text + std::strspn(text, " \t");
}

// The level of a "LOG_LEVEL=word" line; false for any other line. An unknown word is LEVEL_OFF.
bool parse_level(const char* line, int& level) {
    constexpr char key[] = "LOG_LEVEL";
    if (std::strncmp(line, key, sizeof(key) - 1) != 0)
        return false;
    line = skip_blanks(line + sizeof(key) - 1);
    if (*line != '=')
        return false;
    line = skip_blanks(line + 1);
    level = LEVEL_OFF;
    for (int i = 0; i <= LL_DBG; i++)
        if (strcasecmp(line, LEVEL_WORDS[i]) == 0)
            level = i;
    return true;
}

int read_level(const char* home) {
    std::FILE* stream = std::fopen((String(home) + "/.cimplerc").c_str(), "re");
    if (!stream)
        return LEVEL_OFF;
    char line[MAX_RC_LINE];
    int level = LEVEL_OFF;
    while (std::fgets(line, sizeof(line), stream)) {
        trim_end(line);
        if (line[0] != '#' && line[0] != '\0' && parse_level(line, level))
            break;
    }
    std::fclose(stream);
    return level;
}

// Opens the log; the level stays off if any of it fails.
int open_log() {
    const char* home = std::getenv("CIMPLE_HOME");
    if (!home)
        return LEVEL_OFF;
    const int level = read_level(home);
    if (level == LEVEL_OFF)
        return LEVEL_OFF;
    const String folder = String(home) + "/.cimple";
    mkdir(folder.c_str(), 0777);
    log_stream = std::fopen((folder + "/messages").c_str(), "ae");
    if (!log_stream)
        return LEVEL_OFF;
    lock_file = open((folder + "/messages.lock").c_str(), O_RDWR | O_CREAT | O_CLOEXEC, 0666);
    return lock_file == -1 ? LEVEL_OFF : level;
}

// Under the mutex.
__attribute__((format(printf, 4, 0))) void write_line(Log_Level level, const char* file, int line,
                                                      const char* format, va_list args) {
    String when = Datetime::now().readable();
    const sint32 point = when.find('.');
    if (point >= 0)
        when.erase(static_cast<uint32>(point));

    Buffer text;
    text.format("%s %s: %s(%d): ", when.c_str(), LEVEL_WORDS[level], file, line);
    text.vformat(format, args);
    if (text.empty() || text.data()[text.size() - 1] != '\n')
        text.append('\n');

    set_file_lock(F_WRLCK);
    std::fwrite(text.data(), 1, text.size(), log_stream);
    std::fflush(log_stream);
    set_file_lock(F_UNLCK);
}

// An unloaded module leaves no open files behind.
__attribute__((destructor)) void close_log() {
    if (log_stream)
        std::fclose(log_stream);
    if (lock_file != -1)
        close(lock_file);
    log_stream = nullptr;
    log_level = LEVEL_OFF;
}

} // namespace

void log_msg(Log_Level level, const char* file, int line, const char* format, ...) {
    if (level > log_level.load(std::memory_order_relaxed))
        return;
    const No_Cancellation whole_line;
    va_list args;
    va_start(args, format);
    try {
        const Auto_Mutex guard(*log_mutex);
        if (log_level == LEVEL_UNKNOWN)
            log_level = open_log();
        if (level <= log_level)
            write_line(level, file, line, format, args);
    } catch (const std::exception&) {
        // A message lost for want of memory must not become its caller's failure.
    }
    va_end(args);
}

int set_log_enabled(bool flag) {
    return enabled.exchange(flag) == flag ? -1 : 0;
}

bool log_enabled() {
    return enabled.load(std::memory_order_relaxed);
}

} // namespace cimple
