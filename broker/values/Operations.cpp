#include "broker/values/Operations.h"

namespace KPRV::broker {

Result Operations::enumerate_instance_names(const std::string& class_name)
{
    return run({.operation = Operation::ENUMERATE_INSTANCE_NAMES, .path = {.class_name = class_name}});
}

Result Operations::enumerate_instances(const std::string& class_name, const Property_List& properties)
{
    return run({.operation = Operation::ENUMERATE_INSTANCES,
                .path = {.class_name = class_name},
                .properties = properties});
}

Result Operations::get_instance(const Path_Value& path, const Property_List& properties)
{
    return run({.operation = Operation::GET_INSTANCE, .path = path, .properties = properties});
}

Result Operations::create_instance(const Instance_Value& instance)
{
    return run({.operation = Operation::CREATE_INSTANCE, .path = instance.path, .instance = instance});
}

Result Operations::modify_instance(const Instance_Value& instance, const Property_List& properties)
{
    return run({.operation = Operation::MODIFY_INSTANCE,
                .path = instance.path,
                .properties = properties,
                .instance = instance});
}

Result Operations::delete_instance(const Path_Value& path)
{
    return run({.operation = Operation::DELETE_INSTANCE, .path = path});
}

Result Operations::invoke_method(const Path_Value& path, const std::string& method,
                                 const std::vector<Named_Value>& in)
{
    return run({.operation = Operation::INVOKE_METHOD, .path = path, .method = method, .in = in});
}

} // namespace KPRV::broker
