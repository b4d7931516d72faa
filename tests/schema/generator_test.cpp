// What the generator writes, and how it fails.
#include "schema/generator/generator.h"

#include <gtest/gtest.h>

#include <sys/wait.h>

#include <algorithm>
#include <cstdio>
#include <set>
#include <sstream>

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

// The part of a text from a beginning up to what the next part begins with.
std::string part(const std::string& text, const std::string& begin, const std::string& next) {
    const std::size_t place = text.find(begin);
    return place == std::string::npos
               ? ""
               : text.substr(place, text.find(next, place + begin.size()) - place);
}

TEST_F(Generated, RegistrationInSections) {
    const std::string text = contents("share/vorlan_mpca_provider.reg");
    EXPECT_EQ(part(text, "[VLNMPCA_Card]\n", "["), "[VLNMPCA_Card]\n"
                                                   "   provider: VLNMPCA_Card_Provider\n"
                                                   "   location: vorlan_mpca_provider\n"
                                                   "   type: instance method\n"
                                                   "   group: vorlan_mpca\n"
                                                   "   unload: never\n"
                                                   "   namespace: root/vorlan\n");
    EXPECT_EQ(part(text, "[VLNMPCA_CardConformsToProfile]\n", "["),
              "[VLNMPCA_CardConformsToProfile]\n"
              "   provider: VLNMPCA_CardConformsToProfile_Provider\n"
              "   location: vorlan_mpca_provider\n"
              "   type: instance method association\n"
              "   group: vorlan_mpca\n"
              "   unload: never\n"
              "   namespace: root/vorlan root/pg_interop\n");
    EXPECT_EQ(text.find(" \n"), std::string::npos);
    EXPECT_EQ(text.compare(0, 37, "[VLNMPCA_SoftwareInstallationService]"), 0);
}

TEST_F(Generated, RegistrationAsInstances) {
    const std::string text = contents("share/registration/provider_module.mof");
    EXPECT_EQ(text.find("instance of PG_ProviderModule\n{\n"
                        "    Name = \"vorlan_mpca_provider\";\n"
                        "    Vendor = \"Vorlan\";\n"
                        "    Version = \"10.2.261\";\n"
                        "    InterfaceType = \"CMPI\";\n"
                        "    InterfaceVersion = \"2.0.0\";\n"
                        "    Location = \"vorlan_mpca_provider\";\n"
                        "    UserContext = 4;\n"
                        "    ModuleGroupName = \"vorlan_mpca\";\n"
                        "};\n"),
              0u);
    EXPECT_NE(text.find("instance of PG_Provider\n{\n"
                        "    ProviderModuleName = \"vorlan_mpca_provider\";\n"
                        "    Name = \"VLNMPCA_CardConformsToProfile_Provider\";\n"
                        "};\n\n"
                        "instance of PG_ProviderCapabilities\n{\n"
                        "    ProviderModuleName = \"vorlan_mpca_provider\";\n"
                        "    ProviderName = \"VLNMPCA_CardConformsToProfile_Provider\";\n"
                        "    CapabilityID = \"VLNMPCA_CardConformsToProfile\";\n"
                        "    ClassName = \"VLNMPCA_CardConformsToProfile\";\n"
                        "    Namespaces = {\"root/vorlan\", \"root/PG_InterOp\"};\n"
                        "    ProviderType = {2, 3, 5};\n"
                        "    SupportedProperties = NULL;\n"
                        "    SupportedMethods = NULL;\n"
                        "};\n"),
              std::string::npos);
    EXPECT_NE(part(text, "ClassName = \"VLNMPCA_Card\"", "}\n;")
                  .find("    Namespaces = {\"root/vorlan\"};\n    ProviderType = {2, 5};\n"),
              std::string::npos);
}

// The classes under whose name a text names a namespace: the name stands between a word at the
// beginning of a line and a character.
std::set<std::string> classes_in(const std::string& text, const std::string& name_space,
                                 const std::string& word, char end) {
    std::istringstream lines(text);
    std::set<std::string> found;
    std::string name;
    for (std::string line; std::getline(lines, line);) {
        if (line.starts_with(word))
            name = line.substr(word.size(), line.find(end, word.size()) - word.size());
        if (line.find(name_space) != std::string::npos)
            found.insert(name);
    }
    return found;
}

