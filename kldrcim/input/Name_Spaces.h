#pragma once

#include "broker/Host.h"

namespace KPRV::kldrcim {

using namespace broker;

/// True of the module that this program comes with, of which more is known than its library says.
bool is_own_module(const Host& host);

/// True if there is somebody for the name space. What another module serves cannot be known, and is believed.
/// False with `error`, which names those that there are.
bool is_served(const Host& host, const std::string& name_space, std::string& error);

} // namespace KPRV::kldrcim
