#pragma once

#include "module/managers/FCHBAManager.h"
#include "module/managers/HDRManager.h"
#include "module/managers/ServerManager.h"

namespace KPRV {

// Where the lists come from. The caller owns the elements.

inline Array<Instance*> fc_hba_instances(classId_t id)
{
    return FCHBAManager::getFCHBAManager()->getInstances(id);
}

inline Array<Instance*> hdr_instances(classId_t id)
{
    return HDRManager::getHDRManager()->getInstances(id);
}

inline Array<Instance*> server_instances(classId_t id)
{
    return ServerManager::getServerManager()->getInstances(id);
}

inline Array<Instance*> fc_ports_of(const String& adapter_address)
{
    return FCHBAManager::getFCHBAManager()->getFCPortInstancesByAdapter(adapter_address);
}

inline Array<Instance*> ethernet_ports_of(const String& adapter_address)
{
    return FCHBAManager::getFCHBAManager()->getEthernetPortInstancesByAdapter(adapter_address);
}

} // namespace KPRV
