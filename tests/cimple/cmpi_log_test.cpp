// The engine's message log. It reads its environment once in a process, so that each case runs in a
// process of its own, which the parent looks at afterwards.
#include "cimple/log.h"
#include "tests/cimple/cmpi_fixture.h"

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <regex.h>
#include <sstream>

namespace cimple {

namespace {

class Log_Death_Test : public Cmpi_Test {
protected:
    Log_Death_Test() : home(std::filesystem::current_path() / "log_home") {
        GTEST_FLAG_SET(death_test_style, "threadsafe");
    }
    ~Log_Death_Test() override { GTEST_FLAG_SET(death_test_style, "fast"); }

    // Runs the body in a process with this settings file, and answers its log; "-" if there is
    // none.
    template <class Body>
    std::string log_of(const char* settings, Body body) {
        EXPECT_EXIT(
            {
                prepare(settings);
                body();
                std::exit(0);
            },
            testing::ExitedWithCode(0), "");
        std::ifstream stream(home + "/.cimple/messages");
        std::stringstream text;
        text << stream.rdbuf();
        const bool written = stream.is_open();
        std::filesystem::remove_all(home);
        return written ? text.str() : "-";
    }
    void prepare(const char* settings) {
        std::filesystem::create_directory(home);
        if (settings) {
            std::ofstream(home + "/.cimplerc") << settings;
            setenv("CIMPLE_HOME", home.c_str(), 1);
        } else {
            unsetenv("CIMPLE_HOME");
        }
    }
    const std::string home; // below the test's own folder
};

void one_of_each() {
    CIMPLE_ERR("an error\n");
    CIMPLE_WARN("a warning");
    CIMPLE_DBG("detail %d", 7);
}

bool matches(const std::string& text, const char* pattern) {
    regex_t regex;
    EXPECT_EQ(regcomp(&regex, pattern, REG_EXTENDED | REG_NOSUB), 0);
    const bool found = regexec(&regex, text.c_str(), 0, nullptr, 0) == 0;
    regfree(&regex);
    return found;
}

TEST_F(Log_Death_Test, LinesUpToTheLevel) {
    const std::string log =
        log_of("# a comment\n\nOTHER=1\nLOG_LEVEL = warn \nLOG_LEVEL=DBG\n", one_of_each);
    EXPECT_TRUE(matches(log, "^[0-9]{4}/[0-9]{2}/[0-9]{2} [0-9]{2}:[0-9]{2}:[0-9]{2} ERR: "
                             "[^ ]*log_test.cpp\\([0-9]+\\): an error\n"
                             "[0-9/]+ [0-9:]+ WARN: [^ ]+: a warning\n$"))
        << log;
}

TEST_F(Log_Death_Test, OffUnlessTurnedOn) {
    for (const char* settings :
         {static_cast<const char*>(nullptr), "", "LOG_LEVEL=LOUD\nLOG_LEVEL=DBG\n", "LOG_LEVEL\n",
          " LOG_LEVEL=DBG\n"})
        EXPECT_EQ(log_of(settings, one_of_each), "-") << (settings ? settings : "no CIMPLE_HOME");
}

// Warnings of the conversion have a switch of their own.
TEST_F(Log_Death_Test, WarningsCanBeSwitchedOff) {
    const std::string log = log_of("LOG_LEVEL=DBG\n", [] {
        if (set_log_enabled(true) != -1 || set_log_enabled(false) != 0)
            std::_Exit(1);
        one_of_each();
    });
    EXPECT_EQ(log.find("a warning"), std::string::npos);
    EXPECT_NE(log.find("detail 7"), std::string::npos);
}

// The trace of calls tells more than the answers do.
TEST_F(Log_Death_Test, CallsAreTraced) {
    const std::string log = log_of("LOG_LEVEL=DBG\n", [this] {
        const host::ObjectPath unknown = {"root/test", "No_Such_Class", {}};
        for (int operation : {OP_ENUM_ASSOCIATOR_NAMES, OP_ENUM_ASSOCIATORS})
            if (ask({operation, "Test_Link", unknown}).rc != 0)
                std::_Exit(1);
        script.instances = {make_link(create_null<Test_Root>(), make_base("gone", 1))};
        script.status = {{OP_ENUM_ASSOCIATOR_NAMES, ENUM_ASSOCIATOR_NAMES_UNSUPPORTED},
                         {OP_ENUM_ASSOCIATORS, ENUM_ASSOCIATORS_UNSUPPORTED}};
        ask({OP_ENUM_ASSOCIATORS, "Test_Link", {"root/test", "Test_Root", {}}});
        ask({.operation = OP_INVOKE_METHOD,
             .class_name = "Test_Service",
             .path = unknown,
             .method = "Run"});
        core->module.cleanup(*core, true);
    });
    for (const char* line : {
             "enter: cimple_cmpi_adapter()\n",
             "return: associatorNames(): CMPI_RC_ERR_INVALID_CLASS\n",
             "return: associators(): CMPI_RC_OK\n",
             "an associator of class Test_Base was not found: 6\n",
             "return: invokeMethod(): CMPI_RC_ERR_FAILED MetaClass not found\n",
             "return: cleanup(): CMPI_RC_OK cleanup unload\n",
             "enter: ~CMPI_Adapter()\n",
         })
        EXPECT_NE(log.find(line), std::string::npos) << line << "in\n" << log;
}

} // namespace

} // namespace cimple
