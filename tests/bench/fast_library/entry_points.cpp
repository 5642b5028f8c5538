// The entry points that benchmarks ask, over prepared answers.

#include "module/adapter/CIMProviderZntj.h"
#include "tests/bench/fast_library/Storage.h"

#include <map>

using namespace KPRV;
using namespace KPRV::bench;

static const Storage* storage;
static evtProcessCB event_callback;
static Recorded_Calls* recorded;

/// Takes note of a call, if somebody records: made again, it produces the same answer and destroys it.
static void note(JsonReqFP entry_point, const Json::Value& request)
{
    if (recorded)
        recorded->push_back([entry_point, request] { entry_point(request); });
}

/// Texts and numbers by turns, as the library's larger answers have them.
static Json::Value members(int count)
{
    Json::Value answer;
    for (int i = 0; i < count; i++) {
        Json::Value& member = answer["member" + std::to_string(i)];
        if (i % 2)
            member = i * 1000003;
        else
            member = "text of member " + std::to_string(i);
    }
    return answer;
}

#pragma GCC visibility push(default)
extern "C" {

void prepare_storage(const Storage_Size& size)
{
    static std::map<Storage_Size, Storage>& prepared = *new std::map<Storage_Size, Storage>;
    storage = &prepared.try_emplace(size, size).first->second;
}

void record_calls(Recorded_Calls* calls)
{
    recorded = calls;
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

Json::Value getServerTime(const Json::Value&)
{
    return Json::Value(Json::objectValue);
}

/// An object of the size that the request names.
Json::Value getFcByFcWwn(const Json::Value& request)
{
    static const std::map<std::string, Json::Value>& answers = *new std::map<std::string, Json::Value>{
        {"25 members", members(25)},
        {"30 KB", members(750)},
    };
    return answers.at(request["wwn"].asString());
}

void registerEventProcessingCb(evtProcessCB callback)
{
    event_callback = callback;
}

Json::Value register_for_events(const Json::Value&)
{
    Json::Value answer;
    answer["result"] = 0;
    return answer;
}

Json::Value unregister_for_events(const Json::Value&)
{
    return register_for_events({});
}

void send_event(const char* text)
{
    if (event_callback)
        event_callback(text);
}

Json::Value getAllAdaptersIndexString(const Json::Value& request)
{
    note(getAllAdaptersIndexString, request);
    return storage->adapters;
}

Json::Value getHbaByWwn(const Json::Value& request)
{
    note(getHbaByWwn, request);
    return storage->adapter(request["wwn"]);
}

Json::Value getFcPhyPortIndicesByAdapter(const Json::Value& request)
{
    note(getFcPhyPortIndicesByAdapter, request);
    return storage->ports_of(request["indexStr"]);
}

Json::Value getPortByWwn(const Json::Value& request)
{
    note(getPortByWwn, request);
    return storage->port(request["wwn"]);
}

Json::Value getAllRemotePorts(const Json::Value& request)
{
    note(getAllRemotePorts, request);
    return storage->remote_ports_of(request["pPortWwn"]);
}

Json::Value getCompleteRemotePort(const Json::Value& request)
{
    note(getCompleteRemotePort, request);
    return storage->remote_port(request["rPortWwn"]);
}

} // extern "C"
#pragma GCC visibility pop
