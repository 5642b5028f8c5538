// Of `PortHelper`, single questions about a port that others ask.
#include "module/adapter/Guarded_Call.h"
#include "module/adapter/Json_Access.h"
#include "module/adapter/ProviderUtil.h"
#include "module/model/Optics_Query.h"
#include "module/model/PortHelper.h"

namespace KPRV {

int PortHelper::getPortDetails(const String& address, Json::Value& out) const
{
    LOG_SCOPE("getPortDetails");
    constexpr uint32 FLAT_MAC_SIZE = 12;
    out = Json::Value();
    // The index form is made inside the guard, so that an address of one character is a failed lookup, too.
    const bool answered = guarded(LOG_HERE, {"libGetPortByWwn", address.c_str(), address.c_str()}, [&] {
        Json::Value request(Json::objectValue);
        request[address.size() == FLAT_MAC_SIZE ? "mac" : "wwn"] =
            ProviderUtil::getIndexInColonFormat(address).c_str();
        out = libGetPortByWwn(request);
    });
    if (!answered)
        return -1;
    if (!ProviderUtil::isValidJsonResponse(out)) {
        LOG(ERR, "Port Info is NOT available");
        return -1;
    }
    LOG(INFO, "getPortDetails success - %s", address.c_str());
    return 0;
}

bool PortHelper::isPortDisabled(const String& address) const
{
    LOG_SCOPE("isPortDisabled");
    Json::Value port;
    if (getPortDetails(address, port) != 0 || !hasMember(port, "portStatus")) {
        LOG(ERR, "Unable to get port status");
        return false;
    }
    return !asBool(port["portStatus"]);
}

int PortHelper::getNumberOfPorts(const String& adapter_address, Json::Value& out) const
{
    LOG_SCOPE("getNumberOfPorts");
    Json::Value request(Json::objectValue);
    request["indexStr"] = ProviderUtil::getIndexInColonFormat(adapter_address).c_str();
    out = libGetFcPhyPortIndicesByAdapter(request);
    if (!ProviderUtil::isValidJsonResponse(out) || !hasMember(out, "indexStrings") ||
        !isArrayOrNull(out["indexStrings"])) {
        LOG(ERR, "libGetFcPhyPortIndicesByAdapter returns NULL for %s", adapter_address.c_str());
        return -1;
    }
    const int count = static_cast<int>(out["indexStrings"].size());
    // It is ports that are counted; the log has always called them adapters.
    LOG(INFO, "Number of Adapters: %d", count);
    return count;
}

int PortHelper::getOpticsInfo(const String& address, Json::Value& out) const
{
    LOG_SCOPE("getOpticsInfo");
    return query_optics(LOG_HERE, address, nullptr, out);
}

} // namespace KPRV
