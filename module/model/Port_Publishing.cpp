// Of `PortHelper`, what becomes of one port for the class that was asked for.
#include "module/adapter/Guarded_Call.h"
#include "module/adapter/Json_Access.h"
#include "module/adapter/ProviderUtil.h"
#include "module/model/Fresh_Instances.h"
#include "module/model/PortHelper.h"
#include "module/model/Remote_Ports.h"
#include "module/model/TargetHelper.h"

namespace KPRV {

void PortHelper::publish(classId_t id, const Wanted& wanted, const Json::Value& answer, _hbaPortInfo& port,
                         Fresh_Instances& instances) const
{
    switch (id) {
    case FCPORT:
        instances.append(getFCPortInstance(port, wanted));
        break;
    case SCSIPROTOCOLENDPOINT:
        publish_endpoints(wanted, port, instances);
        break;
    case FCPORTSTATISTICS:
        publish_statistics(wanted, answer, port, instances);
        break;
    case LOGICALPORTGROUP:
        instances.append(getLogicalPortGroupInstance(port, wanted));
        break;
    case ALARMDEVICE:
        publish_alarm(wanted, answer, port, instances);
        break;
    case STORAGEEXTENT:
    case TAPEDRIVE:
    case LOGICALDISK:
        TargetHelper::getTargetHelperObject()->getTargetInstances(port, id, wanted, instances);
        break;
    default:
        LOG(INFO, "Unhandled class support");
    }
}

/// The port as an initiator, then each target that it sees.
void PortHelper::publish_endpoints(const Wanted& wanted, _hbaPortInfo& port, Fresh_Instances& instances) const
{
    instances.append(getSCSIProtocolEndpointInstance(port, true, wanted));
    Remote_Ports remotes(LOG_HERE, port.localWWN);
    if (!remotes.listed())
        return;
    LOG(DBG, "Number of Rports = %u", remotes.size());
    for (unsigned i = 0; i < remotes.size(); i++) {
        Json::Value answer;
        if (!remotes.ask_next(LOG_HERE, answer))
            continue;
        const Remote_Port remote(answer);
        if (!remote.is_valid() || remote.device().isNull()) {
            LOG(ERR, "libGetCompleteRemotePort returned NULL for %s", remotes.wwn());
            continue;
        }
        const Remote_Device device(remote.device());
        if (!device.is_target())
            continue;
        guarded(LOG_HERE, {"libGetCompleteRemotePort"}, [&] {
            name_remote_port(remotes.wwn(), port);
            port.status = asInt(device.state());
            instances.append(getSCSIProtocolEndpointInstance(port, false, wanted));
        });
    }
}

void PortHelper::publish_statistics(const Wanted& wanted, const Json::Value& answer, const _hbaPortInfo& port,
                                    Fresh_Instances& instances) const
{
    // The name is misspelt in the log, and always was.
    constexpr Guarded_Entry entry = {"libGetDynamicPortStatisticsat"};
    const bool fcoe = asBool(member(answer, "isFCoE"));
    Json::Value request(Json::objectValue), counters;
    request["indexStr"] = member(answer, "wwn");
    if (!guarded_call(LOG_HERE, entry, libGetDynamicPortStatistics, request, counters))
        return;
    if (!ProviderUtil::isValidJsonResponse(counters) || !counters.isArray() || counters.empty()) {
        LOG(WARN, "libGetDynamicPortStatistics failed for port WWN= %s", port.portWWN);
        return;
    }
    prov_pport_stats_s statistics = {};
    if (guarded(LOG_HERE, entry, [&] { read_statistics(counters, fcoe, statistics); }))
        instances.append(getFCPortStatisticsInstance(port, statistics, fcoe, wanted));
}

void PortHelper::publish_alarm(const Wanted& wanted, const Json::Value& answer, const _hbaPortInfo& port,
                               Fresh_Instances& instances) const
{
    if (!hasMember(answer, "isMezz") || !hasMember(answer, "beaconState")) {
        LOG(INFO, "beaconState is NOT available failed for %s.", port.portWWN);
        return;
    }
    // Mezzanine cards have no beacon.
    if (asBool(answer["isMezz"]))
        return;
    instances.append(getAlarmDeviceInstance(port, asBool(answer["beaconState"]), wanted));
}

} // namespace KPRV
