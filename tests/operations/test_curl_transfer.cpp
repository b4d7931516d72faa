// Fetching and sending: with the machine's libcurl from a server of our own, and over a libcurl
// that the test plays, for what no real one does on demand.
#include "operations/curl_library.h"
#include "operations/method_wrapper.h"
#include "tests/device/log_capture.h"
#include "tests/operations/http_server.h"

#include <algorithm>
#include <cstdarg>
#include <cstdlib>
#include <dlfcn.h>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <set>
#include <sys/resource.h>

using namespace cimple;
namespace fs = std::filesystem;

namespace {

using Lines = std::vector<std::string>;

int opened = 0; // libraries that are open, by way of either loader

// The machine's libcurl, counted.
constexpr Loader_Calls COUNTED = {
    [](const char* file, int mode) {
        void* library = dlopen(file, mode);
        opened += library ? 1 : 0;
        return library;
    },
    dlsym,
    [](void* library) {
        --opened;
        return dlclose(library);
    },
    dlerror,
};

struct Fetched {
    std::string path = "-";
    int code = -1;
    bool by_curl = false;
};

Fetched fetch(const std::string& uri, bool stop = false) {
    Fetched result;
    VLN_MethodWrapper::downloadFileUsingCurl(uri.c_str(), stop, result.path, result.code,
                                             result.by_curl);
    return result;
}

void write_file(const fs::path& path, const std::string& content) {
    std::ofstream(path, std::ios::binary) << content;
}

std::string content_of(const fs::path& path) {
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), {}};
}

bool has_line(const Lines& lines, const std::string& line) {
    return line.empty() || log_capture::count(lines, line) == 1;
}

std::size_t open_files() {
    const fs::directory_iterator files("/proc/self/fd");
    return static_cast<std::size_t>(std::distance(begin(files), end(files)));
}

// A folder for the served files and one to work in.
class Transfer : public testing::Test {
protected:
    Transfer() {
        char name[] = "/tmp/vln-curl-XXXXXX";
        m_folder = mkdtemp(name);
        fs::create_directory(m_folder / "served");
        fs::create_directory(m_folder / "work");
        fs::current_path(m_folder / "work");
        replace_curl_loader(&COUNTED);
        opened = 0;
        log_capture::take();
    }
    ~Transfer() override {
        EXPECT_EQ(opened, 0);
        replace_curl_loader(nullptr);
        fs::current_path("/");
        fs::remove_all(m_folder);
    }

    fs::path served(const char* name) const { return m_folder / "served" / name; }

    fs::path m_folder;
};

class Real_Transfer : public Transfer {
protected:
    void SetUp() override {
        if (!curl_is_present() && sizeof(void*) == 4)
            GTEST_SKIP() << "the machine has no libcurl of 32 bits (Debian: libcurl4:i386)";
    }
};

} // namespace

TEST_F(Real_Transfer, AFetchEndsWhenItIsToldTo) {
    constexpr int STOPPED = 42;
    const Http_Server server(m_folder / "served");
    EXPECT_EQ(fetch(server.plain() + "/slow.vfw", true).code, STOPPED);
    EXPECT_TRUE(has_line(log_capture::take(), "3:download failed 42"));
}

// Nothing is fetched that lies on the disk, in whatever form it is named.
TEST_F(Transfer, AFileOfTheDiskIsTakenAsItIs) {
    const std::string file = m_folder / "served/image.vfw";
    write_file(file, "image");
    write_file("here.vfw", "image");
    const std::pair<std::string, std::string> rows[] = {
        {"file://" + file, file}, {"file://localhost" + file, file}, {file, file},
        {"here.vfw", "here.vfw"}, {"image:file://" + file, file},
    };
    for (const auto& [uri, path] : rows) {
        const Fetched result = fetch(uri);
        EXPECT_EQ(result.path, path);
        EXPECT_EQ(result.code, 0) << uri;
        EXPECT_FALSE(result.by_curl) << uri;
        EXPECT_EQ(log_capture::take(), (Lines{"5:VLN_MethodWrapper::downloadFileUsingCurl",
                                              "5:VLN_MethodWrapper::Firmware file path: " + path,
                                              "5:File found in local file system."}));
    }
}

