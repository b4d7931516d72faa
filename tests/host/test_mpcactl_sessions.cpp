// mpcactl with several commands in one process, and with a host that is kept between processes.

#include "tests/host/mpcactl.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <pty.h>
#include <unistd.h>

namespace {

TEST(MpcactlSession, AScriptReadsLikeASession) {
    write_text("script", "# what is there\n\n"
                         "names Test_Good # three\n"
                         "  create Test_Good Name=it\\'s' \"new\"' \\\n    Level=0x10\r\n"
                         "enum Test_Good -p Name,Level\n");
    const Outcome result = run({"run", "script"});
    EXPECT_EQ(result.status, 0) << result.err;
    EXPECT_EQ(result.out, "mpcactl> names Test_Good # three\n"
                          "Test_Good.Name=\"a\"\n"
                          "Test_Good.Name=\"b\"\n"
                          "Test_Good.Name=\"c \\\"quoted\\\", and\\\\more\"\n"
                          "\n"
                          "mpcactl>   create Test_Good Name=it\\'s' \"new\"' \\\n"
                          "    Level=0x10\n"
                          "Test_Good.Name=\"it's \\\"new\\\"\"\n"
                          "\n"
                          "mpcactl> enum Test_Good -p Name,Level\n"
                          "Name                  Level\n"
                          "a                     1\n"
                          "b                     2\n"
                          "c \"quoted\", and\\more  3\n"
                          "it's \"new\"            16\n");
}

struct Script {
    const char* text;
    std::vector<std::string> options;
    int status;
    const char* out; // of a quiet run
    const char* err; // its beginning
};

TEST(MpcactlSession, TheFirstFailureIsTheStatusAndEachIsNamed) {
    const Script scripts[] = {
        {"get 'Test_Good.Name=\"none\"'\nenum Test_Godo\nget 'Test_Good.Name=\"b\"' -p Level\n",
         {},
         1,
         "Level\n2\n",
         "mpcactl: standard input:1: CMPI_RC_ERR_NOT_FOUND: no such name\n"
         "mpcactl: standard input:2: unknown class Test_Godo; did you mean Test_Good?\n"},
        {"census\nenum Test_Godo\ncensus\n",
         {"--stop"},
         2,
         "Test_Good\t3\n",
         "mpcactl: standard input:2: "},
        {"\\\n\\\n\ncensus \\\n --formt json\n",
         {},
         2,
         "",
         "mpcactl: standard input:4: unknown option --formt; did you mean --format?\nTry help.\n"},
        {"get 'a\n", {}, 2, "", "mpcactl: standard input:1: the quote ' is not closed\n"},
        {"run x\n", {}, 2, "", "mpcactl: standard input:1: unknown command run"},
        {"census --keep x\n", {}, 2, "", "mpcactl: standard input:1: unknown option --keep"},
        {"census\nquit\nenum Test_Godo\n", {}, 0, "Test_Good\t3\n", ""},
        {"names Test_Good --namespace root/other --format json",
         {},
         0,
         "[\n  \"Test_Good.Name=\\\"a\\\"\"",
         ""},
        {"", {}, 0, "", ""},
    };
    for (const Script& each : scripts) {
        write_text("input", each.text);
        std::string line = "mpcactl --mof " TEST_MOF " --module " GOOD_PROVIDER
                           " --namespace root/test run - --quiet <input";
        for (const std::string& option : each.options)
            line += " " + option;
        const Outcome result = run_shell(line);
        EXPECT_EQ(result.status, each.status) << each.text;
        EXPECT_EQ(result.out.substr(0, std::string(each.out).size()), each.out) << each.text;
        EXPECT_EQ(result.err.substr(0, std::string(each.err).size()), each.err) << each.text;
    }
}

TEST(MpcactlSession, FaultsAreToldBehindTheirLine) {
    write_text("script", "invoke 'Test_Bad.Name=\"x\"' Misbehave 'How=unknown property'\n"
                         "enum Test_Godo\n");
    const Outcome result = run({"run", "script"}, MISBEHAVING_PROVIDER);
    EXPECT_EQ(result.status, 1);
    const std::size_t fault = result.err.find("1 provider fault:\n  ");
    EXPECT_EQ(fault, 0u) << result.err;
    EXPECT_LT(fault, result.err.find("script:2:"));
    EXPECT_EQ(result.err.find("provider fault", fault + 20), std::string::npos) << "told once";
}

TEST(MpcactlSession, LargeAndWildLinesDoNotHurt) {
    std::string numbers, text = "invoke 'Test_Good.Name=\"a\"' Echo 'Words=";
    for (int i = 0; i < 100000; ++i)
        numbers += (i ? ",7" : "7"), text += "\"a,b\",";
    text += "z' --format json\n";
    write_text("script", "create Test_Good Name=q Numbers=" + numbers + "\n" + text +
                             "get 'Test_Good.Name=\"" + std::string(1000000, 'x') + "\"'\n" +
                             "enum " + std::string(100000, 'X') + "\n" + std::string(9999, '\'') +
                             "\n");
    const Outcome result = run({"run", "script"});
    EXPECT_EQ(result.status, 1);
    EXPECT_NE(result.err.find("script:3: CMPI_RC_ERR_NOT_FOUND"), std::string::npos);
    EXPECT_LT(result.err.size(), 1500u) << "long words are cut";
}

TEST(MpcactlSession, TypedAloneItAsks) {
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

TEST(MpcactlSession, AKeptHostGoesOnWhereItWas) {
    std::filesystem::remove_all("kept");
    const std::string start = "mpcactl --simulate two-port-cna --keep kept ";
    EXPECT_EQ(run_shell(start + "run --quiet - <<'END'\n"
                                "hardware 100002564C000000 portAttributes FunctionalPortState 3\n"
                                "hardware 100002564C000000 portAttributes IfName 'vln{{9'\n"
                                "hardware 100002564C000004 features SRIOV '{\"status\": 190}'\n"
                                "modify 'VLNMPCA_ProviderConfigSetting.InstanceID="
                                "\"Vorlan MPCA Provider:cachetimeout\"' current=20\n"
                                "END")
                  .err,
              "");
    const std::string ports = "enum VLNMPCA_EthernetPort -p ElementName,OperationalStatus ";
    EXPECT_EQ(run_shell(start + ports + "| head -2").out,
              "ElementName       OperationalStatus\nvln{9             10\n");
    EXPECT_NE(run_shell(start + "enum VLNMPCA_ProviderConfigSetting -p current").out.find("20"),
              std::string::npos);
    const std::string state = contents("kept/state.json");
    EXPECT_NE(state.find("\"status\": 190"), std::string::npos) << state;

    EXPECT_NE(run_shell("mpcactl --simulate no-nic --keep kept census")
                  .err.find("the state of scenario \"two-port-cna.json\" does not go with"),
              std::string::npos);
    write_text("kept/state.json", state.substr(0, state.size() / 2));
    const Outcome broken = run_shell(start + "census");
    EXPECT_EQ(broken.status, 2);
    EXPECT_NE(broken.err.find("kept/state.json:"), std::string::npos) << broken.err;
    EXPECT_EQ(contents("kept/state.json"), state.substr(0, state.size() / 2)) << "left alone";
}

// Some only once something has been done there.
TEST(MpcactlSession, OneHostShowsEveryClass) {
    constexpr std::size_t CLASSES = 299;
    write_text("all.run",
               contents(SOURCE_FOLDER "/simulator/scenarios/everything.run") + "census\n");
    const Outcome result =
        run_bare({"--simulate", "everything", "run", "--stop", "--quiet", "all.run"});
    ASSERT_EQ(result.status, 0) << result.err;
    std::istringstream lines(result.out);
    std::size_t classes = 0;
    for (std::string line; std::getline(lines, line);) {
        std::istringstream row(line);
        std::string name;
        std::size_t count = 0;
        if (!line.starts_with("VLNMPCA_") || !(row >> name >> count))
            continue;
        ++classes;
        EXPECT_NE(count, 0u) << name;
    }
    EXPECT_EQ(classes, CLASSES);
}

} // namespace
