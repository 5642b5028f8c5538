#include "broker/Association_Routing.h"

#include "broker/values/Path_Identity.h"

#include <algorithm>

namespace KPRV::broker {

namespace {

bool can_hold(const Class_Catalogue& catalogue, const Class_Info& association, const std::string& class_name)
{
    return std::any_of(association.properties.begin(), association.properties.end(),
                       [&](const Feature_Info& feature) {
                           return feature.type == CMPI_ref && !feature.target_class.empty() &&
                                  catalogue.is_a(class_name, feature.target_class);
                       });
}

} // namespace

std::vector<std::string> association_classes(const Class_Catalogue& catalogue, const Request& request)
{
    const std::string& named = named_association(request);
    std::vector<std::string> classes;
    for (const std::string& name : catalogue.class_names()) {
        const Class_Info* info = catalogue.find(name);
        if (info->is_association && (named.empty() ? can_hold(catalogue, *info, request.path.class_name)
                                                   : catalogue.is_a(name, named)))
            classes.push_back(info->name);
    }
    // A module that does not publish its classes can still be asked by name.
    if (classes.empty() && !named.empty() && !catalogue.find(named))
        classes.push_back(named);
    return classes;
}

void Association_Merge::add(const std::string& provider_class, Result one)
{
    _sum.done_count += one.done_count;
    _sum.stopped = one.stopped;
    if (!one.ok()) {
        _sum.failures.push_back({provider_class, one.rc, one.message});
        if (!_first_failure)
            _first_failure = std::move(one);
        return;
    }
    _succeeded = true;
    for (Instance_Value& instance : one.instances)
        if (is_new(instance.path))
            _sum.instances.push_back(std::move(instance));
    for (Path_Value& path : one.paths)
        if (is_new(path))
            _sum.paths.push_back(std::move(path));
}

bool Association_Merge::instance(Instance_Value&& instance)
{
    return !is_new(instance.path) || _receiver->instance(std::move(instance));
}

bool Association_Merge::path(Path_Value&& path)
{
    return !is_new(path) || _receiver->path(std::move(path));
}

/// An instance whose path has no keys (some providers return such) cannot be told from its like: it stays.
bool Association_Merge::is_new(const Path_Value& path)
{
    return path.keys.empty() || _seen.insert(lower_name(path.name_space) + ":" + path_identity(path)).second;
}

Result Association_Merge::settle()
{
    if (_first_failure && !_succeeded) {
        _sum.rc = _first_failure->rc;
        _sum.message = _first_failure->message;
        _sum.exception = _first_failure->exception;
    }
    _sum.done = _sum.done_count > 0;
    return std::move(_sum);
}

} // namespace KPRV::broker