TEST_F(Real_Transfer, WhatAServerAnswersBecomesAFile) {
    const std::string image(100000, 'i');
    for (const char* name : {"image.vfw", "full.vfw"})
        write_file(served(name), image);
    write_file(served("full-late.vfw"), "fits into the buffer of the file");
    for (const char* name : {"full.vfw", "full-late.vfw"})
        fs::create_symlink("/dev/full", name);
    const Http_Server server(m_folder / "served");
    const std::string &plain = server.plain(), &secure = server.secure();
    const struct {
        std::string uri;
        int code;
        const char* file; // in the folder that we work in, null for none
        std::string content;
        std::string line = {};
    } rows[] = {
        {plain + "/image.vfw", 0, "image.vfw", image},
        {secure + "/image.vfw", 0, "image.vfw", image},
        {plain + "/slow.vfw", 0, "slow.vfw", "slowslowslowslowslow"},
        // The answer is fetched whatever its status: an adapter takes no page for an image.
        {plain + "/none.vfw", 0, "none.vfw", "no such file"},
        {plain + "/moved.vfw", 0, "moved.vfw", "elsewhere"},
        {plain + "/cut.vfw", 18, "cut.vfw", "the first half", "3:download failed 18"},
        {plain + "/full.vfw", 23, "full.vfw", "", "3:download failed 23"},
        {plain + "/full-late.vfw", 23, "full-late.vfw", "", "3:download failed 23"},
        {plain + "/", 23, nullptr, "", "3:ERROR: Could not open the file for writing"},
        {"http://127.0.0.1:1/refused.vfw", 7, "refused.vfw", "", "3:download failed 7"},
        {"http://[/bad.vfw", 3, nullptr, "", "3:download failed 3"},
        {"carrier-pigeon://coop/bird.vfw", 1, "bird.vfw", "", "3:download failed 1"},
        {"bird.vfw.not-there", 0, nullptr, "",
         "3:ERROR: Could not parse the URI to get the firmware file name"},
    };
    fetch(plain + "/image.vfw"); // what libraries keep open for good is open now
    log_capture::take();
    const std::size_t files = open_files();
    for (const auto& row : rows) {
        const Fetched result = fetch(row.uri);
        const Lines lines = log_capture::take();
        EXPECT_EQ(result.path, row.file ? row.file : row.uri);
        EXPECT_EQ(result.code, row.code) << row.uri;
        EXPECT_EQ(open_files(), files) << row.uri;
        EXPECT_TRUE(has_line(lines, row.line)) << row.uri << testing::PrintToString(lines);
        EXPECT_TRUE(has_line(lines, "4:File not found on local file system. Trying libcURL..."));
        EXPECT_TRUE(has_line(lines, "5:Successfully closed curl so"));
        if (row.file && !fs::is_symlink(row.file)) {
            EXPECT_TRUE(result.by_curl);
            EXPECT_EQ(content_of(row.file), row.content) << row.uri;
        }
    }
}

TEST_F(Real_Transfer, ALargeFileTakesNoMemory) {
    constexpr std::size_t SIZE = 64U << 20;
    constexpr long MOST_KIB = 16 << 10;
    std::ofstream(served("large.vfw"), std::ios::binary) << "first";
    fs::resize_file(served("large.vfw"), SIZE);
    const Http_Server server(m_folder / "served");
    rusage before{};
    rusage after{};
    getrusage(RUSAGE_SELF, &before);
    EXPECT_EQ(fetch(server.plain() + "/large.vfw").code, 0);
    getrusage(RUSAGE_SELF, &after);
    EXPECT_EQ(fs::file_size("large.vfw"), SIZE);
    EXPECT_LT(after.ru_maxrss - before.ru_maxrss, MOST_KIB);
}