// Profiles are served in both namespaces, and so are the classes that a client walks over to the
// elements and to other profiles. Both forms say the same.
TEST_F(Generated, ProfileClassesAreRegisteredForInterop) {
    const std::string sections = contents("share/vorlan_mpca_provider.reg");
    const std::string instances = contents("share/registration/provider_module.mof");
    const std::set<std::string> found = classes_in(sections, "root/pg_interop", "[", ']');
    EXPECT_EQ(found, classes_in(instances, "root/PG_InterOp", "    ClassName = \"", '"'));
    EXPECT_EQ(found.size(), 16u);
    for (const std::string& name : found)
        EXPECT_TRUE(name == "VLNMPCA_RegisteredProfile" || name == "VLNMPCA_ReferencedProfile" ||
                    name == "VLNMPCA_BaseServerReferencedProfile" ||
                    name.ends_with("ConformsToProfile"))
            << name;
    EXPECT_EQ(classes_in(sections, "root/vorlan", "[", ']').size(), 299u);
    EXPECT_EQ(classes_in(instances, "\"root/vorlan\"", "    ClassName = \"", '"').size(), 299u);
}

// ---- The layers of MOF ----

constexpr const char* QUALIFIERS = "10_vorlan_mpca_qualifiers.mof";
constexpr const char* BASE = "20_vorlan_mpca_base.mof";
constexpr const char* PROVIDER = "30_vorlan_mpca_provider.mof";
constexpr const char* ADDITIONS = "final/20_vorlan_mpca_additions.mof";
constexpr const char* INTEROP = "interop/30_vorlan_mpca_interop.mof";

mof::Document document_of(const std::vector<const char*>& files) {
    std::string text;
    for (const char* file : files)
        text += contents(std::string("share/mof/") + file);
    return mof::parse_text(text, "share");
}

using Names = std::set<std::string>;

Names names_of(const mof::Document& document) {
    Names names;
    for (const mof::Class& each : document.classes)
        names.insert(each.name);
    return names;
}

// The superclass, and the classes of references and embedded objects.
Names named_by(const mof::Class& declared) {
    Names names;
    for (const mof::Feature& feature : declared.features) {
        names.insert(feature.target);
        for (const mof::Parameter& parameter : feature.parameters)
            names.insert(parameter.target);
    }
    names.insert(declared.superclass);
    names.erase("");
    return names;
}

// As a compiler reads it that knows only what came before; and each class has its version.
void expect_loads(const mof::Document& document) {
    const mof::Schema schema{mof::Document(document)};
    Names known;
    for (const mof::Class& each : document.classes) {
        known.insert(each.name);
        for (const std::string& name : named_by(each))
            EXPECT_TRUE(known.count(name)) << each.name << " names " << name;
        EXPECT_TRUE(mof::find(each.qualifiers, "Version")) << each.name;
    }
}

bool is_experimental(const mof::Qualifiers& qualifiers) {
    return mof::is_true(qualifiers, "Experimental");
}

// Of the base classes that are Experimental here these are in Final releases all the same.
const Names FINAL_LATER = {"CIM_DiagnosticSettingData", "CIM_VLANEndpointSettingData"};

// Gives a class what it would have from a superclass that is not there.
void fold(mof::Class& into, const mof::Class& superclass) {
    into.superclass = superclass.superclass;
    for (mof::Feature inherited : superclass.features) {
        const auto own =
            std::find_if(into.features.begin(), into.features.end(),
                         [&](const mof::Feature& each) { return each.name == inherited.name; });
        if (own == into.features.end())
            into.features.push_back(inherited);
        else if (!inherited.is_override())
            std::erase_if(own->qualifiers,
                          [](const auto& each) { return each.name == "Override"; });
    }
}

