// The forms of the bound functions against a loader of the test's own: which library and symbol a
// call looks for under each combination of missing flags, what it calls, and what it answers when
// there is nothing to call.
#include "device/library/bound_functions.h"
#include "device/library/runtime_loader.h"
#include "tests/device/log_capture.h"

#include <gtest/gtest.h>
#include <map>
#include <set>

using namespace cimple;

namespace {

// Handles are the addresses of these; the default scope is the null handle.
char g_hba, g_lax, g_ax;

std::set<std::string> g_installed;       // files
std::map<std::string, void*> g_exported; // "library:symbol"
std::vector<std::string> g_lookups;      // the same, as they were asked for

const char* libraryOf(void* handle) {
    return handle == &g_hba ? "hba" : handle == &g_lax ? "lax" : handle == &g_ax ? "ax" : "default";
}

void* fakeOpen(const char* file, int) {
    if (!g_installed.count(file))
        return nullptr;
    return std::string(file).find("HBA") != std::string::npos ? &g_hba
           : std::string(file) == "liblaxapi.so"              ? &g_lax
                                                              : &g_ax;
}

void* fakeSymbol(void* handle, const char* name) {
    g_lookups.push_back(std::string(libraryOf(handle)) + ":" + name);
    const auto found = g_exported.find(g_lookups.back());
    return found == g_exported.end() ? nullptr : found->second;
}

int fakeClose(void*) {
    return 0;
}

char* fakeError() {
    return nullptr;
}

const Loader_Calls FAKE_CALLS{fakeOpen, fakeSymbol, fakeClose, fakeError};

using Names = std::vector<std::string>;

// The hosts that set each combination of flags.
struct Host {
    const char* name;
    std::set<std::string> files;
};
const Host ALL{"all", {"libHBAAPI.so.2", "liblaxapi.so", "libaxapi.so"}};
const Host NO_HBA{"no HBA API", {"liblaxapi.so", "libaxapi.so"}};
const Host NO_LOCAL{"no local library", {"libHBAAPI.so", "libaxapi.so"}};
const Host ONLY_AX{"management library only", {"libaxapi.so"}};
const Host NOTHING{"nothing", {}};

class Forms : public testing::Test {
protected:
    void SetUp() override { VLN_Runtime_Loader::setCalls(&FAKE_CALLS); }
    void TearDown() override {
        unloadRuntimeLibraries();
        VLN_Runtime_Loader::setCalls(nullptr);
        g_exported.clear();
    }

    static void start(const Host& host) {
        unloadRuntimeLibraries();
        g_installed = host.files;
        loadRuntimeLibraries();
        g_lookups.clear();
    }
};

// Calls any function with zeros.
template <class R, class... P>
R callWithZeros(R (*function)(P...)) {
    return function(P{}...);
}

// A result as a number, so that failure values of all types go into one table.
template <class R, class... P>
intptr_t failureOf(R (*function)(P...)) {
    if constexpr (std::is_void_v<R>) {
        callWithZeros(function);
        return -2; // nothing is answered
    } else if constexpr (std::is_pointer_v<R>) {
        return reinterpret_cast<intptr_t>(callWithZeros(function));
    } else {
        return static_cast<intptr_t>(callWithZeros(function));
    }
}

struct Bound {
    const char* name;
    intptr_t (*call)();
};

const Bound ALL_BOUND[] = {
#define VLN_BOUND(form, name, arguments, failure) {#name, [] { return failureOf(::name); }},
#include "device/library/bound_functions.inc"
#undef VLN_BOUND
};

intptr_t expectedFailure(const std::string& name) {
    static const std::map<std::string, intptr_t> OTHERS{
        {"HBA_GetNumberOfAdapters", 0},
        {"AX_GetNumberOfLocalAdapters", 0},
        {"AX_GetNextVpdEntry", 0},
        {"AX_GetAttributeValue", 0},
        {"VlnGetBoardNumber", -1},
        {"AX_CNA_FCOE_SetFIPParams", 0},
        {"AX_CNA_FCOE_SetFCFConnectList", 0},
        {"AX_CNA_FCOE_GetFIPParams", 0},
        {"AX_CNA_FCOE_GetFCFConnectList", 0},
        {"HBA_CloseAdapter", -2},
        {"HBA_RefreshInformation", -2},
        {"CPQFC_CloseAdapter", -2},
    };
    const auto found = OTHERS.find(name);
    return found == OTHERS.end() ? 1 : found->second;
}

} // namespace

TEST_F(Forms, EveryFunctionFailsWithItsValue) {
    EXPECT_EQ(std::size(ALL_BOUND), 188U);
    for (const Host* host : {&ALL, &NO_HBA, &NO_LOCAL, &ONLY_AX, &NOTHING}) {
        start(*host);
        for (const Bound& bound : ALL_BOUND)
            EXPECT_EQ(bound.call(), expectedFailure(bound.name))
                << bound.name << ", " << host->name;
    }
}

