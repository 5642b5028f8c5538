#include "agent/MethodRegistration.h"

#include "agent/JsonRpcManager.h"
#include "agent/ProviderDiscoveryMethods.h"

namespace KPRV {

void MethodRegistration::registerMethods()
{
    ProviderDiscoveryMethods::registerMethods(*JsonRpcManager::instance());
}

} // namespace KPRV
