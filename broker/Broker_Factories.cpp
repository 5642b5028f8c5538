// The table of `newInstance` and its like.
#include "broker/Broker.h"
#include "broker/Convert.h"
#include "broker/values/Datetime_Text.h"
#include "broker/values/Type_Words.h"
#include "broker/values/Value_Text.h"

#include <chrono>

namespace KPRV::broker {

namespace {

CMPIInstance* new_instance(const CMPIBroker* mb, const CMPIObjectPath* path, CMPIStatus* rc)
{
    Broker_Call call("CMNewInstance", mb, rc);
    if (!call)
        return nullptr;
    auto* source = argument_object<Path_Object>(call, call.core(), path);
    if (!source)
        return nullptr;
    Instance_Value instance;
    instance.path = source->content;
    return make_object<Instance_Object>(call.core(), call.name(), std::move(instance))->cmpi();
}

CMPIObjectPath* new_object_path(const CMPIBroker* mb, const char* name_space, const char* class_name,
                                CMPIStatus* rc)
{
    Broker_Call call("CMNewObjectPath", mb, rc, class_name);
    if (!call || !call.need_text(call.core(), name_space, "name space") ||
        !call.need_text(call.core(), class_name, "class name"))
        return nullptr;
    Path_Value path;
    path.name_space = name_space;
    path.class_name = class_name;
    return make_object<Path_Object>(call.core(), call.name(), std::move(path))->cmpi();
}

CMPIArgs* new_args(const CMPIBroker* mb, CMPIStatus* rc)
{
    Broker_Call call("CMNewArgs", mb, rc);
    return call ? make_object<Args_Object>(call.core(), call.name())->cmpi() : nullptr;
}

CMPIString* new_string(const CMPIBroker* mb, const char* text, CMPIStatus* rc)
{
    Broker_Call call("CMNewString", mb, rc, text);
    if (!call || !call.need_text(call.core(), text, "text"))
        return nullptr;
    return make_object<String_Object>(call.core(), call.name(), std::string_view(text))->cmpi();
}

CMPIArray* new_array(const CMPIBroker* mb, CMPICount count, CMPIType type, CMPIStatus* rc)
{
    Broker_Call call("CMNewArray", mb, rc);
    if (!call)
        return nullptr;
    CMPIType element = type == CMPI_chars ? CMPIType(CMPI_string) : type;
    if (!is_value_type(element))
        return call.violation(call.core(), CMPI_RC_ERR_INVALID_DATA_TYPE, "element " + type_word_name(type));
    return make_object<Array_Object>(call.core(), call.name(), element, count)->cmpi();
}

CMPIDateTime* new_date_time(const CMPIBroker* mb, CMPIStatus* rc)
{
    using namespace std::chrono;
    Broker_Call call("CMNewDateTime", mb, rc);
    auto now = duration_cast<microseconds>(system_clock::now().time_since_epoch()).count();
    return call ? make_object<Datetime_Object>(call.core(), call.name(),
                                               datetime_text(static_cast<std::uint64_t>(now), false))
                      ->cmpi()
                : nullptr;
}

CMPIDateTime* new_date_time_from_binary(const CMPIBroker* mb, CMPIUint64 time, CMPIBoolean interval,
                                        CMPIStatus* rc)
{
    Broker_Call call("CMNewDateTimeFromBinary", mb, rc);
    return call
               ? make_object<Datetime_Object>(call.core(), call.name(), datetime_text(time, interval))->cmpi()
               : nullptr;
}

CMPIDateTime* new_date_time_from_chars(const CMPIBroker* mb, const char* text, CMPIStatus* rc)
{
    Broker_Call call("CMNewDateTimeFromChars", mb, rc, text);
    if (!call || !call.need_text(call.core(), text, "text"))
        return nullptr;
    if (!is_datetime_text(text))
        return call.violation(call.core(), CMPI_RC_ERR_INVALID_PARAMETER, "not a datetime: " + quoted(text));
    return make_object<Datetime_Object>(call.core(), call.name(), std::string_view(text))->cmpi();
}

CMPISelectExp* new_select_exp(const CMPIBroker* mb, const char* query, const char* language,
                              CMPIArray** projection, CMPIStatus* rc)
{
    Broker_Call call("CMNewSelectExp", mb, rc, query);
    if (!call || !call.need_text(call.core(), query, "query") ||
        !call.need_text(call.core(), language, "language"))
        return nullptr;
    if (projection)
        *projection = nullptr;
    return make_object<Select_Object>(call.core(), call.name(), std::string(query), std::string(language))
        ->cmpi();
}

CMPIBoolean class_path_is_a(const CMPIBroker* mb, const CMPIObjectPath* path, const char* class_name,
                            CMPIStatus* rc)
{
    Broker_Call call("CMClassPathIsA", mb, rc, class_name);
    if (!call || !call.need_text(call.core(), class_name, "class name"))
        return 0;
    auto* object = argument_object<Path_Object>(call, call.core(), path);
    return object && call.core().catalogue->is_a(object->content.class_name, class_name);
}

/// An object of any kind; null after a violation.
Object* any_object(Broker_Call& call, const void* address)
{
    Object* object = find_object(address);
    if (!object || !object->live) {
        call.violation(call.core(), CMPI_RC_ERR_INVALID_HANDLE, "this is no object of this server");
        return nullptr;
    }
    return object;
}

std::string object_text(const Object& object)
{
    switch (object.kind) {
    case Object_Kind::STRING:
        return static_cast<const String_Object&>(object).text();
    case Object_Kind::DATETIME:
        return static_cast<const Datetime_Object&>(object).text();
    case Object_Kind::PATH:
        return path_text(static_cast<const Path_Object&>(object).content);
    case Object_Kind::INSTANCE:
        return mof_instance(static_cast<const Instance_Object&>(object).value());
    default:
        return kind_name(object.kind);
    }
}

CMPIString* to_string(const CMPIBroker* mb, const void* address, CMPIStatus* rc)
{
    Broker_Call call("CDToString", mb, rc);
    Object* object = call ? any_object(call, address) : nullptr;
    return object ? make_object<String_Object>(call.core(), call.name(), object_text(*object))->cmpi()
                  : nullptr;
}

CMPIBoolean is_of_type(const CMPIBroker* mb, const void* address, const char* type, CMPIStatus* rc)
{
    Broker_Call call("CDIsOfType", mb, rc, type);
    if (!call || !call.need_text(call.core(), type, "type name"))
        return 0;
    Object* object = any_object(call, address);
    return object && same_name(kind_type(object->kind), type);
}

CMPIString* get_type(const CMPIBroker* mb, const void* address, CMPIStatus* rc)
{
    Broker_Call call("CDGetType", mb, rc);
    Object* object = call ? any_object(call, address) : nullptr;
    return object ? make_object<String_Object>(call.core(), call.name(),
                                               std::string_view(kind_type(object->kind)))
                        ->cmpi()
                  : nullptr;
}

/// There are no message catalogues: the default text is the answer, its place holders unreplaced.
CMPIString* get_message(const CMPIBroker* mb, const char* id, const char* text, CMPIStatus* rc, CMPICount,
                        ...)
{
    Broker_Call call("CMGetMessage", mb, rc, id);
    return call ? make_object<String_Object>(call.core(), call.name(), std::string_view(text ? text : ""))
                      ->cmpi()
                : nullptr;
}

CMPIStatus log_message(const CMPIBroker* mb, CMPISeverity, const char* id, const char*, const CMPIString*)
{
    return Broker_Call("CMLogMessage", mb, nullptr, id).status();
}

CMPIStatus trace(const CMPIBroker* mb, CMPILevel, const char* component, const char*, const CMPIString*)
{
    return Broker_Call("CMTraceMessage", mb, nullptr, component).status();
}

constexpr With_Null_Slots<CMPIBrokerEncFT, 7> table = {
    {CMPIVersion100, new_instance, new_object_path, new_args, new_string, new_array, new_date_time,
     new_date_time_from_binary, new_date_time_from_chars, new_select_exp, class_path_is_a, to_string,
     is_of_type, get_type, get_message, log_message, trace},
    {}};

} // namespace

const CMPIBrokerEncFT* const broker_enc_table = &table.table;

} // namespace KPRV::broker
