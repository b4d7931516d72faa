// Stands between the product's bound functions and the simulated libraries: a function for each
// entry point, made from its type alone. What an argument that is answered in has room for is told
// by its type, and for bytes by the size that goes with it.
#include "fuzz/odd_answers.h"

#include "device/library/axapi.h"
#include "device/library/axapi_attributes.h"
#include "device/library/axapi_bridging.h"
#include "device/library/axapi_channels.h"
#include "device/library/axapi_diagnostics.h"
#include "device/library/axapi_dump.h"
#include "device/library/axapi_hba.h"
#include "device/library/axapi_iscsi.h"
#include "device/library/axapi_virtual_ports.h"
#include "device/library/runtime_loader.h"

#include <algorithm>
#include <array>
#include <cstring>
#include <dlfcn.h>
#include <mutex>
#include <string_view>
#include <tuple>
#include <type_traits>
#include <utility>
#include <vector>

namespace {

using fuzz::Odd_Answer;

std::mutex mutex; // guards the two below
std::vector<Odd_Answer> odd_answers;
std::array<unsigned, 256> calls;

// The records for this call of the function.
std::vector<Odd_Answer> take(unsigned function) {
    const std::lock_guard lock(mutex);
    const unsigned call = calls[function]++;
    std::vector<Odd_Answer> taken;
    for (const Odd_Answer& odd : odd_answers)
        if (odd.function == function && (odd.when == call || odd.when >= 128))
            taken.push_back(odd);
    return taken;
}

struct Room {
    void* at = nullptr;
    std::size_t size = 0;
};

template <class T>
constexpr bool is_byte =
    std::is_void_v<T> || std::is_same_v<T, char> || std::is_same_v<T, std::uint8_t>;

// The number that the argument is or points to, if there is one of 32 bits.
template <class... A, std::size_t at>
std::uint32_t size_at(const std::tuple<A...>& arguments, std::integral_constant<std::size_t, at>) {
    if constexpr (at < sizeof...(A)) {
        using Argument = std::tuple_element_t<at, std::tuple<A...>>;
        if constexpr (std::is_same_v<Argument, std::uint32_t>)
            return std::get<at>(arguments);
        if constexpr (std::is_same_v<Argument, std::uint32_t*>)
            return std::get<at>(arguments) ? *std::get<at>(arguments) : 0;
    }
    return 0;
}

template <class... A, std::size_t at>
bool is_count_at(const std::tuple<A...>&, std::integral_constant<std::size_t, at>) {
    if constexpr (at < sizeof...(A))
        return std::is_same_v<std::tuple_element_t<at, std::tuple<A...>>, std::uint32_t*>;
    return false;
}

// Before the call, when sizes still tell the caller's room.
template <std::size_t at, class... A>
Room room_at(const std::tuple<A...>& arguments) {
    using Pointer = std::tuple_element_t<at, std::tuple<A...>>;
    using T = std::remove_pointer_t<Pointer>;
    constexpr std::integral_constant<std::size_t, at + 1> next;
    if constexpr (!std::is_pointer_v<Pointer> || std::is_const_v<T> || std::is_function_v<T>) {
        return {};
    } else if constexpr (is_byte<T>) {
        std::uint32_t size = size_at(arguments, next);
        if constexpr (at > 0 && at + 1 == sizeof...(A) && std::is_same_v<T, std::uint8_t>)
            size = size_at(arguments, std::integral_constant<std::size_t, at - 1>());
        return {std::get<at>(arguments), size};
    } else {
        // A table with a count behind it, which tells that there is no room.
        const bool none = is_count_at(arguments, next) && size_at(arguments, next) == 0;
        return {std::get<at>(arguments), none ? 0 : sizeof(T)};
    }
}

void change(const Room& room, const Odd_Answer& odd) {
    if (!room.at || room.size == 0)
        return;
    auto* const bytes = static_cast<std::uint8_t*>(room.at);
    std::uint16_t offset = 0;
    std::memcpy(&offset, odd.offset, sizeof offset);
    const std::size_t from = offset % room.size;
    switch (odd.what / 8 % 4) {
    case 0: // some bytes
        std::memcpy(bytes + from, odd.value, std::min(sizeof odd.value, room.size - from));
        break;
    case 1: // texts without an end, or one byte all over
        std::memset(bytes + from, odd.value[0], room.size - from);
        break;
    case 2: // a short stretch of it
        std::memset(bytes + from, odd.value[0],
                    std::min<std::size_t>(odd.value[1] + 1u, room.size - from));
        break;
    default: // noise
        for (std::size_t i = from, noise = odd.value[0]; i < room.size; ++i) {
            noise = noise * 1103515245 + 12345;
            bytes[i] = static_cast<std::uint8_t>(noise >> 16);
        }
    }
}

enum What : unsigned { STATUS_INSTEAD, STATUS_BEHIND, NOTHING_AT_ALL, WHAT_IS_LEFT };

template <class Result>
void change_result(Result& result, const Odd_Answer& odd, bool may_lead_anywhere) {
    std::int32_t value = 0;
    std::memcpy(&value, odd.value, sizeof value);
    if constexpr (std::is_integral_v<Result>)
        result = static_cast<Result>(value);
    else if (!may_lead_anywhere || odd.argument % 2 == 0)
        result = nullptr;
    else
        result = static_cast<char*>(result) + value;
}

// Functions of one name with the type they have in the header; number is their place in the table.
template <class Function, unsigned number>
struct Listener;

template <class Result, class... A, unsigned number>
struct Listener<Result(A...), number> {
    static inline Result (*library)(A...) = nullptr;