// A Final CIM Schema as poor as one can be: whatever has been Experimental is not there.
mof::Document final_schema() {
    mof::Document document = document_of({QUALIFIERS, BASE});
    std::map<std::string, mof::Class> gone;
    std::vector<mof::Class> classes;
    for (mof::Class& each : document.classes) {
        if (const auto found = gone.find(each.superclass); found != gone.end())
            fold(each, found->second);
        std::erase_if(each.features,
                      [](const auto& one) { return is_experimental(one.qualifiers); });
        if (is_experimental(each.qualifiers) && !FINAL_LATER.count(each.name))
            gone.emplace(each.name, each);
        else
            classes.push_back(each);
    }
    document.classes = std::move(classes);
    return document;
}

mof::Document over(mof::Document below, const std::vector<const char*>& files) {
    for (mof::Class& each : document_of(files).classes)
        below.classes.push_back(std::move(each));
    return below;
}

TEST_F(Generated, LayersLoadOverWhatTheyNeed) {
    expect_loads(document_of({QUALIFIERS, BASE, PROVIDER}));
    expect_loads(over(final_schema(), {ADDITIONS, PROVIDER}));
    expect_loads(document_of({QUALIFIERS, BASE, INTEROP}));
    expect_loads(over(final_schema(), {INTEROP}));
    EXPECT_EQ(names_of(document_of({PROVIDER})).size(), 299u);
    EXPECT_EQ(names_of(document_of({BASE})).size(), 139u);
    // As tools take a folder: by the names of its files.
    Names files;
    for (const auto& entry : fs::directory_iterator("share/mof"))
        if (entry.is_regular_file())
            files.insert(entry.path().filename());
    EXPECT_EQ(files, (Names{QUALIFIERS, BASE, PROVIDER}));
}

TEST_F(Generated, AdditionsAreWhatOursNeedAndNoFinalSchemaHas) {
    Names used;
    for (const mof::Class& each : document_of({ADDITIONS, PROVIDER}).classes)
        used.merge(named_by(each));
    const Names present = names_of(over(final_schema(), {PROVIDER}));
    Names missing;
    std::set_difference(used.begin(), used.end(), present.begin(), present.end(),
                        std::inserter(missing, missing.end()));
    EXPECT_EQ(names_of(document_of({ADDITIONS})), missing);
    EXPECT_EQ(missing, (Names{"CIM_ProductElementComponent", "CIM_SCSIArbitraryLogicalUnit",
                              "CIM_iSCSISessionStatistics"}));
}

TEST_F(Generated, InteropHasWhatTellsOfProfiles) {
    const Names interop = names_of(document_of({INTEROP}));
    for (const mof::Class& each : document_of({PROVIDER}).classes)
        EXPECT_TRUE(each.name.find("Profile") == std::string::npos || interop.count(each.name))
            << each.name;
    EXPECT_LT(interop.size(), 30u);
}

// What is written reads back as it was: the generator makes the same of it again.
TEST_F(Generated, MofOfTheLayersIsWhole) {
    std::string all;
    for (const char* file : {QUALIFIERS, BASE, PROVIDER})
        all += std::string("#pragma include (\"share/mof/") + file + "\")\n";
    generator::Output(".").write("again.mof", all);
    ASSERT_EQ(run("again.mof out_again share_again 1 1 1"), (std::pair<std::string, int>("", 0)));
    for (const char* file : {QUALIFIERS, BASE, PROVIDER, ADDITIONS, INTEROP})
        EXPECT_EQ(contents(std::string("share_again/mof/") + file),
                  contents(std::string("share/mof/") + file));
    // Nothing of the catalogue is lost but what is of other parties.
    const mof::Schema catalogue = mof::load_schema(MOF_FOLDER "/catalogue.mof");
    const mof::Schema written = mof::load_schema("again.mof");
    const auto features = [](const mof::Schema_Class& of) {
        std::string text;
        for (const mof::Schema_Feature& each : of.features)
            if (each.name() != "LocationIndicator") // in the class that sets it
                text += each.feature->text + "\n";
        return text;
    };
    for (const auto& each : catalogue.classes())
        if (each->name().starts_with("CIM_") || each->name().starts_with("VLNMPCA_")) {
            EXPECT_EQ(features(*each), features(*written.find(each->name())));
        }
    EXPECT_EQ(written.find("CIM_LogicalDevice")->find("LocationIndicator"), nullptr);
    EXPECT_NE(written.find("VLNMPCA_EthernetPort")->find("LocationIndicator"), nullptr);
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

// What documents a class reaches object managers, and costs the library nothing.
TEST(Generator, DescriptionsStayInTheMof) {
    const generator::Output here(".");
    const std::string qualifiers = contents(MOF_FOLDER "/qualifiers.mof");
    const std::string documented = R"([Version("1.0.0"), Description("Long, "
    "and wrapped.")]
