#pragma once

#include "module/runtime/ground/Types.h"

namespace KPRV {

/// Reference counts are plain words so that records stay plain; these are the only two ways to change one.
inline void atomic_inc(sint32& count)
{
    __atomic_fetch_add(&count, 1, __ATOMIC_RELAXED);
}

/// True when this call took the count to 0: the caller then frees the object.
inline bool atomic_dec_and_test(sint32& count)
{
    return __atomic_sub_fetch(&count, 1, __ATOMIC_ACQ_REL) == 0;
}

/// The count as it stands. 1 means that the caller holds the only handle.
inline sint32 atomic_get(const sint32& count)
{
    return __atomic_load_n(&count, __ATOMIC_ACQUIRE);
}

/// As `atomic_dec_and_test`, for what nobody can find but through a counted handle: whoever holds the only
/// one need not lock the bus to give it up.
inline bool atomic_release(sint32& count)
{
    return atomic_get(count) == 1 || atomic_dec_and_test(count);
}

} // namespace KPRV
