#pragma once

#include "module/adapter/classId_t.h"
#include "module/model/Connector_Data.h"
#include "module/model/Logged_Life.h"
#include "module/runtime/ground/Array.h"
#include "module/runtime/ground/String.h"
#include "module/runtime/objects/Instance.h"
#include "module/schema/KALDERA_PhysicalConnector.h"

#include <json/value.h>

namespace KPRV {

class Fresh_Instances;

/// Publishes the transceiver of each FC port as a connector. Nothing is kept between calls. Instances belong
/// to the caller; what the table of the builder does not name is null.
class PhysicalAssetHelper
{
public:
    static PhysicalAssetHelper* getPhysicalAssetHelperObject();

    /// Walks all ports of all adapters for id 35. A port without a readable transceiver is left out; an
    /// adapter that cannot be read ends the walk. Exceptions of `libGetAllAdaptersIndexString` and
    /// `libGetFcPhyPortIndicesByAdapter` pass.
    Array<Instance*> getInstancesByClass(classId_t id) const;

    KALDERA_PhysicalConnector* getPhysicalConnectorInstance(const _sfpInfo& sfp) const;

private:
    PhysicalAssetHelper();

    void walk_ports(int adapter_id, const String& adapter, classId_t id, Fresh_Instances& instances) const;
    void publish(int adapter_id, int port_index, const Json::Value& element, classId_t id,
                 Fresh_Instances& instances) const;

    const Logged_Life _life;
};

} // namespace KPRV
