#include "module/model/TargetHelper.h"

#include "module/adapter/Guarded_Call.h"
#include "module/adapter/Json_Access.h"
#include "module/model/Fresh_Instances.h"
#include "module/model/Record_Filling.h"
#include "module/model/Remote_Ports.h"

namespace KPRV {

/// One walk over the targets of a local port.
struct TargetHelper::Walk
{
    const _hbaPortInfo& port;
    classId_t id;
    const Wanted& wanted;
    Fresh_Instances& instances;
    bool no_description_seen = false;
};

namespace {

/// What a failed reading of an answer is told as.
constexpr Guarded_Entry entry = {"libGetCompleteRemotePort"};

/// A media changer is published as a tape drive.
bool is_tape(const std::string& type)
{
    return type == "Tape" || type == "Media Changer";
}

} // namespace

TargetHelper::TargetHelper() : _life("TargetHelper", LOG_HERE) {}

TargetHelper* TargetHelper::getTargetHelperObject()
{
    static TargetHelper helper;
    return &helper;
}

void TargetHelper::getTargetInstances(const _hbaPortInfo& port, classId_t id, const Wanted& wanted,
                                      Fresh_Instances& instances) const
{
    LOG_SCOPE("getTargetInstances");
    Remote_Ports remotes(LOG_HERE, port.portWWN);
    if (!remotes.listed())
        return;
    LOG(DBG, "libGetAllRemotePorts. Number of rports -  %d", static_cast<int>(remotes.size()));
    Walk walk = {.port = port, .id = id, .wanted = wanted, .instances = instances};
    for (unsigned i = 0; i < remotes.size(); i++) {
        Json::Value answer;
        const bool answered = remotes.ask_next(LOG_HERE, answer);
        const Remote_Port remote(answer);
        if (!answered || !remote.is_valid()) {
            LOG(ERR, "libGetCompleteRemotePort response is null or has error");
            continue;
        }
        LOG(DBG, "Loop for the rport index =   %d", static_cast<int>(i));
        guarded(LOG_HERE, entry, [&] { publish_target(walk, i, remotes.wwn(), remote); });
    }
}

void TargetHelper::publish_target(Walk& walk, unsigned index, const char* wwn,
                                  const Remote_Port& remote) const
{
    const Remote_Device device(remote.device());
    if (!device.is_target()) {
        LOG(DBG, "Nothing to do since the its not a Target Rport.");
        return;
    }
    const std::string type = asString(device.type());
    LOG(DBG, "Device type = %s", type.c_str());
    if (is_tape(type) != (walk.id == TAPEDRIVE)) {
        LOG(INFO, "Continue with next rport. Looking for another device type ");
        return;
    }
    LOG(DBG, "rPortWwns[%d]=%s", static_cast<int>(index), wwn);
    const Json::Value* const luns = remote.luns();
    if (!luns || !isArrayOrNull(*luns)) {
        LOG(ERR, "No LUN Info is available for Rport %s.", wwn);
        return;
    }
    LOG(DBG, "Number of Luns = %d.", static_cast<int>(luns->size()));
    char address[24];
    copy_flat(address, wwn);
    std::string path;
    path.append(walk.port.portWWN).append("_").append(address).append("_");
    for (const Json::Value& element : *luns)
        guarded(LOG_HERE, entry, [&] { publish_lun(walk, path, element); });
}

void TargetHelper::publish_lun(Walk& walk, const std::string& path, const Json::Value& element) const
{
    _hbaLunInfo lun = {};
    lun.path = path;
    if (!fill_lun(element, walk.no_description_seen, lun)) {
        LOG(ERR, "LUN info is NOT available");
        return;
    }
    switch (walk.id) {
    case TAPEDRIVE:
        walk.instances.append(getTapeDriveInstance(walk.port, lun, walk.wanted));
        break;
    case STORAGEEXTENT:
        walk.instances.append(getStorageExtentInstance(walk.port, lun, walk.wanted));
        break;
    case LOGICALDISK:
        walk.instances.append(getLogicalDiskInstance(walk.port, lun, walk.wanted));
        break;
    default:
        break;
    }
}

} // namespace KPRV
