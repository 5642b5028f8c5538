#include "module/runtime/objects/Meta_Property.h"

#include "module/runtime/ground/type_dispatch.h"
#include "module/runtime/objects/features.h"

#include <cstring>

namespace KPRV {

bool property_eq(const Meta_Property* mp, const void* a, const void* b)
{
    const uint32 at = null_offset(mp);
    if (static_cast<const uint8*>(a)[at] != static_cast<const uint8*>(b)[at])
        return false;
    // The values count also when both are null: `clear` leaves them equal.
    if (mp->subscript)
        return __equal(static_cast<const __Array*>(a)->rep, static_cast<const __Array*>(b)->rep);
    return visit_type(static_cast<Type>(mp->type), [a, b](auto tag) {
        using T = typename decltype(tag)::type;
        return *static_cast<const T*>(a) == *static_cast<const T*>(b);
    });
}

} // namespace KPRV
