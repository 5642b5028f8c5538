#include "kldrcim/formats/Profile_Text.h"

#include "broker/values/Value_Text.h"
#include "kldrcim/formats/Branch_Text.h"
#include "kldrcim/formats/Format_Json.h"
#include "kldrcim/formats/Node_Label.h"

#include <algorithm>

namespace KPRV::kldrcim {

namespace {

using Kind = Profile_Branch::Kind;

constexpr const char* kind_names[] = {"profile", "subprofile", "element", "software"};

/// The two that register what is implemented here; others by their number.
std::string organization(const Instance_Value& instance)
{
    const Plain_Value* value = instance.property("RegisteredOrganization");
    if (!value || value->null)
        return "";
    const std::uint64_t number = value->as_uint();
    return number == 2 ? "DMTF" : number == 11 ? "SNIA" : "organization " + std::to_string(number);
}

Node_Label label(const Profile_Branch& branch)
{
    const Instance_Value& instance = branch.instance;
    Node_Label result = {kind_names[branch.kind], "", {}};
    switch (branch.kind) {
    case Kind::ELEMENT:
        result.what = instance.path.class_name;
        result.name = line_of(instance, "Name");
        break;
    case Kind::SOFTWARE:
        result.name = line_of(instance, "ElementName");
        result.facts = {line_of(instance, "VersionString"), line_of(instance, "Manufacturer")};
        break;
    default:
        result.name = line_of(instance, "RegisteredName");
        result.facts = {line_of(instance, "RegisteredVersion"), organization(instance)};
        if (branch.conforming_profiles > 0)
            result.facts.push_back(std::to_string(branch.conforming_profiles) + " profiles conform");
    }
    std::erase(result.facts, "");
    return result;
}

bool has_same(const std::vector<Profile_Branch>& branches, const Profile_Branch& wanted)
{
    return std::any_of(branches.begin(), branches.end(), [&](const Profile_Branch& branch) {
        return same_object(branch.instance.path, wanted.instance.path);
    });
}

Text_Branch lines_of(const Profile_Branch& branch, const Profile_Branch* parent)
{
    Text_Branch lines = {label_line(label(branch)), {}};
    for (const Profile_Branch& child : branch.children) {
        const bool told_above = child.kind == Kind::SOFTWARE && branch.kind == Kind::SUBPROFILE && parent &&
                                has_same(parent->children, child);
        if (!told_above)
            lines.children.push_back(lines_of(child, &branch));
    }
    return lines;
}

std::string json_of(const Profile_Branch& branch, unsigned indent)
{
    const Node_Label shown = label(branch);
    std::vector<std::string> children;
    for (const Profile_Branch& child : branch.children)
        children.push_back(json_of(child, indent + 4));
    return json_branch({kind_names[branch.kind], shown.what, shown.name, shown.facts,
                        path_text(branch.instance.path), std::move(children)},
                       indent);
}

} // namespace

std::string profile_text(const std::vector<Profile_Branch>& roots, bool ascii)
{
    std::vector<Text_Branch> lines;
    lines.reserve(roots.size());
    for (const Profile_Branch& root : roots)
        lines.push_back(lines_of(root, nullptr));
    return branch_text(lines, ascii);
}

std::string profile_json(const std::vector<Profile_Branch>& roots)
{
    const bool one = roots.size() == 1;
    std::vector<std::string> objects;
    objects.reserve(roots.size());
    for (const Profile_Branch& root : roots)
        objects.push_back(json_of(root, one ? 0 : 2));
    return (one ? objects.front() : json_array(objects)) + "\n";
}

} // namespace KPRV::kldrcim
