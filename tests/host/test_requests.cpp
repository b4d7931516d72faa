// What the object manager refuses by itself, and what it takes from a provider. Operations that
// work are those of mpcactl's tests.

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

TEST_F(Requests, WrongRequestsDoNotReachTheProvider) {
    const std::size_t before = manager.statistics().calls;
    EXPECT_EQ(manager.enumerate("Nonsense").status.rc, CMPI_RC_ERR_INVALID_CLASS);
    EXPECT_EQ(manager.enumerate("Test_Platform").status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(manager.enumerate("Test_Platform", std::nullopt, "root/none").status.rc,
              CMPI_RC_ERR_INVALID_NAMESPACE);
    EXPECT_EQ(manager.get({"", "Test_Good", {}}).status.rc, CMPI_RC_ERR_INVALID_PARAMETER);
    host::Instance wrong{good("a"), {{"Nonsense", Value::text("x")}}};
    EXPECT_EQ(manager.modify(wrong).rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
    EXPECT_EQ(manager.invoke(good("a"), "None", {}).status.rc, CMPI_RC_ERR_METHOD_NOT_FOUND);
    EXPECT_EQ(manager.invoke({"", "Test_Good", {}}, "Echo", {}).status.rc,
              CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(manager.associators(good("a"), {"Test_Good", "", "", ""}).status.rc,
              CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(manager.statistics().calls, before);
    EXPECT_EQ(manager.invoke({"", "Test_Good", {}}, "Version", {}).value.value.as_unsigned(), 42u)
        << "a static method needs no keys";
    EXPECT_TRUE(manager.associator_names(good("a"), {"", "Test_Numbered", "", ""}).value.empty());
    EXPECT_TRUE(manager.reference_names(good("a"), {"", "", "Second", ""}).value.empty());
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

} // namespace
