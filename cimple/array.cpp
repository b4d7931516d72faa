#include "cimple/array.h"

#include "cimple/datetime.h"
#include "cimple/string.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <new>
#include <utility>

namespace cimple {

// The elements follow, aligned for every element type.
struct alignas(8) Array_Rep {
    const Array_Traits* traits;
    uint32 size;
    uint32 capacity;
};

namespace {

constexpr uint32 SMALLEST_CAPACITY = 8;
constexpr uint32 LARGEST_COUNT = 0x7FFFFFFF;

// The traits of a type with the one empty block of its arrays. The block is constant: whoever
// writes to an array first replaces it.
struct Element_Type {
    Array_Traits traits;
    Array_Rep empty;
};

template <class T>
void construct(void* to, const void* from) {
    new (to) T(*static_cast<const T*>(from));
}

template <class T>
void destruct(void* element) {
    static_cast<T*>(element)->~T();
}

template <class T>
bool equal_elements(const void* a, const void* b) {
    return *static_cast<const T*>(a) == *static_cast<const T*>(b);
}

constexpr Array_Traits plain(std::size_t size) {
    return {static_cast<uint32>(size), nullptr, nullptr, nullptr};
}

template <class T>
constexpr Array_Traits counted() {
    return {sizeof(T), construct<T>, destruct<T>, equal_elements<T>};
}

extern const Element_Type element_types[TYPE_INSTANCE + 1];

constexpr Element_Type row(uint32 type, const Array_Traits& traits) {
    return {traits, {&element_types[type].traits, 0, SMALLEST_CAPACITY}};
}

constinit const Element_Type element_types[TYPE_INSTANCE + 1] = {
    row(TYPE_BOOLEAN, plain(sizeof(boolean))),    row(TYPE_UINT8, plain(sizeof(uint8))),
    row(TYPE_SINT8, plain(sizeof(sint8))),        row(TYPE_UINT16, plain(sizeof(uint16))),
    row(TYPE_SINT16, plain(sizeof(sint16))),      row(TYPE_UINT32, plain(sizeof(uint32))),
    row(TYPE_SINT32, plain(sizeof(sint32))),      row(TYPE_UINT64, plain(sizeof(uint64))),
    row(TYPE_SINT64, plain(sizeof(sint64))),      row(TYPE_REAL32, plain(sizeof(real32))),
    row(TYPE_REAL64, plain(sizeof(real64))),      row(TYPE_CHAR16, plain(sizeof(char16))),
    row(TYPE_STRING, counted<String>()),          row(TYPE_DATETIME, counted<Datetime>()),
    row(TYPE_INSTANCE, plain(sizeof(Instance*))),
};

static_assert(offsetof(Element_Type, traits) == 0);

Array_Rep* empty_rep(const Array_Traits* traits) {
    return const_cast<Array_Rep*>(&reinterpret_cast<const Element_Type*>(traits)->empty);
}

bool is_empty_rep(const Array_Rep* rep) {
    return rep == empty_rep(rep->traits);
}

char* element(Array_Rep* rep, std::size_t index) {
    return reinterpret_cast<char*>(rep) + sizeof(Array_Rep) + index * rep->traits->size;
}

Array_Rep* allocate(const Array_Traits* traits, uint32 capacity) {
    if (capacity > LARGEST_COUNT || capacity > (SIZE_MAX - sizeof(Array_Rep)) / traits->size)
        throw std::bad_alloc();
    void* block = std::malloc(sizeof(Array_Rep) + std::size_t{capacity} * traits->size);
    if (!block)
        throw std::bad_alloc();
    return new (block) Array_Rep{traits, 0, capacity};
}

void construct_all(const Array_Traits* traits, char* to, const void* from, uint32 count) {
    const char* item = static_cast<const char*>(from);
    if (!traits->construct) {
        std::memcpy(to, item, std::size_t{count} * traits->size);
        return;
    }
    for (; count > 0; --count, to += traits->size, item += traits->size)
        traits->construct(to, item);
}

void destruct_all(const Array_Traits* traits, char* first, uint32 count) {
    if (!traits->destruct)
        return;
    for (; count > 0; --count, first += traits->size)
        traits->destruct(first);
}

bool equal_items(const Array_Traits* traits, const void* a, const void* b) {
    return traits->equal ? traits->equal(a, b) : std::memcmp(a, b, traits->size) == 0;
}

} // namespace

const Array_Traits* array_traits(uint32 type) {
    return &element_types[std::min<uint32>(type, TYPE_INSTANCE)].traits;
}

Array_Base::Array_Base(const Array_Traits* traits) noexcept : _rep(empty_rep(traits)) {}

// Copies are kept by the thousand and hardly ever grow: they get no room to spare.
Array_Base::Array_Base(const Array_Base& other) : Array_Base(other.traits()) {
    if (other.size() != 0)
        _rep = allocate(other.traits(), other.size());
    append(other.data(), other.size());
}

Array_Base::Array_Base(Array_Base&& other) noexcept : Array_Base(other.traits()) {
    swap(other);
}

Array_Base::~Array_Base() {
    if (is_empty_rep(_rep))
        return;
    destruct_all(_rep->traits, element(_rep, 0), _rep->size);
    std::free(_rep);
}

Array_Base& Array_Base::operator=(const Array_Base& other) {
    if (this != &other)
        Array_Base(other).swap(*this);
    return *this;
}

Array_Base& Array_Base::operator=(Array_Base&& other) noexcept {
    Array_Base(std::move(other)).swap(*this);
    return *this;
}

uint32 Array_Base::size() const noexcept {
    return _rep->size;
}
uint32 Array_Base::capacity() const noexcept {
    return _rep->capacity;
}
const void* Array_Base::data() const noexcept {
    return element(_rep, 0);
}
void* Array_Base::data() noexcept {
    return element(_rep, 0);
}
const Array_Traits* Array_Base::traits() const noexcept {
    return _rep->traits;
}

void Array_Base::swap(Array_Base& other) noexcept {
    std::swap(_rep, other._rep);
}

void Array_Base::reserve(uint32 capacity) {
    if (capacity <= _rep->capacity)
        return;
    Array_Rep* grown = allocate(_rep->traits, capacity);
    std::memcpy(element(grown, 0), element(_rep, 0), std::size_t{_rep->size} * _rep->traits->size);
    grown->size = _rep->size;
    if (!is_empty_rep(_rep))
        std::free(_rep);
    _rep = grown;
}

// Doubles, so that building an array item by item stays linear.
void Array_Base::make_room(uint32 count) {
    if (count > LARGEST_COUNT - _rep->size)
        throw std::bad_alloc();
    const uint32 wanted = _rep->size + count;
    if (is_empty_rep(_rep))
        _rep = allocate(_rep->traits, std::max(wanted, SMALLEST_CAPACITY));
    else if (wanted > _rep->capacity)
        reserve(std::max(wanted, std::min(_rep->capacity * 2, LARGEST_COUNT)));
}

void Array_Base::insert(uint32 position, const void* items, uint32 count) {
    if (count == 0)
        return;
    const auto first = reinterpret_cast<std::uintptr_t>(element(_rep, 0));
    const auto end = reinterpret_cast<std::uintptr_t>(element(_rep, _rep->size));
    const auto item = reinterpret_cast<std::uintptr_t>(items);
    if (item >= first && item < end) {
        Array_Base copy(traits());
        copy.insert(0, items, count);
        insert(position, copy.data(), count);
        return;
    }
    make_room(count);
    position = std::min(position, _rep->size);
    std::memmove(element(_rep, std::size_t{position} + count), element(_rep, position),
                 std::size_t{_rep->size - position} * _rep->traits->size);
    construct_all(_rep->traits, element(_rep, position), items, count);
    _rep->size += count;
}

void Array_Base::append(const void* items, uint32 count) {
    insert(size(), items, count);
}

void Array_Base::prepend(const void* items, uint32 count) {
    insert(0, items, count);
}

void Array_Base::remove(uint32 position, uint32 count) {
    if (position >= _rep->size || count == 0)
        return;
    count = std::min(count, _rep->size - position);
    destruct_all(_rep->traits, element(_rep, position), count);
    std::memmove(element(_rep, position), element(_rep, std::size_t{position} + count),
                 std::size_t{_rep->size - position - count} * _rep->traits->size);
    _rep->size -= count;
}

void Array_Base::resize(uint32 count, const void* fill) {
    if (count <= size()) {
        remove(count, size() - count);
        return;
    }
    Array_Base grown(traits());
    grown.reserve(count);
    grown.append(data(), size());
    while (grown.size() < count)
        grown.append(fill, 1);
    swap(grown);
}

void Array_Base::assign(const void* items, uint32 count) {
    Array_Base copy(traits());
    copy.append(items, count);
    swap(copy);
}

void Array_Base::clear() noexcept {
    Array_Base(traits()).swap(*this);
}

sint32 Array_Base::find(const void* item) const noexcept {
    for (uint32 i = 0; i < size(); ++i) {
        if (equal_items(traits(), element(_rep, i), item))
            return static_cast<sint32>(i);
    }
    return -1;
}

bool Array_Base::equal(const Array_Base& other) const noexcept {
    if (size() != other.size() || traits() != other.traits())
        return false;
    if (!traits()->equal)
        return size() == 0 ||
               std::memcmp(data(), other.data(), std::size_t{size()} * traits()->size) == 0;
    for (uint32 i = 0; i < size(); ++i) {
        if (!traits()->equal(element(_rep, i), element(other._rep, i)))
            return false;
    }
    return true;
}

} // namespace cimple
