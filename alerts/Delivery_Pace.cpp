#include "alerts/Delivery_Pace.h"

namespace KPRV {

constinit Delivery_Pace delivery_pace = {Time::sleep};

} // namespace KPRV
