// mpcactl as its users see it: a child process, its output, its words about errors, its status.
// What its help, README, guides and the texts of the tests show of it works as shown.

#include "tests/operations/http_server.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <cstring>
#include <dlfcn.h>
#include <filesystem>
#include <fstream>
#include <pty.h>
#include <sstream>
#include <string>
#include <sys/wait.h>
#include <unistd.h>
#include <vector>

namespace {

#define OF_THE_TESTS "--mof " TEST_MOF " --namespace root/test --module "

// Documented sessions write files and clear them away: never in the folder that somebody stands in.
[[maybe_unused]] const bool IN_OWN_FOLDER = (std::filesystem::create_directories(TEST_FOLDER),
                                             std::filesystem::current_path(TEST_FOLDER), true);

struct Outcome {
    int status; // -1: it died
    std::string out;
    std::string err;
};

std::string contents(const std::string& name) {
    std::ostringstream text;
    text << std::ifstream(name).rdbuf();
    return text.str();
}

// A command of a shell that finds mpcactl, and in variables the providers of the tests.
Outcome run_shell(const std::string& command) {
    const std::string folder = std::string(MPCACTL).substr(0, std::string(MPCACTL).rfind('/'));
    setenv("PATH", (folder + ":/usr/bin:/bin").c_str(), 1);
    setenv("GOOD", OF_THE_TESTS GOOD_PROVIDER, 1);
    setenv("BAD", OF_THE_TESTS MISBEHAVING_PROVIDER, 1);
    setenv("SCENARIOS", SOURCE_FOLDER "/simulator/scenarios", 1);
    std::ofstream("command.sh") << command << "\n";
    const int status = std::system("sh command.sh >mpcactl.out 2>mpcactl.err");
    const bool ended = WIFEXITED(status) && WEXITSTATUS(status) < 128;
    return {ended ? WEXITSTATUS(status) : -1, contents("mpcactl.out"), contents("mpcactl.err")};
}

std::vector<std::string> lines_of(const std::string& text) {
    std::vector<std::string> lines;
    std::istringstream stream(text);
    for (std::string line; std::getline(stream, line);)
        lines.push_back(line);
    return lines;
}

// The commands that a help text lists below their own title.
std::vector<std::string> names_in(const std::string& help) {
    std::vector<std::string> names;
    bool commands = false;
    for (const std::string& line : lines_of(help)) {
        commands = line == "Subcommands:" || (commands && line.starts_with("  "));
        if (commands && line.starts_with("  "))
            names.push_back(line.substr(2, line.find(' ', 2) - 2));
    }
    return names;
}

// What a topic does not serve yet may refuse; it may not be wrong usage.
void expect_works(const std::string& line) {
    const Outcome result = run_shell(line);
    const bool refused =
        result.status == 1 && result.err.starts_with("mpcactl: CMPI_RC_ERR_NOT_SUPPORTED");
    EXPECT_TRUE(result.status == 0 || refused) << line << "\n" << result.err;
}

TEST(Mpcactl, EachCommandHasExamplesThatWork) {
    std::filesystem::remove_all("host"); // which an example keeps
    std::vector<std::string> commands = names_in(run_shell("mpcactl --help").out);
    ASSERT_GE(commands.size(), 16u);
    commands.push_back(""); // of the whole
    for (const std::string& command : commands) {
        const Outcome help = run_shell("mpcactl " + command + " --help");
        EXPECT_EQ(help.status, 0) << command;
        EXPECT_NE(help.out.find("--simulate"), std::string::npos)
            << "no common options: " << command;
        int examples = 0;
        bool below = false;
        for (const std::string& line : lines_of(help.out)) {
            below = line == "Examples:" || (below && line.starts_with("  "));
            if (below && line.starts_with("  ")) {
                expect_works(line);
                ++examples;
            }
        }
        EXPECT_GT(examples, 0) << command;
    }
}

TEST(Mpcactl, TheReadMesExamplesWork) {
    const std::string start = "    ./run mpcactl ";
    int examples = 0;
    for (const std::string& line : lines_of(contents(SOURCE_FOLDER "/README.md"))) {
        if (!line.starts_with(start))
            continue;
        expect_works("mpcactl " + line.substr(start.size()));
        ++examples;
    }
    EXPECT_GE(examples, 5);
}

struct Documented {
    std::string place;
    std::string command;
    std::string output;
};

// Blocks that begin with ```console: "$ " before a command, "> " before the lines that it goes on
// over, the rest is what the terminal shows.
std::vector<Documented> sessions_in(const std::string& file) {
    std::vector<Documented> found;
    bool inside = false;
    int number = 0;
    for (const std::string& line : lines_of(contents(file))) {
        ++number;
        if (line.starts_with("```")) {
            inside = line == "```console";
        } else if (inside && line.starts_with("$ ")) {
            found.push_back({file + ":" + std::to_string(number), line.substr(2), ""});
        } else if (inside && !found.empty()) {
            const bool more = line.starts_with("> ") && found.back().output.empty();
            (more ? found.back().command : found.back().output) +=
                more ? "\n" + line.substr(2) : line + "\n";
        }
    }
    return found;
}

constexpr char WEB[] = "http://firmware.example"; // in texts, the folder that they are run in

// The command as it is run; empty where the machine's libcurl is of the other word size only.
std::string over_the_web(std::string command, const Http_Server& server) {
    const std::size_t place = command.find(WEB);
    if (place == std::string::npos)
        return command;
    void* curl = dlopen("libcurl.so.4", RTLD_LAZY);
    if (!curl && sizeof curl == 4)
        return {};
    return command.replace(place, std::strlen(WEB), server.plain());
}

// Guides, the hosts property by property, and mpcactl itself.
TEST(Mpcactl, DocumentedSessionsShowWhatIsShown) {
    namespace fs = std::filesystem;
    std::vector<fs::path> texts;
    for (const char* place : {SOURCE_FOLDER "/docs", SOURCE_FOLDER "/tests/road/shown",
                              SOURCE_FOLDER "/tests/host/shown"})
        for (const auto& entry : fs::recursive_directory_iterator(place))
            if (entry.path().extension() == ".md")
                texts.push_back(entry.path());
    int sessions = 0;
    for (const fs::path& text : texts) {
        // A folder for each text, in which its files and kept hosts are.
        const fs::path folder = fs::path("documented") / text.stem();
        fs::remove_all(folder);
        fs::create_directories(folder);
        const Http_Server server(fs::absolute(folder));
        for (const Documented& each : sessions_in(text)) {
            const std::string command = over_the_web(each.command, server);
            if (command.empty())
                continue;
            const Outcome result =
                run_shell("cd " + folder.string() + "\n{ " + command + "\n} 2>&1");
            EXPECT_EQ(result.out, each.output) << each.place << ": " << each.command;
            ++sessions;
        }
    }
    EXPECT_GE(sessions, 20);
}

TEST(Mpcactl, LargeAndWildLinesDoNotHurt) {
    std::string numbers, text = "invoke 'Test_Good.Name=\"a\"' Echo 'Words=";
    for (int i = 0; i < 100000; ++i)
        numbers += (i ? ",7" : "7"), text += "\"a,b\",";
    text += "z' --format json\n";
    std::ofstream("script") << "create Test_Good Name=q Numbers=" << numbers << "\n"
                            << text << "get 'Test_Good.Name=\"" << std::string(1000000, 'x')
                            << "\"'\nenum " << std::string(100000, 'X') << "\n"
                            << std::string(9999, '\'') << "\n";
    const Outcome result = run_shell("mpcactl $GOOD run script");
    EXPECT_EQ(result.status, 1);
    EXPECT_NE(result.err.find("script:3: CMPI_RC_ERR_NOT_FOUND"), std::string::npos);
    EXPECT_LT(result.err.size(), 1500u) << "long words are cut";
    std::ofstream("script") << "create Test_Good Level=" << std::string(100000, '9')
                            << "\ncreate Test_Good Words=" << std::string(60000, '[')
                            << std::string(60000, ']') << "\n";
    const std::string wrong = run_shell("mpcactl $GOOD run script").err;
    EXPECT_NE(wrong.find("is no uint16"), std::string::npos);
    EXPECT_NE(wrong.find("nested too deeply"), std::string::npos);
    EXPECT_LT(wrong.size(), 1500u);
}

TEST(Mpcactl, TypedAloneItAsks) {
    int terminal = -1;
    const pid_t child = forkpty(&terminal, nullptr, nullptr, nullptr);
    if (child == 0) {
        setenv("TERM", "dumb", 1);
        execl(MPCACTL, "mpcactl", "--mof", TEST_MOF, "--module", GOOD_PROVIDER, "--namespace",
              "root/test", nullptr);
        _exit(99);
    }
    ASSERT_GT(child, 0);
    const std::string typed = "census\nenum Test_Godo\nquit\n";
    ASSERT_EQ(write(terminal, typed.data(), typed.size()), static_cast<ssize_t>(typed.size()));
    std::string screen;
    char block[512];
    for (ssize_t n = 0; (n = read(terminal, block, sizeof block)) > 0;)
        screen.append(block, static_cast<std::size_t>(n));
    int status = 0;
    waitpid(child, &status, 0);
    close(terminal);
    EXPECT_EQ(WEXITSTATUS(status), 2);
    for (const char* text : {"mpcactl> ", "Test_Good\t3", "mpcactl: unknown class Test_Godo"})
        EXPECT_NE(screen.find(text), std::string::npos) << text << "\n" << screen;
}

} // namespace
