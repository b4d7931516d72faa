// The children that operations run in, and who watches them.
#include "tests/hostile/sweep.h"

#include <algorithm>
#include <chrono>
#include <cinttypes>
#include <csignal>
#include <cstring>
#include <fstream>
#include <thread>
#include <utility>

#include <execinfo.h>
#include <fcntl.h>
#include <sys/mman.h>
#include <sys/syscall.h>
#include <sys/wait.h>

namespace sweep {

namespace {

namespace fs = std::filesystem;

#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__)
constexpr bool IS_SANITIZED = true;
#else
constexpr bool IS_SANITIZED = false;
#endif

constexpr std::uint64_t TOO_LONG = 60000;           // milliseconds for one point
constexpr unsigned MOST_FINDINGS = 5;               // of one operation; those after them are alike
constexpr std::size_t MOST_OPERATIONS = 24;         // of one child
constexpr std::size_t FEW_POINTS = 100, EIGHTH = 8; // see Stage::run
constexpr std::size_t PREPARING = ~std::size_t(0);
constexpr const char* STACKS = "stacks.txt";

std::uint64_t now() {
    return static_cast<std::uint64_t>(std::chrono::duration_cast<std::chrono::milliseconds>(
                                          std::chrono::steady_clock::now().time_since_epoch())
                                          .count());
}

// Where a child is.
struct Slot {
    std::atomic<std::size_t> operation;
    std::atomic<std::size_t> point;
    std::atomic<std::uint64_t> since;
    std::atomic<bool> is_done;
    char text[256];

    void begin(std::size_t which, std::size_t number, const std::string& what) {
        std::snprintf(text, sizeof text, "%s", what.c_str());
        operation = which;
        point = number;
        since = now();
    }
};

struct Tally {
    std::atomic<unsigned long> found[KINDS];
    std::atomic<unsigned long> tried[KINDS];
};

// Shared by the processes of a sweep.
struct Ledger {
    std::atomic<std::size_t> next_group;
    std::atomic<unsigned long> findings;
    Slot slots[64];
    Tally tallies[1]; // one for each operation
};

struct Group {
    std::size_t begin, end; // operations of one scenario
};

std::vector<Group> groups_of(const std::vector<Operation>& operations) {
    std::vector<Group> groups;
    for (std::size_t i = 0; i < operations.size(); ++i) {
        const bool fits = !groups.empty() &&
                          groups.back().end - groups.back().begin < MOST_OPERATIONS &&
                          operations[i].scenario == operations[i - 1].scenario &&
                          operations[i].log == operations[i - 1].log;
        if (!fits)
            groups.push_back({i, i});
        groups.back().end = i + 1;
    }
    return groups;
}

// ---- In the child ----

int stacks = -1; // the file

Events* events = nullptr; // of the module, once it is loaded

void write_frames(const char* head, void* const* frames, int count) {
    if (write(stacks, head, std::strlen(head)) > 0)
        backtrace_symbols_fd(frames, count, stacks);
}

// Where the event failed, unless it was told before.
void write_event() {
    if (events && events->depth > 0)
        write_frames("the event\n", events->stack, std::exchange(events->depth, 0));
}

// backtrace needs nothing that a signal handler lacks once it was called.
void write_stack(int signal) {
    void* frames[64];
    const int count = backtrace(frames, 64);
    char head[64];
    std::snprintf(head, sizeof head, "thread %ld, signal %d\n",
                  static_cast<long>(syscall(SYS_gettid)), signal);
    write_event();
    write_frames(head, frames, count);
}

void end_by(int signal) {
    write_stack(signal);
    std::signal(signal, SIG_DFL);
    raise(signal);
}

void prepare_for_the_worst() {
    stacks = open(STACKS, O_CREAT | O_TRUNC | O_WRONLY | O_APPEND | O_CLOEXEC, 0600);
    void* frames[4];
    backtrace(frames, 4);
    std::signal(SIGUSR2, write_stack);
    if (!IS_SANITIZED) // which print more themselves
        for (const int signal : {SIGSEGV, SIGBUS, SIGFPE, SIGILL, SIGABRT})
            std::signal(signal, end_by);
}

class Child {
public:
    Child(const std::vector<Operation>& operations, const Choice& choice, Ledger& ledger,
          Slot& slot)
        : _operations(operations), _choice(choice), _ledger(ledger), _slot(slot) {}

