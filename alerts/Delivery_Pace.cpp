#include "alerts/Delivery_Pace.h"

namespace KPRV {

constinit Delivery_Pace delivery_pace = {Time::monotonic, Time::sleep_until};

void Delivery_Passes::sleep_to_end()
{
    // From end to end, and not from now on: what the work takes and how late the thread wakes would add up,
    // and a burst would leave at less than 50 a second.
    _end += PERIOD;
    // Every pass has its sleep. What a stall took is not caught up with: the server would get all of it at
    // once.
    if (const uint64 now = delivery_pace.now(); _end <= now)
        _end = now + PERIOD;
    delivery_pace.sleep_until(_end);
}

} // namespace KPRV
