#include "module/model/Lun_Data.h"

#include <algorithm>

namespace KPRV {

namespace {

// What is read of an element, in the order of its members.
enum : size_t
{
    ID_TYPE,
    DESCRIPTION,
    NUMBER,
    PRODUCT_ID,
    PRODUCT_SERIAL_NUMBER,
    VENDOR,
    NUM_LUN_MEMBERS
};
constexpr std::array<std::string_view, NUM_LUN_MEMBERS> lun_members = {
    "lunDescIdType", "lunDescription", "number", "productID", "productSerialNumber", "vendor",
};
static_assert(std::ranges::is_sorted(lun_members));

} // namespace

bool fill_lun(const Json::Value& element, bool& no_description_seen, _hbaLunInfo& lun)
{
    constexpr uint32 BY_PRODUCT = 0, UNKNOWN = 10;
    constexpr size_t VENDOR_SIZE = 8, PRODUCT_SIZE = 16, TEXT_SIZE = 64;
    const Members<NUM_LUN_MEMBERS> members(element, lun_members);
    if (!members.has(VENDOR) || !members.has(NUMBER) || !members.has(PRODUCT_ID))
        return false;
    lun.number = asUInt(members[NUMBER]);
    lun.vendor = Cut_Text(members[VENDOR], VENDOR_SIZE);
    lun.productID = Cut_Text(members[PRODUCT_ID], PRODUCT_SIZE);
    lun.idType = asUInt(members[ID_TYPE]);

    if (members.has(DESCRIPTION))
        lun.description = Cut_Text(members[DESCRIPTION], TEXT_SIZE);
    else
        no_description_seen = true;
    // One LUN without a description puts all that follow in the same walk under these rules, those with a
    // description, too: the names of LUNs that clients already keep depend on it.
    if (no_description_seen) {
        if (members.has(PRODUCT_SERIAL_NUMBER))
            lun.serialNumber = Cut_Text(members[PRODUCT_SERIAL_NUMBER], TEXT_SIZE);
        lun.idType = members.has(PRODUCT_SERIAL_NUMBER) ? BY_PRODUCT : UNKNOWN;
    }
    return true;
}

} // namespace KPRV
