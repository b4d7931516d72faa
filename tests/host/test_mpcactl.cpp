// mpcactl as its users see it: a child process, its output, its words about errors, its exit
// status.

#include "host/path_text.h"

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include <fstream>
#include <sstream>
#include <sys/wait.h>

namespace {

struct Outcome {
    int status;
    std::string out;
    std::string err;
};

std::string shell_word(const std::string& text) {
    std::string word = "'";
    for (char c : text)
        word += c == '\'' ? std::string("'\\''") : std::string(1, c);
    return word + "'";
}

std::string contents(const std::string& name) {
    std::ostringstream text;
    text << std::ifstream(name).rdbuf();
    return text.str();
}

Outcome run_bare(const std::vector<std::string>& arguments) {
    std::string line = shell_word(MPCACTL);
    for (const std::string& argument : arguments)
        line += " " + shell_word(argument);
    const int status = std::system((line + " >mpcactl.out 2>mpcactl.err").c_str());
    return {WIFEXITED(status) ? WEXITSTATUS(status) : -1, contents("mpcactl.out"),
            contents("mpcactl.err")};
}

Outcome run(std::vector<std::string> arguments, const std::string& module = GOOD_PROVIDER) {
    const std::vector<std::string> common = {"--mof", TEST_MOF,      "--module",
                                             module,  "--namespace", "root/test"};
    arguments.insert(arguments.begin(), common.begin(), common.end());
    return run_bare(arguments);
}

const std::string A = "Test_Good.Name=\"a\"";

TEST(Mpcactl, ListsClassesNamesAndCounts) {
    EXPECT_EQ(run({"classes"}).out, "Test_Good\n");
    EXPECT_NE(run({"classes", "--all"}).out.find("Test_Link\n"), std::string::npos);
    EXPECT_EQ(run({"census"}).out, "Test_Good\t3\n");
    const Outcome names = run({"names", "Test_Good"});
    EXPECT_EQ(names.status, 0);
    EXPECT_EQ(names.err, "");
    std::istringstream lines(names.out);
    int count = 0;
    for (std::string line; std::getline(lines, line); ++count) {
        const Outcome got = run({"get", line, "--format", "json"});
        EXPECT_EQ(got.status, 0) << line << "\n" << got.err;
        EXPECT_EQ(nlohmann::json::parse(got.out)["path"], line);
    }
    EXPECT_EQ(count, 3);
}

TEST(Mpcactl, PrintsATable) {
    EXPECT_EQ(run({"enum", "Test_Good", "-p", "Name,Level"}).out, "Name                  Level\n"
                                                                  "a                     1\n"
                                                                  "b                     2\n"
                                                                  "c \"quoted\", and\\more  3\n");
    EXPECT_EQ(run({"refs", A, "-p", "Note"}).out.substr(0, 15), "Test_Link.First")
        << "the path at least";
    const std::string list = run({"get", A}).out;
    EXPECT_EQ(list.substr(0, list.find('\n')),
              "Name  Level  Big                   Offset  Ratio  Flag  When                       "
              "Words                 Note");
}

TEST(Mpcactl, PrintsJsonExactly) {
    const auto json = nlohmann::json::parse(run({"enum", "Test_Good", "--format", "json"}).out);
    ASSERT_EQ(json.size(), 3u);
    const auto& properties = json[0]["properties"];
    EXPECT_EQ(properties["Big"].get<std::uint64_t>(), 18446744073709551615ull);
    EXPECT_EQ(properties["Offset"], -5);
    EXPECT_EQ(properties["Ratio"].dump(), "0.1");
    EXPECT_TRUE(properties["Note"].is_null());
    EXPECT_EQ(properties["Words"].dump(), R"(["one","two,three",null])");
    EXPECT_EQ(properties["When"], "19700101000001.000000+000");
    EXPECT_FALSE(properties.contains("Numbers"));
}

TEST(Mpcactl, PrintsMof) {
    const std::string mof = run({"get", A, "-p", "Words,Big,Note", "--format", "mof"}).out;
    EXPECT_EQ(mof, "instance of Test_Good\n{\n"
                   "    Name  = \"a\";\n"
                   "    Big   = 18446744073709551615;\n"
                   "    Words = {\"one\", \"two,three\", NULL};\n"
                   "    Note  = NULL;\n};\n");
}

TEST(Mpcactl, ChangesAndCalls) {
    EXPECT_EQ(run({"create", "Test_Good", "Name=it's, \"new\"", "Level=0x10"}).out,
              "Test_Good.Name=\"it's, \\\"new\\\"\"\n");
    EXPECT_EQ(run({"modify", A, "Level=5", "Note"}).status, 0);
    EXPECT_EQ(run({"delete", A}).status, 0);
    EXPECT_EQ(
        run({"invoke", A, "Echo", "Number=18446744073709551615", "Words=x,y", "Who=" + A}).out,
        "ReturnValue  0\nNumberOut    18446744073709551615\nWordsOut     x, y\n"
        "WhoOut       " +
            A + "\n");
    EXPECT_EQ(run({"invoke", A, "Echo", "Words=[\"a,b\"]", "--format", "json"}).out,
              "{\n  \"returnValue\": 0,\n  \"outputs\": {\n    \"WordsOut\": [\n      \"a,b\"\n"
              "    ]\n  }\n}\n");
}

TEST(Mpcactl, WalksAssociations) {
    const std::string b = "Test_Good.Name=\"b\"";
    EXPECT_EQ(run({"assoc-names", A}).out, b + "\n");
    EXPECT_EQ(run({"assoc-names", b, "--role", "Second"}).out, A + "\n");
    const std::string link =
        "Test_Link.First=" + host::quote(A) + ",Second=" + host::quote(b) + "\n";
    EXPECT_EQ(run({"ref-names", A, "--via", "Test_Link"}).out, link);
    EXPECT_NE(run({"refs", A}).out.find("Strength"), std::string::npos);
    EXPECT_NE(run({"assoc", A, "--result-class", "Test_Base"}).out.find("two,three"),
              std::string::npos);
}

struct Wrong_Usage {
    std::vector<std::string> arguments;
    const char* says;
};

TEST(Mpcactl, WrongUsageEndsWithTwoAndAHint) {
    const Wrong_Usage cases[] = {
        {{}, "Commands: "},
        {{"enmu", "Test_Good"}, "unknown command enmu; did you mean enum?"},
        {{"enum"}, "CLASS is required"},
        {{"enum", "Test_Godo"}, "unknown class Test_Godo; did you mean Test_Good?"},
        {{"enum", "Test_Good", "-p", "Levle"}, "did you mean Level?"},
        {{"enum", "Test_Good", "--formt", "json"}, "did you mean --format?"},
        {{"enum", "Test_Good", "--format", "xml"}, "xml"},
        {{"get", "Test_Good.Nmae=\"a\""}, "its keys are Name"},
        {{"get", "Test_Good"}, "the key Name of Test_Good is missing"},
        {{"create", "Test_Good", "Level=70000"}, "Level: \"70000\" is no uint16"},
        {{"create", "Test_Good", "Lvel=7"}, "did you mean Level?"},
        {{"create", "Test_Good", "=7"}, "has no property"},
        {{"names", "Test_Good", "extra"}, "not expected: extra"},
        {{"modify", A}, "at least one NAME=VALUE"},
        {{"modify", A, "Name=b"}, "cannot be changed"},
        {{"invoke", A, "Ehco"}, "did you mean Echo?"},
        {{"invoke", A, "Echo", "NumberOut=1"}, "has no input NumberOut"},
        {{"assoc", A, "--via", "Test_Good"}, "Test_Good is no association"},
        {{"census", "--simulate", "no-such-scenario"}, "there is no scenario no-such-scenario"},
        {{"census", "--host-root", "x"}, "--host-root goes with --simulate"},
        {{"census", "--platform", "/nonexistent.json"}, "/nonexistent.json: cannot be read"},
    };
    for (const Wrong_Usage& each : cases) {
        const Outcome result = run(each.arguments);
        EXPECT_EQ(result.status, 2) << each.says << "\n" << result.err;
        EXPECT_NE(result.err.find(each.says), std::string::npos)
            << "not \"" << each.says << "\" but " << result.err;
        EXPECT_EQ(result.out, "") << each.says;
    }
    EXPECT_EQ(run({"census"}, "/nonexistent.so").status, 2);
}

TEST(Mpcactl, ACimErrorEndsWithOneAndItsWord) {
    const Outcome missing = run({"get", "Test_Good.Name=\"none\""});
    EXPECT_EQ(missing.status, 1);
    EXPECT_EQ(missing.err, "mpcactl: CMPI_RC_ERR_NOT_FOUND: no such name\n");
    EXPECT_EQ(missing.out, "");
    const Outcome unserved = run({"enum", "Test_Platform"});
    EXPECT_EQ(unserved.status, 1);
    EXPECT_NE(unserved.err.find("CMPI_RC_ERR_NOT_SUPPORTED"), std::string::npos);
}

TEST(Mpcactl, ProviderFaultsAndLeaksEndWithOne) {
    const std::vector<std::string> leak = {"invoke", "Test_Bad.Name=\"x\"", "Misbehave",
                                           "How=leak of a clone"};
    const Outcome result = run(leak, MISBEHAVING_PROVIDER);
    EXPECT_EQ(result.status, 1);
    EXPECT_EQ(result.out, "ReturnValue  0\n");
    EXPECT_EQ(result.err, "1 provider fault:\n  leak: 1 CMPIString was never released\n");
}

TEST(Mpcactl, HelpIsOnEveryLevel) {
    const Outcome top = run_bare({"--help"});
    EXPECT_EQ(top.status, 0);
    EXPECT_NE(top.out.find("Examples:"), std::string::npos);
    for (const char* command : {"classes", "enum", "names", "get", "create", "modify", "delete",
                                "census", "assoc", "assoc-names", "refs", "ref-names", "invoke"}) {
        EXPECT_NE(top.out.find(command), std::string::npos);
        const Outcome help = run_bare({command, "--help"});
        EXPECT_EQ(help.status, 0) << command;
        EXPECT_NE(help.out.find("Example"), std::string::npos) << command;
    }
}

TEST(Mpcactl, CallsAreTraced) {
    const Outcome result = run({"names", "Test_Good", "--trace-calls"});
    EXPECT_NE(result.err.find("call Test_Good enumerateInstanceNames"), std::string::npos);
}

} // namespace
