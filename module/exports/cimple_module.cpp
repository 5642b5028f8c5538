// The one symbol by which a server that knows the module finds its list of providers.
#include "module/runtime/dispatch/Registration.h"

namespace KPRV {
extern const Registration* _cimple_registration_head;
}

/// The head of the registration list: how a host that knows this module finds its providers.
extern "C" __attribute__((visibility("default"))) const KPRV::Registration* cimple_module()
{
    return KPRV::_cimple_registration_head;
}
