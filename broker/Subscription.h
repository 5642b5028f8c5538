#pragma once

#include "broker/Local_Server.h"

#include <map>

namespace KPRV::broker {

/// The filters of one indication class that clients have active, by name space, and the calls that a server
/// makes of them: what is still active at the end is ended.
class Subscription
{
public:
    Subscription(Local_Server& server, std::string provider_class);
    ~Subscription();
    Subscription(const Subscription&) = delete;
    Subscription& operator=(const Subscription&) = delete;

    /// One more filter in a name space: asks the provider, activates it, and enables indications with the
    /// first of all. Undone if the provider refuses; its code then.
    CMPIrc add(const std::string& name_space);
    /// One filter less; the last of all disables indications first. Without such a filter rc 6 and no call.
    CMPIrc remove(const std::string& name_space);

    /// Active filters of a name space.
    unsigned count(const std::string& name_space) const;

private:
    CMPIrc deactivate(const std::string& name_space);

    Local_Server& _server;
    const std::string _class;
    std::map<std::string, unsigned> _filters;
};

} // namespace KPRV::broker
