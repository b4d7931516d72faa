// mpcactl: each command, its forms of output, its words about errors.

#include "tests/host/mpcactl.h"

#include "host/path_text.h"

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include <filesystem>

namespace {

// Documented sessions write files and clear them away: never in the folder that somebody stands in.
[[maybe_unused]] const bool IN_OWN_FOLDER = (std::filesystem::create_directories(TEST_FOLDER),
                                             std::filesystem::current_path(TEST_FOLDER), true);

const std::string A = "Test_Good.Name=\"a\"";

TEST(Mpcactl, ListsClassesNamesAndCounts) {
    EXPECT_EQ(run({"classes"}).out, "Test_Good\n");
    EXPECT_NE(run({"classes", "--all"}).out.find("Test_Link\n"), std::string::npos);
    EXPECT_EQ(run({"census"}).out, "Test_Good\t3\n");
    // Test_Base itself has no provider.
    const Outcome names = run({"names", "Test_Base"});
    EXPECT_EQ(run({"enum", "Test_Base", "-p", "Level"}).out, "Level\n1\n2\n3\n");
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
    EXPECT_EQ(run({"refs", A, "-p", " Strength ,"}).out, "Strength\n7\n");
    EXPECT_EQ(run({"get", A, "-p", "Inner,Note"}).out, "Inner  Note\nNULL   NULL\n");
    const std::string list = run({"get", A}).out;
    EXPECT_EQ(list.substr(0, list.find('\n')),
              "Name  Level  Big                   Offset  Ratio  Flag  When                       "
              "Words                 Numbers  Note");
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
    EXPECT_FALSE(properties.contains("Inner"));
}

TEST(Mpcactl, PrintsMof) {
    const std::string mof = run({"get", A, "-p", "Words,Big,Note", "--format", "mof"}).out;
    EXPECT_EQ(mof, "instance of Test_Good\n{\n"
                   "    Name  = \"a\";\n"
                   "    Big   = 18446744073709551615;\n"
                   "    Words = {\"one\", \"two,three\", NULL};\n"
                   "    Note  = NULL;\n};\n");
}

TEST(Mpcactl, PrintsWordsBesideValues) {
    const auto words = [](std::vector<std::string> command) {
        command.push_back("--words");
        return run(command).out;
    };
    EXPECT_EQ(words({"enum", "Test_Good", "-p", "Level"}), "Level\n1 (Low)\n2\n3 (High)\n");
    EXPECT_EQ(words({"get", A, "-p", "Big"}), "Big\n18446744073709551615 (Sound, Light)\n");
    EXPECT_EQ(words({"assoc", A, "-p", "Level,Words"}),
              "Level  Words\n0      one (First */ of all), two,three, NULL\n");
    EXPECT_EQ(words({"get", A, "-p", "Level,Words", "--format", "mof"}),
              "instance of Test_Good\n{\n"
              "    Name  = \"a\";\n"
              "    Level = 1 /* Low */;\n"
              "    Words = {\"one\" /* First * / of all */, \"two,three\", NULL};\n};\n");
    EXPECT_EQ(words({"invoke", A, "Echo", "Number=5"}),
              "ReturnValue  0 (Done)\nNumberOut    5 (Five)\n");
    EXPECT_EQ(words({"get", A, "--format", "json"}), run({"get", A, "--format", "json"}).out)
        << "programs read numbers";
}

TEST(Mpcactl, AClassShowsWhatItMeans) {
    const std::string text = run({"class", "Test_Good"}).out;
    for (const char* part :
         {"by the module\n\nSays what it hears.\n\nProperties\n",
          "for a second line of the\n      text. [decibel]\n      1 Low; 3.. High\n  Big ",
          "      bit 0 Sound; bit 3 Light; bit 63 Sound\n",
          "  uint32 Echo\n      Gives back what it is given.\n      0 Done; .. Failed\n    in "})
        EXPECT_NE(text.find(part), std::string::npos) << part << "\n" << text;
    const auto json = nlohmann::json::parse(run({"class", "Test_Good", "--format", "json"}).out);
    EXPECT_EQ(json["description"], "Says what it hears.");
    EXPECT_EQ(json["properties"][1]["unit"], "decibel");
    EXPECT_EQ(json["methods"][0]["values"].dump(),
              R"([{"value":"0","word":"Done"},{"value":"..","word":"Failed"}])");
}

TEST(Mpcactl, ChangesAndCalls) {
    EXPECT_EQ(run({"create", "Test_Good", "Name=it's, \"new\"", "Level=0x10"}).out,
              "Test_Good.Name=\"it's, \\\"new\\\"\"\n");
    EXPECT_EQ(run({"modify", A, "Level=5", "Note"}).status, 0);
    EXPECT_EQ(run({"delete", A}).status, 0);
    const std::string long_name(60, 'x');
    EXPECT_EQ(run({"invoke", A, "Echo", "Words=" + long_name}).out,
              "ReturnValue  0\nWordsOut     " + long_name + "\n")
        << "cells are cut on a terminal only";
    EXPECT_EQ(
        run({"invoke", A, "Echo", "Number=18446744073709551615", "Words=x,y", "Who=" + A}).out,
        "ReturnValue  0\nNumberOut    18446744073709551615\nWordsOut     x, y\n"
        "WhoOut       " +
            A + "\n");
    EXPECT_EQ(run({"invoke", A, "Echo", "Words=[\"a,b\"]", "--format", "json"}).out,
              "{\n  \"returnValue\": 0,\n  \"outputs\": {\n    \"WordsOut\": [\n      \"a,b\"\n"
              "    ]\n  }\n}\n");
}

TEST(Mpcactl, ListsAreSplitBetweenTheirElements) {
    const std::pair<const char*, const char*> lists[] = {
        {"a,b", R"(["a","b"])"},
        {"", "[]"},
        {",", R"(["",""])"},
        {R"("a,b",c)", R"(["a,b","c"])"},
        {R"("say \"a,b\" \\",c)", R"(["say \"a,b\" \\","c"])"},
        {R"(5" disk,3" disk)", R"(["5\" disk","3\" disk"])"},
        {R"(n:C.K="a,b",L=1,D.K=2,x)", R"(["n:C.K=\"a,b\",L=1","D.K=2","x"])"},
        {R"(a=1,b=2)", R"(["a=1","b=2"])"},
        {R"(["a,b",null])", R"(["a,b",null])"},
    };
    for (const auto& [list, elements] : lists) {
        const Outcome result =
            run({"invoke", A, "Echo", "Words=" + std::string(list), "--format", "json"});
        ASSERT_EQ(result.status, 0) << list << "\n" << result.err;
        EXPECT_EQ(nlohmann::json::parse(result.out)["outputs"]["WordsOut"].dump(), elements);
    }
}

