#include "kldrcim/connection/Connection.h"

namespace KPRV::kldrcim {

Result Connection::enumerate_instance_names(const std::string& class_name)
{
    return run({.operation = Operation::ENUMERATE_INSTANCE_NAMES, .path = {.class_name = class_name}});
}

Result Connection::enumerate_instances(const std::string& class_name, const Property_List& properties)
{
    return run({.operation = Operation::ENUMERATE_INSTANCES,
                .path = {.class_name = class_name},
                .properties = properties});
}

Result Connection::get_instance(const Path_Value& path, const Property_List& properties)
{
    return run({.operation = Operation::GET_INSTANCE, .path = path, .properties = properties});
}

Result Connection::invoke_method(const Path_Value& path, const std::string& method,
                                 const std::vector<Named_Value>& in)
{
    return run({.operation = Operation::INVOKE_METHOD, .path = path, .method = method, .in = in});
}

} // namespace KPRV::kldrcim
