#include "broker/Subscription.h"

namespace KPRV::broker {

Subscription::Subscription(Host& host, std::string provider_class)
    : host_(host), class_(std::move(provider_class))
{
}

Subscription::~Subscription()
{
    while (!filters_.empty())
        remove(std::string(filters_.begin()->first));
}

CMPIrc Subscription::add(const std::string& name_space)
{
    if (const CMPIrc rc = host_.authorize_filter(class_, name_space); rc != CMPI_RC_OK)
        return rc;
    // The answer would only tell a server to poll by itself, which none does.
    host_.must_poll(class_, name_space);
    const bool is_first_of_all = filters_.empty();
    if (const CMPIrc rc = host_.activate_filter(class_, name_space, count(name_space) == 0); rc != CMPI_RC_OK)
        return rc;
    ++filters_[name_space];
    const CMPIrc rc = is_first_of_all ? host_.enable_indications(class_) : CMPI_RC_OK;
    if (rc != CMPI_RC_OK)
        remove(name_space);
    return rc;
}

CMPIrc Subscription::remove(const std::string& name_space)
{
    if (count(name_space) == 0)
        return CMPI_RC_ERR_NOT_FOUND;
    const bool is_last_of_all = filters_.size() == 1 && count(name_space) == 1;
    const CMPIrc disabled = is_last_of_all ? host_.disable_indications(class_) : CMPI_RC_OK;
    const CMPIrc deactivated = deactivate(name_space);
    return disabled != CMPI_RC_OK ? disabled : deactivated;
}

CMPIrc Subscription::deactivate(const std::string& name_space)
{
    const auto filter = filters_.find(name_space);
    const bool is_last = --filter->second == 0;
    if (is_last)
        filters_.erase(filter);
    return host_.deactivate_filter(class_, name_space, is_last);
}

unsigned Subscription::count(const std::string& name_space) const
{
    const auto filter = filters_.find(name_space);
    return filter == filters_.end() ? 0 : filter->second;
}

} // namespace KPRV::broker
