#pragma once

#include "runtime/Time.h"

namespace KPRV {

/// How the delivery thread waits between two passes. Nothing in the product changes it; a test puts its own
/// in its place.
struct Delivery_Pace
{
    void (*sleep)(uint64 microseconds);
};

extern Delivery_Pace delivery_pace;

} // namespace KPRV
