#include "module/adapter/Ethernet_Port_Query.h"

#include "module/adapter/Guarded_Call.h"
#include "module/adapter/Json_Access.h"
#include "module/adapter/ProviderUtil.h"

namespace KPRV {

int query_ethernet_port(Call_Site site, const String& mac, Json::Value& out)
{
    Log_Scope scope("getEthPortDetails", site);
    const char* address = mac.c_str();
    const Guarded_Entry entry = {"libGetEthPortByEthMac", address, address};
    out = Json::Value();
    const bool answered = guarded(site, entry, [&] {
        Json::Value request(Json::objectValue);
        request["mac"] = ProviderUtil::getIndexInColonFormat(mac).c_str();
        out = libGetEthPortByEthMac(request);
    });
    if (!answered)
        return -1;
    if (ProviderUtil::isValidJsonResponse(out) && hasMember(out, "ethData") &&
        isObjectOrNull(member(out, "ethData")))
        return 0;
    LOG_LINE(ERR, site.file, site.line, "Ethernet Port Info is NOT available");
    return -1;
}

} // namespace KPRV
