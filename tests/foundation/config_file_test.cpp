#include "tests/foundation/foundation_fixture.h"

#include "foundation/config_file.h"

#include <filesystem>

namespace cimple {

class Config_File_Test : public Foundation_Test {
protected:
    const std::string path = host_path(Host_File::TUNING);
};

TEST_F(Config_File_Test, MissingFileGivesDefaultsAndIsWrittenAtTheEnd) {
    {
        VlnConfigFile config;
        config.load(path.c_str());
        EXPECT_EQ(config.get_cache_timeout(), 10U);
        EXPECT_FALSE(config.get_refresh_adapter());
        EXPECT_TRUE(config.get_refresh_san());
        EXPECT_EQ(config.set_cache_timeout(30), 0);
        EXPECT_EQ(config.set_refresh_adapter(1), 0);
        EXPECT_EQ(config.set_refresh_san(0), 0);
        EXPECT_FALSE(exists(Host_File::TUNING)) << "a change stays in memory";
    }
    EXPECT_EQ(read(path), "##################################################\n"
                          "# Vorlan HBA CIM Provider Configuration Settings #\n"
                          "##################################################\n"
                          "VLN_PROVIDER_CACHE_TIMEOUT = 30\n"
                          "VLN_PROVIDER_REFRESH_ADAPTERDATA = TRUE\n"
                          "VLN_PROVIDER_REFRESH_SANDATA = FALSE\n");
    VlnConfigFile config;
    config.load(path.c_str());
    EXPECT_EQ(config.get_cache_timeout(), 30U);
    EXPECT_TRUE(config.get_refresh_adapter());
    EXPECT_FALSE(config.get_refresh_san());
}

TEST_F(Config_File_Test, ObjectThatLoadedNothingWritesNothing) {
    {
        VlnConfigFile config;
        config.load(nullptr);
    }
    EXPECT_TRUE(std::filesystem::is_empty(std::string(host_root()) + "/etc"));
}

struct Tuning_Case {
    std::string text;
    uint32 timeout;
    bool adapter, san;
};

TEST_F(Config_File_Test, Lines) {
    const Tuning_Case cases[] = {
        {"VLN_PROVIDER_CACHE_TIMEOUT = 31\nVLN_PROVIDER_CACHE_TIMEOUT = 7\n"
         "VLN_PROVIDER_CACHE_TIMEOUT = 8\n",
         7, false, true},
        {"VLN_PROVIDER_CACHE_TIMEOUT=1", 1, false, true},
        {"VLN_PROVIDER_CACHE_TIMEOUT = 0\nVLN_PROVIDER_CACHE_TIMEOUT = -5\n"
         "VLN_PROVIDER_CACHE_TIMEOUT = many\nVLN_PROVIDER_CACHE_TIMEOUT =\n"
         "VLN_PROVIDER_CACHE_TIMEOUT\nVLN_PROVIDER_CACHE_TIMEOUT = 4294967301\n",
         10, false, true},
        {"# VLN_PROVIDER_CACHE_TIMEOUT = 5\n  # VLN_PROVIDER_CACHE_TIMEOUT = 5\n", 10, false, true},
        {"vln_provider_cache_timeout = 5\nXVLN_PROVIDER_CACHE_TIMEOUT = 5\n= 5\n=\n", 10, false,
         true},
        {"  VLN_PROVIDER_REFRESH_ADAPTERDATA\t=  TRUE  \t\r\n"
         "VLN_PROVIDER_REFRESH_SANDATA = FALSE ",
         10, true, false},
        {"VLN_PROVIDER_REFRESH_ADAPTERDATA = true\nVLN_PROVIDER_REFRESH_ADAPTERDATA = TRUE!\n"
         "VLN_PROVIDER_REFRESH_ADAPTERDATA = 1\nVLN_PROVIDER_REFRESH_SANDATA = FALSE = TRUE\n",
         10, false, true},
        {"VLN_PROVIDER_REFRESH_SANDATA = maybe\nVLN_PROVIDER_REFRESH_SANDATA = FALSE\n"
         "VLN_PROVIDER_REFRESH_SANDATA = TRUE\n",
         10, false, false},
        {std::string(5000, 'x') + "\n\0binary = 1\n" + std::string(2000, ' ') +
             "VLN_PROVIDER_CACHE_TIMEOUT = 5\n"
             "VLN_PROVIDER_CACHE_TIMEOUT = 6\n",
         6, false, true},
    };
    for (const Tuning_Case& c : cases) {
        SCOPED_TRACE(c.text);
        write(path, c.text);
        VlnConfigFile config;
        config.load(path.c_str());
        EXPECT_EQ(config.get_cache_timeout(), c.timeout);
        EXPECT_EQ(config.get_refresh_adapter(), c.adapter);
        EXPECT_EQ(config.get_refresh_san(), c.san);
    }
}

TEST_F(Config_File_Test, WebLaunchAddress) {
    const std::string file = host_path(Host_File::WEB_LAUNCH);
    Log_Capture capture;
    EXPECT_EQ(readWebLaunchURL(file.c_str()), "");
    EXPECT_TRUE(capture.has(VLN_INFO, "WebLaunch config file '" + file + "' not found."));
    const std::pair<std::string, std::string> cases[] = {
        {"", ""},
        {"\n\n# only a comment\n   # another\n", ""},
        {"# where\n\n  \t https://host:8443/launch?a=#b \nhttps://second\n",
         "https://host:8443/launch?a=#b "},
        {"https://no-end-of-line", "https://no-end-of-line"},
        {"# from another system\r\n\r\nhttps://host/\r\n", "https://host/"},
        {std::string(300, 'h'), std::string(256, 'h')},
    };
    for (const auto& [text, address] : cases) {
        write(file, text);
        EXPECT_EQ(readWebLaunchURL(file.c_str()), address) << text;
    }
}

} // namespace cimple
