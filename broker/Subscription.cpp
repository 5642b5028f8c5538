#include "broker/Subscription.h"

namespace KPRV::broker {

Subscription::Subscription(Local_Server& server, std::string provider_class)
    : _server(server), _class(std::move(provider_class))
{
}

Subscription::~Subscription()
{
    while (!_filters.empty())
        remove(std::string(_filters.begin()->first));
}

CMPIrc Subscription::add(const std::string& name_space)
{
    if (const CMPIrc rc = _server.authorize_filter(_class, name_space); rc != CMPI_RC_OK)
        return rc;
    // The answer would only tell a server to poll by itself, which none does.
    _server.must_poll(_class, name_space);
    const bool is_first_of_all = _filters.empty();
    if (const CMPIrc rc = _server.activate_filter(_class, name_space, count(name_space) == 0);
        rc != CMPI_RC_OK)
        return rc;
    ++_filters[name_space];
    const CMPIrc rc = is_first_of_all ? _server.enable_indications(_class) : CMPI_RC_OK;
    if (rc != CMPI_RC_OK)
        remove(name_space);
    return rc;
}

CMPIrc Subscription::remove(const std::string& name_space)
{
    if (count(name_space) == 0)
        return CMPI_RC_ERR_NOT_FOUND;
    const bool is_last_of_all = _filters.size() == 1 && count(name_space) == 1;
    const CMPIrc disabled = is_last_of_all ? _server.disable_indications(_class) : CMPI_RC_OK;
    const CMPIrc deactivated = deactivate(name_space);
    return disabled != CMPI_RC_OK ? disabled : deactivated;
}

CMPIrc Subscription::deactivate(const std::string& name_space)
{
    const auto filter = _filters.find(name_space);
    const bool is_last = --filter->second == 0;
    if (is_last)
        _filters.erase(filter);
    return _server.deactivate_filter(_class, name_space, is_last);
}

unsigned Subscription::count(const std::string& name_space) const
{
    const auto filter = _filters.find(name_space);
    return filter == _filters.end() ? 0 : filter->second;
}

} // namespace KPRV::broker
