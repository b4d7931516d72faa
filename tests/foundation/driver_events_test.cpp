// The drivers' lines of a log of any size and any content.
#include "tests/foundation/foundation_fixture.h"

#include "foundation/driver_events.h"

#include <algorithm>
#include <atomic>
#include <cstdlib>
#include <filesystem>
#include <malloc.h>
#include <new>
#include <sys/stat.h>

namespace {

// What this program has of the heap by way of new, and the most that it had.
std::atomic<std::size_t> taken{0}, most_taken{0};

} // namespace

// Not inlined: a compiler that sees malloc behind new takes free behind delete for a mistake.
[[gnu::noinline]] void* operator new(std::size_t size) {
    void* block = std::malloc(size);
    if (!block)
        throw std::bad_alloc();
    taken += malloc_usable_size(block);
    most_taken = std::max(taken.load(), most_taken.load());
    return block;
}
[[gnu::noinline]] void operator delete(void* block) noexcept {
    taken -= malloc_usable_size(block);
    std::free(block);
}
[[gnu::noinline]] void operator delete(void* block, std::size_t) noexcept {
    operator delete(block);
}

namespace cimple {

class Driver_Events_Test : public Foundation_Test {
protected:
    const std::vector<std::string>& read_lines(const std::string& text) {
        write(Host_File::SYSTEM_LOG, text);
        return read_again();
    }
    const std::vector<std::string>& read_again() {
        fc.clear();
        nic.clear();
        const Driver_Events drivers[] = {{"vfcd", &fc}, {"vnicd", &nic}};
        ReadDriverEvents(drivers);
        return nic.lines();
    }

    DeviceLog fc, nic;
};

using Lines = std::vector<std::string>;

TEST_F(Driver_Events_Test, NewestFirstByKeyWordWhateverTheBytes) {
    const std::string bad = "\xEF\xBF\xBD", longest(MAX_EVENT_LINE - 8, 'x');
    const struct {
        std::string text;
        Lines lines;
    } rows[] = {
        {"", {}},
        {"vnicd", {"vnicd"}}, // the last line may still be written
        {"a vnicd 1\nvfcd\n\nvnicd 2 vfcd\nVNICD\nvnic d\n", {"vnicd 2 vfcd", "a vnicd 1"}},
        {std::string("vnicd\xFF\0\xC3\xA4\xC3\n", 11), {"vnicd" + bad + bad + "\xC3\xA4" + bad}},
        {"vnicd 1 " + longest + "\nvnicd 2\n", {"vnicd 2", "vnicd 1 " + longest}},
        // Of a longer line neither the end nor a word there counts, and no character is cut.
        {"vnicd 1 " + longest.substr(1) + "\xC3\xA4vfcd\nvnicd 2",
         {"vnicd 2", "vnicd 1 " + longest.substr(1)}},
        {std::string(5 * MAX_EVENT_LINE, 'y') + "vnicd\nvnicd 2\n", {"vnicd 2"}},
        {"vnicd" + std::string(5 * MAX_EVENT_LINE, 'y'),
         {"vnicd" + std::string(MAX_EVENT_LINE - 5, 'y')}},
    };
    for (const auto& row : rows)
        EXPECT_EQ(read_lines(row.text), row.lines) << row.text.substr(0, 40);
}

TEST_F(Driver_Events_Test, TheNewestThatFit) {
    std::string many;
    for (int i = 0; i < 3000; ++i)
        many += "vnicd " + std::to_string(i) + "\n";
    EXPECT_EQ(read_lines(many).size(), 1024u);
    EXPECT_EQ(nic.lines().front(), "vnicd 2999");
    EXPECT_EQ(nic.lines().back(), "vnicd 1976");
    std::string large;
    for (int i = 0; i < 100; ++i)
        large += "vnicd " + std::to_string(i) + std::string(20000, '\xFF') + "\n";
    EXPECT_EQ(read_lines(large).size(), MAX_EVENT_TEXT / 60008) << "counted as they are shown";
    EXPECT_TRUE(nic.lines().front().starts_with("vnicd 99"));
}

// 64 MiB of the worst there is: all lines are wanted, short and long, and an endless one.
TEST_F(Driver_Events_Test, MemoryDoesNotGrowWithTheLog) {
    std::string block = "vnicd vfcd " + std::string(MAX_EVENT_LINE, 'z') + "\n";
    while (block.size() < (1u << 20))
        block += "vnicd and vfcd\n";
    block += std::string(1u << 20, 'e');
    std::FILE* file = std::fopen(host_path(Host_File::SYSTEM_LOG).c_str(), "wb");
    ASSERT_TRUE(file);
    for (int i = 0; i < 32; ++i)
        std::fwrite(block.data(), 1, block.size(), file);
    std::fclose(file);
    std::string().swap(block);
    const std::size_t before = taken;
    most_taken = before;
    EXPECT_EQ(read_again().size(), 1024u);
    EXPECT_LT(most_taken - before, std::size_t{4} << 20);
    EXPECT_GT(most_taken - before, 2 * 1024 * sizeof(std::string)) << "counted at all";
}

TEST_F(Driver_Events_Test, WhatIsNoFileOrGoesAwayAddsNothing) {
    namespace fs = std::filesystem;
    const std::string path = host_path(Host_File::SYSTEM_LOG);
    Log_Capture capture;
    EXPECT_TRUE(read_again().empty());
    ASSERT_EQ(mkfifo(path.c_str(), 0600), 0);
    EXPECT_TRUE(read_again().empty()) << "and nobody waits for a writer";
    fs::remove(path);
    fs::create_directory(path);
    EXPECT_TRUE(read_again().empty());
    EXPECT_FALSE(capture.has(VLN_DBG, "Finished reading Events for vfcd"));
    fs::remove(path);
    // Rotated away, and begun anew.
    EXPECT_EQ(read_lines("vnicd old\n").size(), 1u);
    fs::rename(path, path + ".1");
    EXPECT_EQ(read_lines("vnicd new\n"), Lines{"vnicd new"});
    EXPECT_TRUE(capture.has(VLN_DBG, "Reading Events for vnicd"));
    EXPECT_TRUE(capture.has(VLN_DBG, "Finished reading Events for vnicd"));
}

} // namespace cimple
