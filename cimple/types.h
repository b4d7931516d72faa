// The engine's scalar types: the fourteen CIM types and their codes.
//
// Everything in cimple/ is the object model in memory and its binding to CMPI; it knows nothing of
// adapters. Sizes follow the compiler: what is a 4-byte handle on i386 is an 8-byte one on x86-64.
#ifndef CIMPLE_TYPES_H
#define CIMPLE_TYPES_H

#include <atomic>
#include <cstddef>
#include <cstdint>

namespace cimple {

using boolean = bool;
using uint8 = std::uint8_t;
using sint8 = std::int8_t;
using uint16 = std::uint16_t;
using sint16 = std::int16_t;
using uint32 = std::uint32_t;
using sint32 = std::int32_t;
using uint64 = std::uint64_t;
using sint64 = std::int64_t;
using real32 = float;
using real64 = double;
using char16 = char16_t;

// A reference count. Static records hold 0 and are never counted.
using Atomic = std::atomic<uint32>;

// Type codes of properties and parameters (CIM Infrastructure, intrinsic types). TYPE_INSTANCE is
// the engine's own: references and embedded objects. An array is the element's code plus TYPE_ARRAY.
enum Type : sint32 {
    TYPE_NONE = -1,
    TYPE_BOOLEAN = 0,
    TYPE_UINT8 = 1,
    TYPE_SINT8 = 2,
    TYPE_UINT16 = 3,
    TYPE_SINT16 = 4,
    TYPE_UINT32 = 5,
    TYPE_SINT32 = 6,
    TYPE_UINT64 = 7,
    TYPE_SINT64 = 8,
    TYPE_REAL32 = 9,
    TYPE_REAL64 = 10,
    TYPE_CHAR16 = 11,
    TYPE_STRING = 12,
    TYPE_DATETIME = 13,
    TYPE_INSTANCE = 14,
};

inline constexpr sint32 TYPE_ARRAY = 0x80;
inline constexpr uint32 NUM_TYPES = 14;

} // namespace cimple

#endif // CIMPLE_TYPES_H
