// The object whose constructor opens and starts the adapter library, and whose destructor frees it; linked
// last.
#include "module/adapter/ProviderInit.h"

namespace KPRV {

ProviderInit gProviderInit;

} // namespace KPRV
