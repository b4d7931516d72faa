// The association, method and indication interfaces.
#include "cimple/cmpi_thread_context.h"
#include "tests/cimple/cmpi_fixture.h"

namespace cimple {

namespace {

class Association_Test : public Cmpi_Test {
protected:
    static Test_Link* link(const char* left, const char* right, uint32 slot,
                           const char* right_name_space = "") {
        Test_Link* made = make_link(make_leaf(left), make_base(right, slot));
        made->Right->__name_space = right_name_space;
        made->Weight.set(5);
        return made;
    }
    void unsupported() {
        script.status = {{OP_ENUM_ASSOCIATOR_NAMES, ENUM_ASSOCIATOR_NAMES_UNSUPPORTED},
                         {OP_ENUM_REFERENCES, ENUM_REFERENCES_UNSUPPORTED},
                         {OP_ENUM_ASSOCIATORS, ENUM_ASSOCIATORS_UNSUPPORTED}};
        script.instances = {link("a", "x", 1), link("b", "y", 2), link("a", "z", 3, "root/far")};
    }
    Told walk(int operation, const host::ObjectPath& path, const char* role = nullptr,
              const host::Property_List& list = std::nullopt) {
        return ask({operation, "Test_Link", path, {}, list, nullptr, role});
    }
};

TEST_F(Association_Test, RolesAndClassesNarrowTheMatch) {
    unsupported();
    const struct {
        const char* result_class;
        const char* role;
        const char* result_role;
        int expected;
    } cases[] = {
        {"", "", "", 2},          {"test_base", "left", "RIGHT", 2},
        {"Test_Leaf", "", "", 0}, {"", "Right", "", 0},
        {"", "", "Left", 0},      {"", "NoSuch", "", 0},
        {"No_Class", "", "", 0},  {nullptr, nullptr, "Right", 2},
    };
    for (const auto& row : cases) {
        const Told told = ask({OP_ENUM_ASSOCIATOR_NAMES,
                               "Test_Link",
                               leaf("a"),
                               {},
                               std::nullopt,
                               row.result_class,
                               row.role,
                               row.result_role});
        EXPECT_EQ(told.rc, 0);
        EXPECT_EQ(told.results(), row.expected)
            << testing::PrintToString(row.result_class) << testing::PrintToString(row.role)
            << testing::PrintToString(row.result_role);
    }
}

TEST_F(Association_Test, AnUnknownSourceHasNoAssociations) {
    unsupported();
    for (int operation : {OP_ENUM_ASSOCIATOR_NAMES + 0, OP_ENUM_ASSOCIATORS + 0,
                          OP_ENUM_REFERENCES + 0, REFERENCE_NAMES + 0})
        EXPECT_EQ(walk(operation, {"root/test", "No_Such_Class", {}}).rc, 0) << operation;
    EXPECT_EQ(script.count(OP_ENUM_INSTANCES) + script.count(OP_ENUM_REFERENCES), 0);
}

TEST_F(Association_Test, ReferencesToTheSource) {
    unsupported();
    const auto references = [this](const host::Property_List& list) {
        Told told = walk(OP_ENUM_REFERENCES, leaf("a"), "LEFT", list);
        EXPECT_EQ(told.results(), 2);
        told.instances.resize(2);
        return std::move(told.instances);
    };
    EXPECT_EQ(references(std::nullopt)[0].property("Weight")->as_unsigned(), 5u);
    const auto named = references({{"Left"}});
    EXPECT_FALSE(named[0].property("Weight"));
    EXPECT_TRUE(named[0].property("Right")) << "a key comes with any list";
    // What is listed keeps its null; what is not listed is null.
    static_cast<Test_Link*>(script.instances[0].get())->Weight.null = 1;
    const auto weights = references({{"Weight"}});
    EXPECT_FALSE(weights[0].property("Weight"));
    EXPECT_TRUE(weights[1].property("Weight"));

    const Told names = walk(REFERENCE_NAMES, leaf("a"));
    ASSERT_EQ(names.results(), 2);
    EXPECT_EQ(*names.paths[0].key("Left")->as_reference(), leaf("a"));
    const Told none = walk(OP_ENUM_REFERENCES, leaf("a"), "NoSuch");
    EXPECT_EQ(none.rc + none.results(), 0);
}

TEST_F(Association_Test, AProviderThatAnswersItselfIsAsked) {
    script.instances = {make_base("own", 9)};
    EXPECT_EQ(
        ask({OP_ENUM_ASSOCIATOR_NAMES, "Test_Link", leaf("a"), {}, std::nullopt, "RC", "R1", "R2"})
            .results(),
        1);
    EXPECT_EQ(script.role, "RC/R1/R2");
    EXPECT_EQ(walk(OP_ENUM_ASSOCIATORS, leaf("a")).results(), 1);
    EXPECT_TRUE(trace.empty());
    EXPECT_EQ(script.count(OP_ENUM_INSTANCES), 0);
}

TEST_F(Association_Test, EveryStatusHasItsCode) {
    const struct {
        int operation;
        sint32 direct;    // what the provider answers to it
        sint32 enumerate; // what the enumeration of the fallback answers
        int rc;
    } cases[] = {
        {OP_ENUM_ASSOCIATOR_NAMES, 0, 0, 0},    {OP_ENUM_ASSOCIATOR_NAMES, 110, 0, 1},
        {OP_ENUM_ASSOCIATOR_NAMES, 112, 0, 1},  {OP_ENUM_ASSOCIATOR_NAMES, 111, 0, 0},
        {OP_ENUM_ASSOCIATOR_NAMES, 111, 70, 1}, {OP_ENUM_ASSOCIATOR_NAMES, 111, 71, 2},
        {OP_ENUM_ASSOCIATOR_NAMES, 99, 70, 1},  {OP_ENUM_REFERENCES, 120, 0, 1},
        {OP_ENUM_REFERENCES, 122, 0, 2},        {OP_ENUM_REFERENCES, 121, 0, 0},
        {OP_ENUM_REFERENCES, 121, 70, 1},       {OP_ENUM_REFERENCES, 121, 71, 2},
        {OP_ENUM_ASSOCIATORS, 170, 0, 1},       {OP_ENUM_ASSOCIATORS, 172, 0, 2},
        {OP_ENUM_ASSOCIATORS, 171, 70, 1},      {OP_ENUM_ASSOCIATORS, 171, 71, 2},
        {OP_ENUM_ASSOCIATORS, 99, 0, 0},
    };
    for (const auto& row : cases) {
        script.status = {{OP_ENUM_ASSOCIATOR_NAMES, ENUM_ASSOCIATOR_NAMES_UNSUPPORTED},
                         {OP_ENUM_INSTANCES, row.enumerate}};
        script.status[row.operation] = row.direct;
        EXPECT_EQ(walk(row.operation, leaf("a")).rc, row.rc)
            << row.operation << " " << row.direct << "/" << row.enumerate;
    }
    for (int operation : {OP_ENUM_ASSOCIATORS, OP_ENUM_ASSOCIATOR_NAMES, OP_ENUM_REFERENCES})
        EXPECT_EQ(ask({operation, "Test_Base", leaf("a")}).rc, 1) << "no association";
}

// The closing call: once after a real answer, none after an unsupported one.
TEST_F(Association_Test, TheProcedureClosesTheStreamOfRealAnswers) {
    static std::vector<sint32> closings;
    const Instance_Proc handler = [](const Instance* instance, sint32 status, void*) {
        if (!instance)
            closings.push_back(status);
        unref(instance);
        return true;
    };
    const struct {
        int operation;
        std::size_t handler_at;
        sint32 status;
        std::vector<sint32> closings;
    } cases[] = {
        {OP_ENUM_ASSOCIATOR_NAMES, 5, 111, {}}, {OP_ENUM_ASSOCIATOR_NAMES, 5, 112, {112}},
        {OP_ENUM_REFERENCES, 4, 121, {}},       {OP_ENUM_REFERENCES, 4, 0, {0}},
        {OP_ENUM_ASSOCIATORS, 5, 171, {}},      {OP_ENUM_ASSOCIATORS, 5, 170, {170}},
    };
    const CMPI_Adapter* adapter = block(association_mi()).adapter;
    const Ref<Instance> source(make_base("s", 1));
    for (const auto& row : cases) {
        Provider_Word args[6] = {reinterpret_cast<Provider_Word>(adapter->provider),
                                 reinterpret_cast<Provider_Word>(source.get())};
        args[row.handler_at] = reinterpret_cast<Provider_Word>(handler);
        script.status = {{row.operation, row.status}};
        closings.clear();
        EXPECT_EQ(adapter->proc(nullptr, row.operation, args[0], args[1], args[2], args[3], args[4],
                                args[5], 0, 0),
                  row.status);
        EXPECT_EQ(closings, row.closings) << row.operation << " " << row.status;
    }
}

// ---- Methods ----

TEST_F(Cmpi_Test, ParametersReachTheMethodAndComeBack) {
    const host::ObjectPath service = {"root/test", "Test_Service", {{"Name", Value::text("s")}}};
    const auto run = [&](const char* method, const host::Named_Values& in,
                         const char* class_name = "Test_Service") {
        host::ObjectPath path = service;
        path.class_name = class_name;
        return ask({.operation = OP_INVOKE_METHOD,
                    .class_name = "Test_Service",
                    .path = path,
                    .properties = in,
                    .method = method});
    };
    const Told told =
        run("RUN", {{"level", Value::text("6")}, {"Target", Value::reference(base("t", 3))}});
    EXPECT_EQ(told.rc, 0);
    EXPECT_STREQ(cast<Test_Service>(script.instance.get())->Name.value.c_str(), "s");
    EXPECT_EQ(cast<Test_Base>(script.model.get())->Slot.value, 3u);
    EXPECT_EQ(told.data, number(CMPI_uint32, 7));
    EXPECT_EQ(*host::find(told.outputs, "Answer"), Value::text("level"));
    EXPECT_EQ(told.done, 1);

    EXPECT_EQ(run("NoSuch", {}).rc, CMPI_RC_ERR_METHOD_NOT_FOUND);
    EXPECT_EQ(run("Name", {}).rc, CMPI_RC_ERR_METHOD_NOT_FOUND) << "a property is no method";
    EXPECT_EQ(run("Run", {}, "No_Class").rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(run(nullptr, {}).rc, CMPI_RC_ERR_METHOD_NOT_FOUND);
    const std::pair<sint32, int> answers[] = {{130, 1}, {131, 7}, {132, 2}, {-1, 0}};
    for (const auto& [status, rc] : answers) {
        script.status[OP_INVOKE_METHOD] = status;
        const Told refused = run("Run", {});
        EXPECT_EQ(refused.rc, rc) << status;
        EXPECT_EQ(refused.done, rc == 0);
    }
}

// ---- Indications ----

TEST_F(Cmpi_Test, IndicationsGoToEveryWatchedNamespace) {
    CMPIInstanceMI* instances = instance_mi();
    const CMPIBroker* cmpi_broker = block(instances).adapter->broker;
    host::Request request(*core, known("Test_Base"), "call", "root/test");
    const CMPIContext* context = request.context();
    void* interface = nullptr;
    cimple_cmpi_adapter(&block(instances), &registrations[0], cmpi_broker, context, "Test", 'N',
                        &interface);
    auto* mi = static_cast<CMPIIndicationMI*>(interface);
    const auto activate = [&](const char* name_space) {
        mi->ft->activateFilter(mi, context, nullptr, "", request.path({name_space, "X", {}}), true);
    };
    const auto deactivate = [&](const char* name_space) {
        mi->ft->deActivateFilter(mi, context, nullptr, "", request.path({name_space, "X", {}}),
                                 true);
    };
    for (const char* name_space : {"root/a", "root/b", "root/a"})
        activate(name_space);
    EXPECT_EQ(mi->ft->authorizeFilter(mi, context, nullptr, "", nullptr, "").rc, 0);
    EXPECT_EQ(mi->ft->mustPoll(mi, context, nullptr, "", nullptr).rc, 0);
    EXPECT_EQ(mi->ft->enableIndications(mi, context).rc, 0);
    EXPECT_EQ(mi->ft->enableIndications(mi, context).rc, 0);
    EXPECT_EQ(script.count(OP_ENABLE_INDICATIONS), 1) << "once until disabled";

    CMPI_Thread_Context thread(cmpi_broker, context, nullptr);
    Thread_Context::push(&thread);
    EXPECT_TRUE(script.indication_proc(make_base("i", 1), script.indication_data));
    EXPECT_FALSE(script.indication_proc(nullptr, script.indication_data));
    ASSERT_EQ(core->indications.size(), 2u);
    EXPECT_EQ(core->indications[0].name_space, "root/a");
    EXPECT_EQ(*core->indications[1].instance.property("Id"), Value::text("i"));

    for (const char* name_space : {"root/b", "root/a", "root/unknown"})
        deactivate(name_space);
    script.indication_proc(make_base("j", 2), script.indication_data);
    EXPECT_EQ(core->indications.size(), 3u) << "root/a is still watched once";
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
