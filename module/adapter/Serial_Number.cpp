#include "module/adapter/Serial_Number.h"

#include "module/adapter/Json_Access.h"

namespace KPRV {

std::optional<std::string> oem_serial_number(const Json::Value& hba_data)
{
    std::string serial = asString(member(hba_data, "oemSerialNum"));
    const std::string part = asString(member(hba_data, "partNum"));
    if (serial.empty())
        return std::nullopt;
    if (serial.starts_with(part))
        serial.erase(0, part.size());
    return serial;
}

} // namespace KPRV
