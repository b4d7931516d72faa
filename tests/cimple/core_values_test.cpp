// Strings, arrays, datetimes and buffers: the values that members hold.
#include "cimple/array.h"
#include "cimple/buffer.h"
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

TEST(String, EmptyTextsAreEqualHoweverTheyCameAbout) {
    String erased("x");
    erased.erase(0);
    const String forms[] = {String(), String(""), String(static_cast<const char*>(nullptr)), erased,
                            String("abc").substr(3)};
    for (const String& empty : forms) {
        EXPECT_TRUE(empty == String());
        EXPECT_EQ(empty.size(), 0u);
        EXPECT_STREQ(empty.c_str(), "");
    }
}

TEST(String, CapacityIsThirtyTwoThenPowersOfTwo) {
    const struct {
        std::size_t size;
        uint32 capacity;
    } cases[] = {{1, 32}, {31, 32}, {32, 32}, {33, 64}, {64, 64}, {65, 128}, {1000, 1024}};
    for (const auto& c : cases) {
        const String text(std::string(c.size, 'x').c_str());
        EXPECT_EQ(text.capacity(), c.capacity) << c.size;
        EXPECT_EQ(text.c_str()[c.size], '\0');
    }
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

TEST(String, ComparesWithAndWithoutCase) {
    EXPECT_FALSE(String("Card") == String("card"));
    EXPECT_TRUE(equali(String("Card"), String("cARD")));
    EXPECT_TRUE(equali(String("Card"), "CARD"));
    EXPECT_FALSE(equali(String("Card"), "CARDS"));
    EXPECT_FALSE(equali(String("Card"), static_cast<const char*>(nullptr)));
    EXPECT_FALSE(String("a", 1) == String("a\0b", 3));
    EXPECT_TRUE(String("a") < String("ab"));
    EXPECT_FALSE(String("b") < String("ab"));
}

TEST(String, FindsAndCutsWithinBounds) {
    const String text("port=1,port=2");
    EXPECT_EQ(text.find('='), 4);
    EXPECT_EQ(text.find("port=2"), 7);
    EXPECT_EQ(text.find('#'), -1);
    EXPECT_EQ(text.find("none"), -1);
    EXPECT_EQ(text.substr(7, 4), String("port"));
    EXPECT_EQ(text.substr(100, 4), String());
    EXPECT_EQ(text.substr(7, 0xFFFFFFF0), String("port=2"));
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

TEST(Array, EmptyOwnsNothingAndReportsEight) {
    Array<String> a;
    EXPECT_EQ(a.size(), 0u);
    EXPECT_EQ(a.capacity(), 8u);
    EXPECT_EQ(a.data(), Array<String>().data());
    a.append("x");
    EXPECT_EQ(a.capacity(), 8u);
    EXPECT_TRUE(Array<String>().empty());
    a.reserve(11);
    EXPECT_EQ(a.capacity(), 11u);
    a.reserve(3);
    EXPECT_EQ(a.capacity(), 11u);
    a.clear();
    EXPECT_TRUE(a == Array<String>());
}

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

TEST(Datetime, WritingOneCopyLeavesTheOther) {
    Datetime zero;
    Datetime a;
    a.usec(5);
    Datetime b(a);
    b.utc(60);
    b.set_timestamp(true);
    EXPECT_TRUE(a == Datetime(5, 0, false));
    EXPECT_TRUE(b == Datetime(5, 60, true));
    EXPECT_TRUE(zero == Datetime());
    EXPECT_FALSE(a == b);
    b.clear();
    EXPECT_TRUE(b == zero);
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

TEST(Buffer, GrowsAndStaysTerminated) {
    Buffer buffer;
    EXPECT_STREQ(buffer.data(), "");
    buffer.append("world");
    buffer.insert(0, "hello ", 6);
    EXPECT_EQ(buffer.capacity(), 4096u);
    buffer.append(5000, '.');
    EXPECT_EQ(buffer.capacity(), 8192u);
    EXPECT_EQ(std::string(buffer.data()).size(), 5011u);
    buffer.remove(5, 100000);
    EXPECT_STREQ(buffer.data(), "hello");
    buffer.remove(9, 1);
    buffer.clear();
    EXPECT_STREQ(buffer.data(), "");
}

TEST(Buffer, FormatsTextsLongerThanItsRoom) {
    Buffer buffer;
    const std::string text(10000, 'y');
    buffer.append(std::string(4000, 'x').c_str());
    EXPECT_EQ(buffer.format("<%s|%d>", text.c_str(), 7), 10004);
    EXPECT_EQ(buffer.size(), 14004u);
    EXPECT_EQ(std::string(buffer.data()).substr(13998), "yyy|7>");
    EXPECT_EQ(buffer.format("%s", ""), 0);
}

} // namespace
} // namespace cimple
