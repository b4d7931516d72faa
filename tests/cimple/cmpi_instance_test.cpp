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

TEST_F(Cmpi_Test, FactoryFillsTheTables) {
    auto* mi = instance_mi();
    Provider_Static_Data& block = blocks[&base_registration];
    EXPECT_EQ(block.magic, 0x5DE2B131u);
    EXPECT_EQ(mi->hdl, &block);
    EXPECT_EQ(mi->ft->ftVersion, 100);
    EXPECT_EQ(mi->ft->miVersion, 100);
    EXPECT_STREQ(mi->ft->miName, "associationTest") << "the last of the four names";
    EXPECT_EQ(block.method_ft.miName, nullptr);
    EXPECT_EQ(block.association_ft.miName, nullptr);
    EXPECT_EQ(block.indication_ft.miName, nullptr);
    EXPECT_STREQ(block.method_name, "methodTest");
    EXPECT_EQ(script.operations, std::vector<int>{OP_LOAD});
    EXPECT_EQ(block.adapter->meta_class, &Test_Base::static_meta_class);
    EXPECT_EQ(Thread_Context::top(), nullptr);

    EXPECT_EQ(interface<void>(base_registration, 'X'), nullptr);
    EXPECT_EQ(interface<void>(base_registration, 'M'), &block.method_mi);
    EXPECT_EQ(block.adapter->load_count, 3u);
    EXPECT_EQ(script.count(OP_LOAD), 1);
}

