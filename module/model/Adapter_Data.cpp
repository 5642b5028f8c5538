#include "module/model/Adapter_Data.h"

#include "module/adapter/Serial_Number.h"
#include "module/model/AdapterHelper.h"
#include "module/model/Record_Filling.h"
#include "module/runtime/system/log.h"

#include <algorithm>
#include <strings.h>

namespace KPRV {

namespace {

// What is read of `hbaData` and `driver`, in the order of their members.
enum : size_t
{
    HBA_FRU_NUMBER,
    HBA_MAC,
    HBA_STATUS,
    HBA_MODEL,
    HBA_OEM,
    HBA_OEM_SERIAL_NUMBER,
    HBA_PART_NUMBER,
    HBA_PORT_COUNT,
    HBA_SERIAL_NUMBER,
    HBA_UUID,
    HBA_WWN,
    NUM_HBA_MEMBERS
};
constexpr std::array<std::string_view, NUM_HBA_MEMBERS> hba_members = {
    "fruNum",  "hbaMAC",    "hbaStatus",    "model", "oem", "oemSerialNum",
    "partNum", "portCount", "serialNumber", "uuid",  "wwn",
};
static_assert(std::ranges::is_sorted(hba_members));

enum : size_t
{
    NETWORK_NAME,
    NETWORK_VERSION,
    STORAGE_NAME,
    STORAGE_VERSION,
    NUM_DRIVER_MEMBERS
};
constexpr std::array<std::string_view, NUM_DRIVER_MEMBERS> driver_members = {
    "networkDriverName",
    "networkDriverVersion",
    "storageDriverName",
    "storageDriverVersion",
};
static_assert(std::ranges::is_sorted(driver_members));

/// Vendors whose cards carry no FRU number.
bool has_no_fru(const char* vendor)
{
    return strncasecmp(vendor, "HP", 2) == 0 || strncasecmp(vendor, "DELL", 4) == 0;
}

} // namespace

struct AdapterHelper::Hba_Members : Members<NUM_HBA_MEMBERS>
{
    using Members::Members;
};

void AdapterHelper::fillVPDInfo(const Json::Value& hba_data, _adapterData* adapter) const
{
    fill_vpd(Hba_Members(hba_data, hba_members), *adapter);
}

void AdapterHelper::fill_vpd(const Hba_Members& hba, _adapterData& adapter) const
{
    LOG_SCOPE("fillVPDInfo");
    const std::string vendor = asString(hba[HBA_OEM]);
    // Cut as it always was.
    LOG(DBG, "Adapter vendor code is :%.103s", vendor.c_str());

    if (has_no_fru(vendor.c_str()))
        LOG(INFO, "%s VPD info doesnt have the FRU details to print.", vendor.c_str());
    else
        copy_text(adapter.fruNumber, asView(hba[HBA_FRU_NUMBER]));
    copy_text(adapter.partNumber, asView(hba[HBA_PART_NUMBER]));
    if (const auto serial = oem_serial_number(hba[HBA_OEM_SERIAL_NUMBER], hba[HBA_PART_NUMBER]))
        copy_text(adapter.serialNumber, serial->c_str());
    copy_text(adapter.uuid, asView(hba[HBA_UUID]));
}

/// What every adapter with a driver has.
void AdapterHelper::fill_common(const Json::Value& answer, const Hba_Members& hba,
                                _adapterData& adapter) const
{
    copy_text(adapter.serialNumber, asView(hba[HBA_SERIAL_NUMBER]));
    fill_vpd(hba, adapter);
    copy_text(adapter.vendor, "KLDR");
    copy_trimmed(adapter.firmwareVersion, member(answer, "firmware"), "version");
    copy_text(adapter.model, asView(hba[HBA_MODEL]));
}

bool AdapterHelper::fill(const Json::Value& answer, int number, const char* index, Host_Name& host,
                         _adapterData& adapter) const
{
    const Hba_Members hba(member(answer, "hbaData"), hba_members);
    const Members<NUM_DRIVER_MEMBERS> driver(member(answer, "driver"), driver_members);

    adapter.isCNA = hba.has(HBA_MAC);
    LOG(INFO, "Adapter Type : %s", adapter.isCNA ? "CNA" : "FC HBA");
    if (asInt(hba[HBA_PORT_COUNT]) == 0) {
        LOG(WARN, "There are no ports associated to Adapter id %d - %s", number, index);
        return false;
    }
    adapter.systemName = host.get();
    if (adapter.isCNA)
        copy_flat(adapter.mac, text_of(hba[HBA_MAC]));

    // The texts below the address come with a driver: an adapter that has none is published with empty
    // fields.
    const bool network = driver.has(NETWORK_NAME);
    const bool storage = driver.has(STORAGE_NAME);
    if (network) {
        copy_text(adapter.networkDriverName, asView(driver[NETWORK_NAME]));
        copy_trimmed(adapter.networkDriverVersion, driver[NETWORK_VERSION]);
    }
    if (storage) {
        copy_flat(adapter.nodeWWN, text_of(hba[HBA_WWN]));
        copy_text(adapter.storageDriverName, asView(driver[STORAGE_NAME]));
        copy_trimmed(adapter.storageDriverVersion, driver[STORAGE_VERSION]);
    }
    if (network || storage)
        fill_common(answer, hba, adapter);
    adapter.status = asBool(hba[HBA_STATUS]) ? 11 : 10;
    return true;
}

void AdapterHelper::fill_bios(const Json::Value& answer, _adapterData& adapter) const
{
    copy_trimmed(adapter.biosVersion, member(answer, "firmware"), "biosVersion");
    if (!ProviderUtil::valid_UTF_string(adapter.biosVersion))
        copy_text(adapter.biosVersion, "");
}

} // namespace KPRV
