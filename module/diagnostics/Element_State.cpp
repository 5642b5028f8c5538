#include "module/diagnostics/Element_State.h"

#include "module/adapter/Guarded_Call.h"
#include "module/adapter/Json_Access.h"
#include "module/adapter/ProviderUtil.h"

namespace KPRV {

bool getAdapterStatus(const String& address)
{
    LOG_SCOPE("getAdapterStatus");
    constexpr uint32 MAC_INDEX_SIZE = 17;
    Json::Value answer;
    // The index form is made inside the guard, so that an address of one character is a failed query, too.
    guarded(LOG_HERE, {"libGetHbaByWwn"}, [&] {
        const String index = ProviderUtil::getIndexInColonFormat(address);
        Json::Value request(Json::objectValue);
        request[index.size() == MAC_INDEX_SIZE ? "mac" : "wwn"] = index.c_str();
        answer = libGetHbaByWwn(request);
    });
    const Json::Value& hba_data = member(answer, "hbaData");
    if (ProviderUtil::isValidJsonResponse(answer) && hasMember(hba_data, "hbaStatus")) {
        const bool enabled = asBool(member(hba_data, "hbaStatus"));
        LOG(INFO, "%s: adapter status is %d", "getAdapterStatus", enabled);
        return enabled;
    }
    LOG(ERR, "Unable to get adapater status");
    return false;
}

int setPortState(const String& index, bool enable)
{
    LOG_SCOPE("setPortState");
    Json::Value answer;
    guarded(LOG_HERE, {"libSetPortByWwn"}, [&] {
        Json::Value request(Json::objectValue);
        request["indexStr"] = index.c_str();
        request["port"]["portStatus"] = enable;
        request["propArray"].append("portStatus");
        answer = libSetPortByWwn(request);
    });
    if (!ProviderUtil::isValidJsonResponse(answer))
        return -1;
    LOG(INFO, "setPortState - %s %d", index.c_str(), hasMember(answer, "status"));
    return 0;
}

int setAdapterStatus(const String& address, bool enable)
{
    LOG_SCOPE("setAdapterStatus");
    Json::Value answer;
    guarded(LOG_HERE, {"libSetAdapterState", nullptr, address.c_str()}, [&] {
        Json::Value request(Json::objectValue);
        request["indexStr"] = ProviderUtil::getIndexInColonFormat(address).c_str();
        request["enableState"] = enable;
        answer = libSetAdapterState(request);
    });
    if (!ProviderUtil::isValidJsonResponse(answer))
        return -1;
    LOG(INFO, "setAdapterStatus success");
    return 0;
}

} // namespace KPRV
