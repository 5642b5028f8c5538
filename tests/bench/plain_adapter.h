#pragma once

#include <json/value.h>

namespace KPRV::bench {

// What plain providers read of an adapter's answer.

/// False for an adapter without ports, which is not published.
bool plain_has_ports(const Json::Value& adapter);
/// By which an adapter goes, as the library writes it; null without a driver.
const Json::Value& plain_adapter_address(const Json::Value& adapter);

} // namespace KPRV::bench
