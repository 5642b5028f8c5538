#include "module/adapter/ProviderInit.h"

namespace KPRV {

ProviderInit gProviderInit;

} // namespace KPRV
