// Diagnostic tests: they run on the simulator's clock beside the caller, one on an adapter at a
// time, and come to the end that the function's "diagnostics" describe.
#include "simulator/call.h"
#include "simulator/identifiers.h"

#include <algorithm>
#include <cctype>
#include <cstring>

namespace vlnsim::library {
namespace {

constexpr std::uint64_t usec_per_millisecond = 1000;
constexpr std::uint64_t never = ~std::uint64_t{0};
constexpr std::uint32_t max_cycles = 4000;
constexpr std::size_t max_pattern = 8;
constexpr std::uint32_t loopback_external = 0;
constexpr std::uint32_t loopback_types[] = {loopback_external, 2, 3, 4};

// Results of a test by their numbers.
enum : std::uint32_t {
    passed = 0,
    general_error = 1,
    link_down = 2,
    transmit_error = 5,
    receive_error = 6,
    echo_not_supported = 8,
    target_unreachable = 10,
    too_hot = 11,
    another_test_runs = 13,
};

std::uint32_t number_of(const Attribute_Map& map, std::uint16_t identifier) {
    const auto found = map.find(identifier);
    return found == map.end() ? 0 : found->second.number();
}

// ---- Arguments ----

bool pattern_is_good(const char* pattern) {
    if (!pattern)
        return true;
    const std::string_view digits(pattern);
    return digits.size() <= max_pattern &&
           std::all_of(digits.begin(), digits.end(),
                       [](unsigned char digit) { return std::isxdigit(digit) != 0; });
}

// What is wrong with the arguments of a test of cycles, or null.
const char* wrong_with(std::uint32_t cycles, std::uint32_t halt, std::uint32_t reserved,
                       const char* pattern) {
    return cycles > max_cycles         ? "too many cycles"
           : halt > 1                  ? "haltOnError is neither 0 nor 1"
           : reserved != 0             ? "the reserved argument is not 0"
           : !pattern_is_good(pattern) ? "the pattern is not up to eight hexadecimal digits"
                                       : nullptr;
}

// ---- A test's course ----

std::uint64_t after(std::uint64_t start, std::uint64_t milliseconds) {
    return start + milliseconds * usec_per_millisecond;
}

// The cycle with which it ends, by itself.
std::uint32_t last_cycle(const Test& test) {
    const bool fails = test.model.fails_at != 0 && test.model.fails_at < test.cycles;
    return fails && test.halts ? test.model.fails_at : test.cycles;
}

std::uint64_t own_end(const Test& test) {
    if (test.model.endless)
        return never;
    return after(test.start,
                 test.model.pending_time + std::uint64_t{last_cycle(test)} * test.model.cycle_time);
}

std::uint64_t cancel_end(const Test& test) {
    return test.cancelled ? after(*test.cancelled, test.model.cancel_time) : never;
}

bool has_ended(const Test& test, std::uint64_t now) {
    return now >= std::min(own_end(test), cancel_end(test));
}

std::uint32_t cycles_done(const Test& test, std::uint64_t now) {
    const std::uint64_t first = after(test.start, test.model.pending_time);
    const std::uint64_t length = test.model.cycle_time * usec_per_millisecond;
    const std::uint64_t until = std::min(now, cancel_end(test));
    if (until < first)
        return 0;
    const std::uint64_t done = length ? (until - first) / length : test.cycles;
    return static_cast<std::uint32_t>(std::min<std::uint64_t>(done, last_cycle(test)));
}

bool errors_show(const Test& test, std::uint32_t done) {
    const std::uint32_t at = test.model.fails_at ? test.model.fails_at : test.cycles;
    return done >= std::min(at, test.cycles);
}

std::uint32_t result_of(const Diagnostics& model) {
    return model.result            ? model.result
           : model.transmit_errors ? transmit_error
           : model.receive_errors  ? receive_error
           : model.error_cycles    ? general_error
                                   : passed;
}

void fill_pairs(const Diagnostics& model, AX_DiagResults& words) {
    AX_CableResults cable{};
    std::memcpy(&cable, &words, sizeof cable);
    for (std::size_t pair = 0; pair < std::size(cable.pairState); ++pair) {
        cable.pairState[pair] = static_cast<std::uint8_t>(model.pair_state[pair]);
        cable.pairLength[pair] = model.pair_length[pair];
    }
    std::memcpy(&words, &cable, sizeof cable);
}

// What the adapter tells of the test, with the status of the call.
AX_STATUS tell(const Test& test, std::uint64_t now, AX_DiagResults& words) {
    const bool pending = now < after(test.start, test.model.pending_time);
    const std::uint64_t end = std::min(own_end(test), cancel_end(test));
    soil(&words, 0, sizeof words);
    words.state = pending ? AX_DIAG_PENDING : AX_DIAG_RUNNING;
    words.cyclesComplete = cycles_done(test, now);
    words.milliseconds =
        static_cast<std::uint32_t>((std::min(now, end) - test.start) / usec_per_millisecond);
    const bool errors = errors_show(test, words.cyclesComplete);
    words.resultCode = passed;
    words.errorCycles = errors ? test.model.error_cycles : 0;
    words.transmitErrors = errors ? test.model.transmit_errors : 0;
    words.receiveErrors = errors ? test.model.receive_errors : 0;
    if (!has_ended(test, now)) {
        if (test.kind == Test::Kind::cable)
            fill_pairs({}, words);
        return pending ? AX_STATUS_OK : test.model.running_status;
    }
    const bool was_cancelled = cancel_end(test) <= own_end(test);
    words.state = was_cancelled ? std::uint32_t{AX_DIAG_CANCEL_FINISHED} : test.model.end_state;
    words.resultCode = was_cancelled ? general_error : result_of(test.model);
    if (test.kind == Test::Kind::cable)
        fill_pairs(test.model, words);
    return AX_STATUS_OK;
}

// ---- Starting one ----

// A test that comes to nothing has its result when its turn comes.
void fail_at_once(Test& test, std::uint32_t result) {
    test.cycles = 0;
    test.model = {.pending_time = test.model.pending_time, .result = result};
}

bool is_too_hot(const Function& function) {
    const std::uint32_t temperature =
        number_of(function.adapter_attributes, AX_HA_BOARD_TEMPERATURE);
    const std::uint32_t limit = temperature >> 16 & 0xFF;
    return limit != 0 && (temperature & 0xFF) >= limit;
}

bool is_busy(const Call& call, const Function& function, std::uint64_t now) {
    return function.diagnostics->busy ||
           std::any_of(call.sim.tests.begin(), call.sim.tests.end(), [&](const auto& entry) {
               const Test& test = entry.second;
               return test.card == function.card && test.sub_adapter == function.sub_adapter &&
                      !has_ended(test, now);
           });
}

// Tests that have ended may be asked for until the function begins the next one.
void forget_ended(Call& call, const Function& function, std::uint64_t now) {
    std::erase_if(call.sim.tests, [&](const auto& entry) {
        return entry.second.wwpn == function.wwpn && has_ended(entry.second, now);
    });
}

// Starts a test of the function; adjust(function, test) may make it fail.
template <class Adjust>
AX_STATUS start(Call& call, AX_WWN wwn, Test test, std::uint32_t* handle, Adjust adjust) {
    if (call.null(handle, "handle"))
        return AX_STATUS_INVALID_ARGUMENT;
    const Function* function = call.function(wwn);
    if (!function)
        return AX_STATUS_ILLEGAL_WWN;
    if (!function->diagnostics)
        return AX_STATUS_NO_DIAGNOSTICS;
    test.wwpn = function->wwpn;
    test.card = function->card;
    test.sub_adapter = function->sub_adapter;
    test.model = *function->diagnostics;
    test.start = vlnsim_now();
    if (is_busy(call, *function, test.start))
        fail_at_once(test, another_test_runs);
    else if (is_too_hot(*function))
        fail_at_once(test, too_hot);
    else
        adjust(*function, test);
    forget_ended(call, *function, test.start);
    *handle = call.sim.next_test++;
    call.out("handle", *handle);
    call.sim.tests[*handle] = test;
    return AX_STATUS_OK;
}

bool sees(const Function& function, AX_WWN target) {
    std::uint8_t bytes[8];
    std::memcpy(bytes, &target, sizeof bytes);
    const std::uint64_t name = get_name(bytes);
    return std::any_of(function.targets.begin(), function.targets.end(),
                       [&](const Target& each) { return each.port_wwn == name; });
}

// The test of that function with that handle; null, with a violation, when there is none.
Test* find_test(Call& call, AX_WWN wwn, std::uint32_t handle, AX_STATUS& status) {
    const Function* function = call.function(wwn);
    if (!function) {
        status = AX_STATUS_ILLEGAL_WWN;
        return nullptr;
    }
    const auto found = call.sim.tests.find(handle);
    if (found != call.sim.tests.end() && found->second.wwpn == function->wwpn)
        return &found->second;
    call.violation("unknown handle " + std::to_string(handle));
    status = AX_STATUS_INVALID_ARGUMENT;
    return nullptr;
}

} // namespace

AX_STATUS AX_DiagLoopBackTestV3(AX_WWN wwn, uint32_t type, uint32_t cycles, uint32_t haltOnError,
                                uint32_t* handle, uint32_t reserved, const char* pattern) {
    return answer<AX_STATUS>(
        Entry::AX_DiagLoopBackTestV3,
        [&](Call& call) -> AX_STATUS {
            const bool known =
                std::count(std::begin(loopback_types), std::end(loopback_types), type);
            const char* wrong =
                known ? wrong_with(cycles, haltOnError, reserved, pattern) : "unknown type";
            if (wrong) {
                call.violation(wrong);
                return AX_STATUS_INVALID_ARGUMENT;
            }
            return start(call, wwn, {.cycles = cycles, .halts = haltOnError != 0}, handle,
                         [&](const Function&, Test& test) {
                             if (type == loopback_external && !test.model.plug)
                                 fail_at_once(test, link_down);
                         });
        },
        wwn, type, cycles, haltOnError, reserved, pattern);
}

AX_STATUS AX_DiagEchoTestV2(AX_WWN wwn, AX_WWN target, uint32_t cycles, uint32_t haltOnError,
                            uint32_t* handle, uint32_t reserved, const char* pattern) {
    return answer<AX_STATUS>(
        Entry::AX_DiagEchoTestV2,
        [&](Call& call) -> AX_STATUS {
            if (const char* wrong = wrong_with(cycles, haltOnError, reserved, pattern)) {
                call.violation(wrong);
                return AX_STATUS_INVALID_ARGUMENT;
            }
            return start(call, wwn, {.cycles = cycles, .halts = haltOnError != 0}, handle,
                         [&](const Function& function, Test& test) {
                             if (!(function.special_features & AX_FEATURE_FCOE_FUNCTION))
                                 fail_at_once(test, echo_not_supported);
                             else if (!sees(function, target))
                                 fail_at_once(test, target_unreachable);
                         });
        },
        wwn, target, cycles, haltOnError, reserved, pattern);
}

AX_STATUS AX_DiagRunTDR(AX_WWN wwn, uint32_t* handle, AX_CableResults* results) {
    return answer<AX_STATUS>(
        Entry::AX_DiagRunTDR,
        [&](Call& call) -> AX_STATUS {
            if (call.null(results, "results"))
                return AX_STATUS_INVALID_ARGUMENT;
            const AX_STATUS status = start(call, wwn, {.kind = Test::Kind::cable, .cycles = 1},
                                           handle, [](const Function&, Test&) {});
            if (status == AX_STATUS_OK)
                soil(results, 0, sizeof *results);
            return status;
        },
        wwn);
}

AX_STATUS AX_DiagGetResults(AX_WWN wwn, uint32_t handle, AX_DiagResults* results) {
    return answer<AX_STATUS>(
        Entry::AX_DiagGetResults,
        [&](Call& call) -> AX_STATUS {
            if (call.null(results, "results"))
                return AX_STATUS_INVALID_ARGUMENT;
            AX_STATUS status = AX_STATUS_OK;
            const Test* test = find_test(call, wwn, handle, status);
            if (!test)
                return status;
            status = tell(*test, vlnsim_now(), *results);
            call.out("state", results->state);
            return status;
        },
        wwn, handle);
}

AX_STATUS AX_DiagCancelDiagnostic(AX_WWN wwn, uint32_t handle) {
    return answer<AX_STATUS>(
        Entry::AX_DiagCancelDiagnostic,
        [&](Call& call) -> AX_STATUS {
            AX_STATUS status = AX_STATUS_OK;
            Test* test = find_test(call, wwn, handle, status);
            if (!test)
                return status;
            if (test->model.cancel_status == AX_STATUS_OK && !test->cancelled)
                test->cancelled = vlnsim_now();
            return test->model.cancel_status;
        },
        wwn, handle);
}

} // namespace vlnsim::library