TEST_F(Cmpi_Test, CleanupCountsDownAndLoadsAnew) {
    auto* mi = instance_mi();
    auto* method = interface<CMPIMethodMI>(base_registration, 'M');
    Provider_Static_Data& block = blocks[&base_registration];
    EXPECT_EQ(method->ft->cleanup(method, context, false).rc, CMPI_RC_OK);
    EXPECT_EQ(script.count(OP_UNLOAD), 0);
    EXPECT_EQ(mi->ft->cleanup(mi, context, false).rc, CMPI_RC_OK);
    EXPECT_EQ(script.count(OP_UNLOAD), 1);
    EXPECT_EQ(block.adapter, nullptr);
    EXPECT_EQ(block.magic, 0xDDDDDDDDu);
    EXPECT_EQ(mi->ft->cleanup(mi, context, true).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(mi->ft->deleteInstance(mi, context, result, base_path()).rc,
              CMPI_RC_ERR_INVALID_HANDLE);

    instance_mi();
    EXPECT_EQ(script.count(OP_LOAD), 2);
    EXPECT_EQ(block.adapter->load_count, 1u);
    EXPECT_EQ(block.magic, PROVIDER_STATIC_DATA_MAGIC);
}

TEST_F(Cmpi_Test, AProviderMayRefuseToBeUnloaded) {
    script.on = [](int operation) {
        if (operation == OP_LOAD)
            cimom::allow_unload(false);
    };
    auto* mi = instance_mi();
    EXPECT_EQ(mi->ft->cleanup(mi, context, false).rc, CMPI_RC_DO_NOT_UNLOAD);
    EXPECT_NE(blocks[&base_registration].adapter, nullptr);
    EXPECT_EQ(mi->ft->cleanup(mi, context, true).rc, CMPI_RC_OK) << "terminating goes before it";
    EXPECT_EQ(blocks[&base_registration].adapter, nullptr);
}

TEST_F(Cmpi_Test, AFailingLoadIsNotLookedAtButAnExceptionIs) {
    script.status[OP_LOAD] = LOAD_FAILED;
    EXPECT_NE(instance_mi(), nullptr);
    script.on = [](int operation) {
        if (operation == OP_LOAD)
            throw std::bad_alloc();
    };
    EXPECT_EQ(interface<void>(link_registration, 'A'), nullptr);
    EXPECT_EQ(blocks[&link_registration].adapter, nullptr);
    script.on = nullptr;
    EXPECT_NE(interface<void>(link_registration, 'A'), nullptr);
}

TEST_F(Cmpi_Test, FactoriesOnManyThreadsLoadOnce) {
    std::atomic<int> loading{0};
    script.on = [&](int) {
        loading++;
        interface<void>(base_registration, 'M'); // the loading thread itself does not wait
        std::this_thread::yield();
        loading--;
    };
    blocks[&base_registration];
    std::vector<std::thread> threads;
    for (char letter : {'I', 'M', 'A', 'N', 'I', 'M'})
        threads.emplace_back([&, letter] {
            EXPECT_NE(interface<void>(base_registration, letter), nullptr);
            EXPECT_EQ(loading, 0) << "nobody gets an interface before the load has ended";
        });
    for (std::thread& thread : threads)
        thread.join();
    script.on = nullptr;
    EXPECT_EQ(script.count(OP_LOAD), 1);
    EXPECT_EQ(blocks[&base_registration].adapter->load_count, 7u);
}

TEST_F(Cmpi_Test, AnotherThreadsCleanupDoesNotPullACallsAdapterAway) {
    auto* mi = instance_mi();
    script.on = [&](int operation) {
        if (operation == OP_DELETE_INSTANCE)
            std::thread([&] {
                EXPECT_EQ(mi->ft->cleanup(mi, context, true).rc, CMPI_RC_OK);
                instance_mi(); // loads anew, into the same block
            }).join();
    };
    EXPECT_EQ(mi->ft->deleteInstance(mi, context, result, base_path("a", 1)).rc, CMPI_RC_OK);
    EXPECT_EQ(script.count(OP_LOAD), 2);
}

// ---- Frame ----

TEST_F(Cmpi_Test, ACallRunsInAContextUnderTheLock) {
    auto* mi = instance_mi();
    CMPI_Adapter* adapter = blocks[&base_registration].adapter;
    int seen = -1;
    script.on = [&](int) {
        EXPECT_NE(Thread_Context::top(), nullptr);
        std::thread([&] { seen = adapter->lock.try_lock(); }).join();
    };
    mi->ft->enumerateInstances(mi, context, result, base_path(), nullptr);
    EXPECT_EQ(seen, 16) << "busy";
    EXPECT_EQ(Thread_Context::top(), nullptr);
}

TEST_F(Cmpi_Test, NoExceptionLeavesACall) {
    auto* mi = instance_mi();
    CMPI_Adapter* adapter = blocks[&base_registration].adapter;
    for (int kind = 0; kind < 2; kind++) {
        script.on = [kind](int) {
            if (kind == 0)
                throw std::bad_alloc();
            throw 17;
        };
        EXPECT_EQ(mi->ft->enumerateInstances(mi, context, result, base_path(), nullptr).rc,
                  CMPI_RC_ERR_FAILED);
        EXPECT_EQ(Thread_Context::top(), nullptr);
        int lock = -1;
        std::thread([&] {
            lock = adapter->lock.try_lock();
            adapter->lock.unlock();
        }).join();
        EXPECT_EQ(lock, 0);
    }
    EXPECT_EQ(mi->ft->cleanup(mi, context, true).rc, CMPI_RC_ERR_FAILED) << "the unload throws";
    EXPECT_EQ(blocks[&base_registration].adapter, nullptr);
}

TEST_F(Cmpi_Test, NullArgumentsAreFailuresNotCrashes) {
    auto* mi = instance_mi();
    EXPECT_EQ(mi->ft->enumerateInstances(nullptr, context, result, base_path(), nullptr).rc,
              CMPI_RC_ERR_INVALID_HANDLE);
    CMPIInstanceMI empty = {nullptr, mi->ft};
    EXPECT_EQ(mi->ft->getInstance(&empty, context, result, base_path(), nullptr).rc,
              CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(mi->ft->enumerateInstances(mi, context, result, nullptr, nullptr).rc,
              CMPI_RC_ERR_FAILED);
    EXPECT_EQ(mi->ft->createInstance(mi, context, result, base_path(), nullptr).rc, CMPI_RC_OK);
    EXPECT_FALSE(keys_all_set(script.instance.get())) << "all of it is null";
    EXPECT_EQ(mi->ft->enumerateInstanceNames(mi, nullptr, nullptr, base_path()).rc, CMPI_RC_OK);
}

// ---- Status of the provider to CMPI code ----

struct Status_Case {
    int operation;
    sint32 status;
    int rc;
    int done;    // calls of CMReturnDone
    int results; // paths and instances returned
};

constexpr int NAMES = 100; // enumInstanceNames: operation 6 through another function

const Status_Case STATUS_CASES[] = {
    {NAMES, 0, 0, 1, 1},
    {NAMES, 70, 1, 0, 1},
    {NAMES, 71, 2, 0, 1},
    {NAMES, 99, 0, 0, 1},
    {OP_ENUM_INSTANCES, 0, 0, 1, 1},
    {OP_ENUM_INSTANCES, 70, 1, 0, 1},
    {OP_ENUM_INSTANCES, 71, 2, 0, 1},
    {OP_ENUM_INSTANCES, 99, 0, 1, 1},
    {OP_GET_INSTANCE, 0, 0, 1, 1},
    {OP_GET_INSTANCE, 60, 6, 0, 0},
    {OP_GET_INSTANCE, 61, 0, 1, 1}, // found by enumeration
    {OP_GET_INSTANCE, 62, 4, 0, 0},
    {OP_GET_INSTANCE, 63, 2, 0, 0},
    {OP_GET_INSTANCE, 64, 1, 0, 0},
    {OP_CREATE_INSTANCE, 0, 0, 1, 1},
    {OP_CREATE_INSTANCE, 80, 11, 0, 0},
    {OP_CREATE_INSTANCE, 81, 7, 0, 0},
    {OP_CREATE_INSTANCE, 82, 4, 0, 0},
    {OP_CREATE_INSTANCE, 83, 2, 0, 0},
    {OP_CREATE_INSTANCE, 84, 1, 0, 0},
    {OP_CREATE_INSTANCE, 99, 0, 0, 0},
    {OP_MODIFY_INSTANCE, 0, 0, 1, 1},
    {OP_MODIFY_INSTANCE, 100, 6, 0, 0},
    {OP_MODIFY_INSTANCE, 101, 7, 0, 0},
    {OP_MODIFY_INSTANCE, 102, 4, 0, 0},
    {OP_MODIFY_INSTANCE, 103, 2, 0, 0},
    {OP_MODIFY_INSTANCE, 104, 1, 0, 0},
    {OP_MODIFY_INSTANCE, -1, 0, 0, 0},
    {OP_DELETE_INSTANCE, 0, 0, 1, 0},
    {OP_DELETE_INSTANCE, 90, 6, 0, 0},
    {OP_DELETE_INSTANCE, 91, 7, 0, 0},
    {OP_DELETE_INSTANCE, 92, 2, 0, 0},
    {OP_DELETE_INSTANCE, 93, 1, 0, 0},
    {OP_DELETE_INSTANCE, 99, 0, 1, 0},
};

class Status_Test : public Cmpi_Test {
protected:
    CMPIStatus call(CMPIInstanceMI* mi, int operation) {
        CMPIObjectPath* path = base_path("a", 1);
        CMPIInstance* source = broker.instance(fake::instance_data(
            base_data("a", 1), {{"Id", fake::text("a")}, {"Slot", fake::number(CMPI_uint32, 1)}}));
        switch (operation) {
        case NAMES:
            return mi->ft->enumerateInstanceNames(mi, context, result, path);
        case OP_ENUM_INSTANCES:
            return mi->ft->enumerateInstances(mi, context, result, path, nullptr);
        case OP_GET_INSTANCE:
            return mi->ft->getInstance(mi, context, result, path, nullptr);
        case OP_CREATE_INSTANCE:
            return mi->ft->createInstance(mi, context, result, path, source);
        case OP_MODIFY_INSTANCE:
            return mi->ft->modifyInstance(mi, context, result, path, source, nullptr);
        default:
            return mi->ft->deleteInstance(mi, context, result, path);
        }
    }
};

TEST_F(Status_Test, EveryProviderStatusHasItsCode) {
    auto* mi = instance_mi();
    script.instances = {make_base("a", 1)};
    for (const Status_Case& row : STATUS_CASES) {
        SCOPED_TRACE(testing::Message() << row.operation << " answers " << row.status);
        script.status = {
            {row.operation == NAMES ? static_cast<int>(OP_ENUM_INSTANCES) : row.operation,
             row.status}};
        broker.clear_results();
        const CMPIStatus status = call(mi, row.operation);
        EXPECT_EQ(status.rc, row.rc);
        EXPECT_EQ(status.msg, nullptr);
        EXPECT_EQ(broker.done, row.done);
        EXPECT_EQ(static_cast<int>(broker.returned_paths.size() + broker.returned_instances.size()),
                  row.results);
        EXPECT_EQ(broker.live(), 0) << "what is delivered is given back";
    }
}

// ---- The functions ----

TEST_F(Cmpi_Test, AConversionErrorStopsTheStreamButNotTheCall) {
    auto* mi = instance_mi();
    script.instances = {make_base("a", 1), make_base("b", 2), make_base("c", 3)};
    broker.failures = {{"newInstance", 2}};
    EXPECT_EQ(mi->ft->enumerateInstances(mi, context, result, base_path(), nullptr).rc, 0);
    EXPECT_EQ(broker.returned_instances.size(), 1u);
    EXPECT_EQ(broker.done, 1);
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
