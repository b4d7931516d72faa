// A host in a folder of the test's own, and a clock that the test sets.
#ifndef TESTS_FOUNDATION_FIXTURE_H
#define TESTS_FOUNDATION_FIXTURE_H

#include "foundation/host_paths.h"
#include "foundation/logger.h"

#include <gtest/gtest.h>
#include <mutex>
#include <string>
#include <utility>
#include <vector>

namespace cimple {

class Foundation_Test : public testing::Test {
protected:
    void SetUp() override;
    void TearDown() override;

    static std::string read(const std::string& path);
    static std::string read(Host_File file) { return read(host_path(file)); }
    static void write(const std::string& path, const std::string& text);
    static void write(Host_File file, const std::string& text) { write(host_path(file), text); }
    static bool exists(Host_File file);
};

// A sink that wants every line.
class Log_Capture : public VLN_LoggerInterface {
public:
    Log_Capture() { CLogger::instance().add_logger(this); }
    ~Log_Capture() override { CLogger::instance().remove_logger(this); }

    void log(sint32 level, const char*, uint32, const char* text) override {
        const std::lock_guard guard(_lock);
        lines.emplace_back(level, text);
    }
    void open() override { ++opened; }
    void close() override { ++closed; }
    void clear() override { lines.clear(); }

    // How often the text was logged at the level, as the whole line.
    int count(sint32 level, const std::string& text) const;
    bool has(sint32 level, const std::string& text) const { return count(level, text) > 0; }

    std::vector<std::pair<sint32, std::string>> lines;
    int opened = 0;
    int closed = 0;

private:
    mutable std::mutex _lock; // others may still be logging while a test counts
};

} // namespace cimple

#endif // TESTS_FOUNDATION_FIXTURE_H
