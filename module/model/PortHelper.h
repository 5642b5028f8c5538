#pragma once

#include "module/adapter/classId_t.h"
#include "module/model/Logged_Life.h"
#include "module/model/Port_Data.h"
#include "module/model/Port_Statistics.h"
#include "module/runtime/ground/Array.h"
#include "module/runtime/ground/String.h"
#include "module/runtime/objects/Instance.h"
#include "module/runtime/objects/Wanted.h"
#include "module/schema/KALDERA_AlarmDevice.h"
#include "module/schema/KALDERA_FCPort.h"
#include "module/schema/KALDERA_FCPortStatistics.h"
#include "module/schema/KALDERA_LogicalPortGroup.h"
#include "module/schema/KALDERA_SCSIProtocolEndpoint.h"

#include <json/value.h>

namespace KPRV {

class Fresh_Instances;

/// Publishes each Fibre Channel port, FCoE ports among them: the port itself, its statistics, its SCSI
/// endpoints, its logical port group and its beacon as an alarm device; and walks the ports for the storage
/// behind them. Nothing is kept between calls. Instances belong to the caller; what the tables of the
/// builders do not name is null. Addresses come in either form.
class PortHelper
{
public:
    static PortHelper* getPortHelperObject();

    // The walks serve ids 3, 4, 5, 30 and 36, and 9, 16 and 38 through `TargetHelper`. An adapter or a port
    // that cannot be read is left out, with the reason in the log.

    /// All adapters. Exceptions of `libGetAllAdaptersIndexString` pass.
    Array<Instance*> getInstancesByClass(classId_t id, const Wanted& wanted = {}) const;
    /// One adapter, by its id from 1 in an answer of `getAllAdaptersIndexString`. Throws nothing.
    Array<Instance*> getInstancesByAdapterId(int adapter_id, classId_t id, const Json::Value& adapters) const;
    /// One adapter. Throws nothing.
    Array<Instance*> getInstancesByAdapterAddress(const String& address, classId_t id,
                                                  const Wanted& wanted = {}) const;
    /// The ports of one adapter. Throws nothing.
    Array<Instance*> getFCPortInstancesByAdapter(const String& address, const Wanted& wanted = {}) const;

    // Null for one that is not wanted.

    KALDERA_FCPort* getFCPortInstance(const _hbaPortInfo& port, const Wanted& wanted = {}) const;
    KALDERA_FCPortStatistics* getFCPortStatisticsInstance(const _hbaPortInfo& port,
                                                          const prov_pport_stats_s& statistics, bool fcoe,
                                                          const Wanted& wanted = {}) const;
    KALDERA_SCSIProtocolEndpoint* getSCSIProtocolEndpointInstance(const _hbaPortInfo& port, bool initiator,
                                                                  const Wanted& wanted = {}) const;
    KALDERA_LogicalPortGroup* getLogicalPortGroupInstance(const _hbaPortInfo& port,
                                                          const Wanted& wanted = {}) const;
    KALDERA_AlarmDevice* getAlarmDeviceInstance(const _hbaPortInfo& port, bool beacon_on,
                                                const Wanted& wanted = {}) const;

    // Queries of one port or adapter. What fails is told in the log at ERR.

    /// 0 and the answer of `getPortByWwn` in `out`, or -1. An address of 12 characters is taken for a MAC.
    /// Throws nothing.
    int getPortDetails(const String& address, Json::Value& out) const;
    /// `portStatus` is false; false, told at ERR, for a port that cannot be read or does not tell.
    bool isPortDisabled(const String& address) const;
    /// Number of ports of an adapter, and the library's answer in `out`, whose `indexStrings` lists their
    /// addresses; or -1. Exceptions of `libGetFcPhyPortIndicesByAdapter` pass.
    int getNumberOfPorts(const String& adapter_address, Json::Value& out) const;
    /// 0 and the answer of `getOpticsSFP` in `out`, or -1. Throws nothing.
    int getOpticsInfo(const String& address, Json::Value& out) const;

    /// Turns a port's beacon on for state 3, off for any other: 1 done, 0 failure, 2 not supported on a
    /// mezzanine card, 3 already so. Throws nothing.
    int setAlarmState(const String& address, int state) const;

private:
    PortHelper();

    struct Walk_Words;
    static const Walk_Words by_id_words;
    static const Walk_Words by_address_words;

    struct Walk;
    void walk_adapter(const String& index, Walk& walk, Fresh_Instances& instances) const;
    void walk_adapter_by_id(int adapter_id, const Json::Value& list, Walk& walk,
                            Fresh_Instances& instances) const;
    void walk_port(Json::Value& address, sint32 number, Walk& walk, Fresh_Instances& instances) const;
    void publish(classId_t id, const Wanted& wanted, const Json::Value& answer, _hbaPortInfo& port,
                 Fresh_Instances& instances) const;
    void publish_endpoints(const Wanted& wanted, _hbaPortInfo& port, Fresh_Instances& instances) const;
    void publish_statistics(const Wanted& wanted, const Json::Value& answer, const _hbaPortInfo& port,
                            Fresh_Instances& instances) const;
    void publish_alarm(const Wanted& wanted, const Json::Value& answer, const _hbaPortInfo& port,
                       Fresh_Instances& instances) const;

    const Logged_Life _life;
};

} // namespace KPRV
