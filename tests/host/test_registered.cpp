// What an object manager makes of a provider beyond calling it: who is asked by the registration,
// defaults of classes, and answers that are too large to send.

#include "host/answer_size.h"
#include "host/manager.h"

#include <gtest/gtest.h>

#include <fstream>

namespace {

using host::Value;

const host::ObjectPath A{"root/test", "Test_Good", {{"Name", Value::text("a")}}};

host::Options options() {
    host::Options options;
    options.mof_path = TEST_MOF;
    options.name_space = "root/test";
    return options;
}

struct Registered : testing::Test {
    std::unique_ptr<host::Manager> manager;

    void load(const std::string& registration, const std::string& platform = "") {
        host::Options registered = options();
        registered.registration_path = write("registered.reg", registration);
        if (!platform.empty())
            registered.platform_path = write("registered.json", platform);
        manager = std::make_unique<host::Manager>(registered);
        ASSERT_TRUE(manager->load(GOOD_PROVIDER).ok());
    }
    static std::string write(const std::string& file, const std::string& text) {
        std::ofstream(file) << text;
        return file;
    }
    // The answer to an up-call of the provider: a count, or 1000 and a code.
    std::uint64_t up_call(const char* name_space, const char* class_name) {
        return manager
            ->invoke(A, "CountOf",
                     {{"NameSpace", Value::text(name_space)},
                      {"ClassName", Value::text(class_name)},
                      {"OnThread", Value::boolean(false)}})
            .value.value.as_unsigned();
    }
};

constexpr const char* GOOD = "[Test_Good]\n   type: instance method\n   group: g\n"
                             "   unload: never\n   namespace: root/test root/other\n";
constexpr const char* LINK = "[Test_Link]\n   type: association\n   group: g\n"
                             "   namespace: root/test\n";

TEST_F(Registered, OnlyWhatIsRegisteredIsAsked) {
    load(std::string(GOOD) + LINK);
    EXPECT_EQ(manager->enumerate("Test_Good", std::nullopt, "root/other").value.size(), 3u);
    EXPECT_EQ(manager->associators(A).value.size(), 1u);
    const std::size_t calls = manager->statistics().calls;
    const host::ObjectPath elsewhere{"root/other", A.class_name, A.keys};
    EXPECT_TRUE(manager->associators(elsewhere).ok());
    EXPECT_TRUE(manager->associators(elsewhere).value.empty());
    EXPECT_EQ(manager->associators(elsewhere, {"Test_Link", "", "", ""}).status.rc,
              CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(manager->enumerate("Test_Link").status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
    const auto nobody = manager->get({"", "Test_Platform", A.keys});
    EXPECT_EQ(nobody.status.rc, CMPI_RC_ERR_INVALID_CLASS);
    EXPECT_EQ(nobody.status.message, "class not found: nobody serves Test_Platform in root/test");
    EXPECT_EQ(manager->statistics().calls, calls);

    load("[Test_Good]\n   type: instance\n   namespace: root/test root/interop\n");
    EXPECT_TRUE(manager->get(A).ok());
    EXPECT_TRUE(manager->enumerate("Test_Good", std::nullopt, "root/PG_InterOp").ok());
    EXPECT_EQ(manager->invoke(A, "Version", {}).status.rc, CMPI_RC_ERR_METHOD_NOT_AVAILABLE);
    EXPECT_TRUE(manager->associators(A).value.empty());
}

TEST_F(Registered, UpCallsReachWhomClientsReach) {
    load(std::string(GOOD) + "[Test_Link]\n   type: association\n   group: g\n"
                             "   namespace: root/link\n",
         R"([{"namespace": "root/p", "class": "Test_Platform", "properties": {"Name": "p"}}])");
    EXPECT_EQ(up_call("root/p", "Test_Platform"), 1u);
    EXPECT_EQ(up_call("root/p", "Test_Base"), 1u);
    EXPECT_EQ(up_call("root/p", "Test_Numbered"), 1000u + CMPI_RC_ERR_INVALID_CLASS);
    EXPECT_EQ(up_call("root/other", "Test_Numbered"), 1000u + CMPI_RC_ERR_INVALID_CLASS);
    EXPECT_EQ(up_call("root/none", "Test_Numbered"), 1000u + CMPI_RC_ERR_INVALID_NAMESPACE);
    EXPECT_EQ(up_call("root/link", "Test_Base"), 1000u + CMPI_RC_ERR_INVALID_CLASS)
        << "what is registered elsewhere only";
}

TEST_F(Registered, WhatAnObjectManagerWouldMisreadIsRefused) {
    const std::pair<std::string, const char*> rows[] = {
        {"[A]\n   type: instance event\n", "registered.reg:2: unknown type event"},
        {"[A]\n   type: instance \n", "registered.reg:2: a blank at the end"},
        {"[A]\n   type: instance\n[B]\n", "registered.reg:3: [A] has no namespace"},
        {"[A]\n   namespace: x\n", "registered.reg:2: [A] has no type"},
        {"[A]\n   type: instance\n   namespace: x\n[a]\n   type: method\n   namespace: x\n",
         "a second section [a]"},
        {std::string(GOOD) + "[Test_Link]\n   type: association\n   namespace: root/test\n",
         "[Test_Link] and [Test_Good] are in different groups"},
        {std::string(GOOD) + "[Test_Link]\n   type: association\n   group: h\n   namespace: y\n",
         "[Test_Link] and [Test_Good] are in different groups"},
    };
    for (const auto& [text, wrong] : rows) {
        try {
            load(text);
            ADD_FAILURE() << text;
        } catch (const host::Setup_Error& error) {
            EXPECT_NE(std::string(error.what()).find(wrong), std::string::npos) << error.what();
        }
    }
}

// ---- Answers ----

host::Reply<std::vector<host::Instance>> links(bool class_defaults, std::size_t answer_limit,
                                               const host::Property_List& list = std::nullopt) {
    host::Options strict = options();
    strict.class_defaults = class_defaults;
    strict.answer_limit = answer_limit;
    host::Manager manager(strict);
    EXPECT_TRUE(manager.load(GOOD_PROVIDER).ok());
    return manager.references(A, {"Test_Link", "", "", ""}, list);
}

TEST(Class_Defaults, ComeForWhatTheProviderLeftNull) {
    const host::Instance link = links(true, 0).value.at(0);
    EXPECT_EQ(*link.property("Strength"), Value::unsigned_number(CMPI_uint16, 7)) << "was set";
    EXPECT_EQ(*link.property("Slack"), Value::signed_number(CMPI_sint16, -7));
    EXPECT_EQ(*link.property("Colours"),
              Value::array(CMPI_string, {Value::text("grey"), Value::text("a & b")}));
    EXPECT_EQ(*link.property("Since"), Value::datetime("00000000000500.000000:000"));
    EXPECT_EQ(link.properties.back().name, "Since") << "in the order of the class";
    EXPECT_EQ(links(false, 0).value.at(0).property("Slack"), nullptr);
}

TEST(Answers, AreCountedAsTheyAreSent) {
    const std::string path =
        R"(<INSTANCEPATH><NAMESPACEPATH><HOST>########################</HOST><LOCALNAMESPACEPATH>)"
        R"(<NAMESPACE NAME="root"/><NAMESPACE NAME="test"/></LOCALNAMESPACEPATH></NAMESPACEPATH>)";
    const auto end = [&](const std::string& name) {
        return "<VALUE.REFERENCE>" + path +
               "<INSTANCENAME CLASSNAME=\"Test_Good\"><KEYBINDING "
               "NAME=\"Name\"><KEYVALUE VALUETYPE=\"string\">" +
               name +
               "</KEYVALUE></KEYBINDING>"
               "</INSTANCENAME></INSTANCEPATH></VALUE.REFERENCE>";
    };
    const std::string name = R"(<INSTANCENAME CLASSNAME="Test_Link"><KEYBINDING NAME="First">)" +
                             end("a") + R"(</KEYBINDING><KEYBINDING NAME="Second">)" + end("b") +
                             "</KEYBINDING></INSTANCENAME>";
    const std::string properties =
        R"(<PROPERTY.REFERENCE NAME="First" REFERENCECLASS="Test_Good">)" + end("a") +
        R"(</PROPERTY.REFERENCE><PROPERTY.REFERENCE NAME="Second" REFERENCECLASS="Test_Base">)" +
        end("b") +
        R"(</PROPERTY.REFERENCE><PROPERTY NAME="Strength" TYPE="uint16"><VALUE>7</VALUE>)"
        R"(</PROPERTY><PROPERTY NAME="Slack" TYPE="sint16"></PROPERTY>)"
        R"(<PROPERTY.ARRAY NAME="Colours" TYPE="string"><VALUE.ARRAY><VALUE>grey</VALUE>)"
        R"(<VALUE>a &amp; b</VALUE></VALUE.ARRAY></PROPERTY.ARRAY>)"
        R"(<PROPERTY NAME="Since" TYPE="datetime"></PROPERTY>)";
    const std::string whole = "<VALUE.OBJECTWITHPATH>" + path + name +
                              "</INSTANCEPATH><INSTANCE CLASSNAME=\"Test_Link\">" + properties +
                              "</INSTANCE></VALUE.OBJECTWITHPATH>";
    host::Instance link = links(true, 0).value.at(0);
    std::erase_if(link.properties, [](const host::Named_Value& named) {
        return named.name == "Slack" || named.name == "Since";
    });
    link.properties.insert(link.properties.begin(), link.path.keys.begin(), link.path.keys.end());
    const host::Manager manager(options());
    const host::Class* known = manager.classes().find("Test_Link");
    EXPECT_EQ(xml_size(link, known, host::Path_Form::complete), whole.size());
    EXPECT_EQ(xml_size(link.path, host::Path_Form::keys), name.size());

    EXPECT_EQ(links(false, 0).value.size(), 1u);
    const std::size_t size =
        xml_size(links(false, 0).value.at(0), known, host::Path_Form::complete);
    EXPECT_EQ(links(false, size).value.size(), 1u);
    const auto refused = links(false, size - 1);
    EXPECT_EQ(refused.status.rc, CMPI_RC_ERR_FAILED);
    EXPECT_TRUE(refused.value.empty());
    EXPECT_NE(refused.status.message.find(std::to_string(size)), std::string::npos);
    EXPECT_TRUE(links(false, size - 1, std::vector<std::string>{"Strength"}).ok())
        << "what a list leaves out is not sent";
}

} // namespace
