#include "module/model/Adapter_Data.h"

#include "module/adapter/Serial_Number.h"
#include "module/model/AdapterHelper.h"
#include "module/model/Record_Filling.h"
#include "module/runtime/log.h"

#include <cstdio>
#include <strings.h>

namespace KPRV {

namespace {

/// Vendors whose cards carry no FRU number.
bool has_no_fru(const char* vendor)
{
    return strncasecmp(vendor, "HP", 2) == 0 || strncasecmp(vendor, "DELL", 4) == 0;
}

} // namespace

void AdapterHelper::fillVPDInfo(const Json::Value& hba_data, _adapterData* adapter) const
{
    LOG_SCOPE("fillVPDInfo");
    const std::string vendor = asString(member(hba_data, "oem"));
    char line[128];
    snprintf(line, sizeof line, "Adapter vendor code is :%s", vendor.c_str());
    LOG(DBG, "%s", line);

    if (has_no_fru(vendor.c_str()))
        LOG(INFO, "%s VPD info doesnt have the FRU details to print.", vendor.c_str());
    else
        copy_member(adapter->fruNumber, hba_data, "fruNum");
    copy_member(adapter->partNumber, hba_data, "partNum");
    if (const auto serial = oem_serial_number(hba_data))
        copy_text(adapter->serialNumber, serial->c_str());
    copy_member(adapter->uuid, hba_data, "uuid");
}

/// What every adapter with a driver has.
void AdapterHelper::fill_common(const Json::Value& answer, _adapterData& adapter) const
{
    const Json::Value& hba_data = member(answer, "hbaData");
    copy_member(adapter.serialNumber, hba_data, "serialNumber");
    fillVPDInfo(hba_data, &adapter);
    copy_text(adapter.vendor, "KLDR");
    copy_trimmed(adapter.firmwareVersion, member(answer, "firmware"), "version");
    copy_member(adapter.model, hba_data, "model");
}

bool AdapterHelper::fill(const Json::Value& answer, int number, const char* index, Host_Name& host,
                         _adapterData& adapter) const
{
    const Json::Value& hba_data = member(answer, "hbaData");
    const Json::Value& driver = member(answer, "driver");

    adapter.isCNA = hasMember(hba_data, "hbaMAC");
    LOG(INFO, "Adapter Type : %s", adapter.isCNA ? "CNA" : "FC HBA");
    if (asInt(member(hba_data, "portCount")) == 0) {
        LOG(WARN, "There are no ports associated to Adapter id %d - %s", number, index);
        return false;
    }
    adapter.systemName = host.get();
    if (adapter.isCNA)
        copy_flat(adapter.mac, hba_data, "hbaMAC");

    // The texts below the address come with a driver: an adapter that has none is published with empty
    // fields.
    const bool network = hasMember(driver, "networkDriverName");
    const bool storage = hasMember(driver, "storageDriverName");
    if (network) {
        copy_member(adapter.networkDriverName, driver, "networkDriverName");
        copy_trimmed(adapter.networkDriverVersion, driver, "networkDriverVersion");
    }
    if (storage) {
        copy_flat(adapter.nodeWWN, hba_data, "wwn");
        copy_member(adapter.storageDriverName, driver, "storageDriverName");
        copy_trimmed(adapter.storageDriverVersion, driver, "storageDriverVersion");
    }
    if (network || storage)
        fill_common(answer, adapter);
    return true;
}

void AdapterHelper::fill_bios(const Json::Value& answer, _adapterData& adapter) const
{
    copy_trimmed(adapter.biosVersion, member(answer, "firmware"), "biosVersion");
    if (!ProviderUtil::valid_UTF_string(adapter.biosVersion))
        copy_text(adapter.biosVersion, "");
}

} // namespace KPRV
