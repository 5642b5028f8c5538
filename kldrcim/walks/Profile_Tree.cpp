#include "kldrcim/walks/Profile_Tree.h"

#include "broker/values/Path_Identity.h"

#include <unordered_set>

namespace KPRV::kldrcim {

const char* const profile_root_class = "KALDERA_RegisteredProfile";

namespace {

/// A way from one object to others.
struct Way
{
    const char* association;
    const char* near_role;
    const char* far_role;
};

constexpr Way conforming = {"KALDERA_ElementConformsToProfile", "ConformantStandard", "ManagedElement"};
constexpr Way standards = {"KALDERA_ElementConformsToProfile", "ManagedElement", "ConformantStandard"};
constexpr Way subprofiles = {"KALDERA_SubProfileRequiresProfile", "Antecedent", "Dependent"};
constexpr Way parents = {"KALDERA_SubProfileRequiresProfile", "Dependent", "Antecedent"};
constexpr Way software = {"KALDERA_ProfileElementSoftwareIdentity", "Dependent", "Antecedent"};

class Profile_Walk
{
public:
    Profile_Walk(Association_Index& index, const Class_Catalogue& catalogue)
        : _index(index), _catalogue(catalogue)
    {
    }

    std::vector<Profile_Branch> run()
    {
        std::vector<Profile_Branch> roots;
        for (const Instance_Value& profile : _index.instances(profile_root_class))
            if (ends(standards, profile.path).empty())
                roots.push_back(branch(profile.path));
        return roots;
    }

private:
    using Kind = Profile_Branch::Kind;

    std::vector<Path_Value> ends(const Way& way, const Path_Value& path)
    {
        return _index.far_ends(way.association, way.near_role, path, way.far_role);
    }

    Kind kind_of(const Path_Value& path) const
    {
        // A subprofile is a profile to the schema.
        if (_catalogue.is_a(path.class_name, "CIM_RegisteredSubProfile"))
            return Kind::SUBPROFILE;
        return _catalogue.is_a(path.class_name, "CIM_RegisteredProfile") ? Kind::PROFILE : Kind::ELEMENT;
    }

    Profile_Branch leaf(Kind kind, const Path_Value& path) { return {kind, _index.instance(path), 0, {}}; }

    /// A profile or subprofile with what conforms to it. Profiles that conform to each other in a circle are
    /// entered once.
    Profile_Branch branch(const Path_Value& path)
    {
        Profile_Branch result = leaf(kind_of(path), path);
        if (!_entered.insert(path_identity(path)).second)
            return result;
        std::vector<Profile_Branch> elements, below;
        for (const Path_Value& end : ends(conforming, path)) {
            const Kind kind = kind_of(end);
            if (kind == Kind::ELEMENT) {
                elements.push_back(leaf(kind, end));
                continue;
            }
            ++result.conforming_profiles;
            if (kind == Kind::PROFILE)
                result.children.push_back(branch(end));
            else if (ends(parents, end).empty())
                below.push_back(branch(end));
        }
        for (const Path_Value& end : ends(subprofiles, path))
            below.push_back(branch(end));
        for (const Path_Value& end : ends(software, path))
            below.push_back(leaf(Kind::SOFTWARE, end));
        for (std::vector<Profile_Branch>* more : {&elements, &below})
            result.children.insert(result.children.end(), std::make_move_iterator(more->begin()),
                                   std::make_move_iterator(more->end()));
        return result;
    }

    Association_Index& _index;
    const Class_Catalogue& _catalogue;
    std::unordered_set<std::string> _entered;
};

} // namespace

std::vector<Profile_Branch> walk_profiles(Association_Index& index, const Class_Catalogue& catalogue)
{
    return Profile_Walk(index, catalogue).run();
}

} // namespace KPRV::kldrcim
