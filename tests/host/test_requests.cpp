// A well-behaved provider through every operation, without a leftover.

#include "host/manager.h"

#include <gtest/gtest.h>

namespace {

using host::Value;

host::Options options() {
    host::Options options;
    options.mof_path = TEST_MOF;
    options.name_space = "root/test";
    return options;
}

class Requests : public ::testing::Test {
protected:
    void SetUp() override { ASSERT_TRUE(manager.load(GOOD_PROVIDER).ok()); }

    void TearDown() override {
        manager.close();
        for (const host::Fault& fault : manager.faults())
            ADD_FAILURE() << host::to_string(fault);
    }

    static host::ObjectPath good(const std::string& name) {
        return {"", "Test_Good", {{"Name", Value::text(name)}}};
    }

    host::Manager manager{options()};
};

TEST_F(Requests, InstancesCarryEveryTypeExactly) {
    const auto reply = manager.enumerate("test_good");
    ASSERT_TRUE(reply.ok());
    ASSERT_EQ(reply.value.size(), 3u);
    const host::Instance& first = reply.value[0];
    EXPECT_EQ(first.path, (host::ObjectPath{"root/test", "Test_Good", good("a").keys}));
    EXPECT_EQ(*first.property("Big"), Value::unsigned_number(CMPI_uint64, ~0ull));
    EXPECT_EQ(*first.property("Offset"), Value::signed_number(CMPI_sint16, -5));
    EXPECT_EQ(*first.property("Ratio"), Value::real(CMPI_real32, 0.1f));
    EXPECT_EQ(*first.property("Flag"), Value::boolean(true));
    EXPECT_EQ(*first.property("When"), Value::datetime("19700101000001.000000+000"));
    EXPECT_EQ(*first.property("Words"),
              Value::array(CMPI_string, {Value::text("one"), Value::text("two,three"),
                                         Value::null(CMPI_string)}));
    EXPECT_EQ(*first.property("Note"), Value::null(CMPI_string));
    EXPECT_EQ(first.property("Numbers")->as_array().size(), 2u) << "never set: the default";
}

TEST_F(Requests, APropertyListKeepsTheKeys) {
    const auto reply = manager.enumerate("Test_Good", std::vector<std::string>{"level"});
    ASSERT_FALSE(reply.value.empty());
    EXPECT_EQ(reply.value[0].properties.size(), 2u);
    EXPECT_TRUE(reply.value[0].property("Name") && reply.value[0].property("Level"));
}

TEST_F(Requests, CreateModifyAndDeleteTakeEffect) {
    const host::Instance made{
        good("new"),
        {{"Name", Value::text("new")}, {"Level", Value::unsigned_number(CMPI_uint16, 9)}}};
    EXPECT_EQ(manager.create(made).value.key("Name")->as_text(), "new");
    EXPECT_EQ(manager.create(made).status.rc, CMPI_RC_ERR_ALREADY_EXISTS);
    host::Instance changed = made;
    changed.properties[1].value = Value::unsigned_number(CMPI_uint16, 10);
    EXPECT_TRUE(manager.modify(changed).ok());
    EXPECT_EQ(manager.get(good("new")).value.property("Level")->as_unsigned(), 10u);
    EXPECT_TRUE(manager.remove(good("new")).ok());
    EXPECT_EQ(manager.get(good("new")).status.message, "no such name");
}

TEST_F(Requests, WrongRequestsDoNotReachTheProvider) {
    const std::size_t before = manager.statistics().calls;
    EXPECT_EQ(manager.enumerate("Nonsense").status.rc, CMPI_RC_ERR_INVALID_CLASS);
    EXPECT_EQ(manager.enumerate("Test_Platform").status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(manager.enumerate("Test_Platform", std::nullopt, "root/none").status.rc,
              CMPI_RC_ERR_INVALID_NAMESPACE);
    EXPECT_EQ(manager.get({"", "Test_Good", {}}).status.rc, CMPI_RC_ERR_INVALID_PARAMETER);
    host::Instance wrong{good("a"), {{"Nonsense", Value::text("x")}}};
    EXPECT_EQ(manager.modify(wrong).rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
    EXPECT_EQ(manager.statistics().calls, before);
}

TEST_F(Requests, MethodsTakeAndGiveTypedValues) {
    const Value words = Value::array(CMPI_string, {Value::text("x"), Value::text("")});
    const auto reply = manager.invoke(good("a"), "echo",
                                      {{"Number", Value::unsigned_number(CMPI_uint64, ~0ull)},
                                       {"Words", words},
                                       {"Who", Value::reference(good("b"))}});
    ASSERT_TRUE(reply.ok());
    EXPECT_EQ(reply.value.value, Value::unsigned_number(CMPI_uint32, 0));
    EXPECT_EQ(host::find(reply.value.outputs, "NumberOut")->as_unsigned(), ~0ull);
    EXPECT_EQ(*host::find(reply.value.outputs, "WordsOut"), words);
    EXPECT_EQ(host::find(reply.value.outputs, "WhoOut")->as_reference()->key("Name")->as_text(),
              "b");
    EXPECT_EQ(manager.invoke(good("a"), "None", {}).status.rc, CMPI_RC_ERR_METHOD_NOT_FOUND);
    EXPECT_EQ(manager.invoke({"", "Test_Good", {}}, "Version", {}).value.value.as_unsigned(), 42u)
        << "a static method needs no keys";
    EXPECT_EQ(manager.invoke({"", "Test_Good", {}}, "Echo", {}).status.rc,
              CMPI_RC_ERR_INVALID_PARAMETER);
}

TEST_F(Requests, AssociationsAreWalkedFromBothEnds) {
    const auto names = manager.associator_names(good("b"));
    ASSERT_EQ(names.value.size(), 2u);
    EXPECT_EQ(names.value[0].key("Name")->as_text(), "a");
    EXPECT_EQ(manager.associators(good("b"), {"Test_Link", "", "First", ""}).value.size(), 1u);
    const auto links = manager.references(good("a"));
    ASSERT_EQ(links.value.size(), 1u);
    EXPECT_EQ(links.value[0].path.key("Second")->as_reference()->key("Name")->as_text(), "b");
    EXPECT_EQ(links.value[0].property("Strength")->as_unsigned(), 7u);
    EXPECT_EQ(manager.reference_names(good("a"), {"", "", "Second", ""}).value.size(), 0u);
    EXPECT_EQ(manager.associators(good("a"), {"Test_Good", "", "", ""}).status.rc,
              CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_TRUE(manager.associator_names(good("a"), {"", "Test_Numbered", "", ""}).value.empty());
}

TEST_F(Requests, AThreadOfTheProviderMayCallBack) {
    for (const bool on_thread : {false, true}) {
        const auto count = [&](const char* name_space, const char* class_name) {
            return manager
                .invoke(good("a"), "CountOf",
                        {{"NameSpace", Value::text(name_space)},
                         {"ClassName", Value::text(class_name)},
                         {"OnThread", Value::boolean(on_thread)}})
                .value.value.as_unsigned();
        };
        EXPECT_EQ(count("root/test", "Nonsense"), 1000u + CMPI_RC_ERR_INVALID_CLASS);
        EXPECT_EQ(count("root/none", "Test_Numbered"), 1000u + CMPI_RC_ERR_INVALID_NAMESPACE);
        EXPECT_EQ(count("root/test", "Test_Numbered"), 0u);
    }
    EXPECT_EQ(manager.statistics().up_calls, 6u);
}

TEST(Loading, AMissingModuleAndABadCatalogueAreTold) {
    host::Manager manager(options());
    EXPECT_FALSE(manager.load("/nonexistent/module.so").ok());
    EXPECT_EQ(manager.enumerate("Test_Good").status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
    host::Options bad = options();
    bad.mof_path = "/nonexistent/catalogue.mof";
    EXPECT_THROW(host::Manager{bad}, host::Setup_Error);
}

TEST(Loading, TheWholeCatalogueLoads) {
    host::Options all = options();
    all.mof_path = CATALOGUE_MOF;
    const host::Manager manager(all);
    const host::Class* card = manager.classes().find("vlnmpca_card");
    ASSERT_TRUE(card);
    EXPECT_TRUE(card->is_a(manager.classes().find("CIM_ManagedElement")));
    EXPECT_EQ(card->keys.size(), 2u);
}

} // namespace
