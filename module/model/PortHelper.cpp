#include "module/model/PortHelper.h"

#include "module/adapter/Guarded_Call.h"
#include "module/adapter/Json_Access.h"
#include "module/adapter/ProviderUtil.h"
#include "module/model/Adapter_Walk.h"

namespace KPRV {

/// The walk over an adapter's ports tells its failures in different words, by what the adapter was asked for.
struct PortHelper::Walk_Words
{
    const char* bad_answer;
    const char* no_list;
    const char* no_array;
    /// Null: a port that cannot be read is left out without a word.
    const char* bad_port;
};

constinit const PortHelper::Walk_Words PortHelper::by_id_words = {
    "libGetFcPhyPortIndicesByAdapter returns NULL.",
    "libGetFcPhyPortIndicesByAdapter returns NULL.",
    "libGetFcPhyPortIndicesByAdapter returns NULL.",
    nullptr,
};
constinit const PortHelper::Walk_Words PortHelper::by_address_words = {
    "libGetFcPhyPortIndicesByAdapter returns NULL",
    "indexStrings is not member",
    "indexString not Array",
    "libGetPortByWwn response is null or has error",
};

/// One walk over ports. The request is made once: only the address in it changes.
struct PortHelper::Walk
{
    classId_t id;
    const Walk_Words& words;
    const Wanted& wanted;
    Host_Name host = Host_Name(256);
    Json::Value request = Json::Value(Json::objectValue);
    Json::Value& address = request["wwn"];
};

PortHelper::PortHelper() : _life("PortHelper", LOG_HERE) {}

PortHelper* PortHelper::getPortHelperObject()
{
    static PortHelper helper;
    return &helper;
}

Array<Instance*> PortHelper::getInstancesByClass(classId_t id, const Wanted& wanted) const
{
    LOG_SCOPE("getInstancesByClass");
    Walk walk = {.id = id, .words = by_id_words, .wanted = wanted};
    return walk_adapters(LOG_HERE, [&](int adapter_id, const Json::Value& list, Fresh_Instances& instances) {
        walk_adapter_by_id(adapter_id, list, walk, instances);
    });
}

Array<Instance*> PortHelper::getInstancesByAdapterId(int adapter_id, classId_t id,
                                                     const Json::Value& adapters) const
{
    Fresh_Instances instances;
    const Wanted everything;
    Walk walk = {.id = id, .words = by_id_words, .wanted = everything};
    walk_adapter_by_id(adapter_id, member(adapters, "indexStrings"), walk, instances);
    return instances.release();
}

void PortHelper::walk_adapter_by_id(int adapter_id, const Json::Value& list, Walk& walk,
                                    Fresh_Instances& instances) const
{
    LOG_SCOPE("getInstancesByAdapterId");
    const String index = adapter_address(LOG_HERE, list, static_cast<unsigned>(adapter_id - 1));
    walk_adapter(index, walk, instances);
}

Array<Instance*> PortHelper::getInstancesByAdapterAddress(const String& address, classId_t id,
                                                          const Wanted& wanted) const
{
    LOG_SCOPE("getInstancesByAdapterAddress");
    String index;
    if (!guarded(LOG_HERE, {"libGetFcPhyPortIndicesByAdapter"},
                 [&] { index = ProviderUtil::getIndexInColonFormat(address); }))
        return {};
    Fresh_Instances instances;
    Walk walk = {.id = id, .words = by_address_words, .wanted = wanted};
    walk_adapter(index, walk, instances);
    return instances.release();
}

Array<Instance*> PortHelper::getFCPortInstancesByAdapter(const String& address, const Wanted& wanted) const
{
    LOG_SCOPE("getFCPortInstancesByAdapter");
    LOG(DBG, "getFCPortInstancesByAdapter invoked with address= %s", address.c_str());
    return getInstancesByAdapterAddress(address, FCPORT, wanted);
}

void PortHelper::walk_adapter(const String& index, Walk& walk, Fresh_Instances& instances) const
{
    Json::Value request(Json::objectValue), answer;
    request["indexStr"] = index.c_str();
    if (!guarded_call(LOG_HERE, {"libGetFcPhyPortIndicesByAdapter"}, libGetFcPhyPortIndicesByAdapter, request,
                      answer))
        return;
    const Address_List told(answer);
    auto* const ports = const_cast<Json::Value*>(told.list());
    const char* failure = !told.is_valid()         ? walk.words.bad_answer
                          : !ports                 ? walk.words.no_list
                          : !isArrayOrNull(*ports) ? walk.words.no_array
                                                   : nullptr;
    if (failure) {
        LOG(ERR, "%s", failure);
        return;
    }
    LOG(DBG, "numOfPorts = %u", ports->size());
    // The requests take the addresses out of it.
    Element_Walk addresses(*ports);
    for (unsigned number = 0; number < ports->size(); number++)
        walk_port(addresses.next(), static_cast<sint32>(number), walk, instances);
}

void PortHelper::walk_port(Json::Value& address, sint32 number, Walk& walk, Fresh_Instances& instances) const
{
    if (!guarded(LOG_HERE, {"libGetFcPhyPortIndicesByAdapter"}, [&] { take_text(address, walk.address); }))
        return;
    bool answered;
    const Json::Value answer =
        guarded_answer(LOG_HERE, {"libGetPortByWwn"}, libGetPortByWwn, walk.request, answered);
    if (!answered)
        return;
    _hbaPortInfo port;
    bool is_valid = false;
    if (!guarded(LOG_HERE, {"libGetPortByWwn"},
                 [&] { is_valid = fill_port(answer, number, walk.host, port); }))
        return;
    if (is_valid)
        publish(walk.id, walk.wanted, answer, port, instances);
    else if (walk.words.bad_port)
        LOG(ERR, "%s", walk.words.bad_port);
}

} // namespace KPRV