    // The operations from that one on, and of the first of them the points from that one on.
    [[noreturn]] void run(std::size_t operation, std::size_t point, std::size_t end) {
        prepare_for_the_worst();
        _slot.begin(operation, PREPARING, "the start");
        try {
            const Operation& first = _operations[operation];
            Stage stage(first.scenario, first.log);
            events = &events_of_module();
            check();
            for (; operation < end; ++operation, point = 0)
                run_one(stage, operation, point);
            _slot.begin(end - 1, PREPARING, "the end");
            stage.close();
        } catch (const std::exception& error) {
            ADD_FAILURE() << error.what();
        }
        check();
        _slot.is_done = true;
        std::exit(0);
    }

private:
    void run_one(Stage& stage, std::size_t number, std::size_t from) {
        const Operation& operation = _operations[number];
        Tally& tally = _ledger.tallies[number];
        _slot.begin(number, PREPARING, "a healthy run");
        Counts found{};
        const std::vector<Point> points = stage.prepare(operation, _choice, found);
        check();
        std::copy(found.begin(), found.end(), tally.found);
        for (std::size_t i = from; i < points.size(); ++i) {
            _slot.begin(number, i, points[i].text());
            ++tally.tried[points[i].kind];
            events->depth = 0;
            stage.run(operation, points[i],
                      points.size() <= FEW_POINTS || i % EIGHTH == 0 || i + 1 == points.size());
            check();
        }
    }
    void check() {
        if (!testing::Test::HasFailure())
            return;
        write_event();
        std::fflush(nullptr);
        std::_Exit(1);
    }

    const std::vector<Operation>& _operations;
    const Choice& _choice;
    Ledger& _ledger;
    Slot& _slot;
};

// ---- The watch ----

std::string output_of(const std::string& command) {
    std::string text;
    std::FILE* pipe = popen(command.c_str(), "r");
    char line[512];
    while (pipe && std::fgets(line, sizeof line, pipe))
        text += line;
    if (pipe)
        pclose(pipe);
    return text;
}

std::string before(const std::string& offset) {
    char text[32];
    std::snprintf(text, sizeof text, "0x%lx", std::stoul(offset, nullptr, 16) - 1);
    return text;
}

// "module(+0x12) [0x34]", with the place in the source where addr2line knows it: that of the byte
// before, which belongs to the call.
std::string explained(const std::string& line) {
    const std::size_t open = line.find('('), close = line.find(')');
    if (open == std::string::npos || close == std::string::npos || line[open + 1] != '+')
        return line;
    const std::string place =
        output_of("addr2line -Cfpse " + line.substr(0, open) + " " +
                  before(line.substr(open + 1, close - open - 1)) + " 2>/dev/null");
    return place.empty() || place[0] == '?' ? line : place.substr(0, place.find('\n'));
}

void print_stacks() {
    std::ifstream file(STACKS);
    for (std::string line; std::getline(file, line);)
        std::printf("    %s\n", explained(line).c_str());
}

void ask_for_stacks(pid_t child) {
    for (const auto& task : fs::directory_iterator("/proc/" + std::to_string(child) + "/task")) {
        syscall(SYS_tgkill, child, std::stoi(task.path().filename()), SIGUSR2);
        std::this_thread::sleep_for(std::chrono::milliseconds(50));
    }
}

// How a child ended; "" for well.
std::string watch(pid_t child, const Slot& slot) {
    constexpr auto PERIOD = std::chrono::milliseconds(20);
    int status = 0;
    bool hangs = false;
    while (waitpid(child, &status, WNOHANG) == 0) {
        std::this_thread::sleep_for(PERIOD);
        if (now() - slot.since < TOO_LONG)
            continue;
        hangs = true;
        ask_for_stacks(child);
        kill(child, SIGKILL);
        waitpid(child, &status, 0);
        break;
    }
    if (hangs)
        return "a hang";
    if (WIFSIGNALED(status))
        return std::string("ended by ") + strsignal(WTERMSIG(status));
    const int code = WEXITSTATUS(status);
    return code == 0 && slot.is_done ? "" : "ended with " + std::to_string(code);
}

void print_tally(const std::string& name, const Tally& tally) {
    std::printf("%-64s", name.c_str());
    for (int kind = 0; kind < KINDS; ++kind)
        if (tally.found[kind])
            std::printf("  %s %lu of %lu", kind_name(static_cast<Kind>(kind)),
                        tally.tried[kind].load(), tally.found[kind].load());
    std::printf("\n");
    std::fflush(stdout);
}

class Watch {
public:
    Watch(const std::vector<Operation>& operations, const Choice& choice, Ledger& ledger,
          Slot& slot)
        : _operations(operations), _choice(choice), _ledger(ledger), _slot(slot) {}

