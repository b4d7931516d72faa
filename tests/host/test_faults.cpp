// Every fault that a provider can make is refused, and told.

#include "host/manager.h"

#include <gtest/gtest.h>

namespace {

using host::FaultKind;

host::Options options() {
    host::Options options;
    options.mof_path = TEST_MOF;
    options.name_space = "root/test";
    return options;
}

class Misbehaving : public ::testing::Test {
protected:
    void SetUp() override { ASSERT_TRUE(manager.load(MISBEHAVING_PROVIDER).ok()); }

    host::Reply<host::Method_Result> misbehave(const std::string& how) {
        const host::ObjectPath path{"", "Test_Bad", {{"Name", host::Value::text("x")}}};
        return manager.invoke(path, "Misbehave", {{"How", host::Value::text(how)}});
    }

    host::Manager manager{options()};
};

struct Case {
    const char* how;
    FaultKind kind;
    int rc; // that the wrong call got; -1: the case has no number to give
};

constexpr Case CASES[] = {
    {"unknown property", FaultKind::unknown_property, CMPI_RC_ERR_NO_SUCH_PROPERTY},
    {"wrong type", FaultKind::type_mismatch, CMPI_RC_ERR_TYPE_MISMATCH},
    {"wild text", FaultKind::bad_text, CMPI_RC_OK},
    {"wrong width", FaultKind::type_mismatch, CMPI_RC_ERR_TYPE_MISMATCH},
    {"scalar for array", FaultKind::type_mismatch, CMPI_RC_ERR_TYPE_MISMATCH},
    {"wrong reference", FaultKind::type_mismatch, CMPI_RC_ERR_TYPE_MISMATCH},
    {"unknown key", FaultKind::unknown_property, CMPI_RC_ERR_NO_SUCH_PROPERTY},
    {"unknown class", FaultKind::unknown_class, CMPI_RC_ERR_INVALID_CLASS},
    {"recursion", FaultKind::recursion, CMPI_RC_ERR_FAILED},
    {"double release", FaultKind::double_release, CMPI_RC_ERR_INVALID_HANDLE},
    {"use after release", FaultKind::use_after_release, CMPI_RC_ERR_INVALID_HANDLE},
    {"foreign object", FaultKind::foreign_object, CMPI_RC_ERR_INVALID_HANDLE},
    {"overwritten object", FaultKind::foreign_object, CMPI_RC_ERR_INVALID_HANDLE},
    {"other kind", FaultKind::foreign_object, CMPI_RC_ERR_INVALID_HANDLE},
    {"release of a parameter", FaultKind::released_parameter, CMPI_RC_ERR_FAILED},
    {"release of contents", FaultKind::released_parameter, CMPI_RC_ERR_FAILED},
    {"stale element", FaultKind::stale_element, CMPI_RC_OK},
    {"index out of range", FaultKind::bad_argument, CMPI_RC_ERR_INVALID_PARAMETER},
    {"null text", FaultKind::bad_argument, CMPI_RC_ERR_INVALID_PARAMETER},
    {"bad datetime", FaultKind::bad_argument, CMPI_RC_ERR_INVALID_PARAMETER},
    {"result twice", FaultKind::wrong_result, -1},
    {"result of other type", FaultKind::wrong_result, -1},
    {"result of other kind", FaultKind::wrong_result, -1},
    {"unknown output", FaultKind::bad_output, CMPI_RC_ERR_INVALID_PARAMETER},
    {"output of other type", FaultKind::bad_output, CMPI_RC_ERR_TYPE_MISMATCH},
    {"unattached thread", FaultKind::unattached_thread, CMPI_RC_OK},
    {"undetached thread", FaultKind::attachment, CMPI_RC_OK},
    {"left at detach", FaultKind::left_at_detach, CMPI_RC_OK},
    {"attached twice", FaultKind::attachment, CMPI_RC_ERR_FAILED},
};

TEST_F(Misbehaving, EachFaultIsRefusedAndNamesItsProvider) {
    for (const Case& each : CASES) {
        manager.clear_faults();
        const auto reply = misbehave(each.how);
        EXPECT_TRUE(reply.ok()) << each.how;
        if (each.rc >= 0) {
            EXPECT_EQ(static_cast<int>(reply.value.value.as_unsigned()), each.rc) << each.how;
        }
        const std::vector<host::Fault> faults = manager.faults();
        ASSERT_EQ(faults.size(), 1u) << each.how;
        EXPECT_EQ(faults[0].kind, each.kind) << host::to_string(faults[0]);
        if (each.kind != FaultKind::unattached_thread && each.kind != FaultKind::attachment &&
            each.kind != FaultKind::left_at_detach) {
            EXPECT_EQ(faults[0].class_name, "Test_Bad") << each.how;
        }
    }
}

TEST_F(Misbehaving, AnObjectDoesNotOutliveItsCall) {
    misbehave("keep");
    EXPECT_EQ(manager.fault_count(), 0u);
    EXPECT_EQ(misbehave("use after call").value.value.as_unsigned(),
              static_cast<unsigned>(CMPI_RC_ERR_INVALID_HANDLE));
    EXPECT_EQ(manager.faults().at(0).kind, FaultKind::use_after_release);
}

TEST_F(Misbehaving, WhatIsNeverReleasedIsToldAtTheEnd) {
    misbehave("leak of a clone");
    misbehave("leak of a clone");
    misbehave("leak of a context");
    EXPECT_EQ(manager.fault_count(), 0u) << "a clone may live as long as the provider likes";
    EXPECT_EQ(manager.live_object_count(), 3u);
    manager.close();
    const std::vector<host::Fault> faults = manager.faults();
    ASSERT_EQ(faults.size(), 2u);
    EXPECT_EQ(host::to_string(faults[0]), "leak: 2 CMPIString were never released");
    EXPECT_EQ(host::to_string(faults[1]), "leak: 1 CMPIContext was never released");
    EXPECT_EQ(manager.live_object_count(), 0u);
}

TEST_F(Misbehaving, AWrongAnswerDoesNotReachTheClient) {
    const std::pair<const char*, FaultKind> cases[] = {
        {"enumerate missing key", FaultKind::bad_path},
        {"enumerate unknown class", FaultKind::unknown_class},
        {"enumerate other class", FaultKind::wrong_result},
        {"enumerate after done", FaultKind::wrong_result},
    };
    for (const auto& [how, kind] : cases) {
        misbehave(how);
        manager.clear_faults();
        EXPECT_TRUE(manager.enumerate_names("Test_Bad").value.empty()) << how;
        ASSERT_EQ(manager.fault_count(), 1u) << how;
        EXPECT_EQ(manager.faults()[0].kind, kind) << how;
    }
    manager.clear_faults();
    EXPECT_TRUE(manager.enumerate("Test_Bad").value.empty());
    EXPECT_EQ(manager.faults().at(0).kind, FaultKind::bad_path);
}

TEST_F(Misbehaving, AnUpCallNeedsACompletePath) {
    host::Options with_platform = options();
    const std::string file = "platform_of_test_faults.json";
    FILE* out = std::fopen(file.c_str(), "w");
    ASSERT_TRUE(out);
    std::fputs(R"([{"namespace":"root/test","class":"Test_Platform","properties":{"Name":"p"}}])",
               out);
    std::fclose(out);
    with_platform.platform_path = file;
    host::Manager other(with_platform);
    ASSERT_TRUE(other.load(MISBEHAVING_PROVIDER).ok());
    const host::ObjectPath path{"", "Test_Bad", {{"Name", host::Value::text("x")}}};
    const auto reply =
        other.invoke(path, "Misbehave", {{"How", host::Value::text("incomplete up-call")}});
    EXPECT_EQ(reply.value.value.as_unsigned(),
              static_cast<unsigned>(CMPI_RC_ERR_INVALID_PARAMETER));
    EXPECT_EQ(other.faults().at(0).kind, FaultKind::bad_path);
}

TEST_F(Misbehaving, AProviderMayRefuseToBeUnloaded) {
    manager.enumerate_names("Test_Bad");
    EXPECT_EQ(manager.cleanup(false).rc, CMPI_RC_DO_NOT_UNLOAD);
    EXPECT_TRUE(manager.cleanup(true).ok());
}

} // namespace