// The stand-in has what the product binds, in the libraries in which the product looks for it.
TEST_F(Forms, TheSimulatorHasEveryFunction) {
    std::set<std::string> simulated;
#define VLNSIM_A(name, model) simulated.insert("A AX_" #name);
#define VLNSIM_B(name, model) simulated.insert("B LAX_" #name);
#define VLNSIM_C(name, model) simulated.insert("C AX_" #name);
#define VLNSIM_D(name, model) simulated.insert("D HBA_" #name);
#define VLNSIM_E(name, model) simulated.insert("E CPQFC_" #name);
#define VLNSIM_F(name, model) simulated.insert("F " #name);
#include "simulator/entry_points.def"
    std::set<std::string> bound;
#define VLN_BOUND(form, name, arguments, failure)                                                  \
    bound.insert((#form[0] == 'M' ? "E " : #form " ") + std::string(#name));
#include "device/library/bound_functions.inc"
#undef VLN_BOUND
    EXPECT_EQ(simulated, bound);
}

TEST_F(Forms, SearchOrder) {
    const struct {
        const char* name;
        const Host& host;
        Names lookups;
    } cases[] = {
        {"AX_GetPortState", ALL, {"lax:LAX_GetPortState"}},
        {"AX_GetPortState", NO_HBA, {"lax:LAX_GetPortState"}},
        {"AX_GetPortState", NO_LOCAL, {"ax:LAX_GetPortState", "ax:AX_GetPortState"}},
        {"AX_GetPortState", NOTHING, {}},
        {"LAX_Ini_GetARPTable", ALL, {"lax:LAX_Ini_GetARPTable"}},
        {"LAX_Ini_GetARPTable", ONLY_AX, {"ax:LAX_Ini_GetARPTable"}},
        {"LAX_Ini_GetARPTable", NOTHING, {}},
        {"AX_IsLocalHBA", ALL, {"lax:AX_IsLocalHBA"}},
        {"AX_IsLocalHBA", ONLY_AX, {"ax:AX_IsLocalHBA"}},
        {"AX_IsLocalHBA", NOTHING, {}},
        {"HBA_OpenAdapter", ALL, {"hba:HBA_OpenAdapter"}},
        {"HBA_OpenAdapter", NO_LOCAL, {"hba:HBA_OpenAdapter"}},
        // With the local library, axapi is not opened; the default scope is searched instead.
        {"HBA_OpenAdapter", NO_HBA, {"default:HBA_OpenAdapter"}},
        {"HBA_OpenAdapter", ONLY_AX, {"ax:HBA_OpenAdapter"}},
        {"HBA_OpenAdapter", NOTHING, {}},
        {"CPQFC_FreeLibrary", ALL, {"default:CPQFC_FreeLibrary"}},
        {"CPQFC_FreeLibrary", NOTHING, {"default:CPQFC_FreeLibrary"}},
        {"CPQFC_CloseAdapter", ALL, {"default:CPQFC_CloseAdapter"}},
        {"CPQFC_CloseAdapter", ONLY_AX, {"ax:CPQFC_CloseAdapter"}},
        {"CPQFC_CloseAdapter", NOTHING, {}},
        {"VlnGetBoardNumber", ALL, {"lax:VlnGetBoardNumber"}},
        {"VlnGetBoardNumber", ONLY_AX, {"ax:VlnGetBoardNumber"}},
        {"VlnGetBoardNumber", NOTHING, {}},
    };
    for (const auto& c : cases) {
        start(c.host);
        for (const Bound& bound : ALL_BOUND)
            if (std::string(bound.name) == c.name)
                bound.call();
        EXPECT_EQ(g_lookups, c.lookups) << c.name << ", " << c.host.name;
    }
}

namespace {

AX_STATUS validateWwn77(AX_WWN) {
    return 77;
}

HBA_HANDLE openAdapter78(char*) {
    return 78;
}

AX_STATUS freeLibrary79() {
    return 79;
}

template <class Function>
void* symbolOf(Function* function) {
    return reinterpret_cast<void*>(function);
}

} // namespace

// dlsym is paid once per symbol with the preferred library, and on every call with the fallback.
TEST_F(Forms, CacheIsReadOnThePreferredPathOnly) {
    g_exported = {{"lax:AX_ValidateWwn", symbolOf(validateWwn77)},
                  {"ax:AX_ValidateWwn", symbolOf(validateWwn77)},
                  {"default:HBA_OpenAdapter", symbolOf(openAdapter78)},
                  {"default:CPQFC_FreeLibrary", symbolOf(freeLibrary79)}};
    const struct {
        const Host& host;
        std::size_t lookups;
    } cases[] = {{NO_HBA, 1}, {ONLY_AX, 3}, {ALL, 1}};
    for (const auto& c : cases) {
        start(c.host);
        for (int i = 0; i < 3; ++i)
            EXPECT_EQ(AX_ValidateWwn(AX_WWN{}), 77U) << c.host.name;
        EXPECT_EQ(g_lookups.size(), c.lookups) << c.host.name;
    }
    // What the default scope has is called, and cached, as a library's.
    start(ALL);
    EXPECT_EQ(CPQFC_FreeLibrary(), 79U);
    EXPECT_EQ(CPQFC_FreeLibrary(), 79U);
    EXPECT_EQ(g_lookups, (Names{"default:CPQFC_FreeLibrary"}));
    start(NO_HBA);
    EXPECT_EQ(HBA_OpenAdapter(nullptr), 78U);
    EXPECT_EQ(HBA_OpenAdapter(nullptr), 78U);
    EXPECT_EQ(g_lookups.size(), 2U);
}

// A symbol that is not there is sought again: the null result is no answer for later calls.
TEST_F(Forms, MissingSymbolIsNotCached) {
    start(ALL);
    EXPECT_EQ(AX_ValidateWwn(AX_WWN{}), 1U);
    g_exported["lax:AX_ValidateWwn"] = symbolOf(validateWwn77);
    EXPECT_EQ(AX_ValidateWwn(AX_WWN{}), 77U);
    EXPECT_EQ(g_lookups.size(), 2U);
}
