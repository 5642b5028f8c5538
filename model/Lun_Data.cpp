#include "model/Lun_Data.h"

#include "model/Record_Filling.h"

namespace KPRV {

bool is_lun(const Json::Value& element)
{
    return hasMember(element, "vendor") && hasMember(element, "number") && hasMember(element, "productID");
}

void fill_lun(const Json::Value& element, const char* remote_wwn, bool& no_description_seen, _hbaLunInfo& lun)
{
    constexpr uint32 BY_PRODUCT = 0, UNKNOWN = 10;
    copy_flat(lun.remoteWWN, remote_wwn);
    lun.number = asUInt(member(element, "number"));
    copy_member(lun.vendor, element, "vendor");
    copy_member(lun.productID, element, "productID");
    lun.idType = asUInt(member(element, "lunDescIdType"));

    if (hasMember(element, "lunDescription"))
        copy_member(lun.description, element, "lunDescription");
    else
        no_description_seen = true;
    // One LUN without a description puts all that follow in the same walk under these rules, those with a
    // description, too: the names of LUNs that clients already keep depend on it.
    if (no_description_seen) {
        const bool has_serial = hasMember(element, "productSerialNumber");
        if (has_serial)
            copy_member(lun.serialNumber, element, "productSerialNumber");
        lun.idType = has_serial ? BY_PRODUCT : UNKNOWN;
    }
}

} // namespace KPRV
