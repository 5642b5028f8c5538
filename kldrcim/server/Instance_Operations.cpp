// The operations on instances.
#include "kldrcim/server/Cim_Server.h"
#include "kldrcim/server/Object_Answers.h"

#include "kldrcim/wire/Instance_Reading.h"

namespace KPRV::kldrcim {

namespace {

using Tag = Xml_Tag;

Instance_Form form_of(const Operation_Call& call)
{
    Instance_Form form;
    form.properties = call.parameters.names("PropertyList");
    if (call.parameters.flag("IncludeClassOrigin", false))
        form.origins = &call.space.classes();
    return form;
}

Result enumerate_instances(const Operation_Call& call)
{
    const std::string class_name = call.parameters.required_class_name("ClassName");
    Instance_Form form = form_of(call);
    if (!call.parameters.flag("DeepInheritance", true))
        form.seen_as = call.space.classes().find(class_name);
    Request request = call.request(Operation::ENUMERATE_INSTANCES, {.class_name = class_name});
    request.properties = form.properties;
    call.answer.open_values();
    Object_Answers receiver(call, form, Object_Text::NAMED);
    return receiver.run(std::move(request));
}

Result enumerate_instance_names(const Operation_Call& call)
{
    call.answer.open_values();
    const std::string class_name = call.parameters.required_class_name("ClassName");
    Object_Answers receiver(call, {}, Object_Text::NAMED);
    return receiver.run(call.request(Operation::ENUMERATE_INSTANCE_NAMES, {.class_name = class_name}));
}

/// One instance, or why there is none.
Result get_one(const Operation_Call& call, const Property_List& properties, Instance_Value& instance)
{
    Request request = call.request(Operation::GET_INSTANCE, call.path("InstanceName"));
    request.properties = properties;
    Result result = call.space.run(std::move(request), nullptr);
    if (result.ok() && result.instances.empty())
        return failed(CMPI_RC_ERR_NOT_FOUND, "");
    if (result.ok())
        instance = std::move(result.instances.front());
    return result;
}

Result get_instance(const Operation_Call& call)
{
    const Instance_Form form = form_of(call);
    Instance_Value instance;
    Result result = get_one(call, form.properties, instance);
    if (result.ok())
        write_instance(call.answer.object(), instance, form);
    return result;
}

Result create_instance(const Operation_Call& call)
{
    const Xml_Node node = call.parameters.required("NewInstance");
    Instance_Value instance = Instance_Reader(call.space.classes()).instance(node);
    Request request = call.request(Operation::CREATE_INSTANCE, {.class_name = instance.path.class_name});
    // The keys are properties of what is to be created.
    if (const Class_Info* info = call.space.classes().find(instance.path.class_name))
        for (const Named_Value& property : instance.properties)
            if (const Feature_Info* feature = info->property(property.name); feature && feature->key)
                request.path.keys.push_back(property);
    instance.path = request.path;
    request.instance = std::move(instance);
    Result result = call.space.run(std::move(request), nullptr);
    if (result.ok() && !result.paths.empty())
        write_instance_name(call.answer.object(), result.paths.front());
    return result;
}

Result modify(const Operation_Call& call, Path_Value path, std::vector<Named_Value> properties,
              Property_List names)
{
    Request request = call.request(Operation::MODIFY_INSTANCE, std::move(path));
    request.properties = std::move(names);
    request.instance = {request.path, std::move(properties)};
    return call.space.run(std::move(request), nullptr);
}

Result modify_instance(const Operation_Call& call)
{
    const Xml_Node node = call.parameters.required("ModifiedInstance");
    Instance_Value instance = Instance_Reader(call.space.classes()).instance_with_path(node);
    return modify(call, instance.path, std::move(instance.properties), call.parameters.names("PropertyList"));
}

Result delete_instance(const Operation_Call& call)
{
    return call.space.run(call.request(Operation::DELETE_INSTANCE, call.path("InstanceName")), nullptr);
}

/// What the class says of a property; status 12 if it has none of that name.
const Feature_Info& property_of(const Operation_Call& call, const Path_Value& path, const std::string& name)
{
    const Class_Info* info = call.space.classes().find(path.class_name);
    const Feature_Info* feature = info ? info->property(name) : nullptr;
    if (!feature)
        throw Wire_Error::status(info ? CMPI_RC_ERR_NO_SUCH_PROPERTY : CMPI_RC_ERR_INVALID_CLASS,
                                 info ? name : path.class_name);
    return *feature;
}

Result get_property(const Operation_Call& call)
{
    call.parameters.required("PropertyName");
    const std::string name =
        property_of(call, call.path("InstanceName"), call.parameters.text("PropertyName")).name;
    Instance_Value instance;
    Result result = get_one(call, std::vector{name}, instance);
    const Plain_Value* value = result.ok() ? instance.property(name) : nullptr;
    if (value && !value->null)
        write_value(call.answer.object(), *value);
    return result;
}

Result set_property(const Operation_Call& call)
{
    call.parameters.required("PropertyName");
    const Path_Value path = call.path("InstanceName");
    const Feature_Info& feature = property_of(call, path, call.parameters.text("PropertyName"));
    Plain_Value value =
        Instance_Reader(call.space.classes()).value(call.parameters.find("NewValue"), feature.type);
    return modify(call, path, {{feature.name, std::move(value)}}, std::vector{feature.name});
}

constexpr const char* instance_options =
    "ClassName LocalOnly DeepInheritance IncludeQualifiers IncludeClassOrigin "
    "PropertyList";

// clang-format off
constexpr Operation_Row rows[] = {
    {"EnumerateInstances",     instance_options,                          true,  enumerate_instances},
    {"EnumerateInstanceNames", "ClassName",                               true,  enumerate_instance_names},
    {"GetInstance",            "InstanceName LocalOnly IncludeQualifiers IncludeClassOrigin PropertyList", false, get_instance},
    {"CreateInstance",         "NewInstance",                             false, create_instance},
    {"ModifyInstance",         "ModifiedInstance IncludeQualifiers PropertyList", false, modify_instance},
    {"DeleteInstance",         "InstanceName",                            false, delete_instance},
    {"GetProperty",            "InstanceName PropertyName",               false, get_property},
    {"SetProperty",            "InstanceName PropertyName NewValue",      false, set_property},
};
// clang-format on

} // namespace

std::span<const Operation_Row> instance_operations()
{
    return rows;
}

} // namespace KPRV::kldrcim
