#pragma once

#include "module/runtime/ground/String.h"
#include "module/runtime/system/log.h"

#include <json/value.h>

namespace KPRV {

/// Asks the library for the addresses of all adapters. `response` keeps the answer; the result is its array
/// (or null value) `indexStrings`, a null pointer for a bad answer, which is told at ERR. The library's
/// exceptions pass.
const Json::Value* query_adapter_list(Call_Site site, Json::Value& response);

/// Address of an adapter by its place in that list, from 0; empty, told at ERR, if it is no text.
String adapter_address(Call_Site site, const Json::Value& list, unsigned index);

} // namespace KPRV
