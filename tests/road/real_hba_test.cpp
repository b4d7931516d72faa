// The SAN scan over the machine's own HBA API library, with the simulator as a vendor's library
// underneath: what the scan finds must not depend on who stands between.
#include <gtest/gtest.h>

#include <sys/wait.h>

#include <cstdio>
#include <string>

namespace {

struct Outcome {
    int status;          // of the process
    std::string library; // its first line: the path of the HBA API library, or what went wrong
    std::string found;   // all others
};

Outcome run(const std::string& mode, const std::string& scenario) {
    // Leaks are not looked for in a library that is not ours.
    const std::string environment =
        mode == "real" ? "ASAN_OPTIONS=\"$ASAN_OPTIONS:detect_leaks=0\" " : "";
    const std::string command =
        environment + VLN_CHILD " " + mode + " " VLN_SCENARIOS "/" + scenario + " 2>&1";
    std::FILE* pipe = popen(command.c_str(), "r");
    if (!pipe)
        return {-1, "no process", ""};
    std::string text;
    char piece[4096];
    for (std::size_t n = 0; (n = std::fread(piece, 1, sizeof piece, pipe)) > 0;)
        text.append(piece, n);
    const int status = pclose(pipe);
    const std::size_t line = text.find('\n');
    return {WIFEXITED(status) ? WEXITSTATUS(status) : -1, text.substr(0, line),
            line == std::string::npos ? "" : text.substr(line + 1)};
}

class Real_Hba : public testing::TestWithParam<const char*> {};

TEST_P(Real_Hba, FindsTheSameTargets) {
    constexpr int SKIPPED = 77;
    const Outcome simulated = run("simulated", GetParam());
    ASSERT_EQ(simulated.status, 0) << simulated.library << '\n' << simulated.found;
    EXPECT_TRUE(simulated.library.starts_with(VLN_SIMULATOR)) << simulated.library;
    const Outcome real = run("real", GetParam());
    if (real.status == SKIPPED)
        GTEST_SKIP() << "Not run over the real HBA API library: " << real.library;
    ASSERT_EQ(real.status, 0) << real.library << '\n' << real.found;
    EXPECT_FALSE(real.library.starts_with(VLN_SIMULATOR)) << real.library;
    EXPECT_NE(real.library.find("libHBAAPI.so.2"), std::string::npos) << real.library;
    EXPECT_NE(simulated.found.find("type="), std::string::npos) << "no target at all";
    EXPECT_EQ(real.found, simulated.found);
}

// Many units of all types; few units that fail in all ways, behind a mapping that is stale at
// first.
INSTANTIATE_TEST_SUITE_P(Scenarios, Real_Hba, testing::Values("san-4096-luns.json", "flaky.json"));

} // namespace
