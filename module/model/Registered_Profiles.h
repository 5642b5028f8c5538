#pragma once

#include "module/runtime/ground/Array.h"
#include "module/runtime/ground/String.h"
#include "module/runtime/objects/Instance.h"

namespace KPRV {

// What the module claims to implement: constants of the program, the same on every host.

/// The registered profiles, `KALDERA_RegisteredProfile`, in the order of the table; the caller owns them.
Array<Instance*> registered_profiles();
/// The registered subprofiles, `KALDERA_RegisteredSubProfile`; the caller owns them.
Array<Instance*> registered_subprofiles();
/// Short names (`InstanceID`) of the subprofiles that belong to the profile of that short name, whatever its
/// case; empty if it has none or there is no such profile.
Array<String> subprofiles_of(const String& profile);

} // namespace KPRV
