#include "tests/bench/plain_tunnel.h"

#include "tests/bench/plain_library.h"
#include "tests/bench/plain_support.h"

#include <json/reader.h>
#include <json/writer.h>

#include <map>

namespace KPRV::bench {

namespace {

using procedure = Json::Value (*)(const Json::Value& params);

/// As many as the module knows, so that a look-up costs both sides the same; two of them do something.
const std::map<std::string, procedure> procedures = [] {
    std::map<std::string, procedure> all = {
#define METHOD(wire, ...) {wire, nullptr},
#define HANDLER(...)
#include "contracts/agent/Methods.def"
    };
    all["discovery.getServerTime"] = [](const Json::Value& params) {
        return plain_library::get().get_server_time(params);
    };
    all["discovery.getFcByFcWwn"] = [](const Json::Value& params) {
        Json::Value query;
        query["wwn"] = params[0].asString();
        return plain_library::get().get_fc(query);
    };
    return all;
}();

} // namespace

std::string plain_rpc(const std::string& request)
{
    Json::Value root, reply;
    Json::Reader().parse(request, root);
    reply["id"] = root["id"];
    reply["version"] = "1.1";
    reply["result"] = procedures.at(root["method"].asString())(root["params"]);
    return Json::StyledWriter().write(reply);
}

CMPIStatus plain_execute_method(const CMPIResult* result, const CMPIArgs* in, CMPIArgs* out)
{
    const CMPIData request = in->ft->getArg(in, "request", nullptr);
    const std::string response = plain_rpc(CMGetCharPtr(request.value.string));
    CMAddArg(out, "response", plain_chars(response.c_str()), CMPI_chars);
    CMPIValue value = {};
    value.uint32 = 0;
    CMReturnData(result, &value, CMPI_uint32);
    CMReturnDone(result);
    return {CMPI_RC_OK, nullptr};
}

} // namespace KPRV::bench
