// What the tests of the agent stand on, beside a host in a folder: a clock that stands still till
// it is set, and a management library without adapters.
#ifndef TESTS_AGENT_AGENT_FIXTURE_H
#define TESTS_AGENT_AGENT_FIXTURE_H

#include "agent/provider_agent.h"
#include "cimple/registration.h"
#include "derivedObjects/pattern.h"
#include "tests/foundation/foundation_fixture.h"

#include <atomic>
#include <future>
#include <thread>

namespace cimple {

// Keeps what the agent's logger gets while it lives, whatever its settings.
struct Agent_Log : Log_Capture {
    Agent_Log() { CLogger::instance().set_enabled(); }
};

// The management library that the loader finds: it initialises, and lists no adapters.
struct Fake_Library {
    static std::atomic<bool> present;
    static std::atomic<int> scans; // AX_GetAllLocalHBAInstances asked
    static uint32 kept_dumps;      // what AX_SetDumpRetentionCount was told last
};

class Agent_Test : public Foundation_Test {
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
