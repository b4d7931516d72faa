// The inside of a manager, which the function tables of the broker and of its objects work on.
#ifndef HOST_CORE_H
#define HOST_CORE_H

#include "host/broker.h"
#include "host/call.h"
#include "host/manager.h"
#include "host/module.h"
#include "host/objects.h"
#include "host/platform.h"
#include "host/registration.h"

#include <atomic>
#include <deque>
#include <memory>
#include <mutex>
#include <vector>

namespace host {

class Core : public std::enable_shared_from_this<Core> {
public:
    explicit Core(Options given); // throws Setup_Error
    ~Core();
    Core(const Core&) = delete;
    Core& operator=(const Core&) = delete;

    const Options options;
    ClassRepository classes;
    Platform platform;
    Registration registration;
    Module module;
    std::mutex brokers_mutex;
    std::deque<ProviderBroker> brokers; // of all providers there ever were
    FaultList faults;
    Counters counters;

    // Objects that belong to no call: results of clone, contexts for threads, and what was made
    // where nothing may be made.
    Arena clones;
    Arena contexts;
    Arena strays;

    std::atomic<std::size_t> calls{0};
    std::atomic<std::size_t> up_calls{0};
    std::atomic<std::size_t> left{0};
    std::atomic<std::size_t> answer_peak{0};
    std::atomic<int> attached_threads{0};

    std::mutex records_mutex; // guards the two below
    std::vector<Indication> indications;
    std::vector<Log_Message> messages;

    std::uint64_t now() const; // microseconds since the epoch
    void trace(const std::string& line) const {
        if (options.trace)
            options.trace(line);
    }
    // See Options::refuse.
    bool refuses(bool is_up_call, const char* function, CMPIrc& code) const {
        return options.refuse && options.refuse(is_up_call, function, code);
    }
    bool is_provider_name_space(std::string_view name_space) const;
    // Whether the platform answers for a class that no provider of the module serves.
    Status check_platform(const Class& known, const std::string& name_space) const;
    // Records what is alive as leaks and frees it.
    void report_leaks();
    // Records what a thread leaves behind when it detaches and frees it, in a way that no provider
    // can count on: at once, oldest first. Object managers are known that free it twice.
    void end_thread(Arena& arena);

    // The manager that a fault is reported to when its object cannot tell: that of the running
    // call, else the youngest one; null if there is none.
    static Core* any();
};

// Records a fault of whatever provider is running on this thread. A null core: any().
void report(Core* core, FaultKind kind, std::string text);

} // namespace host

#endif // HOST_CORE_H
