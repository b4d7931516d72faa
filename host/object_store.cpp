#include "host/object_store.h"

#include "host/core.h"

#include <algorithm>
#include <deque>
#include <mutex>
#include <new>
#include <vector>

#if defined(__SANITIZE_THREAD__)
extern "C" {
void AnnotateIgnoreReadsBegin(const char* file, int line);
void AnnotateIgnoreReadsEnd(const char* file, int line);
void AnnotateIgnoreWritesBegin(const char* file, int line);
void AnnotateIgnoreWritesEnd(const char* file, int line);
void AnnotateIgnoreSyncBegin(const char* file, int line);
void AnnotateIgnoreSyncEnd(const char* file, int line);
}
#endif

namespace host {

const char* to_string(Kind kind) {
    constexpr const char* names[] = {
        "CMPIString", "CMPIArray",  "CMPIDateTime",    "CMPIObjectPath", "CMPIInstance",
        "CMPIArgs",   "CMPIResult", "CMPIEnumeration", "CMPIContext",    "CMPISelectExp"};
    static_assert(std::size(names) == KIND_COUNT);
    return names[static_cast<std::size_t>(kind)];
}

Live_Counts Counters::snapshot() const {
    Live_Counts counts{};
    for (std::size_t i = 0; i < KIND_COUNT; ++i)
        counts[i] = live[i].load();
    return counts;
}

namespace {

constexpr auto RELAXED = std::memory_order_relaxed; // a count orders nothing

// What goes on in the store is nothing to the thread sanitizer: its lock, taken for every object
// that a provider makes, would put all calls into an order, and so hide the races of the provider.
class Unseen {
public:
    Unseen() { begin(); }
    ~Unseen() { end(); }
    Unseen(const Unseen&) = delete;
    Unseen& operator=(const Unseen&) = delete;

#if defined(__SANITIZE_THREAD__)
    static void begin() {
        AnnotateIgnoreReadsBegin(__FILE_NAME__, __LINE__);
        AnnotateIgnoreWritesBegin(__FILE_NAME__, __LINE__);
        AnnotateIgnoreSyncBegin(__FILE_NAME__, __LINE__);
    }
    static void end() {
        AnnotateIgnoreSyncEnd(__FILE_NAME__, __LINE__);
        AnnotateIgnoreWritesEnd(__FILE_NAME__, __LINE__);
        AnnotateIgnoreReadsEnd(__FILE_NAME__, __LINE__);
    }
#else
    static void begin() {}
    static void end() {}
#endif
};

// But for this: who gets a slot comes after who had it.
class Seen_Again {
public:
    Seen_Again() { Unseen::end(); }
    ~Seen_Again() { Unseen::begin(); }
    Seen_Again(const Seen_Again&) = delete;
    Seen_Again& operator=(const Seen_Again&) = delete;
};

constexpr std::size_t CHUNK_SIZE = 64 * 1024; // and alignment
constexpr std::size_t RESTING_SLOTS = 4096;   // released slots that are not used again yet
constexpr std::size_t RESTING_BODIES = 1024;

struct Chunk {
    static constexpr std::size_t slots = (CHUNK_SIZE - sizeof(std::size_t)) / sizeof(Object);
    std::size_t used = 0;
    Object objects[slots];
};
static_assert(sizeof(Chunk) <= CHUNK_SIZE);

// Where chunks are, for examination without a lock: entries are only ever added.
class Chunk_Table {
public:
    bool contains(std::uintptr_t base) const {
        for (std::size_t at = hash(base), tries = 0; tries < size; ++tries, at = (at + 1) % size) {
            const std::uintptr_t entry = _entries[at].load(std::memory_order_acquire);
            if (entry == base)
                return true;
            if (entry == 0)
                return false;
        }
        return false;
    }

    void add(std::uintptr_t base) {
        if (++_count > size * 3 / 4)
            throw std::bad_alloc();
        std::size_t at = hash(base);
        while (_entries[at].load(std::memory_order_relaxed) != 0)
            at = (at + 1) % size;
        _entries[at].store(base, std::memory_order_release);
    }

private:
    static constexpr std::size_t size = 1 << 15;
    static std::size_t hash(std::uintptr_t base) {
        return static_cast<std::size_t>(base / CHUNK_SIZE * 2654435761u) % size;
    }
    std::array<std::atomic<std::uintptr_t>, size> _entries{};
    std::size_t _count = 0;
};

// All managers of a process share one store: an object of one that is handed to another is noticed.
class Store {
public:
    // Never destroyed: a provider's static objects may outlive everything else.
    static Store& the() {
        static Store& store = *new Store;
        return store;
    }

    const Chunk_Table& chunks() const { return _table; }

    Object* add(Core& core, Kind kind, const void* table, std::unique_ptr<Body> body,
                Arena& arena) {
        const Unseen unseen;
        const std::lock_guard lock(_mutex);
        Object* object = take_slot();
        object->hdl = body.get();
        object->ft = table;
        object->kind = kind;
        object->parameter = false;
        object->serial = ++_serial;
        object->core = &core;
        object->body = body.release();
        link(*object, arena);
        object->state.store(Object::live, std::memory_order_release);
        return object;
    }

