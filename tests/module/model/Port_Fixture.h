#pragma once

#include "module/managers/FCHBAManager.h"
#include "module/model/PortHelper.h"
#include "module/model/TargetHelper.h"
#include "tests/module/model/Taken_Instances.h"
#include "tests/support/Fake_Library.h"
#include "tests/support/Fixed_Host.h"
#include "tests/support/Log_Capture.h"

#include <gtest/gtest.h>

namespace KPRV {

inline constexpr const char* ADAPTER = "20:00:8c:7c:ff:00:00:00";
inline constexpr const char* PORT = "10:00:8c:7c:ff:00:00:01";
inline constexpr const char* REMOTE = "50:06:01:60:00:00:00:0a";
inline constexpr const char* REMOTE_2 = "50:06:01:60:00:00:00:0b";

/// An answer with one member changed.
inline Json::Value with(Json::Value answer, const char* name, const Json::Value& value)
{
    answer[name] = value;
    return answer;
}
inline Json::Value without(Json::Value answer, const char* name)
{
    answer.removeMember(name);
    return answer;
}
inline Json::Value list_of(const std::vector<Json::Value>& addresses)
{
    Json::Value list = json("{'indexStrings': []}");
    for (const Json::Value& address : addresses)
        list["indexStrings"].append(address);
    return list;
}

/// What the library answers for a port.
inline Json::Value fc_port(const char* wwn = PORT)
{
    return with(json("{'nodeWwn': '20:00:8c:7c:ff:00:00:01', 'PortSymbolicName': 'a port',"
                     " 'operatingSpeed': 8, 'supportedPortSpeeds': [16, 8, 4], 'portTypeMOFValue': 10,"
                     " 'maxFrameSize': 2112, 'portStatusValue': 11, 'portStatus': true, 'isFCoE': false,"
                     " 'isMezz': false, 'beaconState': false}"),
                "wwn", wwn);
}

/// A host with one adapter and one port.
struct Port_Fixture : testing::Test
{
    // Made before the log, which would else show the beginning of those that a test is the first to use.
    const FCHBAManager* manager = FCHBAManager::getFCHBAManager();
    const TargetHelper* targets = TargetHelper::getTargetHelperObject();
    const PortHelper* helper = PortHelper::getPortHelperObject();
    Fixed_Host host;
    Fake_Library library;
    Log_Capture log;

    Port_Fixture()
    {
        library.answers("getAllAdaptersIndexString", list_of({ADAPTER}));
        library.answers("getFcPhyPortIndicesByAdapter", list_of({PORT}));
        library.answers("getPortByWwn", fc_port());
    }

    /// Each remote port answers the same, but for the throwing one.
    void remote_ports(const std::vector<Json::Value>& wwns, const Json::Value& answer,
                      const char* throwing = "")
    {
        Json::Value list = Json::arrayValue;
        for (const Json::Value& wwn : wwns)
            list.append(with(Json::objectValue, "remotePortWwn", wwn));
        library.answers("getAllRemotePorts", list);
        library.answers("getCompleteRemotePort", [=](const Json::Value& request) {
            if (request["rPortWwn"] == throwing)
                throw HbaAgentError{7, "busy"};
            return answer;
        });
    }

    std::vector<Set_Properties> walk(classId_t id) { return taken(helper->getInstancesByClass(id)); }
    Lines walk(classId_t id, const char* property)
    {
        return taken(helper->getInstancesByClass(id), property);
    }
};

} // namespace KPRV
