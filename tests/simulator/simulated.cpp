#include "tests/simulator/simulated.h"

#include <cstring>

void Simulated::SetUp() {
    vlnsim_reset();
}

void Simulated::TearDown() {
    _laxapi.reset();
    _hbaapi.reset();
    vlnsim_close_libraries();
    vlnsim_reset();
}

void Simulated::start(const std::string& file) {
    char error[512];
    ASSERT_EQ(0, vlnsim_load_scenario((VLN_SCENARIOS "/" + file).c_str(), error, sizeof error))
        << error;
    open();
}

void Simulated::start_text(const std::string& text) {
    char error[512];
    ASSERT_EQ(0, vlnsim_load_scenario_text(text.c_str(), "text", error, sizeof error)) << error;
    open();
}

void Simulated::open() {
    char error[512];
    ASSERT_EQ(0, vlnsim_open_libraries(error, sizeof error)) << error;
    _laxapi = std::make_unique<Opened_Library>("liblaxapi.so");
    _hbaapi = std::make_unique<Opened_Library>("libHBAAPI.so.2");
    ASSERT_TRUE(laxapi()) << dlerror();
    ASSERT_TRUE(hbaapi()) << dlerror();
    LOCAL(AX_InitLib)();
    HBA(HBA_LoadLibrary)();
}

std::string Simulated::local_symbol(const std::string& function) {
    // The local library has LAX_ names, and AX_ names where there is no other.
    const std::string lax = "L" + function;
    void* handle = dlopen("liblaxapi.so", RTLD_NOW);
    const bool found = function.starts_with("AX_") && dlsym(handle, lax.c_str());
    dlclose(handle);
    return found ? lax : function;
}

HBAIdentifier Simulated::identifier_of(std::uint32_t index) {
    HBAIdentifier identifier{};
    std::vector<std::uint32_t> table(64);
    auto count = static_cast<std::uint32_t>(table.size());
    EXPECT_EQ(0u, LOCAL(AX_GetAllLocalHBAInstances)(&count, table.data()));
    identifier.instance = table.at(index);
    identifier.instanceCount = count;
    return identifier;
}

AX_WWN Simulated::wwn_of(std::uint32_t index) {
    const HBAIdentifier identifier = identifier_of(index);
    LocalHBAInfoV3 record{};
    EXPECT_EQ(0u, LOCAL(AX_GetLocalHBAInfoV3)(&identifier, &record));
    AX_WWN wwn;
    std::memcpy(&wwn, record.portWWN, sizeof wwn);
    return wwn;
}

std::string Simulated::attribute_text(std::vector<std::uint8_t>& buffer, std::uint16_t identifier) {
    std::uint16_t length = 0;
    AX_STATUS status = 1;
    const void* value = LOCAL(AX_GetAttributeValue)(buffer.data(), identifier, &length, &status);
    return value ? std::string(static_cast<const char*>(value), length)
                 : "status " + std::to_string(status);
}

std::vector<std::string> Simulated::recorded() {
    std::vector<std::string> lines;
    char line[512];
    for (std::size_t i = 0; vlnsim_recorded_call(i, line, sizeof line) == 0; ++i)
        lines.emplace_back(line);
    return lines;
}

std::vector<std::string> Simulated::violations() {
    std::vector<std::string> lines;
    char line[512];
    for (std::size_t i = 0; vlnsim_violation(i, line, sizeof line) == 0; ++i)
        lines.emplace_back(line);
    return lines;
}
