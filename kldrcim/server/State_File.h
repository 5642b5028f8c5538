#pragma once

#include "broker/values/Class_Catalogue.h"

#include <string>
#include <vector>

namespace KPRV::kldrcim {

using namespace broker;

/// Instances in a file, as CIM in XML. A file that is not there holds none. False with `error` for one that
/// cannot be read.
bool read_state(const std::string& file, const Class_Catalogue& classes,
                std::vector<Instance_Value>& instances, std::string& error);

/// All or nothing: the new file takes the place of the old one when it is complete. Closed to others, since
/// listeners' URLs may hold what only they should know.
bool write_state(const std::string& file, const std::vector<Instance_Value>& instances, std::string& error);

} // namespace KPRV::kldrcim