    static Result call(A... arguments) {
        const std::vector<Odd_Answer> odds = take(number);
        const std::tuple<A...> all(arguments...);
        const auto rooms = rooms_of(all, std::index_sequence_for<A...>());
        for (const Odd_Answer& odd : odds)
            if constexpr (std::is_integral_v<Result>)
                if (odd.what % 8 == STATUS_INSTEAD) {
                    Result result{};
                    change_result(result, odd, false);
                    return result;
                }
        if constexpr (std::is_void_v<Result>) {
            library(arguments...);
        } else {
            Result result = library(arguments...);
            for (const Odd_Answer& odd : odds)
                if (odd.what % 8 <= NOTHING_AT_ALL)
                    // What is a value lies in a buffer; a cursor goes back to the library.
                    change_result(result, odd, sizeof...(A) == 4);
                else if (!rooms.empty())
                    change(rooms[odd.argument % rooms.size()], odd);
            return result;
        }
    }

    template <std::size_t... at>
    static std::vector<Room> rooms_of(const std::tuple<A...>& all, std::index_sequence<at...>) {
        std::vector<Room> rooms;
        if constexpr ((... || std::is_function_v<std::remove_pointer_t<A>>))
            return rooms;
        for (const Room& room : std::initializer_list<Room>{room_at<at>(all)...})
            if (room.size > 0)
                rooms.push_back(room);
        return rooms;
    }

    static void* listen(void* function) {
        library = reinterpret_cast<Result (*)(A...)>(function);
        return reinterpret_cast<void*>(&call);
    }
};

struct Row {
    const char* name;
    void* (*listen)(void* function);
};

#define ROW_MODEL(function)                                                                        \
    {#function, Listener<decltype(::function), __COUNTER__ - FIRST - 1>::listen},
#define ROW_STUB(function)
#define VLNSIM_A(name, model) ROW_##model(AX_##name)
#define VLNSIM_B(name, model) ROW_##model(LAX_##name)
#define VLNSIM_C(name, model) ROW_##model(AX_##name)
#define VLNSIM_D(name, model) ROW_##model(HBA_##name)
#define VLNSIM_E(name, model) ROW_##model(CPQFC_##name)
#define VLNSIM_F(name, model) ROW_##model(name)
constexpr unsigned FIRST = __COUNTER__;
constexpr Row ROWS[] = {
#include "simulator/entry_points.def"
};

void* find_symbol(void* handle, const char* name) {
    void* const function = dlsym(handle, name);
    if (!function)
        return nullptr;
    const std::string_view symbol = name;
    for (const Row& row : ROWS)
        if (symbol == row.name || (symbol.starts_with("LAX_") && symbol.substr(1) == row.name))
            return row.listen(function);
    return function;
}

constexpr cimple::Loader_Calls LOADER = {
    [](const char* file, int mode) { return dlopen(file, mode); },
    find_symbol,
    [](void* handle) { return dlclose(handle); },
    [] { return dlerror(); },
};

__attribute__((constructor)) void listen_in() {
    cimple::VLN_Runtime_Loader::setCalls(&LOADER);
}

} // namespace

void answer_oddly(const Odd_Answer* records, std::size_t count) {
    const std::lock_guard lock(mutex);
    odd_answers.assign(records, records + count);
    for (Odd_Answer& odd : odd_answers)
        odd.function = static_cast<std::uint8_t>(odd.function % std::size(ROWS));
    calls.fill(0);
}
