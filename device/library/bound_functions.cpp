#include "device/library/bound_functions.h"

#include "device/library/runtime_loader.h"

#include <tuple>

namespace cimple {

namespace {

// The search for one symbol and its cached result.
class Bound_Symbol {
public:
    constexpr Bound_Symbol(Library_Slot preferred, const char* name,
                           const char* otherName = nullptr)
        : m_preferred(preferred), m_name(name), m_otherName(otherName) {}

protected:
    // The entry point, or null. On the usual path, a comparison and two loads.
    void* find() {
        // The order of the two loads, and of the two stores in resolve(), makes a pointer that
        // another thread has cached visible with its generation. Racing threads store the same.
        if (m_generation.load(std::memory_order_acquire) ==
            VLN_Runtime_Loader::generation(m_preferred)) [[likely]]
            return m_cached.load(std::memory_order_relaxed);
        return resolve();
    }

private:
    [[gnu::noinline, gnu::cold]] void* resolve() {
        const uint32 generation = VLN_Runtime_Loader::generation(m_preferred);
        if (generation == VLN_Runtime_Loader::GENERATION_MISSING)
            return resolveInManagementLibrary();
        void* entry = lookUp(m_preferred, m_name);
        if (entry)
            m_generation.store(generation, std::memory_order_release);
        return entry;
    }

    // Caches what it finds and never reads it: on this path the symbol is looked up on every call.
    // That is meant.
    void* resolveInManagementLibrary() {
        if (m_preferred == SLOT_MANAGEMENT || VLN_Runtime_Loader::missing(SLOT_MANAGEMENT))
            return nullptr;
        void* entry = lookUp(SLOT_MANAGEMENT, m_name);
        if (!entry && m_otherName)
            entry = lookUp(SLOT_MANAGEMENT, m_otherName);
        return entry;
    }

    void* lookUp(Library_Slot slot, const char* name) {
        void* entry = VLN_Runtime_Loader::symbol(slot, name);
        m_cached.store(entry, std::memory_order_relaxed);
        return entry;
    }

    const Library_Slot m_preferred;
    const char* const m_name;
    const char* const m_otherName; // sought after m_name, in the management library only
    std::atomic<void*> m_cached{nullptr};
    // The load that m_cached comes from.
    std::atomic<uint32> m_generation{VLN_Runtime_Loader::GENERATION_NONE};
};

template <class Signature, auto failure>
class Bound_Function;

template <class Result, class... Parameters, auto failure>
class Bound_Function<Result(Parameters...), failure> : Bound_Symbol {
public:
    using Bound_Symbol::Bound_Symbol;

    Result call(Parameters... arguments) {
        auto entry = reinterpret_cast<Result (*)(Parameters...)>(find());
        if (!entry) [[unlikely]]
            return static_cast<Result>(failure);
        return entry(arguments...);
    }
};

// The types of a declared function, by position.
template <class Signature>
struct Declared;

template <class R, class... Parameters>
struct Declared<R(Parameters...)> {
    using Result = R;
    template <std::size_t index>
    using Parameter = std::tuple_element_t<index, std::tuple<Parameters...>>;
};

constexpr int VLN_NO_VALUE = 0; // of a function that returns nothing

} // namespace

} // namespace cimple

// Slot and names of each form.
#define VLN_SEARCH_A(name) SLOT_LOCAL, "L" #name, #name
#define VLN_SEARCH_B(name) SLOT_LOCAL, #name
#define VLN_SEARCH_C(name) SLOT_LOCAL, #name
#define VLN_SEARCH_D(name) SLOT_HBA, #name
#define VLN_SEARCH_E(name) SLOT_CPQFC, #name
#define VLN_SEARCH_F(name) VLN_SEARCH_C(name)
#define VLN_SEARCH_M(name) SLOT_MANAGEMENT, #name

// The parameters of a function of so many, with the types of its declaration.
#define VLN_PARAMETER(name, n) Declared<decltype(::name)>::Parameter<n> a##n
#define VLN_PARAMETERS_0(name)
#define VLN_PARAMETERS_1(name) VLN_PARAMETER(name, 0)
#define VLN_PARAMETERS_2(name) VLN_PARAMETERS_1(name), VLN_PARAMETER(name, 1)
#define VLN_PARAMETERS_3(name) VLN_PARAMETERS_2(name), VLN_PARAMETER(name, 2)
#define VLN_PARAMETERS_4(name) VLN_PARAMETERS_3(name), VLN_PARAMETER(name, 3)
#define VLN_PARAMETERS_5(name) VLN_PARAMETERS_4(name), VLN_PARAMETER(name, 4)
#define VLN_PARAMETERS_6(name) VLN_PARAMETERS_5(name), VLN_PARAMETER(name, 5)
#define VLN_PARAMETERS_7(name) VLN_PARAMETERS_6(name), VLN_PARAMETER(name, 6)
#define VLN_PARAMETERS_8(name) VLN_PARAMETERS_7(name), VLN_PARAMETER(name, 7)
#define VLN_PARAMETERS_9(name) VLN_PARAMETERS_8(name), VLN_PARAMETER(name, 8)
#define VLN_PARAMETERS_10(name) VLN_PARAMETERS_9(name), VLN_PARAMETER(name, 9)

#define VLN_ARGUMENTS_0
#define VLN_ARGUMENTS_1 a0
#define VLN_ARGUMENTS_2 VLN_ARGUMENTS_1, a1
#define VLN_ARGUMENTS_3 VLN_ARGUMENTS_2, a2
#define VLN_ARGUMENTS_4 VLN_ARGUMENTS_3, a3
#define VLN_ARGUMENTS_5 VLN_ARGUMENTS_4, a4
#define VLN_ARGUMENTS_6 VLN_ARGUMENTS_5, a5
#define VLN_ARGUMENTS_7 VLN_ARGUMENTS_6, a6
#define VLN_ARGUMENTS_8 VLN_ARGUMENTS_7, a7
#define VLN_ARGUMENTS_9 VLN_ARGUMENTS_8, a8
#define VLN_ARGUMENTS_10 VLN_ARGUMENTS_9, a9

// The types come from the declaration in device/library/axapi.h and can't disagree with it. A wrong
// number of arguments would make an overload with C linkage, which the compiler refuses.
#define VLN_BOUND(form, name, arguments, failure)                                                  \
    namespace {                                                                                    \
    constinit Bound_Function<decltype(::name), failure> bound_##name{VLN_SEARCH_##form(name)};     \
    }                                                                                              \
    extern "C" Declared<decltype(::name)>::Result name(VLN_PARAMETERS_##arguments(name)) {         \
        return bound_##name.call(VLN_ARGUMENTS_##arguments);                                       \
    }

using namespace cimple;

#include "device/library/bound_functions.inc"