class VLNMPCA_A
{
    [Key, Description("Name.")] string Id;
    [PUnit("byte"), Description("Room.")] uint64 Size;

    [Description("Runs."), ValueMap{"0", ".."}, Values{"Done", "Failed"}]
    uint32 Run(
        [In, Description("How."), ValueMap{"1"}, Values{"At once"}] uint8 Mode);
};)";
    here.write("documented.mof", qualifiers + documented);
    here.write("plain.mof", qualifiers + "class VLNMPCA_A { [Key] string Id; uint64 Size;"
                                         " uint32 Run([In] uint8 Mode); };");
    for (const char* name : {"plain", "documented"}) {
        fs::remove_all(name);
        const std::string to = std::string(name) + "/out " + name + "/share 1 1 1";
        ASSERT_EQ(run(name + std::string(".mof ") + to), (std::pair<std::string, int>("", 0)));
    }
    EXPECT_NE(contents("documented/share/mof/30_vorlan_mpca_provider.mof").find(documented),
              std::string::npos);
    for (const auto& entry : fs::recursive_directory_iterator("plain/out"))
        if (entry.is_regular_file()) {
            const fs::path other = "documented" / fs::relative(entry.path(), "plain");
            EXPECT_EQ(contents(entry.path()), contents(other)) << other;
        }
}

TEST(Generator, EndsWithThePlaceOfTheFault) {
    const generator::Output here(".");
    here.write("mof/main.mof", "#pragma include (\"part.mof\")\n");
    here.write("mof/part.mof", "class VLNMPCA_A\n{\n    [Key] string Id\n};\n");
    EXPECT_EQ(run("mof/main.mof bad_out bad_share 1 1 1"),
              (std::pair<std::string, int>(
                  "mof/part.mof:4:1: expected ';' after the feature, found '}'\n", 1)));
    EXPECT_FALSE(fs::exists("bad_out"));
    EXPECT_EQ(run("--check " MOF_FOLDER "/catalogue.mof").second, 0);
    EXPECT_EQ(run("none.mof bad_out bad_share 1 1 1"),
              (std::pair<std::string, int>("none.mof:1:1: cannot read the file\n", 1)));
    here.write("mof/part.mof", "class CIM_A { };\n");
    EXPECT_EQ(run("mof/main.mof bad_out bad_share 1 1 1").second, 1) << "nothing to provide";
    here.write("mof/part.mof", "class VLNMPCA_A { [Key] string Id; };\n");
    EXPECT_EQ(run("mof/main.mof /proc/nowhere share2 1 1 1").second, 1);
    for (const char* wrong :
         {"", "mof/main.mof", "mof/main.mof o s 0 1 1", "mof/main.mof o s 1 x 1"})
        EXPECT_EQ(run(wrong).second, 2) << wrong;
}

