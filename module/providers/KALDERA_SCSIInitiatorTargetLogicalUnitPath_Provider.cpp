#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/CIM_LogicalDevice.h"
#include "module/schema/CIM_SCSIProtocolEndpoint.h"
#include "module/schema/KALDERA_SCSIInitiatorTargetLogicalUnitPath_Skeleton.h"
#include "module/schema/KALDERA_StorageExtent.h"
#include "module/schema/KALDERA_TapeDrive.h"

namespace KPRV {

namespace {

using Path = KALDERA_SCSIInitiatorTargetLogicalUnitPath;
using Endpoint = CIM_SCSIProtocolEndpoint;

/// Any other role counts as a target.
constexpr uint16 ROLE_INITIATOR = 2;

/// The text up to the separator that stands n-th, without it; empty if there are fewer, so that it finds no
/// partner.
std::string_view up_to_separator(std::string_view text, int n)
{
    size_t pos = text.find('_');
    while (pos != text.npos && --n > 0)
        pos = text.find('_', pos + 1);
    return pos == text.npos ? std::string_view() : text.substr(0, pos);
}

/// Logical units by the initiator and target addresses that begin their `DeviceID`.
template <class Unit>
class Units
{
public:
    explicit Units(const List<Unit>& units) : _units(units)
    {
        std::string_view pair;
        for (uint32 i = 0; i < units.size(); i++) {
            if (!units[i])
                continue;
            const std::string_view id = view_of(units[i]->DeviceID.value);
            // The units of a target stand together, and the pair before has one separator in it.
            if (pair.empty() || id.size() <= pair.size() || id[pair.size()] != '_' || !id.starts_with(pair))
                pair = up_to_separator(id, 2);
            if (!pair.empty())
                _index.add(pair, i);
        }
    }

    template <class Visit>
    void for_each_behind(std::string_view pair, Visit visit) const
    {
        if (const auto* found = _index.find(pair)) {
            for (const uint32 i : *found)
                visit(_units[i]);
        }
    }

private:
    const List<Unit>& _units;
    Position_Index _index;
};

} // namespace

class KALDERA_SCSIInitiatorTargetLogicalUnitPath_Provider
    : public KALDERA_SCSIInitiatorTargetLogicalUnitPath_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const Path*, Enum_Instances_Handler<Path>* handler)
    {
        LOG_SCOPE("enum_instances");
        const Wanted& wanted = handler->wanted();
        const Message invalid = SAYING(ERR, "Error: Invalid number of instances returned!\n");
        List<KALDERA_StorageExtent> extents(
            hdr_instances(STORAGEEXTENT, wanted.end<KALDERA_StorageExtent>(&Path::LogicalUnit)));
        List<KALDERA_TapeDrive> drives(
            hdr_instances(TAPEDRIVE, wanted.end<KALDERA_TapeDrive>(&Path::LogicalUnit)));
        if (extents.empty() && drives.empty())
            return invalid.answer(ENUM_INSTANCES_OK);
        List<Endpoint> endpoints(fc_hba_instances(SCSIPROTOCOLENDPOINT, Wanted::names()));
        if (endpoints.empty())
            return invalid.answer(ENUM_INSTANCES_OK);
        LOG(DBG, "Number of SCSIPROTOCOLENDPOINT(Initiator and Target)= %d", int(endpoints.size()));

        // A target's name begins with the address of the initiator through which it was seen.
        std::vector<const Endpoint*> initiators, targets;
        Position_Index targets_of;
        for (uint32 i = 0; i < endpoints.size(); i++) {
            const Endpoint* const endpoint = endpoints[i];
            if (endpoint->Role.value == ROLE_INITIATOR) {
                initiators.push_back(endpoint);
                continue;
            }
            const std::string_view seen_through = up_to_separator(view_of(endpoint->ElementName.value), 1);
            if (!seen_through.empty())
                targets_of.add(seen_through, uint32(targets.size()));
            targets.push_back(endpoint);
        }
        TRACE_BUILDING();
        LOG(DBG,
            "Number of SCSIPROTOCOLENDPOINT(Initiator)= %d; SCSIPROTOCOLENDPOINT(Target)= %d; STORAGEEXTENT= "
            "%d; "
            "TAPEDRIVE= %d ",
            int(initiators.size()), int(targets.size()), int(extents.size()), int(drives.size()));

        const Units<KALDERA_StorageExtent> extents_behind(extents);
        const Units<KALDERA_TapeDrive> drives_behind(drives);
        for (const Endpoint* initiator : initiators) {
            const auto* found = targets_of.find(view_of(initiator->ElementName.value));
            for (size_t n = 0; found && n < found->size(); n++) {
                const Endpoint* const target = targets[(*found)[n]];
                const auto path_to = [&](const Instance* unit) {
                    deliver(*handler, initiator, target, unit);
                };
                extents_behind.for_each_behind(view_of(target->ElementName.value), path_to);
                drives_behind.for_each_behind(view_of(target->ElementName.value), path_to);
            }
        }
        return ENUM_INSTANCES_OK;
    }

private:
    static void deliver(Enum_Instances_Handler<Path>& handler, const Endpoint* initiator,
                        const Endpoint* target, const Instance* unit)
    {
        Ref<Path> path(create_association<Path>());
        set_end(path.ptr(), &Path::Initiator, initiator);
        set_end(path.ptr(), &Path::Target, target);
        set_end(path.ptr(), &Path::LogicalUnit, unit);
        handler.handle(path.steal());
    }
};

PROVIDER_PROC(KALDERA_SCSIInitiatorTargetLogicalUnitPath)

} // namespace KPRV
