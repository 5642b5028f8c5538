// Of `PortHelper`, the beacon of a port: on, off, and what the library says to it.
#include "module/adapter/Guarded_Call.h"
#include "module/adapter/Json_Access.h"
#include "module/adapter/ProviderUtil.h"
#include "module/model/PortHelper.h"

namespace KPRV {

namespace {

enum Alarm_Result
{
    FAILED = 0,
    DONE = 1,
    NOT_SUPPORTED = 2,
    ALREADY_SET = 3,
};

Json::Value beacon_request(const String& index, bool on)
{
    Json::Value request(Json::objectValue);
    request["indexStr"] = index.c_str();
    request["port"]["beaconState"] = on;
    request["propArray"].append("beaconState");
    return request;
}

} // namespace

int PortHelper::setAlarmState(const String& address, int state) const
{
    LOG_SCOPE("setAlarmState");
    constexpr int ALARM_ON = 3;
    String index;
    Json::Value port;
    const bool answered = guarded(LOG_HERE, {"libGetPortByWwn"}, [&] {
        index = ProviderUtil::getIndexInColonFormat(address);
        Json::Value request(Json::objectValue);
        request["wwn"] = index.c_str();
        port = libGetPortByWwn(request);
    });
    if (!answered)
        return FAILED;
    if (!ProviderUtil::isValidJsonResponse(port) || !hasMember(port, "isMezz") ||
        !hasMember(port, "beaconState")) {
        LOG(ERR, "Current ALARM STATE is not available");
        return FAILED;
    }
    if (asBool(port["isMezz"])) {
        LOG(WARN, "setAlarmState: Operation not supported on Mezz cards");
        return NOT_SUPPORTED;
    }
    const bool on = state == ALARM_ON;
    if (asBool(port["beaconState"]) == on) {
        LOG(WARN, "setAlarmState : State already set");
        return ALREADY_SET;
    }

    Json::Value answer;
    if (!guarded_call(LOG_HERE, {"libSetPortByWwn"}, libSetPortByWwn, beacon_request(index, on), answer))
        return FAILED;
    if (!ProviderUtil::isValidJsonResponse(answer)) {
        LOG(ERR, "libSetPortByWwn response is null or has error");
        return FAILED;
    }
    LOG(INFO, "setAlarmState success");
    return DONE;
}

} // namespace KPRV
