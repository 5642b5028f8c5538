#pragma once

#include "broker/values/Receiver.h"
#include "broker/values/Request.h"

namespace KPRV::broker {

/// Somebody who carries out CIM operations, each of which is one request.
class Cim_Operations
{
public:
    virtual ~Cim_Operations() = default;

    /// One operation. With a receiver, instances and paths go there as they come, and are not in the result.
    virtual Result run(Request request, Receiver* receiver = nullptr) = 0;

    Result enumerate_instance_names(const std::string& class_name);
    Result enumerate_instances(const std::string& class_name, const Property_List& properties = {});
    Result get_instance(const Path_Value& path, const Property_List& properties = {});
    Result create_instance(const Instance_Value& instance);
    Result modify_instance(const Instance_Value& instance, const Property_List& properties = {});
    Result delete_instance(const Path_Value& path);
    Result invoke_method(const Path_Value& path, const std::string& method,
                         const std::vector<Named_Value>& in);
};

} // namespace KPRV::broker
