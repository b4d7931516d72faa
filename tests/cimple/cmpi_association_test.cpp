// The association, method and indication interfaces.
#include "cimple/cmpi_thread_context.h"
#include "tests/cimple/cmpi_fixture.h"

namespace cimple {

namespace {

class Association_Test : public Cmpi_Test {
protected:
    static Test_Link* link(const char* left, const char* right, uint32 slot,
                           const char* right_name_space = "") {
        auto* made = create_null<Test_Link>();
        auto* leaf = create_null<Test_Leaf>();
        leaf->Name.set(left);
        made->Left = leaf;
        made->Right = make_base(right, slot);
        made->Right->__name_space = right_name_space;
        made->Weight.set(5);
        return made;
    }
    CMPIObjectPath* leaf_path(const char* name) {
        return broker.path("root/test", "Test_Leaf", {{"Name", fake::text(name)}});
    }
    // The texts after the path, in CMPI's order.
    CMPIStatus names(CMPIObjectPath* path, const char* result_class = nullptr,
                     const char* role = nullptr, const char* result_role = nullptr) {
        broker.clear_results();
        return mi->ft->associatorNames(mi, context, result, path, "ignored", result_class, role,
                                       result_role);
    }
    void unsupported() {
        script.status = {{OP_ENUM_ASSOCIATOR_NAMES, ENUM_ASSOCIATOR_NAMES_UNSUPPORTED},
                         {OP_ENUM_REFERENCES, ENUM_REFERENCES_UNSUPPORTED},
                         {OP_ENUM_ASSOCIATORS, ENUM_ASSOCIATORS_UNSUPPORTED}};
        script.instances = {link("a", "x", 1), link("b", "y", 2), link("a", "z", 3, "root/far")};
    }

