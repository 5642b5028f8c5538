#pragma once

#include "broker/values/Plain_Value.h"

#include <optional>

namespace KPRV::kldrcim {

using namespace broker;

/// A property's number, or the first of an array; nothing for a null or missing one.
std::optional<std::uint64_t> number_of(const Instance_Value& instance, const char* property);

/// A property's text; empty for a null or missing one, and for one that is no text.
std::string text_of(const Instance_Value& instance, const char* property);

} // namespace KPRV::kldrcim
