#pragma once

#include <json/value.h>

#include <optional>
#include <string>

namespace KPRV {

/// The serial number that the maker of an OEM card gave it: `oemSerialNum` of `hbaData`, without `partNum` at
/// its front if that is glued to it (which can leave nothing). None if the card has no such number. Throws
/// `Not_Convertible`.
std::optional<std::string> oem_serial_number(const Json::Value& hba_data);
/// The same of the two members.
std::optional<std::string> oem_serial_number(const Json::Value& oem_serial_number,
                                             const Json::Value& part_number);

} // namespace KPRV
