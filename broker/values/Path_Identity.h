#pragma once

#include "broker/values/Plain_Value.h"

namespace KPRV::broker {

/// A text that is equal for two paths exactly if `same_object` holds for them: class and keys without regard
/// to case and order, integers by number, host and name space left out. For indexes; not for people.
std::string path_identity(const Path_Value& path);

} // namespace KPRV::broker
