#include "schema/mof_parser/mof.h"

#include <gtest/gtest.h>

namespace {

using mof::Value;

struct Bad_Case {
    const char* text;
    const char* message;
};

std::string message_of(const std::string& text) {
    try {
        mof::Schema schema(mof::parse_text(text, "t.mof"));
        return "no error";
    } catch (const mof::Error& error) {
        return error.what();
    }
}

TEST(MofParser, RefusesBadTextWithItsPlace) {
    const Bad_Case cases[] = {
        // Tokens
        {"class A { string s = \"x\n\"; };", "t.mof:1:22: text without closing quote"},
        {"class A { string s = \"x", "t.mof:1:22: text without closing quote"},
        {"class A { string s = \"a\\q\"; };", "t.mof:1:25: 'q' is no escape"},
        {"class A { string s = \"\\x0\"; };",
         "t.mof:1:24: an escape needs one to four hexadecimal digits, and not zero"},
        {"class A {\n  /* never\n closed", "t.mof:2:3: comment without end"},
        {"class A { uint8 a = 0x1G; };", "t.mof:1:21: 'G' is no digit of a number to base 16"},
        {"class A { uint8 a = 09; };", "t.mof:1:21: '9' is no digit of a number to base 8"},
        {"class A { uint64 a = 18446744073709551616; };", "t.mof:1:22: number out of range"},
        {"class A { real64 a = 1e999; };", "t.mof:1:22: '1e999' is out of range"},
        {"class A { real64 a = 1.2.3; };", "t.mof:1:22: '1.2.3' is no number"},
        {"class A { char16 a = ''; };", "t.mof:1:22: a character is missing"},
        {"class A ! {};", "t.mof:1:9: unexpected '!'"},
        {"\x01", "t.mof:1:1: unexpected byte 0x01"},
        // Structure
        {"klass A {};", "t.mof:1:1: expected a class, a qualifier declaration or a pragma, "
                        "found 'klass'"},
        {"instance of A { };", "t.mof:1:1: instances are not read here, only classes"},
        {"[Key] string a;", "t.mof:1:7: expected 'class' after the qualifiers, found 'string'"},
        {"class { };", "t.mof:1:7: expected the name of the class, found '{'"},
        {"class A { }", "t.mof:1:12: expected ';' after the class, found the end of the file"},
        {"class A {\n  uint8 a\n};", "t.mof:3:1: expected ';' after the feature, found '}'"},
        {"class A { foo a; };", "t.mof:1:11: unknown type 'foo'"},
        {"class A { uint8 a[0]; };", "t.mof:1:19: an array has 1 to 32767 elements"},
        {"class A { uint8 f([In] uint8 x uint8 y); };",
         "t.mof:1:32: expected ')' after the parameters, found 'uint8'"},
        {"class A { uint8 f(uint8 x, sint8 X); };", "t.mof:1:34: parameter 'X' twice"},
        {"class A { A ref f(); };", "t.mof:1:17: a method cannot return a reference"},
        {"class A { [Key, Key] uint8 a; };", "t.mof:1:17: qualifier 'Key' twice"},
        {"#pragma include (\"x.mof\")", "t.mof:1:18: an include cannot be followed here"},
        {"#pragma locale (7)", "t.mof:1:17: expected a text in the pragma, found a number"},
        // Values against their types
        {"class A { uint8 a = 256; };", "t.mof:1:21: number out of the range of uint8"},
        {"class A { sint8 a = -129; };", "t.mof:1:21: number out of the range of sint8"},
        {"class A { uint16 a = -1; };", "t.mof:1:22: number out of the range of uint16"},
        {"class A { uint16 a = \"1\"; };", "t.mof:1:22: expected a number of type uint16"},
        {"class A { boolean a = 1; };", "t.mof:1:23: expected true or false"},
        {"class A { string a = 1; };", "t.mof:1:22: expected a text"},
        {"class A { datetime a = \"2020\"; };", "t.mof:1:24: expected a datetime of 25 characters"},
        {"class A { uint8 a[] = 1; };", "t.mof:1:23: expected a list of values in braces"},
        {"class A { uint8 a = {1}; };", "t.mof:1:21: a list of values for something that is no "
                                        "array"},
        {"class A { uint8 a[2] = {1, 2, 3}; };", "t.mof:1:24: more values than the array has "
                                                 "elements"},
        {"class A { uint8 a[] = {1, {2}}; };", "t.mof:1:27: expected a value, found '{'"},
        {"class A { A ref a = \"x\"; };", "t.mof:1:21: a reference can have no default but null"},
        {"class A { [EmbeddedInstance] string a; };",
         "t.mof:1:12: EmbeddedInstance needs the name of a class"},
        {"class A { [EmbeddedObject] uint8 a; };",
         "t.mof:1:34: an embedded object is written as a string"},
    };
    for (const Bad_Case& bad : cases)
        EXPECT_EQ(message_of(bad.text), bad.message) << bad.text;
}

const mof::Feature& feature(const mof::Document& document, const char* name) {
    for (const mof::Feature& each : document.classes.back().features)
        if (each.name == name)
            return each;
    throw std::out_of_range(name);
}

TEST(MofParser, ReadsEveryKindOfDefault) {
    const mof::Document document = mof::parse_text(R"(
        CLASS A { // keywords in any case
            Boolean b = TRUE;
            uint8   hex = 0xFF; uint8 octal = 017; uint8 binary = 101b;
            sint64  least = -9223372036854775808;
            real64  real = -1.5e3; real32 whole = 2;
            char16  letter = 'x'; char16 code = '\x263A'; char16 wide = 'é';
            string  joined = "a" /* and */ "b\n\"\\\x41";
            datetime when = "20200102030405.000000+060";
            uint16  list[] = { 1, 2, 3 }; string none[] = {};
            string  nothing = null;
            uint32  fixed[4] = { 1 };
        };)",
                                                   "t.mof");
    const auto value = [&](const char* name) -> const Value& {
        return *feature(document, name).default_value;
    };
    EXPECT_TRUE(value("b").boolean);
    for (const auto& [name, magnitude] :
         std::initializer_list<std::pair<const char*, unsigned>>{{"hex", 255},
                                                                 {"octal", 15},
                                                                 {"binary", 5},
                                                                 {"letter", 'x'},
                                                                 {"code", 0x263A},
                                                                 {"wide", 0xE9}})
        EXPECT_EQ(value(name).magnitude, magnitude) << name;
    EXPECT_EQ(value("least").as_signed(), INT64_MIN);
    EXPECT_EQ(value("real").real, -1500.0);
    EXPECT_EQ(value("whole").kind, Value::Kind::real);
    EXPECT_EQ(value("joined").text, "ab\n\"\\A");
    EXPECT_EQ(value("when").text, "20200102030405.000000+060");
    EXPECT_EQ(value("list").elements.size(), 3u);
    EXPECT_EQ(value("none").kind, Value::Kind::array);
    EXPECT_EQ(value("nothing").kind, Value::Kind::null);
    EXPECT_EQ(feature(document, "fixed").array, 4);
}

