#include "module/adapter/Serial_Number.h"

#include "module/adapter/Json_Access.h"

namespace KPRV {

std::optional<std::string> oem_serial_number(const Json::Value& hba_data)
{
    return oem_serial_number(member(hba_data, "oemSerialNum"), member(hba_data, "partNum"));
}

std::optional<std::string> oem_serial_number(const Json::Value& oem_serial_number,
                                             const Json::Value& part_number)
{
    std::string serial = asString(oem_serial_number);
    const std::string_view part = asView(part_number);
    if (serial.empty())
        return std::nullopt;
    if (serial.starts_with(part))
        serial.erase(0, part.size());
    return serial;
}

} // namespace KPRV
