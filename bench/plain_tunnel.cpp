#include "bench/plain_tunnel.h"

#include "bench/Libraries.h"

#include <json/reader.h>
#include <json/writer.h>

#include <map>

namespace KPRV::bench {

namespace {

using procedure = Json::Value (*)(const Json::Value& params);

const std::map<std::string, procedure> procedures = {
    {"discovery.getServerTime",
     [](const Json::Value& params) { return Fast_Library::get().get_server_time(params); }},
    {"discovery.getFcByFcWwn",
     [](const Json::Value& params) {
         Json::Value query;
         query["wwn"] = params[0].asString();
         return Fast_Library::get().get_fc(query);
     }},
};

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

} // namespace KPRV::bench
