// The frame around every library function: lock, count, fault script, contract, trace.
#ifndef VLNSIM_CALL_H
#define VLNSIM_CALL_H

#include "simulator/simulator.h"

#include <new>
#include <optional>
#include <type_traits>

namespace vlnsim {

// How arguments and results look in a trace.
std::string shown(AX_WWN wwn);
std::string shown(HBA_WWN wwn);
std::string shown(const char* text);
std::string
shown(const void* pointer); // "null" or "buffer": addresses would differ from run to run
template <class Number>
requires std::is_integral_v<Number> std::string shown(Number number) {
    return std::to_string(number);
}

// One running call; it exists while the simulator's mutex is held.
class Call {
public:
    Call(Simulator& simulator, Entry entry) : sim(simulator), host(simulator.host), _entry(entry) {}

    Simulator& sim;
    Host& host;

    // What the fault script says about this call.
    std::optional<std::uint64_t> forced_status;
    std::optional<std::uint64_t> forced_size; // buffer counts as too small; 0: tell the true need
    std::optional<std::uint64_t> missing;     // identifier, 0: any
    bool is_held = false;

    Entry entry() const { return _entry; }
    void violation(const std::string& what) { sim.add_violation(_entry, what); }

    // Whether an argument that must not be null is null; then it is a violation.
    bool null(const void* pointer, const char* name);
    // The function with that port WWN; null, with a violation, when there is none.
    Function* function(AX_WWN wwn);
    // The same, or the dead port that the name stands for.
    Function* function_or_dead_port(AX_WWN wwn);

    // Whether room for needed bytes or entries is missing, by itself or by the script; then needed
    // is what the caller is to be told.
    bool too_small(std::uint64_t room, std::uint32_t& needed) const;
    // The same for a list with the count at its head, which tells the room on the way in and what
    // there is on the way out.
    bool list_too_small(std::uint32_t& count, std::size_t entries);

    template <class Value>
    void out(const char* name, const Value& value) {
        if (tracing())
            results += std::string(" ") + name + "=" + shown(value);
    }
    bool tracing() const { return sim.trace || sim.recording; }

    // Takes from the script what is for this call; answers the delay in microseconds.
    std::uint64_t take_faults();
    // Whether the library may be called now; a violation if not.
    bool ready();
    void finish(const std::string& arguments, const std::string& result);

    std::string results; // of the trace line

private:
    Entry _entry;
};

// Answers of a function that is not ready: failure, or nothing where the result is a count or a
// handle.
std::uint32_t unready_answer(Entry entry);

namespace detail {

template <class Result>
Result converted(std::uint64_t status) {
    if constexpr (std::is_integral_v<Result>)
        return static_cast<Result>(status);
    else
        return Result{};
}

template <class... Arguments>
std::string listed(const Arguments&... arguments) {
    std::string text;
    ((text += (text.empty() ? "" : ", ") + shown(arguments)), ...);
    return text;
}

} // namespace detail

// Runs body(call) as the function that entry names and answers its result. A pointer function runs
// its body also under a forced status, since it reports that in an argument. Throws nothing.
template <class Result, class Body, class... Arguments>
Result answer(Entry entry, Body body, const Arguments&... arguments) noexcept {
    try {
        Simulator& simulator = Simulator::instance();
        std::unique_lock lock(simulator.mutex);
        simulator.choose_scenario();
        Call call(simulator, entry);
        if (const std::uint64_t delay = call.take_faults()) {
            lock.unlock();
            vlnsim_sleep(delay);
            lock.lock();
        }
        if (call.is_held)
            simulator.wait_for_clearance(lock);
        Result result{};
        if (call.forced_status && std::is_integral_v<Result>)
            result = detail::converted<Result>(*call.forced_status);
        else if (!call.ready())
            result = detail::converted<Result>(unready_answer(entry));
        else
            result = body(call);
        if (call.tracing())
            call.finish(detail::listed(arguments...), shown(result));
        return result;
    } catch (const std::bad_alloc&) {
        return detail::converted<Result>(AX_STATUS_NO_MEMORY);
    } catch (...) {
        return detail::converted<Result>(AX_STATUS_ERROR);
    }
}

// Copies a text and its NUL, cut to the room; a room of 0 takes nothing.
void copy_text(const std::string& text, char* destination, std::size_t room);

// Fills what a call leaves of a buffer with bytes that are not zero: a callee owes nothing about
// them.
void soil(void* buffer, std::size_t used, std::size_t size);

} // namespace vlnsim

#endif // VLNSIM_CALL_H
