#pragma once

#include "runtime/Time.h"

namespace KPRV {

/// The delivery thread's clock, in microseconds. Nothing in the product changes it; a test puts its own in
/// its place.
struct Delivery_Pace
{
    uint64 (*now)();
    void (*sleep_until)(uint64 moment);
};

extern Delivery_Pace delivery_pace;

/// The passes of the delivery thread: a period each, whatever their work takes of it.
class Delivery_Passes
{
public:
    static constexpr uint64 PERIOD = 20 * Time::MSEC;

    /// The first pass begins.
    Delivery_Passes() : _end(delivery_pace.now()) {}

    /// Sleeps to the end of the pass; the next one begins.
    void sleep_to_end();

private:
    uint64 _end;
};

} // namespace KPRV
