// The objects of alerts that live as long as the module, and their place among its statics.
#include "module/alerts/IndicationHelper.h"
#include "module/alerts/IndicationManager.h"

namespace KPRV {

// They stand before the start-up object of the adapter library, whatever the order of linking, so that they
// are still there when that one takes leave of the library: until then it may deliver an event.
[[gnu::init_priority(60000)]] IndicationHelper gIndicationHelperObj;
[[gnu::init_priority(60001)]] IndicationManager gIndicationManagerObj;

} // namespace KPRV
