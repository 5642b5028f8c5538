#pragma once

#include "broker/values/Request.h"

namespace KPRV::broker {

/// Who serves the requests that a provider sends to its server.
class Up_Calls
{
public:
    virtual ~Up_Calls() = default;
    virtual Result up_call(const Request& request) = 0;
    /// `CBDeliverIndication`.
    virtual CMPIrc deliver(const std::string& name_space, const Instance_Value& indication) = 0;
};

} // namespace KPRV::broker
