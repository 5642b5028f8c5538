#pragma once

#include <cstddef>
#include <cstdint>

namespace KPRV {

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

/// Answer of the text searches for "nothing found", and the length that means "up to the end".
inline constexpr uint32 NPOS = ~uint32(0);

/// The CIM scalar types, with the codes that the metadata tables hold.
enum Type : uint16
{
    BOOLEAN = 0,
    UINT8 = 1,
    SINT8 = 2,
    UINT16 = 3,
    SINT16 = 4,
    UINT32 = 5,
    SINT32 = 6,
    UINT64 = 7,
    SINT64 = 8,
    REAL32 = 9,
    REAL64 = 10,
    CHAR16 = 11,
    STRING = 12,
    DATETIME = 13,
};

inline constexpr uint32 NUM_TYPES = 14;

/// Names of the types as MOF writes them, by code.
extern const char* const type_name[NUM_TYPES];

/// Bytes of a scalar in an instance, by code. A string or datetime is one handle, the size of a pointer.
extern const uint32 type_size[NUM_TYPES];

/// Bytes of a default-value literal, by code; the same figures as `type_size`.
extern const uint32 literal_type_size[NUM_TYPES];

/// Finds the code of a MOF type name, whatever its case. 0 and `type` set; -1 for an unknown or empty name.
int type_name_to_type(const char* name, Type& type);

} // namespace KPRV
