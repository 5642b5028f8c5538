#pragma once

#include "broker/values/Plain_Value.h"

namespace KPRV::broker {

/// Stands for a path where an index of millions has no room for its identity: equal for two paths if
/// `same_object` holds for them, and otherwise equal by an accident of 1 in 2^128. Another one in each
/// process, so that nobody can look for such an accident beforehand.
struct Path_Digest
{
    std::uint64_t high = 0;
    std::uint64_t low = 0;

    friend bool operator==(const Path_Digest&, const Path_Digest&) = default;
};

Path_Digest path_digest(const Path_Value& path);

} // namespace KPRV::broker

/// A digest is as good as a hash can be.
template <>
struct std::hash<KPRV::broker::Path_Digest>
{
    std::size_t operator()(const KPRV::broker::Path_Digest& digest) const
    {
        return static_cast<std::size_t>(digest.low);
    }
};