    void remove(Object& object) {
        const Unseen unseen;
        Bodies ended;
        const std::lock_guard lock(_mutex);
        unlink(object);
        retire(object, ended, false);
    }

    std::size_t remove_all(Arena& arena, bool at_once) {
        const Unseen unseen;
        Bodies ended;
        const std::lock_guard lock(_mutex);
        const std::size_t count = arena.count;
        retire_all(arena, ended, at_once);
        return count;
    }

    void adopt(Object& object, Arena& arena) {
        const Unseen unseen;
        const std::lock_guard lock(_mutex);
        unlink(object);
        link(object, arena);
    }

private:
    using Bodies = std::vector<std::unique_ptr<Body>>;

    static void link(Object& object, Arena& arena) {
        object.arena = &arena;
        object.previous = nullptr;
        object.next = arena.first;
        if (arena.first)
            arena.first->previous = &object;
        arena.first = &object;
        ++arena.count;
    }

    static void unlink(Object& object) {
        if (object.previous)
            object.previous->next = object.next;
        else
            object.arena->first = object.next;
        if (object.next)
            object.next->previous = object.previous;
        --object.arena->count;
    }

    void retire_all(Arena& arena, Bodies& ended, bool at_once) {
        std::vector<Object*> objects;
        for (Object* object = arena.first; object; object = object->next)
            objects.push_back(object);
        if (at_once)
            std::reverse(objects.begin(), objects.end());
        arena = Arena{};
        for (Object* object : objects)
            retire(*object, ended, at_once);
    }

    Object* take_slot() {
        if (_resting_count > RESTING_SLOTS) {
            Object* object = _oldest;
            _oldest = object->next;
            --_resting_count;
            const Seen_Again seen;
            object->state.load(std::memory_order_acquire);
            return object;
        }
        if (!_chunk || _chunk->used == Chunk::slots) {
            _chunk = new (std::align_val_t(CHUNK_SIZE)) Chunk();
            _table.add(reinterpret_cast<std::uintptr_t>(_chunk));
        }
        return &_chunk->objects[_chunk->used++];
    }

    // Bodies that may go go to ended: their destructors run without the lock.
    void retire(Object& object, Bodies& ended, bool at_once) {
        {
            const Seen_Again seen;
            object.state.store(Object::dead, std::memory_order_release);
        }
        Counters& counters = object.core->counters;
        counters.live[static_cast<std::size_t>(object.kind)].fetch_sub(1, RELAXED);
        counters.alive.fetch_sub(1, RELAXED);
        std::unique_ptr<Body> body(object.body);
        retire_all(body->contents, ended, at_once);
        object.body = nullptr;
        object.hdl = nullptr;
        object.next = nullptr;
        (_oldest ? _newest->next : _oldest) = &object;
        _newest = &object;
        ++_resting_count;
        if (!object.core->options.strict || at_once) {
            ended.push_back(std::move(body));
            return;
        }
        body->poison();
        _resting_bodies.push_back(std::move(body));
        if (_resting_bodies.size() <= RESTING_BODIES)
            return;
        ended.push_back(std::move(_resting_bodies.front()));
        _resting_bodies.pop_front();
    }

    std::mutex _mutex;
    Chunk_Table _table;
    Chunk* _chunk = nullptr; // the one that slots come from
    Object* _oldest = nullptr;
    Object* _newest = nullptr;
    std::size_t _resting_count = 0;
    std::deque<std::unique_ptr<Body>> _resting_bodies;
    std::uint64_t _serial = 0;
};

} // namespace

Verdict examine(const void* pointer) {
    const auto address = reinterpret_cast<std::uintptr_t>(pointer);
    const std::uintptr_t base = address & ~(CHUNK_SIZE - 1);
    if (!Store::the().chunks().contains(base))
        return Verdict::foreign;
    const std::uintptr_t first = base + offsetof(Chunk, objects);
    if (address < first || (address - first) % sizeof(Object) != 0 ||
        (address - first) / sizeof(Object) >= Chunk::slots)
        return Verdict::foreign;
    const auto* object = reinterpret_cast<const Object*>(address);
    switch (object->state.load(std::memory_order_acquire)) {
    case Object::live:
        return object->hdl == object->body ? Verdict::live : Verdict::foreign;
    case Object::dead:
        return Verdict::released;
    default:
        return Verdict::foreign;
    }
}

Object* create_object(Core& core, Kind kind, const void* table, std::unique_ptr<Body> body,
                      Arena& arena) {
    Object* object = Store::the().add(core, kind, table, std::move(body), arena);
    Counters& counters = core.counters;
    counters.live[static_cast<std::size_t>(kind)].fetch_add(1, RELAXED);
    counters.created.fetch_add(1, RELAXED);
    const std::size_t alive = counters.alive.fetch_add(1, RELAXED) + 1;
    std::size_t peak = counters.peak.load(RELAXED);
    while (peak < alive && !counters.peak.compare_exchange_weak(peak, alive, RELAXED)) {
    }
    return object;
}

void destroy_object(Object& object) {
    Store::the().remove(object);
}

std::size_t destroy_all(Arena& arena, bool at_once) {
    return Store::the().remove_all(arena, at_once);
}

void adopt(Object& object, Arena& arena) {
    Store::the().adopt(object, arena);
}

} // namespace host
