// What the tests of the agent stand on: a host in a folder, a clock that stands still, a management
// library without adapters, and the log's lines.
#ifndef TESTS_AGENT_AGENT_FIXTURE_H
#define TESTS_AGENT_AGENT_FIXTURE_H

#include "agent/provider_agent.h"
#include "cimple/registration.h"
#include "derivedObjects/pattern.h"
#include "foundation/logger.h"

#include <gtest/gtest.h>

#include <atomic>
#include <future>
#include <mutex>
#include <string>
#include <thread>
#include <utility>
#include <vector>

namespace cimple {

// Keeps what is logged while it lives.
class Log_Capture : public VLN_LoggerInterface {
public:
    Log_Capture();
    ~Log_Capture() override;

    void log(sint32 level, const char* file, uint32 line, const char* text) override;
    void open() override {}
    void close() override {}
    void clear() override {}

    // How often the text was logged at the level, as the whole line.
    int count(sint32 level, const std::string& text) const;

private:
    mutable std::mutex _lock; // a refresh may still be logging while a test counts
    std::vector<std::pair<sint32, std::string>> _lines;
};

// The management library that the loader finds: it initialises, and lists no adapters.
struct Fake_Library {
    static std::atomic<bool> present;
    static std::atomic<int> scans; // AX_GetAllLocalHBAInstances asked
    static uint32 kept_dumps;      // what AX_SetDumpRetentionCount was told last
};

class Agent_Test : public ::testing::Test {
protected:
    static constexpr uint64 START = 1700000000ull * 1000000;
    static constexpr uint64 MINUTE = 60000000;

    void SetUp() override;
    void TearDown() override;

    static void advance(uint64 usec);
    // Waits, on no clock, until no refresh runs.
    static void settle(ProviderAgent& agent);
    // How many refreshes a call starts: 0 or 1.
    static int refreshes_started(ProviderAgent& agent);
};

// The agent with one reference, as a loaded class provider holds it.
class Loaded_Agent {
public:
    Loaded_Agent();
    ~Loaded_Agent() { pattern_unload(pattern_table[0]); }
    ProviderAgent* operator->() const { return ProviderAgent::current(); }
    ProviderAgent& operator*() const { return *ProviderAgent::current(); }
};

// Keeps m_DataMutex locked, on a thread of its own as a long operation does, until it is let go.
class Long_Operation {
public:
    explicit Long_Operation(ProviderAgent& agent);
    ~Long_Operation() { end(); }
    void end();

private:
    std::promise<void> _end;
    std::thread _thread;
};

// Enumerates a class of the pattern; -1 if the status was not 0.
int count_instances(const Meta_Class& meta_class);

} // namespace cimple

#endif // TESTS_AGENT_AGENT_FIXTURE_H
