// The memory behind CMPI objects: what a provider holds a pointer to, and whether it still may.
//
// Providers get pointers to slots in memory that is never given back to the system, so any pointer
// they return can be examined without harm: one that was never ours, one that was released, one of
// another kind. A released slot rests before it is used again, so that a late use is told from a
// proper one. The contents live in a body behind the slot.
//
// One lock guards all lists; slots are read without it, since a provider that uses an object on one
// thread while it releases it on another is broken beyond what anybody can check.
#ifndef HOST_OBJECT_STORE_H
#define HOST_OBJECT_STORE_H

#include <array>
#include <atomic>
#include <cstddef>
#include <cstdint>
#include <memory>

namespace host {

class Core;

enum class Kind : std::uint8_t {
    string,
    array,
    datetime,
    object_path,
    instance,
    args,
    result,
    enumeration,
    context,
    select_expression,
};
inline constexpr std::size_t KIND_COUNT = 10;
// "CMPIString"
const char* to_string(Kind kind);

struct Object;

// The objects that end together: those of a call, those in another object, or those that belong to
// the caller.
struct Arena {
    Object* first = nullptr; // the youngest
    std::size_t count = 0;
};

// The contents of an object.
struct Body {
    Body() = default;
    Body(const Body&) noexcept {} // the objects in it stay with the original
    Body& operator=(const Body&) noexcept { return *this; }
    virtual ~Body() = default;
    virtual void poison() {} // overwrites what a provider may still point to

    Arena contents; // values that it handed out, elements that it holds: they go with it
};

struct Object {
    // What the provider sees as CMPIString, CMPIInstance and so on.
    void* hdl;
    const void* ft;

    enum State : std::uint32_t { never = 0, live = 0x4C495645, dead = 0xDEADDEAD };
    std::atomic<std::uint32_t> state;
    Kind kind;
    bool parameter; // belongs to the call or to another object; a provider must not release it
    std::uint64_t serial;
    Core* core;
    Arena* arena;
    Object* previous; // neighbours in the arena; next also in the list of resting slots
    Object* next;
    Body* body;
};

// Counts of live objects by kind.
using Live_Counts = std::array<std::size_t, KIND_COUNT>;
struct Counters {
    std::array<std::atomic<std::size_t>, KIND_COUNT> live{};
    std::atomic<std::size_t> created{0};
    std::atomic<std::size_t> alive{0}; // of all kinds
    std::atomic<std::size_t> peak{0};  // the most that were alive at once
    Live_Counts snapshot() const;
};

enum class Verdict { live, released, foreign };

// Examines any pointer.
Verdict examine(const void* pointer);

Object* create_object(Core& core, Kind kind, const void* table, std::unique_ptr<Body> body,
                      Arena& arena);
// The object must be live.
void destroy_object(Object& object);
// Returns how many there were. At once: oldest first, and without the rest that would make a late
// use of their contents harmless.
std::size_t destroy_all(Arena& arena, bool at_once = false);
// Moves a live object into another arena.
void adopt(Object& object, Arena& arena);

} // namespace host

#endif // HOST_OBJECT_STORE_H
