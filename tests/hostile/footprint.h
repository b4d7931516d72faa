// What a process holds of its system, to be compared when the same work has been done again.
#ifndef TESTS_HOSTILE_FOOTPRINT_H
#define TESTS_HOSTILE_FOOTPRINT_H

#include <gtest/gtest.h>

#include <cstddef>
#include <filesystem>
#include <fstream>
#include <string>

#include <malloc.h>
#include <unistd.h>

namespace hostile {

struct Footprint {
    std::ptrdiff_t threads = 0, descriptors = 0, shared = 0; // names of this process in /dev/shm
    long resident = 0;                                       // KiB
    std::size_t heap = 0;                                    // bytes in use

    static Footprint now() {
        namespace fs = std::filesystem;
        const auto entries = [](const char* folder, const std::string& with = "") {
            std::ptrdiff_t count = 0;
            for (const auto& entry : fs::directory_iterator(folder))
                count += entry.path().filename().string().find(with) != std::string::npos;
            return count;
        };
        Footprint found;
        found.threads = entries("/proc/self/task");
        found.descriptors = entries("/proc/self/fd");
        found.shared = entries("/dev/shm", std::to_string(getpid()));
        malloc_trim(0); // what is free already is nobody's
        long size = 0;
        std::ifstream("/proc/self/statm") >> size >> found.resident;
        found.resident *= sysconf(_SC_PAGESIZE) / 1024;
        found.heap = mallinfo2().uordblks;
        return found;
    }
};

// The sanitizers keep freed memory, and find leaks on their own.
#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__)
inline constexpr bool MEMORY_TELLS = false;
#else
inline constexpr bool MEMORY_TELLS = true;
#endif

// Memory may grow a little: what is free between blocks in use stays with the C library.
inline void expect_no_growth(const Footprint& start, const Footprint& end) {
    constexpr std::size_t HEAP = 1 << 20;
    constexpr long RESIDENT = 4096; // KiB
    EXPECT_EQ(end.threads, start.threads);
    EXPECT_EQ(end.descriptors, start.descriptors);
    EXPECT_EQ(end.shared, start.shared);
    if (!MEMORY_TELLS)
        return;
    EXPECT_LE(end.heap, start.heap + HEAP);
    EXPECT_LT(end.resident, start.resident + RESIDENT);
}

} // namespace hostile

#endif // TESTS_HOSTILE_FOOTPRINT_H