TEST(MofParser, ReadsQualifiersReferencesAndMethods) {
    const mof::Document document = mof::parse_text(R"(
        #pragma locale ("en_US")
        Qualifier Version : string = null, Scope(class, association), Flavor(Restricted);
        [Association, Version ( "2.26" ): DisableOverride ToSubclass, Values { "a", "b" }]
        class A_B : C {
            [Key] A ref Left; B REF Right[];
            [Static] uint32 Run([In(false), Out] A ref Job, datetime Wait, string Names[]);
            uint8 Stop();
        };)",
                                                   "t.mof");
    ASSERT_EQ(document.qualifiers.size(), 1u);
    EXPECT_EQ(document.qualifiers[0].scopes, (std::vector<std::string>{"class", "association"}));
    EXPECT_EQ(document.qualifiers[0].flavors, std::vector<std::string>{"Restricted"});
    const mof::Class& declared = document.classes.at(0);
    EXPECT_EQ(declared.superclass, "C");
    EXPECT_TRUE(mof::is_true(declared.qualifiers, "ASSOCIATION"));
    EXPECT_EQ(mof::find(declared.qualifiers, "version")->value.text, "2.26");
    EXPECT_EQ(mof::find(declared.qualifiers, "values")->value.elements.size(), 2u);
    EXPECT_EQ(declared.text.front(), '[');
    EXPECT_EQ(declared.text.substr(declared.text.size() - 2), "};");
    EXPECT_EQ(feature(document, "Left").target, "A");
    EXPECT_EQ(feature(document, "Right").array, mof::variable_array);
    const mof::Feature& run = feature(document, "Run");
    EXPECT_EQ(run.kind, mof::Feature_Kind::method);
    ASSERT_EQ(run.parameters.size(), 3u);
    EXPECT_FALSE(run.parameters[0].is_in());
    EXPECT_TRUE(run.parameters[0].is_out());
    EXPECT_TRUE(run.parameters[1].is_in());
    EXPECT_FALSE(run.parameters[1].is_out());
    EXPECT_TRUE(feature(document, "Stop").parameters.empty());
    EXPECT_EQ(mof::to_string(run.position), "t.mof:7:29");
}

