// What the generator writes, and how it fails.
#include "schema/generator/generator.h"

#include <gtest/gtest.h>

#include <sys/wait.h>

#include <algorithm>
#include <cstdio>
#include <set>

namespace {

namespace fs = std::filesystem;

std::string contents(const std::string& path) {
    std::optional<std::string> text = mof::read_file(path);
    EXPECT_TRUE(text) << path;
    return text.value_or("");
}

// Standard error and exit status of a run of the program.
std::pair<std::string, int> run(const std::string& arguments) {
    std::FILE* pipe = popen((GENERATOR " " + arguments + " 2>&1").c_str(), "r");
    std::string output;
    for (int c; (c = std::fgetc(pipe)) != EOF;)
        output += static_cast<char>(c);
    const int status = pclose(pipe);
    return {output, WIFEXITED(status) ? WEXITSTATUS(status) : -1};
}

class Generated : public testing::Test {
protected:
    static void SetUpTestSuite() {
        fs::remove_all("out");
        ASSERT_EQ(run(MOF_FOLDER "/catalogue.mof out share 3 2 1"),
                  (std::pair<std::string, int>("", 0)));
    }
};

TEST_F(Generated, ExportsTheFactoriesAndTheModule) {
    const std::string map = contents("out/export.map");
    const std::size_t local = map.find("local:\n    *;\n");
    ASSERT_NE(local, std::string::npos);
    std::set<std::string> symbols;
    std::size_t count = 0;
    for (std::size_t at = 0; (at = map.find(";\n", at)) < local; at++) {
        const std::size_t begin = map.rfind(' ', at) + 1;
        symbols.insert(map.substr(begin, at - begin));
        count++;
    }
    EXPECT_EQ(count, 1591u);
    EXPECT_EQ(symbols.size(), count);
    for (const char* symbol :
         {"cimple_module", "VLNMPCA_Card_Create_InstanceMI",
          "VLNMPCA_Card_Provider_Create_MethodMI", "VLNMPCA_Realizes_Create_AssociationMI"})
        EXPECT_TRUE(symbols.count(symbol)) << symbol;
    EXPECT_FALSE(symbols.count("VLNMPCA_Card_Create_AssociationMI"));
    EXPECT_FALSE(symbols.count("CIM_Card_Create_InstanceMI"));
}

TEST_F(Generated, RegistrationStanzas) {
    const std::string text = contents("share/vorlan_mpca_provider.reg");
    const auto stanza = [&](const std::string& name) {
        const std::size_t begin = text.find("[" + name + "]\n");
        return begin == std::string::npos ? ""
                                          : text.substr(begin, text.find('[', begin + 1) - begin);
    };
    EXPECT_EQ(stanza("VLNMPCA_Card"), "[VLNMPCA_Card]\n"
                                      "   provider: VLNMPCA_Card_Provider\n"
                                      "   location: vorlan_mpca_provider\n"
                                      "   type: instance method\n"
                                      "   group: vorlan_mpca\n"
                                      "   unload: never\n"
                                      "   namespace: root/vorlan\n");
    EXPECT_NE(stanza("VLNMPCA_Realizes").find("   type: instance method association\n"),
              std::string::npos);
    EXPECT_NE(
        stanza("VLNMPCA_RegisteredProfile").find("   namespace: root/vorlan root/pg_interop\n"),
        std::string::npos);
    EXPECT_EQ(std::count(text.begin(), text.end(), '['), 299);
    EXPECT_EQ(text.find(" \n"), std::string::npos);
    EXPECT_EQ(text.compare(0, 37, "[VLNMPCA_SoftwareInstallationService]"), 0);
}

// Reads as a compiler does that knows only what came before.
TEST_F(Generated, SharedMofReadsInOnePass) {
    const std::string all = contents("share/vorlan_mpca_qualifiers.mof") +
                            contents("share/vorlan_mpca_base.mof") +
                            contents("share/vorlan_mpca_provider.mof");
    const mof::Schema schema(mof::parse_text(all, "share"));
    EXPECT_EQ(schema.classes().size(), 441u);
    EXPECT_FALSE(schema.document().qualifiers.empty());
    for (const auto& each : schema.classes()) {
        const auto known = [&](const mof::Declaration& declaration) {
            if (declaration.target.empty())
                return;
            EXPECT_LE(schema.find(declaration.target)->number, each->number)
                << each->name() << " names " << declaration.target;
        };
        for (const mof::Feature& feature : each->declaration->features) {
            known(feature);
            for (const mof::Parameter& parameter : feature.parameters)
                known(parameter);
        }
    }
}

TEST_F(Generated, StructuresAddNewMembersOnly) {
    const std::string port = contents("out/classes/VLNMPCA_EthernetPort.h");
    EXPECT_NE(port.find("struct VLNMPCA_EthernetPort : CIM_EthernetPort {\n"
                        "    Property<String> FunctionalQosBandwidth;\n"),
              std::string::npos);
    const std::string realizes = contents("out/classes/VLNMPCA_Realizes.h");
    EXPECT_EQ(realizes.find("Antecedent;"), std::string::npos);
    const std::string dependency = contents("out/classes/CIM_Dependency.h");
    EXPECT_NE(dependency.find("    CIM_ManagedElement* Antecedent;\n"), std::string::npos);
    const std::string job = contents("out/classes/CIM_ConcreteJob.h");
    EXPECT_NE(job.find("    Instance* JobInParameters;\n"), std::string::npos);
    EXPECT_NE(job.find("struct CIM_ConcreteJob_GetErrors_method : Instance {\n"
                       "    Property<Array<CIM_Error*>> Errors;\n"
                       "    Property<uint32> return_value;\n"),
              std::string::npos);
}

TEST_F(Generated, ASecondRunTouchesNothing) {
    // An age that a rewritten file would not have.
    const fs::file_time_type old = fs::file_time_type::clock::now() - std::chrono::hours(48);
    std::size_t files = 0;
    const auto each_file = [&](const auto& action) {
        for (const char* folder : {"out", "share"})
            for (const auto& entry : fs::recursive_directory_iterator(folder))
                if (entry.is_regular_file())
                    action(entry.path());
    };
    each_file([&](const fs::path& path) { fs::last_write_time(path, old); });
    ASSERT_EQ(run(MOF_FOLDER "/catalogue.mof out share 3 2 1").second, 0);
    each_file([&](const fs::path& path) {
        EXPECT_EQ(fs::last_write_time(path), old) << path;
        files++;
    });
    EXPECT_GT(files, 441u);
}

TEST(Generator, EndsWithThePlaceOfTheFault) {
    const generator::Output here(".");
    here.write("mof/main.mof", "#pragma include (\"part.mof\")\n");
    here.write("mof/part.mof", "class VLNMPCA_A\n{\n    [Key] string Id\n};\n");
    EXPECT_EQ(run("mof/main.mof bad_out bad_share 1 1 1"),
              (std::pair<std::string, int>(
                  "mof/part.mof:4:1: expected ';' after the feature, found '}'\n", 1)));
    EXPECT_FALSE(fs::exists("bad_out"));
    EXPECT_EQ(run("--check mof/main.mof").second, 1);
    EXPECT_EQ(run("--check " MOF_FOLDER "/catalogue.mof").second, 0);
    EXPECT_EQ(run("none.mof bad_out bad_share 1 1 1"),
              (std::pair<std::string, int>("none.mof:1:1: cannot read the file\n", 1)));
    here.write("mof/part.mof", "class CIM_A { };\n");
    EXPECT_EQ(run("mof/main.mof bad_out bad_share 1 1 1").second, 1);
    here.write("mof/part.mof", "class VLNMPCA_A { [Key] string Id; };\n");
    EXPECT_EQ(run("mof/main.mof /proc/nowhere share2 1 1 1").second, 1);
    for (const char* wrong :
         {"", "mof/main.mof", "mof/main.mof o s 0 1 1", "mof/main.mof o s 1 x 1"})
        EXPECT_EQ(run(wrong).second, 2) << wrong;
}

} // namespace
