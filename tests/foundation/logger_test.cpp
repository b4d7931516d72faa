#include "tests/foundation/foundation_fixture.h"

#include "foundation/device_log.h"

#include <cstdarg>
#include <filesystem>
#include <sys/stat.h>
#include <thread>
#include <unistd.h>

namespace {

std::vector<std::pair<int, std::string>> system_log;

} // namespace

// What reaches the system log of the host.
extern "C" __attribute__((format(printf, 2, 3))) void syslog(int priority, const char* format,
                                                             ...) {
    char text[256];
    va_list arguments;
    va_start(arguments, format);
    std::vsnprintf(text, sizeof text, format, arguments);
    va_end(arguments);
    system_log.emplace_back(priority, text);
}

namespace cimple {

class Logger_Test : public Foundation_Test {
protected:
    CLogger& logger = CLogger::instance();
};

TEST_F(Logger_Test, DisabledLoggerWithSystemLogWritesNowhere) {
    Provider_Loggers loggers;
    ASSERT_EQ(loggers.file().validateAndSetPath("trace.log", false), 0);
    logger.set_mode(LOG_MODE_BOTH);
    VLN_LOG(VLN_ERR, "nobody hears this");
    EXPECT_EQ(read("trace.log"), "");
    EXPECT_TRUE(loggers.ring().entries().empty());
    logger.set_enabled();
    VLN_LOG(VLN_ERR, "everybody hears this");
    EXPECT_NE(read("trace.log").find("everybody"), std::string::npos);
    EXPECT_EQ(loggers.ring().entries().size(), 1U);
    std::filesystem::remove("trace.log");
}

// Without a system logger there is nobody to keep a disabled logger's lines.
TEST_F(Logger_Test, DisabledLoggerWithoutSystemLogReachesItsSinks) {
    Log_Capture capture;
    VLN_LOG(VLN_DBG, "value %d", 7);
    EXPECT_TRUE(capture.has(VLN_DBG, "value 7"));
}

TEST_F(Logger_Test, ArgumentsAreEvaluatedOnlyForAnInterestedSink) {
    Provider_Loggers loggers;
    int evaluated = 0;
    logger.set_enabled();
    logger.set_mode(LOG_MODE_RING);
    VLN_LOG(VLN_INFO, "%d", ++evaluated);
    EXPECT_EQ(evaluated, 0);
    VLN_LOG(VLN_ERR, "%d", ++evaluated);
    EXPECT_EQ(evaluated, 1);
    logger.set_mode(LOG_MODE_OTHER);
    VLN_LOG(VLN_CRIT, "%d", ++evaluated);
    EXPECT_EQ(evaluated, 1);
}

TEST_F(Logger_Test, FileRecordHasItsForm) {
    VLN_FileLogger file;
    logger.add_logger(&file);
    logger.set_mode(LOG_MODE_FILE);
    ASSERT_EQ(file.validateAndSetPath("record.log", false), 0);
    const int line = __LINE__ + 1;
    VLN_LOG(VLN_WARN, "text %s", "here");
    const std::string thread = std::to_string(static_cast<unsigned>(pthread_self()));
    EXPECT_EQ(read("record.log"),
              "[threadid =" + thread + "l] [" + Datetime::now().readable().c_str() +
                  "] [logger_test.cpp:" + std::to_string(line) + "][VLN_WARN] text here\n");
    std::filesystem::remove("record.log");
}

TEST_F(Logger_Test, FfdcFileKeepsCriticalAndErrorRecordsOnly) {
    VLN_FileLogger file;
    logger.add_logger(&file);
    logger.set_mode(LOG_MODE_FILE);
    ASSERT_EQ(file.validateAndSetPath("ffdc.log", true), 0);
    for (sint32 level = VLN_CRIT; level <= VLN_DBG; ++level)
        VLN_LOG(level, "level%d", level);
    const std::string text = read("ffdc.log");
    for (sint32 level = VLN_CRIT; level <= VLN_DBG; ++level)
        EXPECT_EQ(text.find("level" + std::to_string(level)) != std::string::npos,
                  level == VLN_CRIT || level == VLN_ERR)
            << level;
    std::filesystem::remove("ffdc.log");
}

TEST_F(Logger_Test, ALineOfAnyLengthIsWhole) {
    Log_Capture capture;
    const std::string text(100000, 'x');
    VLN_LOG(VLN_ERR, "%s!", text.c_str());
    ASSERT_EQ(capture.lines.size(), 1U);
    EXPECT_EQ(capture.lines[0].second, text + "!");
}

TEST_F(Logger_Test, RingKeepsTheNewest1024Records) {
    VLN_CIMLogger ring;
    logger.add_logger(&ring);
    logger.set_mode(LOG_MODE_RING);
    VLN_LOG(VLN_INFO, "too chatty for the ring");
    for (int i = 0; i < 1024; ++i)
        VLN_LOG(VLN_ERR, "record %d", i);
    EXPECT_STREQ(ring.entries().front().message, "[record 0]");
    VLN_LOG(VLN_CRIT, "record 1024");
    const auto entries = ring.entries();
    ASSERT_EQ(entries.size(), 1024U);
    EXPECT_STREQ(entries[0].message, "[record 1024]");
    EXPECT_EQ(entries[0].level, static_cast<uint32>(VLN_CRIT));
    EXPECT_STREQ(entries[1].message, "[record 1]");

    logger.clear_all();
    VLN_LOG(VLN_ERR, "%s", std::string(500, 'y').c_str());
    ASSERT_EQ(ring.entries().size(), 1U);
    EXPECT_EQ(std::string(ring.entries()[0].message), "[" + std::string(198, 'y'));
    logger.remove_logger(&ring);
}

TEST_F(Logger_Test, SystemLogTakesOnlyWhatIsBelowTheLevelsOfCallers) {
    system_log.clear();
    VLN_SysLogger syslogger;
    EXPECT_EQ(logger.add_logger(&syslogger), 0) << "it adds itself";
    for (sint32 level = VLN_CRIT; level <= VLN_DBG; ++level)
        VLN_LOG(level, "level %d", level);
    EXPECT_TRUE(system_log.empty());
    VLN_LOG(VLN_INVALID, "GetInterfaceState %s", "100%n");
    ASSERT_EQ(system_log.size(), 1U);
    EXPECT_EQ(system_log[0], std::make_pair(-1, std::string("[GetInterfaceState 100%n]\n")));
}

TEST_F(Logger_Test, AddingTwiceRemovingTwiceAndModes) {
    Log_Capture capture;
    EXPECT_EQ(logger.add_logger(&capture), 0);
    logger.apply_mode(LOG_MODE_FILE);
    logger.apply_mode(LOG_MODE_NONE);
    EXPECT_EQ(capture.opened, 1);
    EXPECT_EQ(capture.closed, 1);
    EXPECT_EQ(logger.remove_logger(&capture), 1);
    EXPECT_EQ(logger.remove_logger(&capture), 0);
    for (sint32 level : {0, 6, -1, 100})
        logger.set_level(level);
    EXPECT_EQ(logger.get_level(), 0);
    logger.set_level(5);
    EXPECT_EQ(logger.get_level(), 5);
}

TEST_F(Logger_Test, FileLoggerOpensClosesAndClears) {
    VLN_FileLogger file;
    logger.add_logger(&file);
    ASSERT_EQ(file.validateAndSetPath("life.log", false), 0);
    logger.apply_mode(LOG_MODE_FILE);
    VLN_LOG(VLN_ERR, "one");
    logger.clear_all();
    EXPECT_EQ(read("life.log"), "");
    VLN_LOG(VLN_ERR, "two");
    EXPECT_NE(read("life.log").find("two"), std::string::npos);
    logger.apply_mode(LOG_MODE_NONE);
    EXPECT_TRUE(file.get_path().empty());
    logger.apply_mode(LOG_MODE_FILE); // no path any more: nothing to write to
    VLN_LOG(VLN_ERR, "three");
    EXPECT_EQ(read("life.log").find("three"), std::string::npos);
    std::filesystem::remove("life.log");
}

TEST_F(Logger_Test, PathsThatAreNoLogAreRefusedAndTheFormerOneStays) {
    namespace fs = std::filesystem;
    fs::remove_all("paths");
    fs::create_directory("paths");
    VLN_FileLogger file;
    ASSERT_EQ(file.validateAndSetPath("paths/good.log", false), 0);
    write("paths/locked.log", "");
    chmod("paths/locked.log", 0444);
    ASSERT_EQ(mkfifo("paths/pipe", 0600), 0);
    for (const auto& [link, target] :
         {std::pair("own", "other.log"), std::pair("own-own", "own"),
          std::pair("foreign", "good.log"), std::pair("new", "/none/x"),
          std::pair("own-foreign", "foreign"), std::pair("loop", "loop"),
          std::pair("to-device", "/dev/null")})
        fs::create_symlink(target, fs::path("paths") / link);
    std::vector<std::string> bad = {
        "",           "no/such/folder/log", "paths",      "paths/good.log/below",
        "/dev/null",  "paths/locked.log",   "paths/pipe", "paths/to-device",
        "paths/loop", "paths/new"};
    if (lchown("paths/foreign", 1, 1) == 0) // root's to do
        bad.insert(bad.end(), {"paths/foreign", "paths/own-foreign"});
    EXPECT_EQ(file.validateAndSetPath(nullptr, false), -1);
    for (const std::string& path : bad)
        EXPECT_EQ(file.validateAndSetPath(path.c_str(), false), -1) << path;
    EXPECT_STREQ(file.get_path().c_str(), "paths/good.log");
    EXPECT_EQ(file.validateAndSetPath("paths/own-own", false), 0);
    EXPECT_TRUE(fs::exists("paths/other.log"));
    fs::remove_all("paths");
}

// The name is looked at each time that it is opened.
TEST_F(Logger_Test, APathThatIsExchangedIsNeitherOpenedNorEmptied) {
    namespace fs = std::filesystem;
    write("precious", "kept");
    VLN_FileLogger file;
    logger.add_logger(&file);
    ASSERT_EQ(file.validateAndSetPath("life.log", false), 0);
    fs::remove("life.log");
    fs::create_symlink("precious", "life.log");
    if (lchown("life.log", 1, 1) == 0) {
        logger.apply_mode(LOG_MODE_FILE);
        VLN_LOG(VLN_ERR, "a line");
        logger.clear_all();
        EXPECT_EQ(read("precious"), "kept");
    }
    fs::remove("life.log");
    fs::remove("precious");
}

TEST_F(Logger_Test, ThreadsLogWhileThePathChanges) {
    VLN_FileLogger file;
    logger.add_logger(&file);
    logger.set_mode(LOG_MODE_FILE);
    std::vector<std::thread> threads;
    for (int t = 0; t < 4; ++t)
        threads.emplace_back([t] {
            for (int i = 0; i < 200; ++i)
                VLN_LOG(VLN_ERR, "thread %d line %d", t, i);
        });
    for (int i = 0; i < 50; ++i)
        file.validateAndSetPath(i % 2 ? "a.log" : "b.log", false);
    for (std::thread& thread : threads)
        thread.join();
    for (const char* path : {"a.log", "b.log"}) {
        const std::string text = read(path);
        EXPECT_TRUE(text.empty() || text.back() == '\n') << path;
        std::filesystem::remove(path);
    }
}

TEST(DeviceLog, TakesLinesUntilItIsFull) {
    DeviceLog log(2);
    EXPECT_EQ(log.Handlelog(""), 0);
    EXPECT_EQ(log.Handlelog("one"), 0);
    EXPECT_EQ(log.Handlelog("two"), 0);
    EXPECT_EQ(log.Handlelog(""), 0);
    EXPECT_EQ(log.Handlelog("three"), 1);
    EXPECT_EQ(log.lines(), (std::vector<std::string>{"one", "two"}));
    log.clear();
    EXPECT_EQ(log.Handlelog("four"), 0);
}

} // namespace cimple
