// The binding against real shared libraries: load order, log lines, arguments by value, reload.
#include "device/library/bound_functions.h"
#include "device/library/runtime_loader.h"
#include "tests/device/log_capture.h"

#include <cstring>
#include <dlfcn.h>
#include <gtest/gtest.h>
#include <thread>

using namespace cimple;

namespace {

// The hosts are folders; the bare file names of the loader are opened in one of them.
std::string g_host;
std::vector<std::string> g_opened;
int g_openMode;
bool g_closeFails;

void* openInHost(const char* file, int mode) {
    g_opened.emplace_back(file);
    g_openMode = mode;
    return dlopen((std::string(TEST_HOSTS) + "/" + g_host + "/" + file).c_str(), mode);
}

int closeOrFail(void* handle) {
    return g_closeFails ? dlclose(handle), -1 : dlclose(handle);
}

const Loader_Calls HOST_CALLS{openInHost, dlsym, closeOrFail, dlerror};

const AX_WWN WWN{{0x01020304, 0x05060708}};

class Binding : public testing::Test {
protected:
    void SetUp() override {
        VLN_Runtime_Loader::setCalls(&HOST_CALLS);
        g_opened.clear();
        g_closeFails = false;
        log_capture::take();
    }
    void TearDown() override {
        unloadRuntimeLibraries();
        VLN_Runtime_Loader::setCalls(nullptr);
    }

    static uint32 load(const char* host) {
        g_host = host;
        return loadRuntimeLibraries();
    }
    static AX_STATUS feature() {
        uint32 value = 0;
        return AX_GetHBAFeature(WWN, 1, &value);
    }
};

using Names = std::vector<std::string>;

int dlopenFailures(const Names& lines) {
    int n = 0;
    for (const auto& line : lines)
        n += line.rfind("3:dlopen failed :", 0) == 0;
    return n;
}

} // namespace

TEST_F(Binding, LoadsLocalLibraryAndLeavesTheOther) {
    EXPECT_EQ(load("both"), 0U);
    EXPECT_EQ(g_opened, (Names{"libHBAAPI.so.2", "liblaxapi.so"}));
    EXPECT_EQ(g_openMode, RTLD_NOW);
    EXPECT_EQ(dlopenFailures(log_capture::take()), 0);
    EXPECT_EQ(feature(), 201U); // LAX_ name
    EXPECT_EQ(LAX_Ini_GetRouteTable(WWN, nullptr), 202U);
    EXPECT_EQ(AX_ValidateWwn(WWN), 204U); // AX_ name
    EXPECT_EQ(HBA_LoadLibrary(), 105U);
    EXPECT_FALSE(VLN_Runtime_Loader::missing(SLOT_LOCAL));
    // Not looked for, and not a flag either.
    EXPECT_FALSE(VLN_Runtime_Loader::missing(SLOT_MANAGEMENT));
}

TEST_F(Binding, FallsBackToOtherNamesAndLibraries) {
    EXPECT_EQ(load("older"), 1U);
    EXPECT_EQ(g_opened, (Names{"libHBAAPI.so.2", "libHBAAPI.so", "liblaxapi.so", "libaxapi.so"}));
    EXPECT_EQ(dlopenFailures(log_capture::take()), 2);
    EXPECT_FALSE(VLN_Runtime_Loader::missing(SLOT_HBA));
    EXPECT_TRUE(VLN_Runtime_Loader::missing(SLOT_LOCAL));
    EXPECT_EQ(feature(), 501U); // the LAX_ name comes first here too
    EXPECT_EQ(HBA_LoadLibrary(), 405U);
}

TEST_F(Binding, NoLibraryAtAll) {
    EXPECT_EQ(load("nowhere"), 0U);
    EXPECT_EQ(dlopenFailures(log_capture::take()), 4);
    for (auto slot : {SLOT_HBA, SLOT_LOCAL, SLOT_MANAGEMENT})
        EXPECT_TRUE(VLN_Runtime_Loader::missing(slot));
    EXPECT_TRUE(VLN_Runtime_Loader::isCpqfcLibraryPresent());
    EXPECT_EQ(AX_InitLib(), 1U);
}

TEST_F(Binding, ArgumentsArriveAsTheLibraryDeclaresThem) {
    load("both");
    uint32 value = 0;
    AX_GetHBAFeature(WWN, 0x40000000, &value);
    EXPECT_EQ(value, 0x01020304U ^ 0x05060708U ^ 0x40000000U);
    char cursor[300];
    EXPECT_EQ(AX_GetNextVpdEntry(cursor, nullptr, 4, nullptr, 256), cursor + 260);
    HBA_WWN name{{1, 2, 3, 4, 5, 6, 7, 8}};
    EXPECT_EQ(HBA_SendReadCapacity(1, name, 0x900000000LL, nullptr, 0, nullptr, 128),
              100U + 8 + 9 + 128);
    // By value as two words, in memory order.
    const AX_WWN words = AX_WwnOf(&name);
    EXPECT_EQ(std::memcmp(words.word, name.wwn, 8), 0);
}

// The caches outlive the libraries. A pointer from a closed one must not be called, whether the
// next load finds the same libraries, others, or none.
TEST_F(Binding, ReloadInOneProcessCallsNoStalePointer) {
    load("both");
    EXPECT_EQ(feature(), 201U);
    unloadRuntimeLibraries();
    EXPECT_EQ(feature(), 1U);
    EXPECT_EQ(load("older"), 1U);
    EXPECT_EQ(feature(), 501U);
    unloadRuntimeLibraries();
    EXPECT_EQ(feature(), 1U);
    // What was missing in an earlier load is found in a later one.
    EXPECT_EQ(load("both"), 0U);
    EXPECT_EQ(feature(), 201U);
    EXPECT_EQ(AX_ValidateWwn(WWN), 204U);
    unloadRuntimeLibraries();
    load("nowhere");
    EXPECT_EQ(feature(), 1U);
    EXPECT_EQ(HBA_LoadLibrary(), 1U);
}

TEST_F(Binding, SlotIsOpenedOnceAndCloseFailuresAreLogged) {
    g_host = "both";
    EXPECT_TRUE(VLN_Runtime_Loader::loadRuntimeLibrary(SLOT_LOCAL, "laxapi"));
    EXPECT_TRUE(VLN_Runtime_Loader::loadRuntimeLibrary(SLOT_LOCAL, "no such file"));
    EXPECT_EQ(g_opened.size(), 1U);
    g_closeFails = true;
    log_capture::take();
    unloadRuntimeLibraries();
    const auto lines = log_capture::take();
    ASSERT_EQ(lines.size(), 1U);
    EXPECT_EQ(lines[0].rfind("3:dlclose for lib 0x", 0), 0U) << lines[0];
    EXPECT_EQ(lines[0].back(), '\n');
    // The slot is empty all the same.
    EXPECT_FALSE(VLN_Runtime_Loader::loadRuntimeLibrary(SLOT_LOCAL, "no such file"));
}

// Under ThreadSanitizer this is the proof that racing first calls are clean.
TEST_F(Binding, FirstCallsMayRace) {
    for (const char* host : {"both", "older"}) {
        load(host);
        const AX_STATUS expected = std::strcmp(host, "both") == 0 ? 201 : 501;
        std::atomic<int> wrong{0};
        std::vector<std::thread> threads;
        for (int i = 0; i < 4; ++i)
            threads.emplace_back([&] {
                for (int n = 0; n < 1000; ++n)
                    wrong += feature() != expected;
            });
        for (auto& thread : threads)
            thread.join();
        EXPECT_EQ(wrong, 0);
        unloadRuntimeLibraries();
    }
}