TEST(Mpcactl, AFileGivesItsBytes) {
    write_text("bytes.bin", std::string("\0\xff,", 3));
    const Outcome result =
        run({"create", "Test_Good", "Name=f", "Numbers=@bytes.bin", "--trace-calls"});
    EXPECT_EQ(result.out, "Test_Good.Name=\"f\"\n") << result.err;
}

TEST(Mpcactl, AClassShowsWhatItDeclaresAndInherits) {
    const std::string text = run({"class", "Test_Good"}).out;
    for (const char* line :
         {"Bases   Test_Base\n", "Keys    Name\n",
          "  Numbers  uint8[]                   of Test_Base\n", "  Inner    string of Test_Base",
          "  uint32 Echo\n", "    in   Words      string[]\n",
          "    out  WhoOut     Test_Base ref\n", "  uint32 Version (static)\n"})
        EXPECT_NE(text.find(line), std::string::npos) << line << text;
    const auto json = nlohmann::json::parse(run({"class", "Test_Link", "--format", "json"}).out);
    EXPECT_EQ(json["keys"].dump(), R"(["First","Second"])");
    EXPECT_EQ(json["properties"][1]["type"], "Test_Base ref");
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
        {{"enum", "Test_Good", "--format", "xml"}, "xml is no format"},
        {{"get", "Test_Good.Nmae=\"a\""}, "its keys are Name"},
        {{"get", "Test_Good"}, "the key Name of Test_Good is missing"},
        {{"create", "Test_Good", "Level=70000"}, "Level: \"70000\" is no uint16"},
        {{"create", "Test_Good", "Lvel=7", "--namespace", "root/with_a_long_name"},
         "did you mean Level?"},
        {{"create", "Test_Good", "Numbers=@/nonexistent"}, "/nonexistent cannot be read"},
        {{"create", "Test_Good", "Words=\"a,b"}, "a quote is not closed"},
        {{"create", "Test_Good", "Words=" + std::string(60000, '[') + std::string(60000, ']')},
         "nested too deeply"},
        {{"create", "Test_Good", "Level=" + std::string(100000, '9')}, "is no uint16"},
        {{"create", "Test_Good", "Lvel=7"}, "did you mean Level?"},
        {{"create", "Test_Good", "=7"}, "has no property"},
        {{"names", "Test_Good", "extra"}, "not expected: extra"},
        {{"modify", A}, "at least one NAME=VALUE"},
        {{"modify", A, "Name=b"}, "cannot be changed"},
        {{"refs", A, "-p", "Strenght"}, "did you mean Strength?"},
        {{"assoc", A, "--result-class", "Test_Good", "-p", "Strength"}, "has no property"},
        {{""}, "unknown command \"\""},
        {{"get", ""}, "a class name expected"},
        {{"run", "/nonexistent"}, "/nonexistent cannot be read"},
        {{"run", "/"}, "/ cannot be read"},
        {{"run", GOOD_PROVIDER}, ":1: this is no text"},
        {{"hardware", "1", "features", "35", "1"}, "without --simulate"},
        {{"class", "Test"}, "unknown class Test"},
        {{"invoke", A, "Ehco"}, "did you mean Echo?"},
        {{"invoke", A, "Echo", "NumberOut=1"}, "has no input NumberOut"},
        {{"assoc", A, "--via", "Test_Good"}, "Test_Good is no association"},
        {{"census", "--simulate", "no-such-scenario"}, "there is no scenario no-such-scenario"},
        {{"census", "--host-root", "x"}, "--host-root goes with --simulate"},
        {{"census", "--keep", "x"}, "--keep goes with --simulate"},
        {{"census", "--registration", TEST_MOF}, "\"[Class]\" or \"word: value\" expected"},
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
    const Outcome refused = run({"invoke", A, "Version", "--check"});
    EXPECT_EQ(refused.status, 1);
    EXPECT_EQ(refused.out, "ReturnValue  42\n");
    EXPECT_EQ(refused.err, "mpcactl: Version returned 42\n");
    EXPECT_EQ(run({"invoke", A, "Echo", "--check"}).status, 0);
}

