#include "kldrcim/walks/Association_Index.h"

#include "broker/values/Path_Identity.h"

#include <unordered_set>

namespace KPRV::kldrcim {

namespace {

/// Null if the link has no such end.
const Path_Value* end_of(const Path_Value& link, const char* role)
{
    const Plain_Value* value = link.key(role);
    return value ? value->as_path() : nullptr;
}

} // namespace

void Association_Index::note_failure(const std::string& class_name, const Result& result)
{
    if (!result.ok())
        _failures.push_back({class_name, result.rc, result.message});
}

const std::vector<Path_Value>& Association_Index::names(const std::string& class_name)
{
    auto [at, is_new] = _names.try_emplace(class_name);
    if (is_new) {
        Result result = _connection.enumerate_instance_names(class_name);
        note_failure(class_name, result);
        at->second = std::move(result.paths);
    }
    return at->second;
}

std::vector<Path_Value> Association_Index::far_ends(const char* association, const char* near_role,
                                                    const Path_Value& object, const char* far_role,
                                                    const char* above_role, const Path_Value* above)
{
    // The references of an association are its keys, so that names tell all.
    const std::vector<Path_Value>& all = names(association);
    auto [positions, is_new] = _positions.try_emplace(std::string(association) + "." + near_role);
    if (is_new)
        for (std::size_t i = 0; i < all.size(); ++i)
            if (const Path_Value* near = end_of(all[i], near_role))
                positions->second[path_identity(*near)].push_back(i);
    std::vector<Path_Value> ends;
    auto at = positions->second.find(path_identity(object));
    if (at == positions->second.end())
        return ends;
    std::unordered_set<std::string> seen;
    for (std::size_t i : at->second) {
        const Path_Value* far = end_of(all[i], far_role);
        const Path_Value* held = above_role ? end_of(all[i], above_role) : nullptr;
        bool fits = !above_role || (held && above && same_object(*held, *above));
        if (far && fits && seen.insert(path_identity(*far)).second)
            ends.push_back(*far);
    }
    return ends;
}

const Association_Index::Class_Instances& Association_Index::class_instances(const std::string& class_name)
{
    auto [at, is_new] = _instances.try_emplace(lower_name(class_name));
    Class_Instances& kept = at->second;
    if (!is_new)
        return kept;
    Result result = _connection.enumerate_instances(class_name);
    note_failure(class_name, result);
    kept.instances = std::move(result.instances);
    for (std::size_t i = 0; i < kept.instances.size(); ++i)
        kept.by_path.emplace(path_identity(kept.instances[i].path), i);
    return kept;
}

const std::vector<Instance_Value>& Association_Index::instances(const std::string& class_name)
{
    return class_instances(class_name).instances;
}

Instance_Value Association_Index::instance(const Path_Value& path)
{
    const Class_Instances& kept = class_instances(path.class_name);
    auto at = kept.by_path.find(path_identity(path));
    return at == kept.by_path.end() ? Instance_Value{path, path.keys} : kept.instances[at->second];
}

} // namespace KPRV::kldrcim