// What reads well, and the tables or the engine could not hold.
TEST(Generator, RefusesWhatTheTablesCannotHold) {
    const struct {
        const char* text;
        const char* reason;
    } cases[] = {
        // Names that C++ or the engine minds.
        {"class A { uint8 default; };", ":1:17: 'default' is a word of C++"},
        {"class A { uint8 f(uint8 Return_Value); };",
         ":1:25: 'Return_Value' is a name of the engine"},
        {"class A { uint32 String; }; class B : A { string Name; };",
         ":1:18: 'String' is a name of the engine"},
        {"class A { uint8 Property(); };", ":1:17: 'Property' is a name of the engine"},
        {"class A { uint8 f(string Array[]); };", ":1:26: 'Array' is a name of the engine"},
        {"class A { uint8 A; };", ":1:17: 'A' cannot be the name of a member"},
        {"class A { uint8 b; }; class B {};", ":1:17: 'b' cannot be the name of a member"},
        {"class A { uint8 __refs; };", ":1:17: '__refs' cannot be the name of a member"},
        {"class Instance {};", ":1:7: 'Instance' cannot be the name of a class"},
        {"class Datetime {};", ":1:7: 'Datetime' cannot be the name of a class"},
        {"class A { a ref x; };", ":1:17: 'a' is spelled 'A' elsewhere"},
        {"class A { uint8 x; }; class B : A { [Override(\"x\")] uint8 X; };",
         ":1:59: 'X' is spelled 'x' elsewhere"},
        // Values
        {"class A { uint8 v[3]; };", ":1:17: an array of fixed length is not supported"},
        {"class A { uint8 f(uint8 v[3]); };", ":1:25: an array of fixed length is not supported"},
        {"class A { uint8 v[] = {1, null}; };", ":1:27: null inside an array"},
        // Words for values
        {"class A { [ValueMap{\"1\"}, Values{\"a\", \"b\"}] uint8 v; };",
         ":1:27: Values has 2 words for the 1 entries of ValueMap"},
        {"class A { [Values{\"a\"}] uint8 f(); };",
         ":1:12: Values stands alone, without entries for its words"},
        {"class A { uint8 f([ValueMap{\"1\"}] uint8 x); };",
         ":1:20: ValueMap stands alone, without words for its entries"},
        {"class A { [BitMap{\"0\", \"1\"}, BitValues{\"a\"}] uint8 v; };",
         ":1:30: BitValues has 1 words for the 2 entries of BitMap"},
        {"class A { [ValueMap{\"2..1\"}, Values{\"a\"}] uint8 v; };",
         ":1:12: '2..1' of ValueMap is no value of the type"},
        {"class A { [ValueMap{\"256\"}, Values{\"a\"}] uint8 v; };",
         ":1:12: '256' of ValueMap is no value of the type"},
        {"class A { [ValueMap{\"x\"}, Values{\"a\"}] uint8 v; };",
         ":1:12: 'x' of ValueMap is no value of the type"},
        {"class A { [ValueMap{\"1..4\", \"4\"}, Values{\"a\", \"b\"}] uint8 v; };",
         ":1:12: '4' of ValueMap is claimed twice"},
        {"class A { [ValueMap{\"1\"}, Values{\"a\"}] boolean v; };",
         ":1:12: a boolean has no ValueMap"},
        // Keys and ends
        {"[Abstract] class VLNMPCA_A { [Key] uint8 x; };",
         ":1:18: a provided class cannot be abstract"},
        {"class A { uint8 x; }; class VLNMPCA_A : A { uint8 y; };",
         ":1:29: a provided class has a key at least"},
        {"[Association] class A { [Key] A ref x; };",
         ":1:21: an association has two references at least"},
        {"[Abstract, Association] class A { [Key] A ref x; [Key] A ref y; };",
         ":1:31: Association is the first qualifier of a class"},
        {"class A { [Key] uint8 x; }; class B : A { [Key] uint8 y; };",
         ":1:55: 'y' is a key below A, which has its keys"},
        {"class A { [Key] uint8 x; uint8 y; }; class B : A { [Override(\"y\"), Key] uint8 y; };",
         ":1:79: 'y' is a key below A, which has its keys"},
    };
    const auto refuse = [](const std::string& text, const char* reason) {
        const std::string path = "bad.mof";
        generator::Output(".").write(path, text);
        try {
            generator::load_catalogue(path);
            ADD_FAILURE() << "accepted: " << text;
        } catch (const mof::Error& error) {
            EXPECT_EQ(error.what(), path + reason) << text;
        }
    };
    for (const auto& bad : cases)
        refuse(bad.text, bad.reason);
    for (const char* other : {"uint8 z", "uint16 x", "uint8 x[]", "[Out] uint8 x", "B ref x", ""})
        refuse(std::string("class A { uint8 f(") + (*other == 'B' ? "A ref x" : "uint8 x") +
                   "); }; class B : A { [Override(\"f\")] uint8 f(" + other + "); };",
               ":1:68: 'f' has not the parameters that A gives it");
}

} // namespace
