// What help, README and guides show of mpcactl works as shown: examples are taken from the texts.

#include "tests/host/mpcactl.h"
#include "tests/operations/http_server.h"

#include <gtest/gtest.h>

#include <cstring>
#include <dlfcn.h>
#include <filesystem>

namespace {

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

TEST(MpcactlTexts, EachCommandHasExamplesThatWork) {
    std::filesystem::remove_all("host"); // which an example keeps
    const std::vector<std::string> commands = names_in(run_bare({"--help"}).out);
    ASSERT_GE(commands.size(), 16u);
    for (const std::string& command : commands) {
        const Outcome help = run_bare({command, "--help"});
        EXPECT_EQ(help.status, 0) << command;
        EXPECT_NE(help.out.find("--simulate"), std::string::npos)
            << "no common options: " << command;
    }
    std::vector<std::vector<std::string>> calls = {{"--help"}};
    for (const std::string& command : commands)
        calls.push_back({command, "--help"});
    for (const std::vector<std::string>& call : calls) {
        int examples = 0;
        bool below = false;
        for (const std::string& line : lines_of(run_bare(call).out)) {
            below = line == "Examples:" || (below && line.starts_with("  "));
            if (below && line.starts_with("  ")) {
                expect_works(line);
                ++examples;
            }
        }
        EXPECT_GT(examples, 0) << call.front();
    }
}

TEST(MpcactlTexts, TheReadMesExamplesWork) {
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

// Guides, and the hosts property by property.
TEST(MpcactlTexts, DocumentedSessionsShowWhatIsShown) {
    namespace fs = std::filesystem;
    std::vector<fs::path> texts;
    for (const char* place : {SOURCE_FOLDER "/docs", SOURCE_FOLDER "/tests/road/shown"})
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
                run_shell("cd " + shell_word(folder.string()) + "\n{ " + command + "\n} 2>&1");
            EXPECT_EQ(result.out, each.output) << each.place << ": " << each.command;
            ++sessions;
        }
    }
    EXPECT_GE(sessions, 20);
}

} // namespace
