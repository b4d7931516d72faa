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
    const auto start = [&](Thread_Proc proc) {
        in_a_call([proc] {
            Thread thread;
            EXPECT_EQ(Thread::create_joinable(thread, proc, nullptr), 0);
            void* value;
            Thread::join(thread, value);
        });
        EXPECT_EQ(core->attached_threads, 0) << "detached on every way out";
    };
    const Thread_Proc look = [](void*) -> void* {
        String user;
        seen = cimom::get_username(user) ? 1 : 0;
        return nullptr;
    };
    start(look);
    EXPECT_EQ(seen, 1);
    for (Thread_Proc proc : {leave, fail})
        start(proc);
    failures = {{"prepareAttachThread", 0}};
    start(look);
    EXPECT_EQ(seen, 0) << "without a context, but it runs";
    failures.clear();
    in_a_call([] {
        auto* parent = static_cast<CMPI_Thread_Context*>(Thread_Context::top());
        delete parent->thread_create_hook(nullptr); // of a thread that was not started
    });
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

TEST_F(Cmpi_Test, EnumerationConvertsToTheModelsClass) {
    core->platform.read_text(R"({"classes": [{"name": "Foreign_Sub", "superclass": "Test_Sub"}],
        "instances": [
        {"namespace": "root/x", "class": "Foreign_Sub", "properties": {"Id": "1", "Slot": 1, "State": 5}},
        {"namespace": "root/x", "class": "Test_Base", "properties": {"Id": "2", "Slot": 2}}]})",
                             "platform", core->classes);
    const Ref<Test_Base> model{make_base("m", 4)};
    in_a_call([&] {
        Instance_Enumerator enumerator;
        ASSERT_EQ(cimom::enum_instances("root/x", model.get(), enumerator), 0);
        EXPECT_EQ(trace[0], "up-call enumerateInstances root/x:Test_Base.Id=\"m\",Slot=4");
        std::string ids;
        for (; enumerator.more(); enumerator.next()) {
            const Ref<Instance> instance = enumerator.get();
            EXPECT_STREQ(instance->__name_space.c_str(), "root/x");
            EXPECT_EQ(instance->__meta_class, &Test_Base::static_meta_class);
            ids += cast<Test_Base>(instance.get())->Id.value.c_str();
        }
        EXPECT_EQ(ids, "12");
        enumerator.next();
        EXPECT_FALSE(enumerator.get());

        failures = {{"getNext", 2}};
        cimom::enum_instances("root/x", model.get(), enumerator);
        enumerator.next();
        EXPECT_FALSE(enumerator.more()) << "an element that fails ends it";
        failures.clear();
        {
            const auto* outer = static_cast<CMPI_Thread_Context*>(Thread_Context::top());
            CMPI_Thread_Context call(outer->broker(), outer->context(), nullptr);
            Thread_Context::push(&call);
            ASSERT_EQ(cimom::enum_instances("root/x", model.get(), enumerator), 0);
            Thread_Context::pop();
        }
        enumerator.next();
        EXPECT_FALSE(enumerator.more()) << "it went with the call";
        EXPECT_EQ(cimom::enum_instances("root/unknown", model.get(), enumerator), -1);
        EXPECT_EQ(cimom::enum_instances("root/x", nullptr, enumerator), -1);
    });
}

TEST_F(Cmpi_Test, UpCallsToOthersAboutOneInstance) {
    const Ref<Test_Base> model{make_base("m", 4)};
    script.instances = {make_base("m", 4)};
    static_cast<Test_Base*>(script.instances[0].get())->Caption.set("found");
    script.status[OP_CREATE_INSTANCE] = 99;
    script.status[OP_MODIFY_INSTANCE] = 99;
    in_a_call([&] {
        const Ref<Instance> found = cimom::get_instance("root/test", model.get());
        ASSERT_TRUE(found);
        EXPECT_STREQ(cast<Test_Base>(found.get())->Caption.value.c_str(), "found");
        EXPECT_EQ(cimom::create_instance("root/test", model.get()), 0);
        EXPECT_TRUE(key_eq(script.instance.get(), model.get()));
        EXPECT_EQ(cimom::modify_instance("root/test", model.get()), 0);
        EXPECT_EQ(cimom::delete_instance("root/test", model.get()), 0);
        EXPECT_TRUE(key_eq(script.model.get(), model.get()));
        EXPECT_FALSE(cimom::get_instance("root/y", model.get()));
        EXPECT_EQ(cimom::create_instance("root/y", model.get()), -1);
        EXPECT_EQ(cimom::modify_instance("root/y", model.get()), -1);
        EXPECT_EQ(cimom::delete_instance("root/y", model.get()), -1);
    });
}

TEST_F(Cmpi_Test, MethodsOfOthers) {
    const Ref<Test_Service> service(create<Test_Service>());
    service->Name.set("s");
    const auto method_of = [](const Meta_Method& meta) {
        return Ref<Instance>(create(as_class(&meta)));
    };
    const Ref<Instance> run = method_of(Test_Service_Run_method::static_meta_class);
    const Ref<Instance> count = method_of(Test_Service_Count_method::static_meta_class);
    auto* method = static_cast<Test_Service_Run_method*>(run.get());
    method->Level.set(3);
    // Inside another provider: one that runs cannot be asked.
    script.on = [&](int operation) {
        if (operation != OP_DELETE_INSTANCE)
            return;
        EXPECT_EQ(cimom::invoke_method("root/test", service.get(), method), 0);
        EXPECT_EQ(trace[0], "up-call invokeMethod root/test:Test_Service.Name=\"s\"");
        EXPECT_STREQ(method->Answer.value.c_str(), "level");
        EXPECT_EQ(method->return_value.value, 4u);
        EXPECT_EQ(cimom::invoke_method("root/test", service.get(), count.get()), 0);
        EXPECT_EQ(trace[1], "up-call invokeMethod root/test:Test_Service")
            << "static: without keys";

        script.status[OP_INVOKE_METHOD] = INVOKE_METHOD_FAILED;
        EXPECT_EQ(cimom::invoke_method("root/test", service.get(), method), -1);
        EXPECT_EQ(cimom::invoke_method(nullptr, service.get(), method), -1);
        // A path that cannot be made, and a thread without a broker or context.
        for (Instance* each : {run.get(), count.get()}) {
            failures = {{"newObjectPath", 1}};
            EXPECT_EQ(cimom::invoke_method("root/test", service.get(), each), -1);
        }
        const auto* here = static_cast<CMPI_Thread_Context*>(Thread_Context::top());
        CMPI_Thread_Context no_broker(nullptr, here->context(), nullptr);
        CMPI_Thread_Context no_context(here->broker(), nullptr, nullptr);
        for (CMPI_Thread_Context* lacking : {&no_broker, &no_context}) {
            Thread_Context::push(lacking);
            EXPECT_EQ(cimom::invoke_method("root/test", service.get(), method), -1);
            Thread_Context::pop();
        }
        EXPECT_EQ(trace.size(), 3u);
    };
    ask({.operation = OP_DELETE_INSTANCE, .path = base("a", 1)});
}

} // namespace

} // namespace cimple
