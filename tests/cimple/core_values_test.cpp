// Strings, arrays, datetimes and buffers: the values that members hold.
#include "cimple/array.h"
#include "cimple/assert.h"
#include "cimple/buffer.h"
#include "cimple/cimom.h"
#include "cimple/datetime.h"
#include "cimple/string.h"
#include "cimple/thread.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <ctime>
#include <string>
#include <thread>
#include <vector>

namespace cimple {
namespace {

// ---- String ----

TEST(String, CopiesShareUntilOneIsWritten) {
    String a("alpha");
    String b(a);
    EXPECT_EQ(a.c_str(), b.c_str());
    b.append('!');
    EXPECT_STREQ(a.c_str(), "alpha");
    EXPECT_STREQ(b.c_str(), "alpha!");
    a = b;
    a.erase(0, 2);
    EXPECT_STREQ(a.c_str(), "pha!");
    EXPECT_STREQ(b.c_str(), "alpha!");
}

TEST(String, MayBeAppendedToItself) {
    String text("0123456789abcdef");
    for (int i = 0; i < 4; ++i)
        text.append(text);
    EXPECT_EQ(text.size(), 256u);
    EXPECT_EQ(text.substr(240), String("0123456789abcdef"));
    text.assign(text.c_str() + 255, 1);
    EXPECT_STREQ(text.c_str(), "f");
    text.append(text.c_str(), 1);
    EXPECT_STREQ(text.c_str(), "ff");
    text.prepend(text);
    EXPECT_STREQ(text.c_str(), "ffff");
}

TEST(String, ComparesByLengthAndThenInAnyCaseIfTold) {
    EXPECT_FALSE(String("abc") == String("abd") || String("abc") == String("abcd"));
    EXPECT_TRUE(equali(String("aBc"), String("AbC")) && equali(String("aBc"), "AbC"));
    EXPECT_FALSE(equali(String("abc"), String("abcd")) || equali(String("abc"), String("abd")));
    EXPECT_FALSE(equali(String("abc"), "abd") || equali(String("abc"), nullptr));
    String text("ab");
    text.append("cd");
    text.append(static_cast<const char*>(nullptr));
    EXPECT_EQ(text, String("abcd"));
    text.erase(4);
    text.erase(1, 0);
    EXPECT_EQ(text, String("abcd"));
}

TEST(String, CountsAreKeptAcrossThreads) {
    const String shared("shared by several threads");
    std::vector<std::thread> threads;
    for (int t = 0; t < 4; ++t) {
        threads.emplace_back([&shared] {
            for (int i = 0; i < 2000; ++i) {
                String mine(shared);
                mine.append('x');
                String empty;
                String other(empty);
                Datetime zero;
                zero.utc(i);
            }
        });
    }
    for (std::thread& thread : threads)
        thread.join();
    EXPECT_STREQ(shared.c_str(), "shared by several threads");
}

// ---- Array ----

TEST(Array, EditsKeepOrderAndOwnElements) {
    Array<String> a{"b", "d"};
    a.insert(1, "c");
    a.prepend("a");
    a.insert(100, "e");
    EXPECT_TRUE(a == (Array<String>{"a", "b", "c", "d", "e"}));
    Array<String> copy(a);
    copy[0] = "changed";
    EXPECT_EQ(a[0], String("a"));
    a.remove(1, 2);
    a.remove(2, 100);
    a.remove(7);
    EXPECT_TRUE(a == (Array<String>{"a", "d"}));
    a.resize(4, String("z"));
    EXPECT_TRUE(a == (Array<String>{"a", "d", "z", "z"}));
    a.resize(1, String());
    EXPECT_EQ(a.find("a"), 0);
    EXPECT_EQ(a.find("d"), -1);
}

TEST(Array, ElementsOfItselfMayBeInserted) {
    Array<String> a{"first", "second"};
    for (uint32 i = 0; i < 40; ++i)
        a.append(a[i]);
    EXPECT_EQ(a[41], String("second"));
    a.insert(1, a[1]);
    EXPECT_EQ(a[1], String("second"));
    EXPECT_EQ(a[2], String("second"));
    a.assign(a.begin() + 1, 2);
    EXPECT_TRUE(a == (Array<String>{"second", "second"}));
    const Array<uint64>& wide = Array<uint64>{1, 2};
    EXPECT_TRUE(wide == (Array<uint64>{1, 2}));
    EXPECT_FALSE(wide == (Array<uint64>{1, 3}));
}

TEST(Array, ReservesExactlyWhatIsAskedFor) {
    Array<uint16> a{1};
    EXPECT_EQ(a.capacity(), 8u);
    a.reserve(4);
    EXPECT_EQ(a.capacity(), 8u);
    a.reserve(19);
    EXPECT_EQ(a.capacity(), 19u);
    EXPECT_THROW(a.reserve(UINT32_MAX), std::bad_alloc);
    EXPECT_THROW(a.resize(UINT32_MAX, 0), std::bad_alloc);
    EXPECT_TRUE(a == (Array<uint16>{1}));
}

// ---- Datetime ----

// The host's zone for a test, put back afterwards.
class Zone {
public:
    explicit Zone(const char* zone) {
        const char* old = std::getenv("TZ");
        _had = old != nullptr;
        if (old)
            _old = old;
        set(zone);
    }
    ~Zone() { set(_had ? _old.c_str() : nullptr); }

private:
    static void set(const char* zone) {
        if (zone)
            setenv("TZ", zone, 1);
        else
            unsetenv("TZ");
        tzset();
    }
    std::string _old;
    bool _had;
};

TEST(Datetime, ReadsAndWritesBothForms) {
    Zone zone("UTC0");
    const struct {
        const char* text;
        uint64 usec;
        sint32 utc;
        const char* readable;
    } cases[] = {
        {"20240229123456.000007+060", 1709210096000007, 60, "2024/02/29 12:34:56.000007+060"},
        {"19700101000000.000000+000", 0, 0, "1970/01/01 00:00:00.000000+000"},
        {"19700101000001.500000-300", 1500000, -300, "1970/01/01 00:00:01.500000-300"},
        {"19691231235959.250000+000", static_cast<uint64>(-750000), 0,
         "1969/12/31 23:59:59.250000+000"},
        {"00000001020304.000005:000", 93784000005, 0, "00000001 02 03 04.000005:000"},
        {"99999999235959.999999:000", 8639999999999999999u, 0, "99999999 23 59 59.999999:000"},
    };
    for (const auto& c : cases) {
        Datetime value;
        ASSERT_TRUE(value.set(c.text)) << c.text;
        EXPECT_EQ(value.usec(), c.usec) << c.text;
        EXPECT_EQ(value.utc(), c.utc) << c.text;
        EXPECT_EQ(value.is_timestamp(), c.text[21] != ':');
        EXPECT_STREQ(value.ascii().c_str(), c.text);
        EXPECT_STREQ(value.readable().c_str(), c.readable);
    }
    Datetime moved(1500000, -300, true);
    moved.usec(2000000);
    EXPECT_STREQ(moved.ascii().c_str(), "19700101000002.000000-300");
    Datetime carried;
    EXPECT_TRUE(carried.set("20239931000000.000000+000"));
    EXPECT_STREQ(carried.ascii().c_str(), "20310331000000.000000+000");
}

TEST(Datetime, RefusesEverythingElseAndKeepsItsValue) {
    const char* const refused[] = {
        "",
        "0000000102030.000005:0000", // point moved
        "00000001020304.000005:00",
        "00000001020304.000005:0000",
        "00000001020304.000005:001",
        "0000000102030x.000005:000",
        "00000001020304.00000-:000",
        "20240229123456.000007*060",
        "20240229123456.000007+06x",
        "2024-02-29123456.00007+060",
        "20240229123456,000007+060",
        "20240029123456.000007+060", // fields beyond their ends
        "20240200123456.000007+060",
        "20240229243456.000007+060",
        "20240229126056.000007+060",
        "20240229123460.000007+060",
        "99999931235959.000000+000",
        "00000001240304.000005:000",
        "00000001026004.000005:000",
        "00000001020360.000005:000",
        "             .      +   ",
        "\xff\xff\xff\xff\xff\xff\xff\xff\xff\xff\xff\xff\xff\xff.000000+\xff\xff\xff",
    };
    const Datetime before(42, 7, true);
    Datetime value(before);
    for (const char* text : refused) {
        EXPECT_FALSE(value.set(text)) << text;
        EXPECT_TRUE(value == before) << text;
    }
    EXPECT_FALSE(value.set(nullptr));
}

TEST(Datetime, PrintsAnyValueWithoutHarm) {
    const uint64 values[] = {0, 1, UINT64_MAX, uint64{1} << 63, 253402300800000000u};
    for (const uint64 usec : values) {
        for (const sint32 utc : {INT32_MIN, -1, 0, INT32_MAX}) {
            EXPECT_GE(Datetime(usec, utc, true).ascii().size(), 24u);
            EXPECT_GE(Datetime(usec, utc, false).readable().size(), 24u);
        }
    }
}

TEST(Datetime, NowTellsTheClockAndTheOffsetOfTheHost) {
    static uint64 present;
    present = 1709210096000007;
    const Time::Clock clock{[] { return present; }, [](uint64) {}};
    Zone zone("XYZ-02:30"); // POSIX signs zones west: this one is 150 minutes east
    Time::replace_clock(&clock);
    EXPECT_STREQ(Datetime::now().ascii().c_str(), "20240229150456.000007+150");
    present = 0;
    EXPECT_TRUE(Datetime::now() == Datetime());
    Time::replace_clock(nullptr);
}

// ---- Buffer ----

TEST(Buffer, FormatsTextsLongerThanItsRoom) {
    Buffer buffer;
    const std::string text(10000, 'y');
    buffer.append(std::string(4000, 'x').c_str());
    EXPECT_EQ(buffer.format("<%s|%d>", text.c_str(), 7), 10004);
    EXPECT_EQ(buffer.size(), 14004u);
    EXPECT_EQ(std::string(buffer.data()).substr(13998), "yyy|7>");
    EXPECT_EQ(buffer.format("%s", ""), 0);
    buffer.insert(1, "abc", 3);
    buffer.insert(SIZE_MAX, "end", 3);
    buffer.insert(0, "", 0);
    EXPECT_EQ(std::string(buffer.data()).substr(0, 5), "xabcx");
    EXPECT_EQ(std::string(buffer.data()).substr(14003), "y|7>end");
    EXPECT_THROW(buffer.reserve(SIZE_MAX), std::bad_alloc);
    EXPECT_THROW(buffer.insert(0, "x", SIZE_MAX / 4), std::bad_alloc);
    EXPECT_EQ(buffer.size(), 14010u);
}

// ---- What a developer is told ----

TEST(Diagnostics, GoToStandardError) {
    testing::internal::CaptureStderr();
    __cimple_trace("here.cpp", 7, "text");
    EXPECT_EQ(testing::internal::GetCapturedStderr(), "TRACE: here.cpp(7): text\n");
    EXPECT_DEATH(__cimple_assert("here.cpp", 7, "f", "a == b"),
                 "^here.cpp\\(7\\): f\\(\\): assert: a == b\n");
    Array<Instance*> instances;
    EXPECT_DEATH(cimom::enum_instances("root/test", nullptr, instances),
                 "^NOT IMPLEMENTED.\n.*: assert: false\n");
}

// ---- Thread ----

TEST(Thread, ADetachedOneRunsAndTellsItsMaker) {
    struct Meeting {
        Mutex mutex;
        Cond cond;
        bool done = false;
    } static meeting;
    Thread thread;
    ASSERT_EQ(Thread::create_detached(
                  thread,
                  [](void* argument) -> void* {
                      auto& there = *static_cast<Meeting*>(argument);
                      Auto_Mutex lock(there.mutex);
                      there.done = true;
                      there.cond.signal();
                      return nullptr;
                  },
                  &meeting),
              0);
    Auto_Mutex lock(meeting.mutex);
    while (!meeting.done)
        meeting.cond.wait(meeting.mutex);
}

} // namespace
} // namespace cimple
