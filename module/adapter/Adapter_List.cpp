#include "module/adapter/Adapter_List.h"

#include "module/adapter/Guarded_Call.h"

namespace KPRV {

const Json::Value* query_adapter_list(Call_Site site, Json::Value& response)
{
    response = libGetAllAdaptersIndexString(Json::Value());
    const Address_List told(response);
    if (told.is_valid() && told.list() && isArrayOrNull(*told.list()))
        return told.list();
    LOG_LINE(ERR, site.file, site.line, "libGetAllAdaptersIndexString returns NULL.");
    return nullptr;
}

String adapter_address(Call_Site site, const Json::Value& list, unsigned index)
{
    String address;
    guarded(site, {"libGetAllAdaptersIndexString"}, [&] {
        const std::string_view text = asView(element(list, index));
        address.assign(text.data(), text.substr(0, text.find('\0')).size());
    });
    return address;
}

} // namespace KPRV
