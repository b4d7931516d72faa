// Platform files: what they hold, and what is said about bad ones.

#include "host/manager.h"
#include "host/platform.h"

#include <gtest/gtest.h>

#include <fstream>

namespace {

constexpr const char* PLATFORM = R"({
  "classes": [{"name": "Extra_Class", "superclass": "Test_Platform"}],
  "instances": [
    {"namespace": "root/platform", "class": "Test_Platform",
     "properties": {"Name": "one", "Level": 3}},
    {"namespace": "root/platform", "class": "extra_class", "properties": {"Name": "two"}},
    {"namespace": "root/elsewhere", "class": "Test_Platform", "properties": {"Name": "three"}}
  ]
})";

host::Options options(const std::string& file) {
    host::Options options;
    options.mof_path = TEST_MOF;
    options.platform_path = file;
    options.name_space = "root/test";
    return options;
}

std::string write(const std::string& name, const std::string& text) {
    std::ofstream(name) << text;
    return name;
}

TEST(Platform, AnswersUpCallsByClassAndNamespace) {
    host::Manager manager(options(write("platform.json", PLATFORM)));
    ASSERT_TRUE(manager.load(GOOD_PROVIDER).ok());
    const auto count = [&](const char* name_space, const char* class_name) {
        return manager
            .invoke({"", "Test_Good", {{"Name", host::Value::text("a")}}}, "CountOf",
                    {{"NameSpace", host::Value::text(name_space)},
                     {"ClassName", host::Value::text(class_name)}})
            .value.value.as_unsigned();
    };
    EXPECT_EQ(count("root/platform", "Test_Platform"), 2u) << "subclasses count";
    EXPECT_EQ(count("root/platform", "Extra_Class"), 1u);
    EXPECT_EQ(count("root/elsewhere", "Test_Platform"), 1u);
    EXPECT_EQ(count("root/platform", "Test_Link"), 0u);

    const auto direct = manager.enumerate("Test_Platform", std::nullopt, "root/platform");
    EXPECT_EQ(direct.value.size(), 2u) << "clients see them, too";
    EXPECT_EQ(manager.get(direct.value[0].path).value.property("Level")->as_unsigned(), 3u);
    EXPECT_EQ(manager.remove(direct.value[0].path).rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(manager.fault_count(), 0u);
}

TEST(Platform, SaysWhereAFileIsWrong) {
    const auto instance = [](const std::string& body) { return "[\n  {" + body + "}\n]"; };
    const std::pair<std::string, std::string> cases[] = {
        {"", "bad.json:1: not JSON: "},
        {"[\n  {\"namespace\": }\n]", "bad.json:2: 0: not JSON: "},
        {"[1]", "bad.json:1: 0: an object expected"},
        {"{\"instance\": []}",
         "bad.json:1: instance: unknown; known here are classes or instances"},
        {"{\n\"classes\": [\n{\"name\": \"X\",\n\"superclass\": \"Test_Platfrom\"}]}",
         "bad.json:4: classes/0/superclass: unknown superclass Test_Platfrom; did you mean "
         "Test_Platform?"},
        {"{\"classes\": [{\"name\": \"Test_Base\"}]}", "classes/0/name: class Test_Base exists"},
        {instance("\"namespace\": \"a\""), "bad.json:2: 0/class: is missing"},
        {instance("\"namespace\": 5, \"class\": \"Test_Base\""), "0/namespace: a text expected"},
        {instance("\"namespace\": \"a\",\n\"class\": \"Test_Bsae\""),
         "bad.json:3: 0/class: unknown class Test_Bsae; did you mean Test_Base?"},
        {instance("\"namespace\": \"a\",\"class\": \"Test_Base\",\"properties\":{\"Level\": 1}"),
         "0/properties: the key Name of Test_Base is missing"},
        {instance("\"namespace\": \"a\",\"class\": \"Test_Base\",\"properties\":{\"Name\": \"x\",\n"
                  "\n\"Words\": [\"a\",\n 7]}"),
         "bad.json:5: 0/properties/Words/1: a text in quotes expected"},
        {instance("\"class\": \"Test_Base\",\n\"class\": \"Test_Base\""),
         "bad.json:3: 0/class: the name stands twice"},
    };
    for (const auto& [text, expected] : cases) {
        host::ClassRepository classes(TEST_MOF);
        host::Platform platform;
        try {
            platform.read_text(text, "bad.json", classes);
            ADD_FAILURE() << "accepted: " << text;
        } catch (const host::Setup_Error& error) {
            EXPECT_NE(std::string(error.what()).find(expected), std::string::npos)
                << text << "\ngave: " << error.what() << "\nnot:  " << expected;
        }
    }
    EXPECT_THROW(host::Manager(options("/nonexistent.json")), host::Setup_Error);
}

} // namespace
