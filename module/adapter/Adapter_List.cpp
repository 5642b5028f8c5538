#include "module/adapter/Adapter_List.h"

#include "module/adapter/Guarded_Call.h"
#include "module/adapter/Json_Access.h"
#include "module/adapter/ProviderUtil.h"

namespace KPRV {

const Json::Value* query_adapter_list(Call_Site site, Json::Value& response)
{
    response = libGetAllAdaptersIndexString(Json::Value());
    if (ProviderUtil::isValidJsonResponse(response)) {
        const Json::Value* const list = find_member(response, "indexStrings");
        if (list && isArrayOrNull(*list))
            return list;
    }
    LOG_LINE(ERR, site.file, site.line, "libGetAllAdaptersIndexString returns NULL.");
    return nullptr;
}

String adapter_address(Call_Site site, const Json::Value& list, unsigned index)
{
    String address;
    guarded(site, {"libGetAllAdaptersIndexString"},
            [&] { address = asString(element(list, index)).c_str(); });
    return address;
}

} // namespace KPRV