TEST_F(Real_Transfer, AFileIsSentWithTheLoginOfItsAddress) {
    const Http_Server server(m_folder / "served");
    const std::string& plain = server.plain();
    const std::string there = plain.substr(std::string("http://").size());
    write_file("log.txt", "what happened");
    const struct {
        std::string uri;
        const char* file;
        int result;
        std::string received;
        std::string line = {};
    } rows[] = {
        {plain + "/up/a", "log.txt", 0, "|what happened"},
        {"http://eve:a%3Ab%4@" + there + "/up/b", "log.txt", 0,
         "Basic ZXZlOmE6YiU0|what happened"}, // eve:a:b%4
        {"http://eve@" + there + "/up/c", "log.txt", 0, "Basic ZXZlOg==|what happened"},
        {server.secure() + "/up/d", "log.txt", 0, "|what happened"},
        {plain + "/up/e", "none.txt", -1, "|what happened",
         "3:couldnot locate the file none.txt, to be uploaded"},
        {"http://127.0.0.1:1/up/f", "log.txt", -1, "|what happened",
         "3:curl upload file failed, errorcode 7"},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(VLN_MethodWrapper::uploadFileUsingCurl(row.uri.c_str(), row.file), row.result);
        const Lines lines = log_capture::take();
        EXPECT_TRUE(has_line(lines, row.line)) << row.uri << testing::PrintToString(lines);
        EXPECT_EQ(fetch(plain + "/received").code, 0);
        EXPECT_EQ(content_of("received"), row.received) << row.uri;
        log_capture::take();
    }
}

// ---- A libcurl of the test's own ----

namespace {

struct Played {
    std::string name;    // the one name under which it is found
    std::string missing; // a function that it does not have
    int init = 0;
    bool handle = true;
    int bad_option = 0; // fails with 48
    int perform = 0;
    bool throws = false;
    int close = 0;

    std::vector<std::string> tried; // names, each with its mode
    std::vector<std::string> options;
    std::multiset<std::string> calls;
};
Played played;

std::string option_text(int option, va_list values) {
    const std::string number = std::to_string(option);
    if (option >= 30000)
        return number + "=" + std::to_string(va_arg(values, std::int64_t));
    if (option < 10000)
        return number + "=" + std::to_string(va_arg(values, long));
    const void* value = va_arg(values, const void*);
    if (option == 10002 || option == 10005)
        return number + "=" + static_cast<const char*>(value);
    return number + (value ? "=*" : "=null");
}

int play_setopt(void*, int option, ...) {
    va_list values;
    va_start(values, option);
    played.options.push_back(option_text(option, values));
    va_end(values);
    return option == played.bad_option ? 48 : 0;
}

int play_perform(void*) {
    played.calls.insert("perform");
    if (played.throws)
        throw std::bad_alloc();
    return played.perform;
}

const std::pair<const char*, void (*)()> FUNCTIONS[] = {
    {"curl_global_init",
     reinterpret_cast<void (*)()>(+[](long flags) { return flags == 3 ? played.init : 99; })},
    {"curl_global_cleanup", +[] { played.calls.insert("global_cleanup"); }},
    {"curl_easy_init",
     reinterpret_cast<void (*)()>(+[]() -> void* { return played.handle ? &played : nullptr; })},
    {"curl_easy_setopt", reinterpret_cast<void (*)()>(&play_setopt)},
    {"curl_easy_perform", reinterpret_cast<void (*)()>(&play_perform)},
    {"curl_easy_cleanup",
     reinterpret_cast<void (*)()>(+[](void*) { played.calls.insert("cleanup"); })},
};

constexpr Loader_Calls PLAYED = {
    [](const char* file, int mode) -> void* {
        played.tried.push_back(file + std::string(mode & RTLD_NOW ? " now" : " lazy") +
                               (mode & RTLD_GLOBAL ? "" : " local"));
        opened += played.name == file ? 1 : 0;
        return played.name == file ? &played : nullptr;
    },
    [](void*, const char* name) -> void* {
        for (const auto& [known, function] : FUNCTIONS)
            if (known == std::string(name) && played.missing != name)
                return reinterpret_cast<void*>(function);
        return nullptr;
    },
    [](void*) {
        --opened;
        return played.close;
    },
    []() -> char* { return nullptr; },
};

class Played_Transfer : public Transfer {
protected:
    Played_Transfer() {
        played = {};
        played.name = "libcurl.so.4";
        replace_curl_loader(&PLAYED);
    }
};

constexpr char URI[] = "https://host/image.vfw";

} // namespace