// ---- Includes ----

mof::Reader files(std::map<std::string, std::string> contents) {
    return [contents](const std::string& path) -> std::optional<std::string> {
        auto found = contents.find(path);
        return found == contents.end() ? std::nullopt : std::optional(found->second);
    };
}

TEST(MofParser, IncludesAreReadBesideTheirFileAndInTheirPlace) {
    const mof::Document document =
        mof::parse_file("dir/main.mof", files({
                                            {"dir/main.mof", "class A {};\n"
                                                             "#pragma include (\"sub/b.mof\")\n"
                                                             "class D {};"},
                                            {"dir/sub/b.mof", "#pragma include (\"c.mof\")\n"
                                                              "class B {};"},
                                            {"dir/sub/c.mof", "class C {};"},
                                        }));
    std::string order;
    for (const mof::Class& each : document.classes)
        order += each.name;
    EXPECT_EQ(order, "ACBD");
    EXPECT_EQ(document.files,
              (std::vector<std::string>{"dir/main.mof", "dir/sub/b.mof", "dir/sub/c.mof"}));
}

TEST(MofParser, FaultsOfIncludesNameTheRightFile) {
    auto message = [](std::map<std::string, std::string> contents) -> std::string {
        try {
            mof::parse_file("a.mof", files(std::move(contents)));
            return "no error";
        } catch (const mof::Error& error) {
            return error.what();
        }
    };
    EXPECT_EQ(message({}), "a.mof:1:1: cannot read the file");
    EXPECT_EQ(message({{"a.mof", "#pragma include (\"b.mof\")"}}),
              "a.mof:1:18: cannot read 'b.mof'");
    EXPECT_EQ(message({{"a.mof", "#pragma include (\"b.mof\")"}, {"b.mof", "\n  oops"}}),
              "b.mof:2:3: expected a class, a qualifier declaration or a pragma, found 'oops'");
    EXPECT_EQ(message({{"a.mof", "#pragma include (\"b.mof\")"},
                       {"b.mof", "#pragma include (\"a.mof\")"}}),
              "b.mof:1:18: 'a.mof' includes itself");
    // A class does not go on in the file that includes it.
    EXPECT_EQ(message({{"a.mof", "#pragma include (\"b.mof\") };"}, {"b.mof", "class B {"}}),
              "b.mof:1:10: expected a feature, found the end of the file");
    std::map<std::string, std::string> deep = {{"a.mof", "#pragma include (\"0\")"}};
    for (int i = 0; i < 40; i++)
        deep[std::to_string(i)] = "#pragma include (\"" + std::to_string(i + 1) + "\")";
    EXPECT_EQ(message(deep), "14:1:18: includes are nested too deep");
}

TEST(MofParser, NoDepthOfNestingExhaustsTheStack) {
    for (const char* opening : {"{", "[", "(", "[a(", "class A {", "/*", "#pragma include (\""}) {
        std::string text;
        for (int i = 0; i < 200000; i++)
            text += opening;
        EXPECT_NE(message_of(text), "no error") << opening;
        EXPECT_NE(message_of("class A { uint8 a[] = " + text), "no error") << opening;
    }
    std::string chain = "class C0 {};";
    for (int i = 1; i < 20000; i++)
        chain += "class C" + std::to_string(i) + " : C" + std::to_string(i - 1) + " {};";
    EXPECT_EQ(message_of(chain), "no error");
}

} // namespace
