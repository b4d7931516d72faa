#include "tests/agent/agent_fixture.h"

#include "derivedObjects/pattern.h"
#include "device/library/axapi.h"
#include "device/library/runtime_loader.h"

#include <cstring>

namespace cimple {

// ---- Library ----

std::atomic<bool> Fake_Library::present{true};
std::atomic<int> Fake_Library::scans{0};
uint32 Fake_Library::kept_dumps = 0;

namespace {

AX_STATUS init_library() {
    return AX_STATUS_OK;
}

AX_STATUS list_instances(uint32_t* count, uint32_t*) {
    ++Fake_Library::scans;
    *count = 0;
    return AX_STATUS_OK;
}

AX_STATUS keep_dumps(AX_WWN, uint32_t count) {
    Fake_Library::kept_dumps = count;
    return AX_STATUS_OK;
}

char library_handle;

void* open_library(const char* file, int) {
    return Fake_Library::present && std::strcmp(file, "liblaxapi.so") == 0 ? &library_handle
                                                                           : nullptr;
}

void* find_symbol(void* handle, const char* name) {
    if (handle != &library_handle)
        return nullptr;
    if (std::strcmp(name, "LAX_InitLib") == 0)
        return reinterpret_cast<void*>(&init_library);
    if (std::strcmp(name, "AX_GetAllLocalHBAInstances") == 0)
        return reinterpret_cast<void*>(&list_instances);
    if (std::strcmp(name, "LAX_SetDumpRetentionCount") == 0)
        return reinterpret_cast<void*>(&keep_dumps);
    return nullptr;
}

int close_library(void*) {
    return 0;
}

char* loader_error() {
    static char text[] = "no such library";
    return text;
}

constexpr Loader_Calls FAKE_LOADER = {open_library, find_symbol, close_library, loader_error};

// ---- Clock ----

std::atomic<uint64> present_time{0};

constexpr Time::Clock STANDING_CLOCK = {
    [] { return present_time.load(); },
    [](uint64 usec) { present_time += usec; },
};

} // namespace

// ---- Agent ----

void Agent_Test::SetUp() {
    Foundation_Test::SetUp();
    write(Host_File::KERNEL_VERSION, "Linux version 6.1.0\n");
    write(Host_File::DISTRIBUTION, "Debian GNU/Linux 12\n");
    present_time = START;
    Time::replace_clock(&STANDING_CLOCK);
    Fake_Library::present = true;
    Fake_Library::scans = 0;
    VLN_Runtime_Loader::setCalls(&FAKE_LOADER);
}

void Agent_Test::TearDown() {
    EXPECT_EQ(ProviderAgent::current(), nullptr) << "the test leaves an agent behind";
    VLN_Runtime_Loader::setCalls(nullptr);
    Foundation_Test::TearDown();
}

void Agent_Test::advance(uint64 usec) {
    present_time += usec;
}

void Agent_Test::settle(ProviderAgent& agent) {
    for (;;) {
        {
            Auto_Mutex lock(agent.m_DataFetchMutex);
            if (!agent.m_bDataFetchRunning)
                return;
        }
        std::this_thread::yield();
    }
}

int Agent_Test::refreshes_started(ProviderAgent& agent) {
    settle(agent);
    Agent_Log log;
    agent.BuildCimpleInfo();
    settle(agent);
    return log.count(VLN_DBG, "PERF: DataFetch_Handler Thread BEGIN");
}

Loaded_Agent::Loaded_Agent() {
    EXPECT_EQ(pattern_load(pattern_table[0]), PROVIDER_OK);
}

Long_Operation::Long_Operation(ProviderAgent& agent) {
    std::promise<void> begun;
    _thread = std::thread([this, &agent, &begun] {
        Auto_Mutex data(agent.m_DataMutex);
        begun.set_value();
        _end.get_future().wait();
    });
    begun.get_future().wait();
}

void Long_Operation::end() {
    if (!_thread.joinable())
        return;
    _end.set_value();
    _thread.join();
}

int count_instances(const Meta_Class& meta_class) {
    struct Counter {
        int delivered = 0;
        static bool take(const Instance* instance, sint32, void* self) {
            ++static_cast<Counter*>(self)->delivered;
            unref(instance);
            return true;
        }
    } counter;
    for (const Pattern_Row& row : pattern_table)
        if (row.meta_class == &meta_class)
            return pattern_enum_instances(row, {&Counter::take, &counter}) == ENUM_INSTANCES_OK
                       ? counter.delivered
                       : -1;
    return -1;
}

} // namespace cimple
