#include "module/agent/MethodRegistration.h"

#include "module/agent/JsonRpcManager.h"
#include "module/agent/ProviderDiscoveryMethods.h"

namespace KPRV {

void MethodRegistration::registerMethods()
{
    ProviderDiscoveryMethods::registerMethods(*JsonRpcManager::instance());
}

} // namespace KPRV
