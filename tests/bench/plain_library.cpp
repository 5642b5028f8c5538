#include "tests/bench/plain_library.h"

#include "tests/bench/Open_Library.h"

#include <json/value.h>

namespace KPRV::bench {

const plain_library& plain_library::get()
{
    static const plain_library library(open_library("libdzntj.so"));
    return library;
}

plain_library::plain_library(void* library)
    : get_adapters(find_function<JsonReqFP>(library, "getAllAdaptersIndexString")),
      get_adapter(find_function<JsonReqFP>(library, "getHbaByWwn")),
      get_fc_ports(find_function<JsonReqFP>(library, "getFcPhyPortIndicesByAdapter")),
      get_port(find_function<JsonReqFP>(library, "getPortByWwn")),
      get_remote_ports(find_function<JsonReqFP>(library, "getAllRemotePorts")),
      get_remote_port(find_function<JsonReqFP>(library, "getCompleteRemotePort")),
      get_server_time(find_function<JsonReqFP>(library, "getServerTime")),
      get_fc(find_function<JsonReqFP>(library, "getFcByFcWwn"))
{
    Json::Value request;
    request["appId"] = 2;
    find_function<JsonReqFP>(library, "init_hba_lib")(request);
}

} // namespace KPRV::bench
