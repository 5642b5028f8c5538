#pragma once

#include "contracts/adapter/Signatures.h"

namespace KPRV::bench {

/// The adapter library as plain providers call it: by its name, as the module opens it, and made ready once.
class plain_library
{
public:
    static const plain_library& get();

    const JsonReqFP get_adapters;
    const JsonReqFP get_adapter;
    const JsonReqFP get_fc_ports;
    const JsonReqFP get_port;
    const JsonReqFP get_remote_ports;
    const JsonReqFP get_remote_port;
    const JsonReqFP get_server_time;
    const JsonReqFP get_fc;

private:
    explicit plain_library(void* library);
};

} // namespace KPRV::bench
