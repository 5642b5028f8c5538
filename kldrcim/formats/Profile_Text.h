#pragma once

#include "kldrcim/walks/Profile_Tree.h"

namespace KPRV::kldrcim {

/// The tree for people, one line a branch. The software of a subprofile is shown only where it is not that of
/// its profile.
std::string profile_text(const std::vector<Profile_Branch>& roots, bool ascii);

/// All of it as nested objects with the members of the topology's tree: "kind", "what", "name", "facts",
/// "path" and, unless it is empty, "children"; an array if the roots are not exactly one.
std::string profile_json(const std::vector<Profile_Branch>& roots);

} // namespace KPRV::kldrcim
