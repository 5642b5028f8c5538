#include "broker/values/Cim_Operations.h"

namespace KPRV::broker {

Result Cim_Operations::enumerate_instance_names(const std::string& class_name)
{
    return run({.operation = Operation::ENUMERATE_INSTANCE_NAMES, .path = {.class_name = class_name}});
}

Result Cim_Operations::enumerate_instances(const std::string& class_name, const Property_List& properties)
{
    return run({.operation = Operation::ENUMERATE_INSTANCES,
                .path = {.class_name = class_name},
                .properties = properties});
}

Result Cim_Operations::get_instance(const Path_Value& path, const Property_List& properties)
{
    return run({.operation = Operation::GET_INSTANCE, .path = path, .properties = properties});
}

Result Cim_Operations::create_instance(const Instance_Value& instance)
{
    return run({.operation = Operation::CREATE_INSTANCE, .path = instance.path, .instance = instance});
}

Result Cim_Operations::modify_instance(const Instance_Value& instance, const Property_List& properties)
{
    return run({.operation = Operation::MODIFY_INSTANCE,
                .path = instance.path,
                .properties = properties,
                .instance = instance});
}

Result Cim_Operations::delete_instance(const Path_Value& path)
{
    return run({.operation = Operation::DELETE_INSTANCE, .path = path});
}

Result Cim_Operations::invoke_method(const Path_Value& path, const std::string& method,
                                     const std::vector<Named_Value>& in)
{
    return run({.operation = Operation::INVOKE_METHOD, .path = path, .method = method, .in = in});
}

} // namespace KPRV::broker
