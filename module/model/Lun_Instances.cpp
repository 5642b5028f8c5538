// Of `TargetHelper`, the instances of one logical unit: extent, tape drive, disk, the path to it.
#include "module/adapter/ProviderUtil.h"
#include "module/model/Instance_Building.h"
#include "module/model/Record_Filling.h"
#include "module/model/TargetHelper.h"
#include "module/runtime/objects/Ref.h"
#include "module/runtime/system/log.h"

#include <algorithm>
#include <array>
#include <iterator>
#include <utility>

namespace KPRV {

namespace {

enum class Named_By
{
    PRODUCT,
    DESCRIPTION,
    NOTHING,
};

struct Name_Row
{
    uint32 id_type;
    Named_By source;
    uint16 format;
    uint16 name_space;
};

// clang-format off
constexpr Name_Row name_rows[] = {
//   id type  Name                    NameFormat  NameNamespace
    { 0,      Named_By::PRODUCT,       7,         7},
    { 1,      Named_By::DESCRIPTION,  11,         4},
    { 2,      Named_By::DESCRIPTION,  10,         3},
    { 3,      Named_By::DESCRIPTION,   9,         2},
    { 8,      Named_By::DESCRIPTION,   1,         1},
    {10,      Named_By::NOTHING,       0,         0},
};
// clang-format on

/// Null for an id type that is not known.
const Name_Row* name_row(const _hbaLunInfo& lun)
{
    const auto row = std::ranges::find(name_rows, lun.idType, &Name_Row::id_type);
    return row == std::end(name_rows) ? nullptr : row;
}

std::string_view trimmed(const Cut_Text& text)
{
    return ProviderUtil::trimmed(text.view());
}

String name(Named_By source, const _hbaLunInfo& lun)
{
    switch (source) {
    case Named_By::PRODUCT: {
        const std::string_view parts[] = {trimmed(lun.vendor), "+", trimmed(lun.productID), "+",
                                          trimmed(lun.serialNumber)};
        return String::joined(parts);
    }
    case Named_By::DESCRIPTION:
        return to_String(lun.description.view());
    case Named_By::NOTHING:
        break;
    }
    return "Unable To Fetch";
}

/// Signed: a number beyond the positive range shows as a negative one.
String numbered_name(uint32 number)
{
    return to_String("LUN_" + std::to_string(static_cast<sint32>(number)));
}

/// Most LUNs of a host bear one of the first numbers: those share their names.
String element_name(uint32 number)
{
    static const auto first_names = [] {
        std::array<String, 64> names;
        for (uint32 i = 0; i < names.size(); i++)
            names[i] = numbered_name(i);
        return names;
    }();
    return number < first_names.size() ? first_names[number] : numbered_name(number);
}

/// What the three classes have in common; null for a LUN that is not wanted. A LUN goes by the path on which
/// it is seen.
template <class T>
Ref<T> create_lun(classId_t id, const Array<String>& identification, const _hbaPortInfo& port,
                  const _hbaLunInfo& lun, const Wanted& wanted)
{
    static const Lasting_Array<uint16> okay = {2};
    if (!wanted.may_begin_with(&T::DeviceID, lun.path))
        return Ref<T>();
    String element = element_name(lun.number);
    const std::string_view device_parts[] = {
        lun.path, trimmed(lun.vendor), "_", trimmed(lun.productID), "_", {element.c_str(), element.size()}};
    Ref<T> instance = create_wanted(wanted, &T::DeviceID, device_parts);
    if (!instance)
        return instance;
    String device_id = String::joined(device_parts);
    set_system_keys(*instance, id, port.systemName);
    if (wanted.whole()) {
        instance->ElementName.set(std::move(element));
        instance->OtherIdentifyingInfo.set(array_of(device_id));
        instance->IdentifyingDescriptions.set(identification);
        instance->OperationalStatus.set(okay);
    }
    instance->DeviceID.set(std::move(device_id));
    return instance;
}

} // namespace

KALDERA_StorageExtent* TargetHelper::getStorageExtentInstance(const _hbaPortInfo& port,
                                                              const _hbaLunInfo& lun,
                                                              const Wanted& wanted) const
{
    LOG_SCOPE("getStorageExtentInstance");
    static const Lasting_Array<String> identification = {
        "It is a unique identification for a Storage Extent"};
    auto extent = create_lun<KALDERA_StorageExtent>(STORAGEEXTENT, identification, port, lun, wanted);
    const Name_Row* const row = name_row(lun);
    if (!row)
        LOG(ERR, "Default idType. Should not have reached here. ");
    if (extent && wanted.whole()) {
        extent->Name.set(row ? name(row->source, lun) : "");
        if (row) {
            extent->NameFormat.set(row->format);
            extent->NameNamespace.set(row->name_space);
        }
    }
    LOG(DBG, "Returned instance of StorageExtent for port WWN= %s", port.portWWN);
    return extent.steal();
}

KALDERA_TapeDrive* TargetHelper::getTapeDriveInstance(const _hbaPortInfo& port, const _hbaLunInfo& lun,
                                                      const Wanted& wanted) const
{
    LOG_SCOPE("getTapeDriveInstance");
    static const Lasting_Array<String> identification = {"It is a unique identification for a Tape Drive"};
    auto drive = create_lun<KALDERA_TapeDrive>(TAPEDRIVE, identification, port, lun, wanted);
    const Name_Row* const row = name_row(lun);
    if (!row)
        LOG(ERR, "Default case for lunInfo.idType. Should not have reached here. ");
    if (drive && wanted.whole())
        drive->Name.set(row ? name(row->source, lun) : "");
    LOG(DBG, "Returned instance of TapeDrive for port WWN= %s", port.portWWN);
    return drive.steal();
}

KALDERA_LogicalDisk* TargetHelper::getLogicalDiskInstance(const _hbaPortInfo& port, const _hbaLunInfo& lun,
                                                          const Wanted& wanted) const
{
    LOG_SCOPE("getLogicalDiskInstance");
    static const Lasting_Array<String> identification = {"It is a unique identification for a Logical Disk"};
    auto disk = create_lun<KALDERA_LogicalDisk>(LOGICALDISK, identification, port, lun, wanted);
    if (disk && wanted.whole()) {
        const std::string_view device = trimmed(lun.deviceName);
        const bool by_device = !device.empty();
        disk->Name.set(by_device ? to_String(device) : to_String(lun.description.view()));
        disk->NameFormat.set(by_device ? 12 : 1);
        disk->NameNamespace.set(by_device ? 8 : 1);
    }
    LOG(DBG, "Returned instance of logicalDisk for port WWN= %s", port.portWWN);
    return disk.steal();
}

} // namespace KPRV
