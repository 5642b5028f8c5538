#include "broker/Server_Store.h"

#include "broker/Convert.h"
#include "broker/values/Class_Catalogue.h"

#include <algorithm>

namespace KPRV::broker {

namespace {

std::string method_key(const std::string& class_name, const std::string& method)
{
    return lower_name(class_name + "." + method);
}

Result failed(CMPIrc rc)
{
    Result result;
    result.rc = rc;
    return result;
}

} // namespace

void Server_Store::add_name_space(const std::string& name_space)
{
    const Auto_Lock lock(_mutex);
    _spaces[lower_name(name_space)];
}

void Server_Store::add(const std::string& name_space, Instance_Value instance)
{
    instance.path.name_space = name_space;
    const Auto_Lock lock(_mutex);
    _spaces[lower_name(name_space)].instances.push_back(std::move(instance));
}

void Server_Store::add_class(const std::string& name_space, const std::string& class_name,
                             const std::string& superclass)
{
    const Auto_Lock lock(_mutex);
    std::string& known = _spaces[lower_name(name_space)].classes[lower_name(class_name)];
    if (!superclass.empty())
        known = lower_name(superclass);
}

void Server_Store::refuse(const std::string& name_space, CMPIrc rc)
{
    const Auto_Lock lock(_mutex);
    _spaces[lower_name(name_space)].refusal = rc;
}

bool Server_Store::Name_Space::is_a(const Class_Catalogue& catalogue, const std::string& class_name,
                                    const std::string& ancestor) const
{
    std::string name = class_name;
    // Whoever names a class as its own ancestor should not be waited for.
    for (std::size_t step = 0; step <= classes.size() && !name.empty(); ++step) {
        if (catalogue.is_a(name, ancestor))
            return true;
        auto at = classes.find(lower_name(name));
        name = at == classes.end() ? "" : at->second;
    }
    return false;
}

void Server_Store::on_method(const std::string& name_space, const std::string& class_name,
                             const std::string& method, Method answer)
{
    const Auto_Lock lock(_mutex);
    _spaces[lower_name(name_space)].methods[method_key(class_name, method)] = std::move(answer);
}

bool Server_Store::has_name_space(const std::string& name_space) const
{
    const Auto_Lock lock(_mutex);
    return _spaces.count(lower_name(name_space)) != 0;
}

bool Server_Store::serves(const Class_Catalogue& catalogue, const Path_Value& path) const
{
    const Auto_Lock lock(_mutex);
    auto found = _spaces.find(lower_name(path.name_space));
    if (found == _spaces.end())
        return false;
    const Name_Space& space = found->second;
    if (space.refusal)
        return true;
    std::string prefix = lower_name(path.class_name) + ".";
    auto method = space.methods.lower_bound(prefix);
    if (method != space.methods.end() && method->first.starts_with(prefix))
        return true;
    auto fits = [&](const std::string& class_name) {
        return space.is_a(catalogue, class_name, path.class_name);
    };
    return std::any_of(space.instances.begin(), space.instances.end(),
                       [&](const Instance_Value& instance) { return fits(instance.path.class_name); }) ||
           std::any_of(space.classes.begin(), space.classes.end(),
                       [&](const auto& known) { return fits(known.first); });
}

std::vector<Instance_Value> Server_Store::instances(const std::string& name_space) const
{
    const Auto_Lock lock(_mutex);
    auto space = _spaces.find(lower_name(name_space));
    return space == _spaces.end() ? std::vector<Instance_Value>() : space->second.instances;
}

std::vector<Instance_Value>::iterator Server_Store::find(Name_Space& space, const Path_Value& path)
{
    return std::find_if(space.instances.begin(), space.instances.end(),
                        [&](const Instance_Value& instance) { return same_object(instance.path, path); });
}

Result Server_Store::run(const Class_Catalogue& catalogue, const Request& request)
{
    std::optional<Method> method;
    Result result = look_up(catalogue, request, method);
    return method ? (*method)(request) : result;
}

Result Server_Store::look_up(const Class_Catalogue& catalogue, const Request& request,
                             std::optional<Method>& method)
{
    const Auto_Lock lock(_mutex);
    Name_Space& space = _spaces[lower_name(request.path.name_space)];
    if (space.refusal)
        return failed(*space.refusal);
    switch (request.operation) {
    case Operation::ENUMERATE_INSTANCES:
    case Operation::ENUMERATE_INSTANCE_NAMES:
        return enumerate(catalogue, space, request);
    case Operation::INVOKE_METHOD: {
        auto known = space.methods.find(method_key(request.path.class_name, request.method));
        if (known == space.methods.end())
            return failed(CMPI_RC_ERR_METHOD_NOT_FOUND);
        method = known->second;
        return {};
    }
    case Operation::GET_INSTANCE:
    case Operation::CREATE_INSTANCE:
    case Operation::MODIFY_INSTANCE:
    case Operation::DELETE_INSTANCE:
        return change(space, request);
    default:
        return failed(CMPI_RC_ERR_NOT_SUPPORTED);
    }
}

Result Server_Store::enumerate(const Class_Catalogue& catalogue, const Name_Space& space,
                               const Request& request) const
{
    Result result;
    for (const Instance_Value& instance : space.instances) {
        if (!space.is_a(catalogue, instance.path.class_name, request.path.class_name))
            continue;
        if (request.operation == Operation::ENUMERATE_INSTANCES)
            result.instances.push_back(instance);
        else
            result.paths.push_back(instance.path);
    }
    return result;
}

Result Server_Store::change(Name_Space& space, const Request& request)
{
    auto at = find(space, request.path);
    bool create = request.operation == Operation::CREATE_INSTANCE;
    if (create != (at == space.instances.end()))
        return failed(create ? CMPI_RC_ERR_ALREADY_EXISTS : CMPI_RC_ERR_NOT_FOUND);
    Result result;
    switch (request.operation) {
    case Operation::GET_INSTANCE:
        result.instances.push_back(*at);
        break;
    case Operation::CREATE_INSTANCE:
        space.instances.push_back({request.path, request.instance.properties});
        result.paths.push_back(request.path);
        break;
    case Operation::MODIFY_INSTANCE:
        for (const Named_Value& property : request.instance.properties)
            if (!request.properties || contains_name(*request.properties, property.name))
                set_value(at->properties, property.name, property.value);
        break;
    default:
        space.instances.erase(at);
    }
    return result;
}

} // namespace KPRV::broker
