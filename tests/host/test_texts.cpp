// Object paths and datetimes as text: round trips, and texts that mean harm.

#include "host/datetime.h"
#include "host/path_text.h"
#include "host/value_json.h"

#include <gtest/gtest.h>

namespace {

using host::Value;

const host::ClassRepository& classes() {
    static const host::ClassRepository repository(TEST_MOF);
    return repository;
}

host::Parsed_Path parse(const std::string& text) {
    return host::parse_path(classes(), text, "root/test");
}

std::string print(const host::ObjectPath& path) {
    return host::path_to_text(path, "root/test");
}

TEST(PathText, ReadsBackWhateverAKeyHolds) {
    std::string every_byte;
    for (int c = 1; c < 256; ++c)
        every_byte += static_cast<char>(c);
    for (const std::string& name :
         {std::string(), std::string("plain"), std::string("\"quoted\", with=a\\comma.dot:"),
          std::string("Class.Key=\"x\""), std::string("\\x41"), every_byte}) {
        const host::ObjectPath inner{"root/other", "Test_Good", {{"Name", Value::text(name)}}};
        const host::ObjectPath other{"root/test", "Test_Good", {{"Name", Value::text(name)}}};
        const host::ObjectPath link{
            "root/test",
            "Test_Link",
            {{"First", Value::reference(inner)}, {"Second", Value::reference(other)}}};
        for (const host::ObjectPath& path : {inner, other, link}) {
            const std::string text = print(path);
            EXPECT_EQ(text.find_first_of("\n\r\t"), std::string::npos);
            const host::Parsed_Path back = parse(text);
            EXPECT_EQ(back.error, "") << text;
            EXPECT_EQ(back.path, path) << text;
        }
    }
}

TEST(PathText, TypesComeFromTheClass) {
    const host::Parsed_Path parsed = parse("test_numbered.On=true,Large=0xff,Small=7");
    ASSERT_EQ(parsed.error, "");
    EXPECT_EQ(print(parsed.path), "Test_Numbered.Small=7,Large=255,On=TRUE");
    EXPECT_EQ(parsed.path.keys[0].value, Value::unsigned_number(CMPI_uint8, 7));
}

TEST(PathText, SaysWhatIsWrong) {
    const std::pair<const char*, const char*> cases[] = {
        {"", "a class name expected"},
        {"Test_Goood.Name=\"x\"", "did you mean Test_Good?"},
        {"Test_Good", "the key Name of Test_Good is missing"},
        {"Test_Good.", "the name of a key expected"},
        {"Test_Good.Name", "'=' behind the name of a key"},
        {"Test_Good.Name=", "a value expected"},
        {"Test_Good.Name=x", "in double quotes"},
        {"Test_Good.Name=\"x", "a closing quote expected"},
        {"Test_Good.Name=\"x\\", "an escape"},
        {"Test_Good.Name=\"x\\q\"", "an escape"},
        {"Test_Good.Name=\"\\x\"", "hexadecimal digits"},
        {"Test_Good.Name=\"x\",", "the name of a key expected"},
        {"Test_Good.Name=\"x\"y", "',' or the end"},
        {"Test_Good.Name=\"x\",Name=\"y\"", "given twice"},
        {"Test_Good.Level=5", "has no key Level; its keys are Name"},
        {":Test_Good.Name=\"x\"", "the namespace before ':' is empty"},
        {"Test_Numbered.Small=256,Large=1,On=TRUE", "is no uint8"},
        {"Test_Numbered.Small=-1,Large=1,On=TRUE", "is no uint8"},
        {"Test_Numbered.Small=\"1\",Large=1,On=TRUE", "without quotes"},
        {"Test_Link.First=\"Test_Bad.Name=\\\"x\\\"\",Second=\"Test_Bad.Name=\\\"x\\\"\"",
         "class Test_Bad is no Test_Good"},
        {"Test_Link.First=\"Test_Good\",Second=\"Test_Good\"", "Name of Test_Good is missing"},
    };
    for (const auto& [text, expected] : cases)
        EXPECT_NE(parse(text).error.find(expected), std::string::npos)
            << text << " gave: " << parse(text).error;
    std::string nested = "Test_Good.Name=\"x\"";
    for (int i = 0; i < 12; ++i)
        nested = "Test_Link.First=" + host::quote(nested) + ",Second=" + host::quote("Test_Good");
    EXPECT_NE(parse(nested).error, "");
}

TEST(Json, IsExactAndReadsBack) {
    const host::Class& known = *classes().find("Test_Base");
    const host::Json json = {{"Big", 18446744073709551615ull},
                             {"Offset", -32768},
                             {"Ratio", 0.1},
                             {"Flag", false},
                             {"Words", {"a", nullptr}},
                             {"Note", nullptr},
                             {"Inner", {{"class", "Test_Good"}, {"properties", {{"Level", 3}}}}}};
    const host::Instance instance{host::ObjectPath{"root/test", "Test_Base", {}},
                                  host::properties_from_json(classes(), known, json, "root/test")};
    EXPECT_EQ(host::to_json(instance, "root/test")["properties"].dump(), json.dump());
    const host::Json wrong[] = {{{"Big", -1}},           {{"Level", 65536}},
                                {{"Flag", 1}},           {{"Words", "a"}},
                                {{"Words", {1}}},        {{"Nope", 1}},
                                {{"When", "yesterday"}}, {{"Inner", {{"class", "Test_Link"}}}},
                                {{"Level", 1.5}},        {{"Name", 1}}};
    for (const host::Json& each : wrong)
        EXPECT_THROW(host::properties_from_json(classes(), known, each, ""), host::Json_Complaint)
            << each;
}

TEST(DateTime, BothFormsAgree) {
    const std::pair<const char*, std::uint64_t> cases[] = {
        {"19700101000000.000000+000", 0},
        {"20000229235959.999999+000", 951868799999999},
        {"20240301010000.000000+060", 1709251200000000},
        {"00000001020304.000005:000", 93784000005},
        {"99999999235959.999999:000", 8639999999999999999},
    };
    for (const auto& [text, microseconds] : cases) {
        const auto parsed = host::parse_datetime(text);
        ASSERT_TRUE(parsed) << text;
        EXPECT_EQ(parsed->microseconds, microseconds) << text;
        const auto back = host::parse_datetime(host::format_datetime(*parsed));
        EXPECT_EQ(back->microseconds, microseconds) << text;
        EXPECT_EQ(back->interval, parsed->interval);
    }
    for (const char* text :
         {"", "20230229000000.000000+000", "20241301000000.000000+000", "20240101000000.000000 000",
          "2024010100000a.000000+000", "00000001020304.000005:001", "20240101240000.000000+000"})
        EXPECT_FALSE(host::parse_datetime(text)) << text;
    EXPECT_TRUE(host::parse_datetime("20240101******.******+***"));
}

} // namespace
