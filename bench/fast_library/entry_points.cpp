// The entry points that benchmarks ask, over prepared answers.

#include "adapter/CIMProviderZntj.h"
#include "bench/fast_library/Storage.h"

#include <map>

using namespace KPRV;
using namespace KPRV::bench;

static const Storage* storage;

#pragma GCC visibility push(default)
extern "C" {

void prepare_storage(const Storage_Size& size)
{
    static std::map<Storage_Size, Storage>& prepared = *new std::map<Storage_Size, Storage>;
    storage = &prepared.try_emplace(size, size).first->second;
}

Json::Value init_hba_lib(const Json::Value&)
{
    Json::Value answer;
    answer["result"] = 0;
    return answer;
}

uint32 getNumberOfAdapters()
{
    return 1;
}

Json::Value getAllAdaptersIndexString(const Json::Value&)
{
    return storage->adapters;
}

Json::Value getFcPhyPortIndicesByAdapter(const Json::Value& request)
{
    return storage->ports_of(request["indexStr"]);
}

Json::Value getPortByWwn(const Json::Value& request)
{
    return storage->port(request["wwn"]);
}

Json::Value getAllRemotePorts(const Json::Value& request)
{
    return storage->remote_ports_of(request["pPortWwn"]);
}

Json::Value getCompleteRemotePort(const Json::Value& request)
{
    return storage->remote_port(request["rPortWwn"]);
}

} // extern "C"
#pragma GCC visibility pop
