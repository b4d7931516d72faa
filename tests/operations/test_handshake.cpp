// The wrapper's constructor and destructor, over real semaphores of this process.
#include "operations/method_wrapper.h"
#include "tests/device/log_capture.h"
#include "tests/operations/fake_bound.h"

#include <cstdlib>
#include <fcntl.h>
#include <gtest/gtest.h>
#include <semaphore.h>
#include <sys/stat.h>
#include <thread>
#include <unistd.h>

using namespace cimple;

namespace {

std::string nameOf(const char* prefix) {
    return prefix + std::to_string(getpid());
}

bool exists(const std::string& name) {
    sem_t* semaphore = sem_open(name.c_str(), 0);
    if (semaphore == SEM_FAILED)
        return false;
    sem_close(semaphore);
    return true;
}

class Handshake : public testing::Test {
protected:
    const std::string m_first = nameOf("/VLN_AX_INIT_LIB_");
    const std::string m_second = nameOf("/VLN_AX_INIT_LIB_DONE_");

    void SetUp() override {
        fake = Fake_Bound();
        log_capture::take();
    }
    void TearDown() override {
        sem_unlink(m_first.c_str());
        sem_unlink(m_second.c_str());
    }
};

} // namespace

TEST_F(Handshake, InitialiserRunsTheLibraryOnce) {
    int calls = 0;
    fake.initLib = [&] {
        ++calls;
        return AX_STATUS_OK;
    };
    {
        VLN_MethodWrapper wrapper;
        EXPECT_EQ(log_capture::take(),
                  (std::vector<std::string>{
                      "5:VLN_MethodWrapper::Constructor", "5:Setting Up for FIFO.. ",
                      "5:Aquired Semaphore.. Running AX_InitLib " + m_first + " ",
                      "5:Aquired Completed Semaphore.. Running AX_InitLib " + m_second,
                      "5:Signalling Completed Semaphore.. Running AX_InitLib",
                      "5:Signaled Completed Semaphore.. Running AX_InitLib",
                      "5:AX Library initialized"}));
        EXPECT_TRUE(exists(m_first));
    }
    EXPECT_EQ(log_capture::take(), (std::vector<std::string>{"5:Value of Sem in destructor=3",
                                                             "5:AX Library uninitialzed"}));
    EXPECT_EQ(calls, 1);
    EXPECT_FALSE(exists(m_first));
    EXPECT_FALSE(exists(m_second));
}

TEST_F(Handshake, RefusalThrowsAndALaterTryStartsAfresh) {
    fake.initLib = [] { return AX_STATUS{1}; };
    EXPECT_THROW(VLN_MethodWrapper(), std::exception);
    EXPECT_EQ(log_capture::count(log_capture::take(),
                                 "1:Error : Initialization of AXLib:: AX_InitLib failed with[1]"),
              1);
    EXPECT_FALSE(exists(m_first));
    // Only what is above zero is an error.
    fake.initLib = [] { return static_cast<AX_STATUS>(-5); };
    EXPECT_NO_THROW(VLN_MethodWrapper());
}

// The second thread takes the semaphore's last unit and waits until the library is up.
TEST_F(Handshake, SecondCallerWaitsForTheFirst) {
    std::atomic<bool> libraryUp{false};
    std::atomic<int> calls{0};
    bool upWhenSecondCameThrough = false;
    std::thread second;
    fake.initLib = [&] {
        if (++calls > 1)
            return AX_STATUS{1};
        second = std::thread([&] {
            VLN_MethodWrapper wrapper;
            upWhenSecondCameThrough = libraryUp;
        });
        sem_t* semaphore = sem_open(m_first.c_str(), 0);
        for (int value = 1; value != 0;)
            sem_getvalue(semaphore, &value);
        sem_close(semaphore);
        libraryUp = true;
        return AX_STATUS_OK;
    };
    {
        VLN_MethodWrapper first;
        second.join();
    }
    EXPECT_EQ(calls, 1);
    EXPECT_TRUE(upWhenSecondCameThrough);
    const auto lines = log_capture::take();
    EXPECT_EQ(
        log_capture::count(lines, "5:Recieved signal on Completed Semaphore.. To issue AX Calls"),
        1);
    // Both ended, one closed the semaphore.
    EXPECT_EQ(log_capture::count(lines, "5:AX Library uninitialzed"), 2);
    EXPECT_FALSE(exists(m_first));
}

// An earlier process with this identifier has ended suddenly, or was of the other word size.
TEST_F(Handshake, NamesLeftByAnEarlierProcessAreNotUsed) {
    int calls = 0;
    fake.initLib = [&] {
        ++calls;
        return AX_STATUS_OK;
    };
    sem_close(sem_open(m_first.c_str(), O_CREAT, 0644, 0)); // whoever waits for it waits for ever
    sem_close(sem_open(m_second.c_str(), O_CREAT, 0644, 0));
    { VLN_MethodWrapper wrapper; }
    EXPECT_EQ(calls, 1);
    EXPECT_FALSE(exists(m_first) || exists(m_second));
}

// Without a semaphore nothing is initialised and nobody is told.
TEST_F(Handshake, NoSemaphoreNoInitialisation) {
    fake.initLib = [] {
        ADD_FAILURE() << "initialised";
        return AX_STATUS_OK;
    };
    // A folder of the semaphore's name in the system's shared memory makes the open fail.
    const std::string folder = "/dev/shm/sem." + m_first.substr(1);
    ASSERT_EQ(mkdir(folder.c_str(), 0700), 0);
    { VLN_MethodWrapper wrapper; }
    rmdir(folder.c_str());
    EXPECT_EQ(log_capture::count(log_capture::take(), "5:AX Library initialized"), 1);
}