    CMPIAssociationMI* mi = association_mi();
};

TEST_F(Association_Test, RolesAndClassesNarrowTheMatch) {
    unsupported();
    const struct {
        const char* result_class;
        const char* role;
        const char* result_role;
        std::size_t expected;
    } cases[] = {
        {"", "", "", 2},          {"test_base", "left", "RIGHT", 2},
        {"Test_Leaf", "", "", 0}, {"", "Right", "", 0},
        {"", "", "Left", 0},      {"", "NoSuch", "", 0},
        {"No_Class", "", "", 0},  {nullptr, nullptr, "Right", 2},
    };
    for (const auto& row : cases) {
        EXPECT_EQ(names(leaf_path("a"), row.result_class, row.role, row.result_role).rc, 0);
        EXPECT_EQ(broker.returned_paths.size(), row.expected)
            << testing::PrintToString(row.result_class) << testing::PrintToString(row.role)
            << testing::PrintToString(row.result_role);
    }
}

TEST_F(Association_Test, AnUnknownSourceHasNoAssociations) {
    unsupported();
    CMPIObjectPath* path = broker.path("root/test", "No_Such_Class");
    EXPECT_EQ(names(path).rc, 0);
    EXPECT_EQ(mi->ft->associators(mi, context, result, path, 0, 0, 0, 0, nullptr).rc, 0);
    EXPECT_EQ(mi->ft->references(mi, context, result, path, 0, 0, nullptr).rc, 0);
    EXPECT_EQ(mi->ft->referenceNames(mi, context, result, path, 0, 0).rc, 0);
    EXPECT_EQ(script.operations, std::vector<int>{OP_LOAD});
}

TEST_F(Association_Test, ReferencesToTheSource) {
    unsupported();
    EXPECT_EQ(mi->ft->references(mi, context, result, leaf_path("a"), "ignored", 0, nullptr).rc, 0);
    ASSERT_EQ(broker.returned_instances.size(), 2u);
    EXPECT_EQ(broker.returned_instances[0]->find("Weight")->scalar.uint32, 5u);

    broker.clear_results();
    const char* properties[] = {"Left", nullptr};
    mi->ft->references(mi, context, result, leaf_path("a"), 0, "LEFT", properties);
    ASSERT_EQ(broker.returned_instances.size(), 2u);
    EXPECT_FALSE(broker.returned_instances[0]->find("Weight"));
    EXPECT_TRUE(broker.returned_instances[0]->find("Right")) << "a key comes with any list";

    // What is listed keeps its null; what is not listed is null.
    static_cast<Test_Link*>(script.instances[0].get())->Weight.null = 1;
    broker.clear_results();
    const char* weight[] = {"Weight", nullptr};
    mi->ft->references(mi, context, result, leaf_path("a"), 0, 0, weight);
    ASSERT_EQ(broker.returned_instances.size(), 2u);
    EXPECT_FALSE(broker.returned_instances[0]->find("Weight"));
    EXPECT_TRUE(broker.returned_instances[1]->find("Weight"));

    mi->ft->referenceNames(mi, context, result, leaf_path("a"), 0, 0);
    ASSERT_EQ(broker.returned_paths.size(), 2u);
    EXPECT_EQ(broker.returned_paths[0]->find("Left")->object->string("Name"), "a");

    broker.clear_results();
    EXPECT_EQ(mi->ft->references(mi, context, result, leaf_path("a"), 0, "NoSuch", nullptr).rc, 0);
    EXPECT_TRUE(broker.returned_instances.empty());
}

TEST_F(Association_Test, AProviderThatAnswersItselfIsAsked) {
    script.instances = {make_base("own", 9)};
    EXPECT_EQ(names(leaf_path("a"), "RC", "R1", "R2").rc, 0);
    EXPECT_EQ(broker.returned_paths.size(), 1u);
    EXPECT_EQ(script.role, "RC/R1/R2");
    EXPECT_EQ(mi->ft->associators(mi, context, result, leaf_path("a"), 0, 0, 0, 0, nullptr).rc, 0);
    EXPECT_EQ(broker.returned_instances.size(), 1u);
    EXPECT_TRUE(broker.upcalls.empty());
    EXPECT_EQ(script.count(OP_ENUM_INSTANCES), 0);
}

TEST_F(Association_Test, EveryStatusHasItsCode) {
    const struct {
        const char* function;
        sint32 direct;    // what operations 14 to 16 answer
        sint32 enumerate; // what the enumeration of the fallback answers
        int rc;
    } cases[] = {
        {"names", 0, 0, 0},          {"names", 110, 0, 1},       {"names", 112, 0, 1},
        {"names", 111, 0, 0},        {"names", 111, 70, 1},      {"names", 111, 71, 2},
        {"names", 99, 70, 1},        {"references", 120, 0, 1},  {"references", 122, 0, 2},
        {"references", 121, 0, 0},   {"references", 121, 70, 1}, {"references", 121, 71, 2},
        {"associators", 170, 0, 1},  {"associators", 172, 0, 2}, {"associators", 171, 70, 1},
        {"associators", 171, 71, 2}, {"associators", 99, 0, 0},
    };
    for (const auto& row : cases) {
        SCOPED_TRACE(testing::Message() << row.function << row.direct << "/" << row.enumerate);
        const std::string function = row.function;
        script.status = {{OP_ENUM_ASSOCIATOR_NAMES, function == "names" ? row.direct : 111},
                         {OP_ENUM_REFERENCES, row.direct},
                         {OP_ENUM_ASSOCIATORS, row.direct},
                         {OP_ENUM_INSTANCES, row.enumerate}};
        CMPIObjectPath* path = leaf_path("a");
        const CMPIStatus status =
            function == "names" ? mi->ft->associatorNames(mi, context, result, path, 0, 0, 0, 0)
            : function == "references"
                ? mi->ft->references(mi, context, result, path, 0, 0, nullptr)
                : mi->ft->associators(mi, context, result, path, 0, 0, 0, 0, nullptr);
        EXPECT_EQ(status.rc, row.rc);
    }
}

TEST_F(Association_Test, AClassThatIsNoAssociationFails) {
    auto* other = association_mi(base_registration);
    CMPIObjectPath* path = leaf_path("a");
    EXPECT_EQ(other->ft->associators(other, context, result, path, 0, 0, 0, 0, nullptr).rc, 1);
    EXPECT_EQ(other->ft->associatorNames(other, context, result, path, 0, 0, 0, 0).rc, 1);
    EXPECT_EQ(other->ft->references(other, context, result, path, 0, 0, nullptr).rc, 1);
}

// The closing call: once after a real answer, none after an unsupported one.
TEST_F(Association_Test, TheProcedureClosesTheStreamOfRealAnswers) {
    static int closings;
    static sint32 closing_status;
    const Instance_Proc handler = [](const Instance* instance, sint32 status, void*) {
        closings += !instance;
        closing_status = status;
        unref(instance);
        return true;
    };
    const auto proc = [&](int operation, std::size_t at) {
        void* provider = nullptr;
        link_registration.proc(nullptr, OP_CREATE_PROVIDER,
                               reinterpret_cast<Provider_Word>(&provider), 0, 0, 0, 0, 0, 0, 0);
        const Ref<Instance> source(make_base("s", 1));
        Provider_Word args[8] = {};
        args[0] = reinterpret_cast<Provider_Word>(provider);
        args[1] = reinterpret_cast<Provider_Word>(source.get());
        args[at] = reinterpret_cast<Provider_Word>(handler);
        closings = 0;
        const sint32 status = link_registration.proc(nullptr, operation, args[0], args[1], args[2],
                                                     args[3], args[4], args[5], args[6], args[7]);
        link_registration.proc(nullptr, OP_DESTROY_PROVIDER, args[0], 0, 0, 0, 0, 0, 0, 0);
        return status;
    };
    const struct {
        int operation;
        std::size_t handler_at;
        sint32 status;
        int closings;
    } cases[] = {
        {OP_ENUM_ASSOCIATOR_NAMES, 5, 111, 0}, {OP_ENUM_ASSOCIATOR_NAMES, 5, 112, 1},
        {OP_ENUM_REFERENCES, 4, 121, 0},       {OP_ENUM_REFERENCES, 4, 0, 1},
        {OP_ENUM_ASSOCIATORS, 5, 171, 0},      {OP_ENUM_ASSOCIATORS, 5, 170, 1},
    };
    for (const auto& row : cases) {
        script.status = {{row.operation, row.status}};
        EXPECT_EQ(proc(row.operation, row.handler_at), row.status);
        EXPECT_EQ(closings, row.closings) << row.operation << " " << row.status;
        if (closings) {
            EXPECT_EQ(closing_status, row.status);
        }
    }
}

// ---- Methods ----

class Method_Test : public Cmpi_Test {
protected:
    CMPIStatus run(const char* method, fake::Members in, const char* class_name = "Test_Service") {
        broker.clear_results();
        out = broker.args();
        CMPIObjectPath* path = broker.path("root/test", class_name, {{"Name", fake::text("s")}});
        return mi->ft->invokeMethod(mi, context, result, path, method, broker.args(in), out);
    }
    CMPIMethodMI* mi = method_mi();
    CMPIArgs* out = nullptr;
};

TEST_F(Method_Test, ParametersReachTheProviderAndComeBack) {
    EXPECT_EQ(run("RUN", {{"level", fake::text("6")},
                          {"Target", fake::object(CMPI_ref, base_data("t", 3))}})
                  .rc,
              0);
    EXPECT_STREQ(cast<Test_Service>(script.instance.get())->Name.value.c_str(), "s");
    EXPECT_EQ(cast<Test_Base>(script.model.get())->Slot.value, 3u);
    ASSERT_EQ(broker.returned_data.size(), 1u);
    EXPECT_EQ(broker.returned_data[0].type, CMPI_uint32);
    EXPECT_EQ(broker.returned_data[0].scalar.uint32, 7u);
    EXPECT_EQ(fake::Broker::data(out).string("Answer"), "level");
    EXPECT_EQ(broker.done, 1);
}

TEST_F(Method_Test, Refusals) {
    EXPECT_EQ(run("NoSuch", {}).rc, CMPI_RC_ERR_METHOD_NOT_FOUND);
    EXPECT_EQ(run("Name", {}).rc, CMPI_RC_ERR_METHOD_NOT_FOUND) << "a property is no method";
    EXPECT_EQ(run("Run", {}, "No_Class").rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(run(nullptr, {}).rc, CMPI_RC_ERR_METHOD_NOT_FOUND);
    const std::pair<sint32, int> answers[] = {{130, 1}, {131, 7}, {132, 2}, {-1, 0}};
    for (const auto& [status, rc] : answers) {
        script.status[OP_INVOKE_METHOD] = status;
        EXPECT_EQ(run("Run", {}).rc, rc) << status;
        EXPECT_EQ(broker.done, rc == 0);
    }
}

// ---- Indications ----

TEST_F(Cmpi_Test, IndicationsGoToEveryWatchedNamespace) {
    auto* mi = interface<CMPIIndicationMI>(indication_registration, 'N');
    const auto activate = [&](const char* name_space) {
        mi->ft->activateFilter(mi, context, nullptr, "", broker.path(name_space, "X"), true);
    };
    const auto deactivate = [&](const char* name_space) {
        mi->ft->deActivateFilter(mi, context, nullptr, "", broker.path(name_space, "X"), true);
    };
    activate("root/a");
    activate("root/b");
    activate("root/a");
    EXPECT_EQ(mi->ft->authorizeFilter(mi, context, nullptr, "", nullptr, "").rc, 0);
    EXPECT_EQ(mi->ft->mustPoll(mi, context, nullptr, "", nullptr).rc, 0);
    EXPECT_EQ(mi->ft->enableIndications(mi, context).rc, 0);
    EXPECT_EQ(mi->ft->enableIndications(mi, context).rc, 0);
    EXPECT_EQ(script.count(OP_ENABLE_INDICATIONS), 1) << "once until disabled";

    CMPI_Thread_Context thread(&broker.broker, context, nullptr);
    Thread_Context::push(&thread);
    EXPECT_TRUE(script.indication_proc(make_base("i", 1), script.indication_data));
    EXPECT_FALSE(script.indication_proc(nullptr, script.indication_data));
    ASSERT_EQ(broker.indications.size(), 2u);
    EXPECT_EQ(broker.indications[0].first, "root/a");
    EXPECT_EQ(broker.indications[1].second->string("Id"), "i");

    deactivate("root/b");
    deactivate("root/a");
    deactivate("root/unknown");
    script.indication_proc(make_base("j", 2), script.indication_data);
    EXPECT_EQ(broker.indications.size(), 3u) << "root/a is still watched once";
    Thread_Context::pop();

    EXPECT_DEATH(script.indication_proc(make_base("k", 3), script.indication_data),
                 "assert: thread_context != 0");
    script.status[OP_DISABLE_INDICATIONS] = DISABLE_INDICATIONS_FAILED;
    EXPECT_EQ(mi->ft->disableIndications(mi, context).rc, 1);
    EXPECT_EQ(mi->ft->disableIndications(mi, context).rc, 0) << "disabled all the same";
    script.status[OP_ENABLE_INDICATIONS] = ENABLE_INDICATIONS_FAILED;
    EXPECT_EQ(mi->ft->enableIndications(mi, context).rc, 1);
    EXPECT_EQ(mi->ft->cleanup(mi, context, true).rc, 0);
}

} // namespace

} // namespace cimple
