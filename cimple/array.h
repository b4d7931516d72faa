// Arrays of property values: an untyped core driven by traits, and a thin typed wrapper.
//
// One handle. The array owns its elements: copying it copies every element by its traits. Elements
// of an array of references are plain pointers that the array does not count. An empty array that
// was never written to owns no memory. Allocation failure throws std::bad_alloc and changes
// nothing.
#ifndef CIMPLE_ARRAY_H
#define CIMPLE_ARRAY_H

#include "cimple/types.h"

#include <initializer_list>

namespace cimple {

class String;
class Datetime;
struct Instance;
struct Array_Rep; // traits, size, capacity, elements

// All elements are relocatable: the core moves them by their bytes.
struct Array_Traits {
    uint32 size;                                   // bytes of an element
    void (*construct)(void* to, const void* from); // null: plain copy
    void (*destruct)(void* element);               // null: nothing
    bool (*equal)(const void* a, const void* b);   // null: byte comparison
};

// The traits of a type code; TYPE_INSTANCE gives those of instance pointers.
const Array_Traits* array_traits(uint32 type);

class Array_Base {
public:
    explicit Array_Base(const Array_Traits* traits) noexcept; // one that array_traits gave
    Array_Base(const Array_Base& other);
    Array_Base(Array_Base&& other) noexcept;
    ~Array_Base();
    Array_Base& operator=(const Array_Base& other);
    Array_Base& operator=(Array_Base&& other) noexcept;

    uint32 size() const noexcept;
    uint32 capacity() const noexcept;
    bool empty() const noexcept { return size() == 0; }
    const void* data() const noexcept;
    void* data() noexcept; // makes the elements writable in place

    // Items may be elements of this array. A position behind the end means the end.
    void reserve(uint32 capacity); // exactly that many when it exceeds the present capacity
    void insert(uint32 position, const void* items, uint32 count);
    void append(const void* items, uint32 count);
    void prepend(const void* items, uint32 count);
    void remove(uint32 position, uint32 count = 1);
    void resize(uint32 count, const void* fill);
    void assign(const void* items, uint32 count);
    void clear() noexcept;
    sint32 find(const void* item) const noexcept; // index or -1
    void swap(Array_Base& other) noexcept;
    bool equal(const Array_Base& other) const noexcept; // sizes first

    const Array_Traits* traits() const noexcept;

private:
    void make_room(uint32 count);

    Array_Rep* _rep;
};

// Type code of a C++ value type; pointers to instances are TYPE_INSTANCE.
template <class T>
struct Type_Of;
template <>
struct Type_Of<boolean> {
    static constexpr Type code = TYPE_BOOLEAN;
};
template <>
struct Type_Of<uint8> {
    static constexpr Type code = TYPE_UINT8;
};
template <>
struct Type_Of<sint8> {
    static constexpr Type code = TYPE_SINT8;
};
template <>
struct Type_Of<uint16> {
    static constexpr Type code = TYPE_UINT16;
};
template <>
struct Type_Of<sint16> {
    static constexpr Type code = TYPE_SINT16;
};
template <>
struct Type_Of<uint32> {
    static constexpr Type code = TYPE_UINT32;
};
template <>
struct Type_Of<sint32> {
    static constexpr Type code = TYPE_SINT32;
};
template <>
struct Type_Of<uint64> {
    static constexpr Type code = TYPE_UINT64;
};
template <>
struct Type_Of<sint64> {
    static constexpr Type code = TYPE_SINT64;
};
template <>
struct Type_Of<real32> {
    static constexpr Type code = TYPE_REAL32;
};
template <>
struct Type_Of<real64> {
    static constexpr Type code = TYPE_REAL64;
};
template <>
struct Type_Of<char16> {
    static constexpr Type code = TYPE_CHAR16;
};
template <>
struct Type_Of<String> {
    static constexpr Type code = TYPE_STRING;
};
template <>
struct Type_Of<Datetime> {
    static constexpr Type code = TYPE_DATETIME;
};
template <class T>
struct Type_Of<T*> {
    static constexpr Type code = TYPE_INSTANCE;
};

template <class T>
class Array : public Array_Base {
public:
    Array() noexcept : Array_Base(array_traits(Type_Of<T>::code)) {}
    Array(std::initializer_list<T> items) : Array() {
        Array_Base::append(items.begin(), static_cast<uint32>(items.size()));
    }

    const T& operator[](uint32 index) const noexcept { return begin()[index]; }
    T& operator[](uint32 index) noexcept { return begin()[index]; }
    const T* begin() const noexcept { return static_cast<const T*>(data()); }
    const T* end() const noexcept { return begin() + size(); }
    T* begin() noexcept { return static_cast<T*>(data()); }
    T* end() noexcept { return begin() + size(); }

    void append(const T& item) { Array_Base::append(&item, 1); }
    void prepend(const T& item) { Array_Base::prepend(&item, 1); }
    void insert(uint32 position, const T& item) { Array_Base::insert(position, &item, 1); }
    void resize(uint32 count, const T& fill) { Array_Base::resize(count, &fill); }
    sint32 find(const T& item) const noexcept { return Array_Base::find(&item); }
    bool operator==(const Array& other) const noexcept { return equal(other); }
};

} // namespace cimple

#endif // CIMPLE_ARRAY_H
