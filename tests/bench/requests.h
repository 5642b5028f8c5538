#pragma once

#include "tests/bench/Plain_Provider.h"
#include "tests/bench/Storage_Size.h"
#include "tests/bench/Twins.h"

namespace KPRV::bench {

// The requests that benchmarks measure, as twins of the module and a plain operation over a host of that
// size.

using Plain_Operation = std::function<plain_operation>;

Twins enumeration(const std::string& name, const char* class_name, const Storage_Size& size,
                  const Plain_Operation& plain);
/// Of a device of that class and id.
Twins get_instance(const std::string& name, const char* class_name, const std::string& id,
                   const Storage_Size& size, const Plain_Operation& plain);
/// From such a device.
Twins associator_names(const std::string& name, const char* association, const char* class_name,
                       const std::string& id, const Storage_Size& size, const Plain_Operation& plain);

// The keys of what the prepared library tells of last.

std::string last_fc_port(const Storage_Size& size);
std::string last_extent(const Storage_Size& size);
std::string last_adapter(const Storage_Size& size);

} // namespace KPRV::bench
