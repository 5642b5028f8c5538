// What a client asks, as a message. The defaults of some parameters mean different things to different
// servers: those are always given.
#include "kldrcim/client/Cim_Request.h"

#include "broker/values/Value_Text.h"
#include "kldrcim/wire/Instance_Writing.h"

namespace KPRV::kldrcim {

namespace {

using Tag = Xml_Tag;
using At = Xml_Attribute;

/// As a header field may have it.
std::string header_text(std::string_view text)
{
    static const char digits[] = "0123456789ABCDEF";
    std::string result;
    for (const char c : text) {
        const auto byte = static_cast<unsigned char>(c);
        const bool is_safe = (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c >= '0' && c <= '9') ||
                             std::string_view("-_.~").find(c) != std::string_view::npos;
        if (is_safe)
            result += c;
        else
            result += {'%', digits[byte >> 4], digits[byte & 15]};
    }
    return result;
}

/// A message with one call in it.
class Call_Writer
{
public:
    explicit Call_Writer(Tag call, const std::string& name) : _call(call), _writer(_message.body)
    {
        _message.body = xml_declaration;
        _writer.open(Tag::CIM).attribute(At::CIMVERSION, "2.0").attribute(At::DTDVERSION, "2.0");
        _writer.open(Tag::MESSAGE).attribute(At::ID, "1").attribute(At::PROTOCOLVERSION, "1.0");
        _writer.open(Tag::SIMPLEREQ).open(_call).attribute(At::NAME, name);
        _message.fields = {"CIMOperation: MethodCall", "CIMMethod: " + header_text(name)};
    }

    Xml_Writer& writer() { return _writer; }

    /// Writes a parameter with what `write` puts into it.
    template <class Write>
    void parameter(const char* name, Write write)
    {
        _writer.open(Tag::IPARAMVALUE).attribute(At::NAME, name);
        write();
        _writer.close(Tag::IPARAMVALUE);
    }
    void flag(const char* name, bool value)
    {
        parameter(name, [&] { write_text_value(_writer, value ? "TRUE" : "FALSE"); });
    }
    void class_name(const char* name, const std::string& value)
    {
        if (!value.empty())
            parameter(name, [&] { write_class_name(_writer, value); });
    }
    void text(const char* name, const std::string& value)
    {
        if (!value.empty())
            parameter(name, [&] { write_text_value(_writer, value); });
    }
    void properties(const Property_List& list)
    {
        if (list)
            parameter("PropertyList", [&] { write_text_array(_writer, *list); });
    }

