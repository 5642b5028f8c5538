#pragma once

#include "module/managers/FCHBAManager.h"
#include "module/managers/HDRManager.h"
#include "module/managers/ServerManager.h"

namespace KPRV {

// Where the lists come from. The caller owns the elements; a null stands for one that is not wanted.

inline Array<Instance*> fc_hba_instances(classId_t id, const Wanted& wanted = {})
{
    return FCHBAManager::getFCHBAManager()->getInstances(id, wanted);
}

inline Array<Instance*> hdr_instances(classId_t id, const Wanted& wanted = {})
{
    return HDRManager::getHDRManager()->getInstances(id, wanted);
}

inline Array<Instance*> server_instances(classId_t id)
{
    return ServerManager::getServerManager()->getInstances(id);
}

inline Array<Instance*> fc_ports_of(const String& adapter_address, const Wanted& wanted = {})
{
    return FCHBAManager::getFCHBAManager()->getFCPortInstancesByAdapter(adapter_address, wanted);
}

inline Array<Instance*> ethernet_ports_of(const String& adapter_address, const Wanted& wanted = {})
{
    return FCHBAManager::getFCHBAManager()->getEthernetPortInstancesByAdapter(adapter_address, wanted);
}

} // namespace KPRV
