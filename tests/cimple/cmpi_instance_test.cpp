// The factory, the life of an adapter, the frame of a call, and the instance interface.
#include "cimple/cimom.h"
#include "tests/cimple/cmpi_fixture.h"

#include <atomic>
#include <cstring>
#include <new>
#include <stdexcept>
#include <thread>

namespace cimple {

namespace {

// ---- Factory and cleanup ----

TEST_F(Cmpi_Test, AnAdapterLivesFromTheFirstFactoryToTheLastCleanup) {
    auto* mi = instance_mi();
    Provider_Static_Data& data = block(mi);
    EXPECT_EQ(data.magic, 0x5DE2B131u);
    EXPECT_EQ(mi->ft->ftVersion, 100);
    EXPECT_EQ(mi->ft->miVersion, 100);
    EXPECT_STREQ(mi->ft->miName, "associationTest_Base_Provider") << "the last of the four names";
    EXPECT_STREQ(data.method_name, "methodTest_Base_Provider");
    EXPECT_EQ(data.method_ft.miName, nullptr);
    EXPECT_EQ(script.operations, std::vector<int>{OP_LOAD});
    EXPECT_EQ(data.adapter->meta_class, &Test_Base::static_meta_class);
    EXPECT_EQ(Thread_Context::top(), nullptr);
    auto* method = method_mi("Test_Base");
    EXPECT_EQ(method, &data.method_mi);
    EXPECT_EQ(data.adapter->load_count, 2u);
    EXPECT_EQ(script.count(OP_LOAD), 1);

    host::Request request(*core, known("Test_Base"), "call", "root/test");
    const CMPIContext* context = request.context();
    EXPECT_EQ(method->ft->cleanup(method, context, false).rc, CMPI_RC_OK);
    EXPECT_EQ(script.count(OP_UNLOAD), 0);
    EXPECT_EQ(mi->ft->cleanup(mi, context, false).rc, CMPI_RC_OK);
    EXPECT_EQ(script.count(OP_UNLOAD), 1);
    EXPECT_EQ(data.adapter, nullptr);
    EXPECT_EQ(data.magic, 0xDDDDDDDDu);
    EXPECT_EQ(mi->ft->cleanup(mi, context, true).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(mi->ft
                  ->deleteInstance(mi, context, request.result(host::Answer::nothing, nullptr),
                                   request.path(base("a", 1)))
                  .rc,
              CMPI_RC_ERR_INVALID_HANDLE);

    core->module.cleanup(*core, true);
    instance_mi();
    EXPECT_EQ(script.count(OP_LOAD), 2);
    EXPECT_EQ(data.adapter->load_count, 1u);
    EXPECT_EQ(data.magic, PROVIDER_STATIC_DATA_MAGIC);
}

TEST_F(Cmpi_Test, AProviderMayRefuseToBeUnloaded) {
    script.on = [](int operation) {
        if (operation == OP_LOAD)
            cimom::allow_unload(false);
    };
    Provider_Static_Data& data = block(instance_mi());
    EXPECT_EQ(core->module.cleanup(*core, false).rc, CMPI_RC_DO_NOT_UNLOAD);
    EXPECT_NE(data.adapter, nullptr);
    EXPECT_EQ(core->module.cleanup(*core, true).rc, CMPI_RC_OK) << "terminating goes before it";
    EXPECT_EQ(data.adapter, nullptr);
}

TEST_F(Cmpi_Test, AFailingLoadIsNotLookedAtButAnExceptionIs) {
    script.status[OP_LOAD] = LOAD_FAILED;
    EXPECT_NE(instance_mi(), nullptr);
    script.on = [](int operation) {
        if (operation == OP_LOAD)
            throw std::bad_alloc();
    };
    EXPECT_EQ(association_mi(), nullptr);
    script.on = nullptr;
    EXPECT_NE(association_mi(), nullptr);
}

TEST_F(Cmpi_Test, FactoriesOnManyThreadsLoadOnce) {
    static Provider_Static_Data data;
    const host::Request request(*core, known("Test_Base"), "call", "root/test");
    const auto make = [&](char letter) {
        void* made = nullptr;
        const CMPIBroker* any = &core->brokers.front().cmpi;
        cimple_cmpi_adapter(&data, &registrations[0], any, request.context(), "", letter, &made);
        return made;
    };
    instance_mi("Test_Types"); // has a broker
    std::atomic<int> loading{0};
    script.operations.clear();
    script.on = [&](int) {
        loading++;
        make('M'); // the loading thread itself does not wait
        std::this_thread::yield();
        loading--;
    };
    std::vector<std::thread> threads;
    for (char letter : {'I', 'M', 'A', 'N', 'I', 'M'})
        threads.emplace_back([&, letter] {
            EXPECT_NE(make(letter), nullptr);
            EXPECT_EQ(loading, 0) << "nobody gets an interface before the load has ended";
        });
    for (std::thread& thread : threads)
        thread.join();
    script.on = nullptr;
    EXPECT_EQ(make('X'), nullptr);
    EXPECT_EQ(script.count(OP_LOAD), 1);
    EXPECT_EQ(data.adapter->load_count, 8u);
    while (data.adapter)
        data.instance_ft.cleanup(&data.instance_mi, request.context(), true);
}

TEST_F(Cmpi_Test, AnotherThreadsCleanupDoesNotPullACallsAdapterAway) {
    script.on = [&](int operation) {
        if (operation == OP_DELETE_INSTANCE)
            std::thread([&] {
                EXPECT_EQ(core->module.cleanup(*core, true).rc, CMPI_RC_OK);
                instance_mi(); // loads anew, into the same block
            }).join();
    };
    EXPECT_EQ(ask({.operation = OP_DELETE_INSTANCE, .path = base("a", 1)}).rc, CMPI_RC_OK);
    EXPECT_EQ(script.count(OP_LOAD), 2);
}

// ---- Frame ----

TEST_F(Cmpi_Test, ACallRunsInAContextUnderTheLockAndNoExceptionLeavesIt) {
    CMPI_Adapter* adapter = block(instance_mi()).adapter;
    const auto try_lock = [adapter] {
        int answer = -1;
        std::thread([&] {
            answer = adapter->lock.try_lock();
            if (answer == 0)
                adapter->lock.unlock();
        }).join();
        return answer;
    };
    for (int kind = 0; kind < 3; kind++) {
        script.on = [&](int) {
            EXPECT_NE(Thread_Context::top(), nullptr);
            EXPECT_EQ(try_lock(), 16) << "busy";
            if (kind == 1)
                throw std::bad_alloc();
            if (kind == 2)
                throw 17;
        };
        EXPECT_EQ(ask({OP_ENUM_INSTANCES}).rc, kind ? CMPI_RC_ERR_FAILED : CMPI_RC_OK);
        EXPECT_EQ(Thread_Context::top(), nullptr);
        EXPECT_EQ(try_lock(), 0);
    }
    script.on = [](int) { throw 17; };
    EXPECT_EQ(core->module.cleanup(*core, true).rc, CMPI_RC_ERR_FAILED) << "the unload throws";
}

TEST_F(Cmpi_Test, NullArgumentsAreFailuresNotCrashes) {
    auto* mi = instance_mi();
    host::Request request(*core, known("Test_Base"), "call", "root/test");
    const CMPIContext* context = request.context();
    CMPIResult* result = request.result(host::Answer::instances, nullptr);
    CMPIObjectPath* path = request.path(base("a", 1));
    EXPECT_EQ(mi->ft->enumerateInstances(nullptr, context, result, path, nullptr).rc,
              CMPI_RC_ERR_INVALID_HANDLE);
    CMPIInstanceMI empty = {nullptr, mi->ft};
    EXPECT_EQ(mi->ft->getInstance(&empty, context, result, path, nullptr).rc,
              CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(mi->ft->enumerateInstances(mi, context, result, nullptr, nullptr).rc,
              CMPI_RC_ERR_FAILED);
    script.status[OP_CREATE_INSTANCE] = 99;
    EXPECT_EQ(mi->ft->createInstance(mi, context, result, path, nullptr).rc, CMPI_RC_OK);
    EXPECT_FALSE(keys_all_set(script.instance.get())) << "all of it is null";
    EXPECT_EQ(mi->ft->enumerateInstanceNames(mi, nullptr, nullptr, path).rc, CMPI_RC_OK);
}

// ---- Status of the provider to CMPI code ----

struct Status_Case {
    int operation;
    sint32 status;
    int rc;
    int done;    // calls of CMReturnDone
    int results; // paths and instances returned
};

const Status_Case STATUS_CASES[] = {
    {ENUM_NAMES, 0, 0, 1, 1},           {ENUM_NAMES, 70, 1, 0, 1},
    {ENUM_NAMES, 71, 2, 0, 1},          {ENUM_NAMES, 99, 0, 0, 1},
    {OP_ENUM_INSTANCES, 0, 0, 1, 1},    {OP_ENUM_INSTANCES, 70, 1, 0, 1},
    {OP_ENUM_INSTANCES, 71, 2, 0, 1},   {OP_ENUM_INSTANCES, 99, 0, 1, 1},
    {OP_GET_INSTANCE, 0, 0, 1, 1},      {OP_GET_INSTANCE, 60, 6, 0, 0},
    {OP_GET_INSTANCE, 61, 0, 1, 1}, // found by enumeration
    {OP_GET_INSTANCE, 62, 4, 0, 0},     {OP_GET_INSTANCE, 63, 2, 0, 0},
    {OP_GET_INSTANCE, 64, 1, 0, 0},     {OP_CREATE_INSTANCE, 0, 0, 1, 1},
    {OP_CREATE_INSTANCE, 80, 11, 0, 0}, {OP_CREATE_INSTANCE, 81, 7, 0, 0},
    {OP_CREATE_INSTANCE, 82, 4, 0, 0},  {OP_CREATE_INSTANCE, 83, 2, 0, 0},
    {OP_CREATE_INSTANCE, 84, 1, 0, 0},  {OP_CREATE_INSTANCE, 99, 0, 0, 0},
    {OP_MODIFY_INSTANCE, 0, 0, 1, 1},   {OP_MODIFY_INSTANCE, 100, 6, 0, 0},
    {OP_MODIFY_INSTANCE, 101, 7, 0, 0}, {OP_MODIFY_INSTANCE, 102, 4, 0, 0},
    {OP_MODIFY_INSTANCE, 103, 2, 0, 0}, {OP_MODIFY_INSTANCE, 104, 1, 0, 0},
    {OP_MODIFY_INSTANCE, -1, 0, 0, 0},  {OP_DELETE_INSTANCE, 0, 0, 1, 0},
    {OP_DELETE_INSTANCE, 90, 6, 0, 0},  {OP_DELETE_INSTANCE, 91, 7, 0, 0},
    {OP_DELETE_INSTANCE, 92, 2, 0, 0},  {OP_DELETE_INSTANCE, 93, 1, 0, 0},
    {OP_DELETE_INSTANCE, 99, 0, 1, 0},
};

TEST_F(Cmpi_Test, EveryProviderStatusHasItsCode) {
    script.instances = {make_base("a", 1)};
    for (const Status_Case& row : STATUS_CASES) {
        SCOPED_TRACE(testing::Message() << row.operation << " answers " << row.status);
        script.status = {
            {row.operation == ENUM_NAMES ? OP_ENUM_INSTANCES + 0 : row.operation, row.status}};
        const Told told = ask(
            {.operation = row.operation, .path = base("a", 1), .properties = base("a", 1).keys});
        EXPECT_EQ(told.rc, row.rc);
        EXPECT_EQ(told.done, row.done);
        EXPECT_EQ(told.results(), row.results);
    }
}

// ---- The functions ----

TEST_F(Cmpi_Test, AConversionErrorStopsTheStreamButNotTheCall) {
    script.instances = {make_base("a", 1), make_base("b", 2), make_base("c", 3)};
    failures = {{"newInstance", 4}}; // each is counted twice, for the broker and the path
    const Told told = ask({OP_ENUM_INSTANCES});
    EXPECT_EQ(told.rc, 0);
    EXPECT_EQ(told.results(), 1);
    EXPECT_EQ(told.done, 1);
}

// The object manager may send the instances of a base class: the provider sees its own class.
TEST_F(Cmpi_Test, ABaseClassReachesTheProviderAsItsOwn) {
    Provider_Operations operations{};
    operations.meta_class = &Test_Sub::static_meta_class;
    operations.delete_instance = [](void*, const Instance* keys) -> sint32 {
        const auto* sub = cast<Test_Sub>(keys);
        return sub && sub->Slot.value == 7 && sub->State.is_null() ? 0 : -2;
    };
    const Ref<Instance> base(make_base("x", 7));
    EXPECT_EQ(
        run_provider_operation(operations, OP_DELETE_INSTANCE,
                               {0, reinterpret_cast<Provider_Word>(base.get()), 0, 0, 0, 0, 0, 0}),
        0);
    for (int operation : {10, 11, 12, 14, 15, 16, 17, -5})
        EXPECT_EQ(run_provider_operation(operations, operation, {}), -1) << operation;
}

} // namespace

} // namespace cimple
