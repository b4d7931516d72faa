#include "tests/foundation/foundation_fixture.h"

#include "foundation/common.h"

#include <filesystem>
#include <sys/statvfs.h>
#include <unistd.h>

namespace cimple {

class Log_Settings_Test : public Foundation_Test {
protected:
    CLogger& logger = CLogger::instance();
};

TEST_F(Log_Settings_Test, WhatIsSavedComesBack) {
    {
        Provider_Loggers loggers;
        logger.set_mode(LOG_MODE_BOTH);
        logger.set_level(3);
        logger.set_enabled();
        ASSERT_EQ(loggers.file().validateAndSetPath("saved.log", false), 0);
        logger.save_config();
    }
    EXPECT_EQ(read(Host_File::LOG_SETTINGS), "4,3,1\nsaved.log");
    EXPECT_EQ(logger.get_mode(), LOG_MODE_NONE) << "the logger is as new";

    Provider_Loggers loggers;
    loggers.start();
    EXPECT_EQ(logger.get_mode(), LOG_MODE_BOTH);
    EXPECT_EQ(logger.get_level(), 3);
    EXPECT_TRUE(logger.is_enabled());
    EXPECT_STREQ(loggers.file().get_path().c_str(), "saved.log");
    EXPECT_FALSE(logger.is_ffdc());
    EXPECT_NE(read("saved.log").find("][VLN_CRIT]  Continuing logs in Vorlan log provider. \n"),
              std::string::npos);
    std::filesystem::remove("saved.log");
}

TEST_F(Log_Settings_Test, FirstRunKeepsASmallLog) {
    Provider_Loggers loggers;
    loggers.start();
    EXPECT_TRUE(logger.is_enabled());
    EXPECT_TRUE(logger.is_ffdc());
    EXPECT_EQ(logger.get_mode(), LOG_MODE_FILE);
    VLN_LOG(VLN_DBG, "not this");
    VLN_LOG(VLN_ERR, "but this");
    const std::string text = read(Host_File::FFDC_LOG);
    EXPECT_EQ(text.find("not this"), std::string::npos);
    EXPECT_NE(text.find("but this"), std::string::npos);
    EXPECT_FALSE(exists(Host_File::LOG_SETTINGS)) << "nothing was configured";
}

TEST_F(Log_Settings_Test, FirstRunWithoutALogFolderGoesOn) {
    std::filesystem::remove_all(std::string(host_root()) + "/opt");
    Log_Capture capture;
    Provider_Loggers loggers;
    loggers.start();
    EXPECT_TRUE(capture.has(VLN_ERR, "validateAndSetPath() failed"));
    EXPECT_FALSE(exists(Host_File::FFDC_LOG));
}

TEST_F(Log_Settings_Test, ReadOnlyRootHasItsSettingsInVar) {
    VLN_Common::replace_statvfs([](const char*, struct statvfs* out) {
        *out = {};
        out->f_flag = ST_RDONLY;
        return 0;
    });
    write(Host_File::LOG_SETTINGS_VAR, "1,2,1\n");
    write(Host_File::LOG_SETTINGS, "0,5,0\n");
    logger.load_config();
    EXPECT_EQ(logger.get_mode(), LOG_MODE_RING);
    EXPECT_EQ(logger.get_level(), 2);
}

struct Bad_Settings {
    const char* text;
    const char* line; // with the file's name in place of %
    sint32 mode, level;
    bool enabled;
};

constexpr const char* NO_MODE = "Unable to read Log Mode from config data file - %";
constexpr const char* NO_LEVEL = "Unable to read Log Level from config data file - %";
constexpr const char* NO_ENABLED = "Unable to read Log Enabled from config data file - %";

// Every way to spoil the first line: fields before the bad one are taken, those behind it are not.
constexpr Bad_Settings BAD_SETTINGS[] = {
    {"", NO_MODE, 3, 1, false},
    {"\n", NO_MODE, 3, 1, false},
    {"nonsense\n", NO_MODE, 3, 1, false},
    {",,,\n", NO_MODE, 3, 1, false},
    {"5,2,1\n", "Invalid value for Log Mode from config data file -%-5", 3, 1, false},
    {"-1,2,1\n", "Invalid value for Log Mode from config data file -%-4294967295", 3, 1, false},
    {"99999999999,2,1\n", "Invalid value for Log Mode from config data file -%-2147483647", 3, 1,
     false},
    {"4", NO_LEVEL, 4, 1, false},
    {"4,", NO_LEVEL, 4, 1, false},
    {"4,x,1", NO_LEVEL, 4, 1, false},
    {"4,6,1\n", "Invalid value for Log Level from config data file -%-6", 4, 1, false},
    {"4,2\n", NO_ENABLED, 4, 2, false},
    {"4,2,\n", NO_ENABLED, 4, 2, false},
    {"4,2,-1\n", "Invalid value for Log Enabled from config data file - %", 4, 2, false},
    {"4,0000000000000000000000002,1\n", NO_ENABLED, 4, 0, false},
};

TEST_F(Log_Settings_Test, BadSettingsKeepWhatCameBeforeThem) {
    const std::string path = host_path(Host_File::LOG_SETTINGS);
    for (const Bad_Settings& bad : BAD_SETTINGS) {
        SCOPED_TRACE(bad.text);
        logger.reset();
        Log_Capture capture;
        logger.set_mode(LOG_MODE_OTHER);
        logger.set_level(1);
        write(Host_File::LOG_SETTINGS, bad.text);
        logger.load_config();
        std::string line(bad.line);
        line.replace(line.find('%'), 1, path);
        EXPECT_TRUE(capture.has(VLN_ERR, line));
        EXPECT_EQ(logger.get_mode(), bad.mode);
        EXPECT_EQ(logger.get_level(), bad.level);
        EXPECT_EQ(logger.is_enabled(), bad.enabled);
    }
}

TEST_F(Log_Settings_Test, TracePathLine) {
    struct Case {
        const char* text;
        const char* path;
    };
    constexpr Case CASES[] = {
        {"2,5,1\npath.log", "path.log"},
        {"2,5,1\npath.log\r\n", "path.log"},
        {"2,5,1\npath.log\nmore\n", "path.log"},
        {"2,5,1\n", ""},
        {"2,5,1", ""},
        {"2,5,1\n\n", ""},
        {"2,5,1\nno/such/folder\n", ""},
        {"1,5,1\npath.log\n", ""}, // the ring needs no path
    };
    for (const Case& c : CASES) {
        SCOPED_TRACE(c.text);
        logger.reset();
        VLN_FileLogger file;
        logger.add_logger(&file);
        write(Host_File::LOG_SETTINGS, c.text);
        logger.load_config();
        EXPECT_STREQ(file.get_path().c_str(), c.path);
        EXPECT_TRUE(logger.is_enabled());
    }
    std::filesystem::remove("path.log");
}

TEST_F(Log_Settings_Test, MissingAndUnwritableSettingsAreLogged) {
    Log_Capture capture;
    logger.load_config();
    EXPECT_TRUE(capture.has(VLN_CRIT, "File access failed with No such file or directory"));
    std::filesystem::remove_all(std::string(host_root()) + "/etc");
    logger.save_config();
    EXPECT_TRUE(capture.has(VLN_ERR, "Unable to open dump file\n"));
}

} // namespace cimple
