#include "module/model/Remote_Ports.h"

#include "module/adapter/Guarded_Call.h"
#include "module/adapter/ProviderUtil.h"

namespace KPRV {

Remote_Ports::Remote_Ports(Call_Site site, const char* port_wwn) : _request(Json::objectValue)
{
    // The index form is made inside the guard: a port without a WWN has no remote ports.
    const bool answered = guarded(site, {"libGetAllRemotePorts"}, [&] {
        const String index = ProviderUtil::getIndexInColonFormat(port_wwn);
        _request["pPortWwn"] = index.c_str();
        _request["lPortWwn"] = index.c_str();
        _list = libGetAllRemotePorts(_request);
        _elements = Element_Walk(_list);
    });
    if (answered && !listed())
        LOG_LINE(ERR, site.file, site.line, "libGetAllRemotePorts returns NULL.");
}

bool Remote_Ports::ask_next(Call_Site site, Json::Value& answer)
{
    Json::Value none;
    Json::Value* const listed_wwn = find_member(_elements.next(), "remotePortWwn");
    Json::Value& remote_wwn = listed_wwn ? *listed_wwn : none;
    _wwn.clear();
    if (!guarded(site, {"libGetAllRemotePorts"}, [&] { _wwn = asView(remote_wwn); }))
        return false;
    if (!_asked)
        _asked = &_request["rPortWwn"];
    // The request takes it out of the list.
    _asked->swap(remote_wwn);
    return guarded_call(site, {"libGetCompleteRemotePort"}, libGetCompleteRemotePort, _request, answer);
}

} // namespace KPRV
