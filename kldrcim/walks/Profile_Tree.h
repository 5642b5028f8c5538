#pragma once

#include "kldrcim/walks/Association_Index.h"

namespace KPRV::kldrcim {

/// A registered profile, or what conforms to one.
struct Profile_Branch
{
    enum Kind
    {
        PROFILE,
        SUBPROFILE,
        ELEMENT,
        SOFTWARE,
    };

    Kind kind;
    Instance_Value instance;
    /// How many profiles and subprofiles are said to conform to this one.
    std::size_t conforming_profiles = 0;
    /// Profiles, elements, subprofiles and software, in this order.
    std::vector<Profile_Branch> children;
};

/// Where the walk starts.
extern const char* const profile_root_class;

/// Starts, as a client that knows nothing, at the registered profiles, and finds the rest by associations
/// alone. The roots are the profiles that conform to no other: one, the standard, as long as the module is
/// right. A subprofile stands under the profile that it belongs to, or under what it conforms to if it
/// belongs to none. Associations that cannot be asked leave their branches out and are told by
/// `index.failures()`.
std::vector<Profile_Branch> walk_profiles(Association_Index& index, const Class_Catalogue& catalogue);

} // namespace KPRV::kldrcim
