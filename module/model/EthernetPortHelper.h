#pragma once

#include "module/adapter/classId_t.h"
#include "module/model/Ethernet_Port_Data.h"
#include "module/model/Logged_Life.h"
#include "module/runtime/ground/Array.h"
#include "module/runtime/ground/String.h"
#include "module/runtime/objects/Instance.h"
#include "module/runtime/objects/Wanted.h"
#include "module/schema/KALDERA_EthernetPort.h"
#include "module/schema/KALDERA_LANEndpoint.h"

#include <json/value.h>

namespace KPRV {

class Fresh_Instances;

/// Publishes the network side of converged adapters: each Ethernet port and its LAN endpoint. Nothing is kept
/// between calls. Instances belong to the caller; what the tables of the builders do not name is null. MACs
/// come in either form.
class EthernetPortHelper
{
public:
    static EthernetPortHelper* getEthernetPortHelperObject();

    // The walks serve ids 20 and 34. An adapter or a port that cannot be read is left out, with the reason in
    // the log. Exceptions of `libGetAllAdaptersIndexString` and `libGetAdapterIdByPort` pass.

    /// All adapters.
    Array<Instance*> getInstancesByClass(classId_t id, const Wanted& wanted = {}) const;
    /// One adapter, by its id from 1.
    Array<Instance*> getInstancesByAdapterId(int adapter_id, classId_t id, const Wanted& wanted = {}) const;
    /// The Ethernet ports of the adapter that the MAC belongs to.
    Array<Instance*> getEthernetPortInstancesByAdapter(const String& mac, const Wanted& wanted = {}) const;

    /// 0 and the answer of `getEthPortByEthMac` in `out`, with its object `ethData`; or -1. Throws nothing.
    int getEthPortDetails(const String& mac, Json::Value& out) const;

    // Null for one that is not wanted.

    KALDERA_EthernetPort* getEthernetPortInstance(const _ethPortInfo& port, const Wanted& wanted = {}) const;
    KALDERA_LANEndpoint* getLANEndpointInstance(const _ethPortInfo& port, const Wanted& wanted = {}) const;

    /// CIM's `PortType` of a transceiver: 108 for "10G_BASE-SR", 105 for every other text.
    sint32 getPortType(const char* transceiver) const;

private:
    EthernetPortHelper();

    void walk_adapter(int adapter_id, classId_t id, const Wanted& wanted, Host_Name& host,
                      Fresh_Instances& instances) const;
    void publish(const String& mac, sint32 number, classId_t id, const Wanted& wanted, Host_Name& host,
                 Fresh_Instances& instances) const;
    sint32 port_type(const String& mac) const;

    const Logged_Life _life;
};

} // namespace KPRV
