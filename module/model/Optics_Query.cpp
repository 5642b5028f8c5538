#include "module/model/Optics_Query.h"

#include "module/adapter/Guarded_Call.h"
#include "module/adapter/Json_Access.h"
#include "module/adapter/ProviderUtil.h"

namespace KPRV {

int query_optics(Call_Site site, const String& address, const char* needed, Json::Value& out)
{
    out = Json::Value();
    const bool answered = guarded(site, {"libGetOpticsSFP", address.c_str()}, [&] {
        Json::Value request(Json::objectValue);
        request["indexStr"] = ProviderUtil::getIndexInColonFormat(address).c_str();
        out = libGetOpticsSFP(request);
    });
    if (!answered)
        return -1;
    if (ProviderUtil::isValidJsonResponse(out) && (!needed || hasMember(out, needed)))
        return 0;
    LOG_LINE(ERR, site.file, site.line, "Unable to get SFP info for %s", address.c_str());
    return -1;
}

} // namespace KPRV
