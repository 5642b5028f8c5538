#pragma once

#include "module/adapter/classId_t.h"
#include "module/model/Logged_Life.h"
#include "module/model/Lun_Data.h"
#include "module/model/Port_Data.h"
#include "module/runtime/ground/Array.h"
#include "module/runtime/objects/Instance.h"
#include "module/runtime/objects/Wanted.h"
#include "module/schema/KALDERA_LogicalDisk.h"
#include "module/schema/KALDERA_StorageExtent.h"
#include "module/schema/KALDERA_TapeDrive.h"

#include <json/value.h>

namespace KPRV {

class Fresh_Instances;
class Remote_Port;

/// Publishes what a local FC port sees through the fabric: each LUN of each target, as an extent, a disk or a
/// tape drive. Nothing is kept between calls. Instances belong to the caller; what the tables of the builders
/// do not name is null.
class TargetHelper
{
public:
    static TargetHelper* getTargetHelperObject();

    /// The LUNs behind one port: extents (9) or disks (38) of all targets but tapes and media changers, and
    /// tape drives (16) of these. A remote port or a LUN that cannot be read is left out, with the reason in
    /// the log. Throws nothing.
    void getTargetInstances(const _hbaPortInfo& port, classId_t id, const Wanted& wanted,
                            Fresh_Instances& instances) const;

    // Null for one that is not wanted.

    KALDERA_StorageExtent* getStorageExtentInstance(const _hbaPortInfo& port, const _hbaLunInfo& lun,
                                                    const Wanted& wanted = {}) const;
    KALDERA_TapeDrive* getTapeDriveInstance(const _hbaPortInfo& port, const _hbaLunInfo& lun,
                                            const Wanted& wanted = {}) const;
    KALDERA_LogicalDisk* getLogicalDiskInstance(const _hbaPortInfo& port, const _hbaLunInfo& lun,
                                                const Wanted& wanted = {}) const;

private:
    TargetHelper();

    struct Walk;
    void publish_target(Walk& walk, unsigned index, const char* wwn, const Remote_Port& remote) const;
    void publish_lun(Walk& walk, const std::string& path, const Json::Value& element) const;

    const Logged_Life _life;
};

} // namespace KPRV
