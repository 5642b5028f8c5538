#include "module/model/Connector_Data.h"

#include "module/model/Record_Filling.h"

namespace KPRV {

void fill_sfp(const Json::Value& answer, int adapter_id, int port_index, _sfpInfo& sfp)
{
    copy_trimmed(sfp.vendorName, answer, "vendorName");
    copy_trimmed(sfp.vendorPart, answer, "vendorPart");
    copy_trimmed(sfp.serialNumber, answer, "serialNo");
    copy_text(sfp.tag, std::string(sfp.serialNumber) + "_" + std::to_string(adapter_id) + "_" +
                           std::to_string(port_index));
    copy_member(sfp.extendedID, answer, "extendedID");
    copy_member(sfp.speed, answer, "speed");
    copy_trimmed(sfp.revision, answer, "revision");
}

} // namespace KPRV