TEST(Mpcactl, ARequestGoesWhereItsClassIsRegistered) {
    write_text("test.reg", "[Test_Good]\n   type: instance\n   group: test\n"
                           "   namespace: root/test root/other\n[Test_Link]\n"
                           "   type: association\n   group: test\n   namespace: root/test\n");
    const auto in = [](const char* name_space, std::vector<std::string> command) {
        command.insert(command.end(), {"--registration", "test.reg", "--namespace", name_space});
        return run(command);
    };
    EXPECT_EQ(in("root/other", {"enum", "Test_Base", "-p", "Level"}).out, "Level\n1\n2\n3\n");
    EXPECT_EQ(in("root/test", {"ref-names", A}).status, 0);
    EXPECT_EQ(in("root/other", {"ref-names", A}).out, "") << "the association is not served there";
    EXPECT_EQ(in("root/tset", {"names", "Test_Good"}).err,
              "mpcactl: CMPI_RC_ERR_INVALID_NAMESPACE: nothing is registered in namespace "
              "root/tset; did you mean root/test?\n");
    EXPECT_EQ(in("root/tset", {"assoc", A}).status, 1);
    EXPECT_EQ(in("root/other", {"names", "Test_Link"}).status, 1);
}

TEST(Mpcactl, AnAnswerThatIsTooLargeIsRefused) {
    const Outcome refused = run({"enum", "Test_Good", "--answer-limit", "1000"});
    EXPECT_EQ(refused.status, 1);
    EXPECT_NE(refused.err.find("1000 may be sent"), std::string::npos) << refused.err;
    EXPECT_EQ(run({"enum", "Test_Good", "--answer-limit", "0"}).status, 0);
}

TEST(Mpcactl, ProviderFaultsAndLeaksEndWithOne) {
    const std::vector<std::string> leak = {"invoke", "Test_Bad.Name=\"x\"", "Misbehave",
                                           "How=leak of a clone"};
    const Outcome result = run(leak, MISBEHAVING_PROVIDER);
    EXPECT_EQ(result.status, 1);
    EXPECT_EQ(result.out, "ReturnValue  0\n");
    EXPECT_EQ(result.err, "1 provider fault:\n  leak: 1 CMPIString was never released\n");
}

TEST(Mpcactl, CallsAreTraced) {
    const Outcome result = run({"names", "Test_Good", "--trace-calls"});
    EXPECT_NE(result.err.find("call Test_Good enumerateInstanceNames"), std::string::npos);
}

} // namespace