    Http_Message end(const std::string& object)
    {
        _writer.close(_call).close(Tag::SIMPLEREQ).close(Tag::MESSAGE).close(Tag::CIM);
        _message.body += '\n';
        _message.fields.push_back("CIMObject: " + header_text(object));
        return std::move(_message);
    }

private:
    const Tag _call;
    Http_Message _message;
    Xml_Writer _writer;
};

const char* name_of(Operation operation)
{
    switch (operation) {
    case Operation::ENUMERATE_INSTANCE_NAMES:
        return "EnumerateInstanceNames";
    case Operation::ENUMERATE_INSTANCES:
        return "EnumerateInstances";
    case Operation::GET_INSTANCE:
        return "GetInstance";
    case Operation::CREATE_INSTANCE:
        return "CreateInstance";
    case Operation::MODIFY_INSTANCE:
        return "ModifyInstance";
    case Operation::DELETE_INSTANCE:
        return "DeleteInstance";
    case Operation::ASSOCIATORS:
        return "Associators";
    case Operation::ASSOCIATOR_NAMES:
        return "AssociatorNames";
    case Operation::REFERENCES:
        return "References";
    case Operation::REFERENCE_NAMES:
        return "ReferenceNames";
    case Operation::INVOKE_METHOD:
        break;
    }
    return "";
}

bool is_repeatable(Operation operation)
{
    return operation != Operation::INVOKE_METHOD && operation != Operation::CREATE_INSTANCE &&
           operation != Operation::MODIFY_INSTANCE && operation != Operation::DELETE_INSTANCE;
}

Http_Message write_method_call(const Request& request)
{
    Call_Writer call(Tag::METHODCALL, request.method);
    if (request.path.keys.empty())
        write_local_class_path(call.writer(), request.path.name_space, request.path.class_name);
    else
        write_local_instance_path(call.writer(), request.path);
    for (const Named_Value& argument : request.in)
        write_parameter(call.writer(), argument);
    return call.end(path_text(request.path));
}

void write_association(Call_Writer& call, const Request& request)
{
    const bool is_reference =
        request.operation == Operation::REFERENCES || request.operation == Operation::REFERENCE_NAMES;
    call.parameter("ObjectName", [&] { write_instance_name(call.writer(), request.path); });
    if (!is_reference)
        call.class_name("AssocClass", request.filter.association_class);
    call.class_name("ResultClass", request.filter.result_class);
    call.text("Role", request.filter.role);
    if (!is_reference)
        call.text("ResultRole", request.filter.result_role);
    if (request.operation == Operation::ASSOCIATORS || request.operation == Operation::REFERENCES) {
        call.flag("IncludeQualifiers", false);
        call.flag("IncludeClassOrigin", false);
        call.properties(request.properties);
    }
}

void write_instance_operation(Call_Writer& call, const Request& request)
{
    const auto name = [&] { write_instance_name(call.writer(), request.path); };
    switch (request.operation) {
    case Operation::ENUMERATE_INSTANCES:
        call.class_name("ClassName", request.path.class_name);
        call.flag("DeepInheritance", true);
        break;
    case Operation::ENUMERATE_INSTANCE_NAMES:
        return call.class_name("ClassName", request.path.class_name);
    case Operation::CREATE_INSTANCE:
        return call.parameter("NewInstance", [&] { write_instance(call.writer(), request.instance); });
    case Operation::MODIFY_INSTANCE:
        call.parameter("ModifiedInstance", [&] {
            call.writer().open(Tag::VALUE_NAMEDINSTANCE);
            name();
            write_instance(call.writer(), request.instance);
            call.writer().close(Tag::VALUE_NAMEDINSTANCE);
        });
        call.flag("IncludeQualifiers", false);
        return call.properties(request.properties);
    default:
        call.parameter("InstanceName", name);
        if (request.operation == Operation::DELETE_INSTANCE)
            return;
    }
    call.flag("LocalOnly", false);
    call.flag("IncludeQualifiers", false);
    call.flag("IncludeClassOrigin", false);
    call.properties(request.properties);
}

} // namespace

std::string wire_name(const Request& request)
{
    return request.operation == Operation::INVOKE_METHOD ? request.method : name_of(request.operation);
}

Http_Message write_request(const Request& request)
{
    if (request.operation == Operation::INVOKE_METHOD) {
        Http_Message message = write_method_call(request);
        message.may_be_repeated = false;
        return message;
    }
    Call_Writer call(Tag::IMETHODCALL, name_of(request.operation));
    write_name_space(call.writer(), request.path.name_space);
    if (is_association_operation(request.operation))
        write_association(call, request);
    else
        write_instance_operation(call, request);
    Http_Message message = call.end(request.path.name_space);
    message.may_be_repeated = is_repeatable(request.operation);
    return message;
}

Http_Message write_class_names_request(const std::string& name_space)
{
    Call_Writer call(Tag::IMETHODCALL, "EnumerateClassNames");
    write_name_space(call.writer(), name_space);
    call.flag("DeepInheritance", true);
    return call.end(name_space);
}

Http_Message write_class_request(const std::string& name_space, const std::string& class_name)
{
    Call_Writer call(Tag::IMETHODCALL, "GetClass");
    write_name_space(call.writer(), name_space);
    call.class_name("ClassName", class_name);
    call.flag("LocalOnly", false);
    call.flag("IncludeQualifiers", true);
    call.flag("IncludeClassOrigin", false);
    return call.end(name_space);
}

} // namespace KPRV::kldrcim
