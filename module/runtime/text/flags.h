#pragma once

#include "module/runtime/ground/Types.h"

namespace KPRV {

/// The flag word of every metadata record: one bit per name of `flag_names`, in that order.
enum Flag : uint32
{
    FLAG_PROPERTY = 1u << 0,
    FLAG_REFERENCE = 1u << 1,
    FLAG_METHOD = 1u << 2,
    FLAG_CLASS = 1u << 3,
    FLAG_ABSTRACT = 1u << 4,
    FLAG_AGGREGATE = 1u << 5,
    FLAG_AGGREGATION = 1u << 6,
    FLAG_ASSOCIATION = 1u << 7,
    FLAG_COMPOSITION = 1u << 8,
    FLAG_COUNTER = 1u << 9,
    FLAG_DELETE = 1u << 10,
    FLAG_DN = 1u << 11,
    FLAG_EMBEDDED_OBJECT = 1u << 12,
    FLAG_EXCEPTION = 1u << 13,
    FLAG_EXPENSIVE = 1u << 14,
    FLAG_EXPERIMENTAL = 1u << 15,
    FLAG_GAUGE = 1u << 16,
    FLAG_IF_DELETED = 1u << 17,
    FLAG_IN = 1u << 18,
    FLAG_INDICATION = 1u << 19,
    FLAG_INVISIBLE = 1u << 20,
    FLAG_KEY = 1u << 21,
    FLAG_LARGE = 1u << 22,
    FLAG_OCTET_STRING = 1u << 23,
    FLAG_OUT = 1u << 24,
    FLAG_READ = 1u << 25,
    FLAG_REQUIRED = 1u << 26,
    FLAG_STATIC = 1u << 27,
    FLAG_TERMINAL = 1u << 28,
    FLAG_WEAK = 1u << 29,
    FLAG_WRITE = 1u << 30,
    FLAG_EMBEDDED_INSTANCE = 1u << 31,
};

/// Mask of the look-ups that take any kind of feature.
inline constexpr uint32 ANY_FEATURE = FLAG_PROPERTY | FLAG_REFERENCE | FLAG_METHOD;

inline constexpr uint32 FLAG_EMBEDDED = FLAG_EMBEDDED_OBJECT | FLAG_EMBEDDED_INSTANCE;

inline constexpr uint32 num_flag_names = 32;
extern const char* const flag_names[num_flag_names];

/// Bit number of a flag name, whatever its case; -1 if there is none.
sint32 flag_name_to_index(const char* name);

} // namespace KPRV
