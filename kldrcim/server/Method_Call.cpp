// Methods of classes.
#include "kldrcim/server/Cim_Server.h"

#include "kldrcim/wire/Instance_Reading.h"

namespace KPRV::kldrcim {

namespace {

const Method_Info* declared_method(const Operation_Call& call, const std::string& class_name)
{
    const Class_Catalogue& classes = call.space.classes();
    const Class_Info* info = classes.find(class_name);
    if (!info && classes.is_known())
        throw Wire_Error::status(CMPI_RC_ERR_INVALID_CLASS, class_name);
    const Method_Info* method = info ? info->method(call.call.name) : nullptr;
    if (info && !method)
        throw Wire_Error::status(CMPI_RC_ERR_METHOD_NOT_FOUND,
                                 class_name + " has no method " + call.call.name);
    return method;
}

std::vector<Named_Value> arguments(const Operation_Call& call, const Method_Info* method)
{
    const Instance_Reader reader(call.space.classes());
    std::vector<Named_Value> in;
    for (const Xml_Node each : call.call.element.children()) {
        if (!each.is(Xml_Tag::PARAMVALUE))
            continue;
        const std::string name(each.attribute(Xml_Attribute::NAME));
        const Feature_Info* declared = method ? method->parameter(name) : nullptr;
        if (method && !declared)
            throw Wire_Error::status(CMPI_RC_ERR_INVALID_PARAMETER, "no parameter " + name.substr(0, 64));
        if (find_value(in, name))
            throw Wire_Error::status(CMPI_RC_ERR_INVALID_PARAMETER, name + " is there twice");
        // What only comes out may be sent, and says nothing.
        if (!declared || declared->in)
            in.push_back(reader.parameter(each, declared));
    }
    return in;
}

/// Parameters come in the order of the declaration.
void write_out(Xml_Writer& writer, std::vector<Named_Value>& out, const Method_Info* method)
{
    if (method)
        for (const Feature_Info& declared : method->parameters)
            for (Named_Value& each : out)
                if (same_name(each.name, declared.name) && declared.out) {
                    if (each.value.null)
                        each.value = Plain_Value::null_of(declared.type);
                    write_parameter(writer, each);
                }
    if (!method)
        for (const Named_Value& each : out)
            write_parameter(writer, each);
}

} // namespace

Result call_method(const Operation_Call& call)
{
    Path_Value path = Instance_Reader(call.space.classes()).path(call.call.object);
    const Method_Info* method = declared_method(call, path.class_name);
    Request request = call.request(Operation::INVOKE_METHOD, std::move(path));
    request.method = method ? method->name : call.call.name;
    request.in = arguments(call, method);
    Result result = call.space.run(std::move(request), nullptr);
    if (!result.ok())
        return result;
    Xml_Writer& writer = call.answer.behind_values();
    if (result.return_value.type == CMPI_null && method && method->return_type != CMPI_null)
        result.return_value = Plain_Value::null_of(method->return_type);
    if (result.return_value.type != CMPI_null)
        write_return_value(writer, result.return_value);
    write_out(writer, result.out, method);
    return result;
}

} // namespace KPRV::kldrcim
