// Mutexes, threads and their contexts, the clock, and up-calls.
#include "cimple/cimom.h"
#include "cimple/cmpi_thread_context.h"
#include "tests/cimple/cmpi_fixture.h"

#include <atomic>
#include <cstring>
#include <stdexcept>
#include <thread>

namespace cimple {

namespace {

// ---- Locks ----

TEST(Mutex_Test, RecursiveAndBusy) {
    Mutex plain, recursive(true);
    plain.lock();
    EXPECT_EQ(plain.try_lock(), 16);
    plain.unlock();
    const Auto_Mutex first(recursive);
    Auto_Mutex second(recursive);
    EXPECT_EQ(recursive.try_lock(), 0);
    recursive.unlock();
    second.unlock();
    int other = -1;
    std::thread([&] { other = recursive.try_lock(); }).join();
    EXPECT_EQ(other, 16) << "held once still";
}

TEST(Mutex_Death_Test, AFailingLockEndsTheProcess) {
#ifdef __SANITIZE_THREAD__
    GTEST_SKIP() << "the sanitizer reports the mutex before it is asked";
#endif
    EXPECT_DEATH(
        {
            Mutex mutex;
            std::memset(static_cast<void*>(&mutex), 0xFF, sizeof(pthread_mutex_t));
            mutex.lock();
        },
        "Mutex\\(.*void cimple::Mutex::lock\\(\\).*pthread_mutex_lock");
}

TEST(Mutex_Death_Test, LockOrderIsAsserted) {
#ifdef CIMPLE_CHECK_LOCKS
    Mutex low(false, 1, "low"), high(true, 2, "high"), free;
    EXPECT_DEATH(
        {
            const Auto_Mutex outer(high);
            const Auto_Mutex inner(low);
        },
        "low \\(rank 1\\) taken while high \\(rank 2\\) is held");
    { const Auto_Mutex first(low), second(high), third(high), unranked(free); }
    high.lock();
    high.unlock();
    const Auto_Mutex again(low); // what was given back does not count
#else
    GTEST_SKIP() << "built without CIMPLE_CHECK_LOCKS";
#endif
}

// ---- Threads ----

void* answer(void* argument) {
    return Thread_Context::top() ? nullptr : argument;
}
void* leave(void* argument) {
    Thread::exit(argument);
}
void* fail(void*) {
    throw std::runtime_error("thread");
}

TEST(Thread_Test, JoinGivesTheValue) {
    int anything = 0;
    const std::pair<Thread_Proc, void*> cases[] = {
        {answer, &anything}, {leave, &anything}, {fail, nullptr}};
    for (const auto& [proc, expected] : cases) {
        Thread thread;
        void* value = &thread;
        ASSERT_EQ(Thread::create_joinable(thread, proc, &anything), 0);
        EXPECT_FALSE(thread == Thread::self());
        EXPECT_EQ(Thread::join(thread, value), 0);
        EXPECT_EQ(value, expected);
    }
}

TEST_F(Cmpi_Test, AThreadStartedInACallIsAttached) {
    static int seen;
    auto* mi = instance_mi();
    Thread thread;
    const auto start = [&](Thread_Proc proc) {
        script.on = [&thread, proc](int) {
            EXPECT_EQ(Thread::create_joinable(thread, proc, nullptr), 0);
        };
        mi->ft->deleteInstance(mi, context, result, base_path("a", 1));
        void* value;
        Thread::join(thread, value);
    };
    const std::vector<std::string> attached = {"prepareAttachThread", "attachThread",
                                               "detachThread"};
    start([](void*) -> void* {
        seen = Thread_Context::top() ? 1 : 0;
        String user;
        cimom::get_username(user);
        return nullptr;
    });
    EXPECT_EQ(seen, 1);
    EXPECT_EQ(broker.upcalls, attached);
    for (Thread_Proc proc : {leave, fail}) {
        broker.clear_results();
        start(proc);
        EXPECT_EQ(broker.upcalls, attached) << "detached on every way out";
    }
    broker.clear_results();
    broker.failures = {{"prepareAttachThread", 0}};
    start([](void*) -> void* {
        seen = Thread_Context::top() ? 1 : 0;
        return nullptr;
    });
    EXPECT_EQ(seen, 0) << "without a context, but it runs";
    EXPECT_TRUE(broker.upcalls.empty());
}

TEST_F(Cmpi_Test, AnUnstartedThreadsContextIsGivenBack) {
    CMPI_Thread_Context parent(&broker.broker, context, nullptr);
    const int before = broker.live();
    delete parent.thread_create_hook(nullptr);
    EXPECT_EQ(broker.live(), before);
}

// A clock that has no pauses of its own leaves them to the host's time.
TEST(Time_Test, APauseEndsByItselfOrByAWake) {
    bool stop = false;
    Time::pause(1, stop);
    std::atomic<bool> over{false};
    std::thread sleeper([&] {
        Time::pause(3600ull * 1000000, stop);
        over = true;
    });
    Time::wake(); // not meant for it: the flag is down
    EXPECT_FALSE(over);
    raise_flag(stop);
    Time::wake();
    sleeper.join();
    Time::pause(3600ull * 1000000, stop);
    Time::sleep(3600ull * 1000000, stop);
}

// ---- Up-calls ----

class Cimom_Test : public Cmpi_Test {
protected:
    Cimom_Test() { Thread_Context::push(&thread); }
    ~Cimom_Test() override {
        Thread_Context::pop();
        EXPECT_EQ(broker.live(), 0) << "a long thread leaves nothing behind";
    }
    CMPI_Thread_Context thread{&broker.broker, context, nullptr};
    const Ref<Test_Base> model{make_base("m", 4)};
};

TEST_F(Cmpi_Test, WithoutAContextEveryUpCallFails) {
    const Ref<Test_Base> base(make_base("m", 4));
    String user;
    Instance_Enumerator enumerator;
    EXPECT_FALSE(cimom::get_username(user));
    EXPECT_EQ(cimom::allow_unload(true), -1);
    EXPECT_EQ(cimom::enum_instances("root", base.get(), enumerator), -1);
    EXPECT_FALSE(enumerator.more());
    EXPECT_FALSE(enumerator.get());
    EXPECT_FALSE(cimom::get_instance("root", base.get()));
    EXPECT_EQ(cimom::create_instance("root", base.get()), -1);
    EXPECT_EQ(cimom::modify_instance("root", base.get()), -1);
    EXPECT_EQ(cimom::delete_instance("root", base.get()), -1);
    EXPECT_EQ(cimom::invoke_method("root", base.get(), base.get()), -1);
    Array<Instance*> list;
    EXPECT_DEATH(cimom::enum_instances("root", base.get(), list), "NOT IMPLEMENTED.*false");
}

TEST_F(Cimom_Test, EnumerationConvertsToTheModelsClass) {
    broker.upcall_instances = {
        fake::instance_data(fake::path_data("root/x", "Foreign_Subclass"),
                            {{"Id", fake::text("1")}, {"Foreign", fake::text("dropped")}}),
        fake::instance_data(fake::path_data("root/x", "Test_Base"), {{"Id", fake::text("2")}})};
    Instance_Enumerator enumerator;
    ASSERT_EQ(cimom::enum_instances("root/x", model.get(), enumerator), 0);
    EXPECT_EQ(broker.upcalls[0], "enumInstances root/x:Test_Base");
    std::string ids;
    for (; enumerator.more(); enumerator.next()) {
        const Ref<Instance> instance = enumerator.get();
        EXPECT_STREQ(instance->__name_space.c_str(), "root/x");
        ids += cast<Test_Base>(instance.get())->Id.value.c_str();
    }
    EXPECT_EQ(ids, "12");
    enumerator.next();
    EXPECT_FALSE(enumerator.get());

    broker.failures = {{"getNext", 2}};
    cimom::enum_instances("root/x", model.get(), enumerator);
    enumerator.next();
    EXPECT_FALSE(enumerator.more()) << "an element that fails ends it";
    broker.failures.clear();
    {
        CMPI_Thread_Context call(&broker.broker, context, nullptr);
        Thread_Context::push(&call);
        ASSERT_EQ(cimom::enum_instances("root/x", model.get(), enumerator), 0);
        Thread_Context::pop();
    }
    EXPECT_EQ(broker.live(), 0) << "it went with the call";
    enumerator.next();
    EXPECT_FALSE(enumerator.more());
    broker.upcall_status = CMPI_RC_ERR_INVALID_CLASS;
    EXPECT_EQ(cimom::enum_instances("root/x", model.get(), enumerator), -1);
    EXPECT_EQ(cimom::enum_instances("root/x", nullptr, enumerator), -1);
    broker.end_call();
}

TEST_F(Cimom_Test, SingleInstances) {
    broker.upcall_instances = {fake::instance_data(
        base_data("m", 4), {{"Id", fake::text("m")}, {"Caption", fake::text("found")}})};
    const Ref<Instance> found = cimom::get_instance("root/y", model.get());
    ASSERT_TRUE(found);
    EXPECT_STREQ(cast<Test_Base>(found.get())->Caption.value.c_str(), "found");
    broker.end_call();

    broker.upcall_instances.clear();
    EXPECT_EQ(cimom::create_instance("root/y", model.get()), 0);
    EXPECT_EQ(cimom::modify_instance("root/y", model.get()), 0);
    EXPECT_EQ(cimom::delete_instance("root/y", model.get()), 0);
    ASSERT_EQ(broker.upcall_instances.size(), 2u);
    EXPECT_EQ(broker.upcall_instances[0]->string("Id"), "m");
    broker.upcall_status = CMPI_RC_ERR_NOT_FOUND;
    EXPECT_FALSE(cimom::get_instance("root/y", model.get()));
    broker.end_call();
    EXPECT_EQ(cimom::create_instance("root/y", model.get()), -1);
    EXPECT_EQ(cimom::modify_instance("root/y", model.get()), -1);
    EXPECT_EQ(cimom::delete_instance("root/y", model.get()), -1);
}

TEST_F(Cimom_Test, MethodsOfOthers) {
    const Ref<Instance> service(create<Test_Service>());
    auto* method = static_cast<Test_Service_Run_method*>(create(static_cast<const Meta_Class*>(
        static_cast<const Meta_Features*>(&Test_Service_Run_method::static_meta_class))));
    const Ref<Instance> owner(method);
    method->Level.set(3);
    broker.method_outputs = {{"Answer", fake::text("from there")}};
    broker.method_result = fake::number(CMPI_uint32, 17);
    EXPECT_EQ(cimom::invoke_method("root/z", service.get(), method), 0);
    EXPECT_EQ(broker.upcalls[0], "invokeMethod Run root/z:Test_Service");
    EXPECT_EQ(broker.upcall_instances[0]->find("Level")->scalar.uint32, 3u);
    EXPECT_STREQ(method->Answer.value.c_str(), "from there");
    EXPECT_EQ(method->return_value.value, 17u);

    broker.upcall_status = CMPI_RC_ERR_FAILED;
    EXPECT_EQ(cimom::invoke_method("root/z", service.get(), method), -1);
    EXPECT_EQ(cimom::invoke_method(nullptr, service.get(), method), -1);

    // A path that cannot be made, for a static method as for another, and a thread without a
    // broker or context.
    broker.upcall_status = CMPI_RC_OK;
    broker.failures = {{"newObjectPath", 1}};
    EXPECT_EQ(cimom::invoke_method("root/z", service.get(), method), -1);
    const Meta_Method& run = Test_Service_Run_method::static_meta_class;
    const Meta_Method static_run{{{{0}, run.flags | FLAG_STATIC, run.name, nullptr, 0},
                                  run.meta_features,
                                  run.num_meta_features,
                                  run.size},
                                 run.return_type};
    method->__meta_class = as_class(&static_run);
    broker.failures = {{"newObjectPath", 1}};
    EXPECT_EQ(cimom::invoke_method("root/z", service.get(), method), -1);
    CMPI_Thread_Context no_broker(nullptr, context, nullptr);
    CMPI_Thread_Context no_context(&broker.broker, nullptr, nullptr);
    for (CMPI_Thread_Context* lacking : {&no_broker, &no_context}) {
        Thread_Context::push(lacking);
        EXPECT_EQ(cimom::invoke_method("root/z", service.get(), method), -1);
        Thread_Context::pop();
    }
    EXPECT_EQ(broker.upcalls.size(), 2u);
}

} // namespace

} // namespace cimple