    void run(const Group& group) {
        std::size_t operation = group.begin, point = 0;
        unsigned findings = 0;
        while (operation < group.end) {
            const std::string how = run_child(operation, point, group.end);
            if (how.empty())
                break;
            tell(how);
            const bool is_new = _slot.operation != operation;
            findings = is_new ? 1 : findings + 1;
            operation = _slot.operation;
            point = _slot.point + 1; // 0 after a failed preparation
            if (_slot.point == PREPARING || findings >= MOST_FINDINGS) {
                ++operation;
                point = findings = 0;
            }
        }
        for (std::size_t i = group.begin; _choice.most > 0 && i < group.end; ++i)
            print_tally(_operations[i].name, _ledger.tallies[i]);
    }

private:
    std::string run_child(std::size_t operation, std::size_t point, std::size_t end) {
        _slot.is_done = false;
        _slot.begin(operation, PREPARING, "the start");
        std::fflush(nullptr);
        const pid_t child = fork();
        if (child == 0)
            Child(_operations, _choice, _ledger, _slot).run(operation, point, end);
        return watch(child, _slot);
    }
    void tell(const std::string& how) {
        ++_ledger.findings;
        std::printf("FINDING %s: %s: %s\n", _operations[_slot.operation].name.c_str(), _slot.text,
                    how.c_str());
        print_stacks();
        std::fflush(stdout);
    }

    const std::vector<Operation>& _operations;
    const Choice& _choice;
    Ledger& _ledger;
    Slot& _slot;
};

} // namespace

unsigned long sweep_all(const std::vector<Operation>& operations, const Choice& choice,
                        unsigned jobs) {
    const std::size_t size = sizeof(Ledger) + operations.size() * sizeof(Tally);
    void* memory = mmap(nullptr, size, PROT_READ | PROT_WRITE, MAP_SHARED | MAP_ANONYMOUS, -1, 0);
    if (memory == MAP_FAILED)
        throw std::runtime_error("no shared memory");
    auto& ledger = *static_cast<Ledger*>(memory); // zeros are its start
    const std::vector<Group> groups = groups_of(operations);
    std::vector<pid_t> watches;
    for (unsigned job = 0; job < std::min<unsigned>(jobs, 64); ++job) {
        std::fflush(nullptr);
        watches.push_back(fork());
        if (watches.back() != 0)
            continue;
        // Children of different jobs have their hosts' roots in folders of their own.
        const fs::path folder = "job-" + std::to_string(job);
        fs::create_directories(folder);
        fs::current_path(folder);
        Watch watch(operations, choice, ledger, ledger.slots[job]);
        for (std::size_t group; (group = ledger.next_group++) < groups.size();)
            watch.run(groups[group]);
        std::fflush(nullptr);
        std::_Exit(0);
    }
    for (const pid_t watch : watches)
        waitpid(watch, nullptr, 0);
    Tally total{};
    for (std::size_t i = 0; i < operations.size(); ++i)
        for (int kind = 0; kind < KINDS; ++kind) {
            total.found[kind] += ledger.tallies[i].found[kind];
            total.tried[kind] += ledger.tallies[i].tried[kind];
        }
    print_tally(std::to_string(operations.size()) + " operations", total);
    const unsigned long findings = ledger.findings;
    munmap(memory, size);
    return findings;
}

} // namespace sweep