TEST_F(Played_Transfer, EachUseHasItsNamesModeAndOptions) {
    const Lines others = {"/lib/libcurl.so.4 now", "/usr/lib/libcurl.so.4 now", "libcurl.so now",
                          "curl.dll now", "libcurl.so.4 now"};
    EXPECT_TRUE(curl_is_present());
    EXPECT_EQ(std::exchange(played.tried, {}), others);

    EXPECT_EQ(fetch(URI).code, 0);
    EXPECT_EQ(std::exchange(played.tried, {}),
              (Lines{"/lib/libcurl.so.4 lazy", "/usr/lib/libcurl.so.4 lazy",
                     "/usr/lib64/libcurl.so.4 lazy", "libcurl.so lazy", "libcurl.so.4 lazy"}));
    EXPECT_EQ(std::exchange(played.options, {}),
              (Lines{"10002=https://host/image.vfw", "20011=*", "10001=*", "10010=*", "64=0",
                     "81=0", "19=1", "20=120", "20219=*", "10057=*", "43=0"}));

    write_file("log.txt", "12345");
    EXPECT_EQ(VLN_MethodWrapper::uploadFileUsingCurl("ftp://me:it@host/", "log.txt"), 0);
    EXPECT_EQ(played.tried, others);
    EXPECT_EQ(played.options,
              (Lines{"46=1", "54=1", "10002=ftp://me:it@host/", "10009=*", "10009=*", "13=100",
                     "14=5", "30115=5", "64=0", "81=0", "107=1", "10005=me:it"}));
}

TEST_F(Played_Transfer, NoLibraryLeavesThePathAsItIs) {
    played.name = "none";
    const Fetched result = fetch(URI);
    EXPECT_EQ(result.path, URI);
    EXPECT_EQ(result.code, 0);
    EXPECT_FALSE(result.by_curl || fs::exists("image.vfw"));
    write_file("log.txt", "12345");
    EXPECT_EQ(VLN_MethodWrapper::uploadFileUsingCurl(URI, "log.txt"), -1);
    const Lines lines = log_capture::take();
    EXPECT_TRUE(
        has_line(lines, "3:ERROR: Could not load the curl library to download from internet"));
    EXPECT_TRUE(has_line(lines, "3:couldnot initialize curl library"));
}

// Whatever fails, the code tells, since a file is there that nobody has filled.
TEST_F(Played_Transfer, AFailureOfTheLibraryIsToldAndLeavesNothingOpen) {
    write_file("log.txt", "12345");
    const struct {
        const char* what;
        void (*arrange)();
        int code;
        const char* line;
        Lines calls;
    } rows[] = {
        {"no init",
         [] { played.missing = "curl_global_init"; },
         4,
         "3:unable to locate function curl_global_init in curl so",
         {}},
        {"no easy init",
         [] { played.missing = "curl_easy_init"; },
         4,
         "3:unable to locate function curl_easy_init in curl so",
         {}},
        {"init fails",
         [] { played.init = 2; },
         2,
         "3:unable to initalize curl",
         {"cleanup", "global_cleanup", "perform"}},
        {"no handle",
         [] { played.handle = false; },
         2,
         "3:ERROR: Could not initialise the curl",
         {"global_cleanup"}},
        {"an option",
         [] { played.bad_option = 10002; },
         48,
         "3:Error Setting CURLOPT_URL, errorcode = 48",
         {"cleanup", "global_cleanup"}},
        {"the transfer",
         [] { played.perform = 6; },
         6,
         "3:download failed 6",
         {"cleanup", "global_cleanup", "perform"}},
        {"an exception",
         [] { played.throws = true; },
         27,
         "3:ERROR: error caught in accessing Curl Library",
         {"cleanup", "global_cleanup", "perform"}},
        {"close",
         [] { played.close = -1; },
         0,
         "3:UNABLE TO CLOSE DYNAMIC LIB",
         {"cleanup", "global_cleanup", "perform"}},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.what);
        for (const bool up : {false, true}) {
            played = {};
            played.name = "libcurl.so";
            row.arrange();
            if (up) {
                EXPECT_EQ(VLN_MethodWrapper::uploadFileUsingCurl(URI, "log.txt"),
                          row.code == 0 ? 0 : -1);
                // Sending does not go on without an initialised library.
                played.calls.erase(played.init ? "perform" : "");
            } else {
                EXPECT_EQ(fetch(URI).code, row.code);
                EXPECT_TRUE(has_line(log_capture::take(), row.line));
                EXPECT_EQ(Lines(played.calls.begin(), played.calls.end()), row.calls);
            }
            EXPECT_EQ(opened, 0);
        }
    }
}
