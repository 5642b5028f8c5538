#include "broker/Convert.h"

#include "broker/values/Type_Words.h"

#include <algorithm>

namespace KPRV::broker {

namespace {

Plain_Value read_number(const CMPIValue& value, CMPIType type)
{
    switch (type) {
    case CMPI_boolean:
        return Plain_Value::boolean(value.boolean != 0);
    case CMPI_char16:
        return Plain_Value::unsigned_number(type, value.char16);
    case CMPI_uint8:
        return Plain_Value::unsigned_number(type, value.uint8);
    case CMPI_uint16:
        return Plain_Value::unsigned_number(type, value.uint16);
    case CMPI_uint32:
        return Plain_Value::unsigned_number(type, value.uint32);
    case CMPI_uint64:
        return Plain_Value::unsigned_number(type, value.uint64);
    case CMPI_sint8:
        return Plain_Value::signed_number(type, value.sint8);
    case CMPI_sint16:
        return Plain_Value::signed_number(type, value.sint16);
    case CMPI_sint32:
        return Plain_Value::signed_number(type, value.sint32);
    case CMPI_sint64:
        return Plain_Value::signed_number(type, value.sint64);
    case CMPI_real32:
        return Plain_Value::real(type, value.real32);
    default:
        return Plain_Value::real(type, value.real64);
    }
}

CMPIValue number_of(const Plain_Value& value)
{
    CMPIValue result = {};
    switch (value.type) {
    case CMPI_boolean:
        result.boolean = value.as_bool();
        break;
    case CMPI_real32:
        result.real32 = static_cast<CMPIReal32>(value.as_real());
        break;
    case CMPI_real64:
        result.real64 = value.as_real();
        break;
    case CMPI_uint8:
    case CMPI_sint8:
        result.uint8 = static_cast<CMPIUint8>(value.as_uint());
        break;
    case CMPI_uint16:
    case CMPI_sint16:
    case CMPI_char16:
        result.uint16 = static_cast<CMPIUint16>(value.as_uint());
        break;
    case CMPI_uint32:
    case CMPI_sint32:
        result.uint32 = static_cast<CMPIUint32>(value.as_uint());
        break;
    default:
        result.uint64 = value.as_uint();
    }
    return result;
}

/// The object pointer of an encapsulated word, whichever member it is read through.
const void* object_of(const CMPIValue& value)
{
    return value.string;
}

CMPIrc read_object(Call_Base& call, Core& core, const CMPIValue& value, CMPIType type, Plain_Value& result)
{
    const void* address = object_of(value);
    if (type & CMPI_ARRAY) {
        auto* array = static_cast<Array_Object*>(argument_object(call, core, address, Object_Kind::ARRAY));
        if (!array)
            return call.code();
        if ((array->element_type | CMPI_ARRAY) != type) {
            call.violation(core, CMPI_RC_ERR_TYPE_MISMATCH,
                           "an array of " + type_word_name(array->element_type) + " passed as " +
                               type_word_name(type));
            return call.code();
        }
        return read_array(call, core, *array, result);
    }
    Object_Kind kind = type == CMPI_string     ? Object_Kind::STRING
                       : type == CMPI_dateTime ? Object_Kind::DATETIME
                       : type == CMPI_ref      ? Object_Kind::PATH
                                               : Object_Kind::INSTANCE;
    Object* object = argument_object(call, core, address, kind);
    if (!object)
        return call.code();
    switch (kind) {
    case Object_Kind::STRING: {
        auto* text = static_cast<String_Object*>(object);
        result = text->has_text() ? Plain_Value::text(text->text()) : Plain_Value::null_of(CMPI_string);
        break;
    }
    case Object_Kind::DATETIME:
        result = Plain_Value::datetime(static_cast<Datetime_Object*>(object)->text());
        break;
    case Object_Kind::PATH:
        result = Plain_Value::path(static_cast<Path_Object*>(object)->content);
        break;
    default:
        result = Plain_Value::instance(static_cast<Instance_Object*>(object)->value());
    }
    return CMPI_RC_OK;
}

} // namespace

CMPIrc read_value(Call_Base& call, Core& core, const CMPIValue* value, CMPIType type, Plain_Value& result)
{
    // The two words for plain characters become strings.
    CMPIType element = static_cast<CMPIType>(type & ~CMPI_ARRAY);
    CMPIType meant = element == CMPI_chars || element == CMPI_charsptr
                         ? static_cast<CMPIType>(CMPI_string | (type & CMPI_ARRAY))
                         : type;
    if (!is_value_type(static_cast<CMPIType>(meant & ~CMPI_ARRAY))) {
        call.violation(core, CMPI_RC_ERR_INVALID_DATA_TYPE, "unknown type word " + std::to_string(type));
        return call.code();
    }
    result = Plain_Value::null_of(meant);
    if (!value)
        return CMPI_RC_OK;
    if (type == CMPI_chars || type == CMPI_charsptr) {
        const char* text = type == CMPI_chars ? reinterpret_cast<const char*>(value) : value->chars;
        if (text)
            result = Plain_Value::text(text);
        return CMPI_RC_OK;
    }
    if (meant & (CMPI_ENC | CMPI_ARRAY))
        return read_object(call, core, *value, meant, result);
    result = read_number(*value, meant);
    return CMPI_RC_OK;
}

CMPIrc read_array(Call_Base& call, Core& core, const Array_Object& array, Plain_Value& result)
{
    std::vector<Plain_Value> elements;
    for (const Array_Object::Element& element : array.elements) {
        Object* object = find_object(element.object);
        if (element.object && (!object || !object->live)) {
            call.violation(core, CMPI_RC_ERR_INVALID_HANDLE,
                           "element " + std::to_string(elements.size()) +
                               " was released before its array was used");
            return call.code();
        }
        elements.push_back(element.value);
    }
    result = Plain_Value::array(array.element_type, std::move(elements));
    return CMPI_RC_OK;
}

CMPIData make_data(Core& core, const char* maker, const Plain_Value& value)
{
    CMPIData data = {};
    data.type = value.type;
    if (value.null) {
        data.state = CMPI_nullValue;
        if (value.type == CMPI_string && core.options.null_string_objects)
            data.value.string = make_object<String_Object>(core, maker, nullptr)->cmpi();
        return data;
    }
    if (value.is_array())
        data.value.array = make_object<Array_Object>(core, maker, value)->cmpi();
    else if (value.type == CMPI_string)
        data.value.string = make_object<String_Object>(core, maker, value.as_text())->cmpi();
    else if (value.type == CMPI_dateTime)
        data.value.dateTime = make_object<Datetime_Object>(core, maker, value.as_text())->cmpi();
    else if (const Path_Value* path = value.as_path())
        data.value.ref = make_object<Path_Object>(core, maker, *path)->cmpi();
    else if (const Instance_Value* instance = value.as_instance())
        data.value.inst = make_object<Instance_Object>(core, maker, *instance)->cmpi();
    else
        data.value = number_of(value);
    return data;
}

CMPIData make_entry(Call_Base& call, Core& core, const std::vector<Named_Value>& entries, const char* name,
                    const char* what, CMPIrc missing)
{
    if (!call.need_text(core, name, what))
        return no_data();
    if (const Plain_Value* value = find_value(entries, name))
        return make_data(core, call.name(), *value);
    call.fail(missing);
    return no_data();
}

CMPIData make_entry_at(Call_Base& call, Core& core, const std::vector<Named_Value>& entries, CMPICount index,
                       CMPIString** name)
{
    if (index >= entries.size()) {
        call.violation(core, CMPI_RC_ERR_NO_SUCH_PROPERTY,
                       "index " + std::to_string(index) + " of " + std::to_string(entries.size()));
        return no_data();
    }
    if (name)
        *name = make_object<String_Object>(core, call.name(), entries[index].name)->cmpi();
    return make_data(core, call.name(), entries[index].value);
}

bool fits_type(Call_Base& call, Core& core, const Class_Info& info, const Feature_Info& feature,
               CMPIType type)
{
    if (feature.type != type)
        call.violation(core, CMPI_RC_ERR_INVALID_DATA_TYPE,
                       info.name + "." + feature.name + " is " + type_word_name(feature.type) + ", not " +
                           type_word_name(type));
    return feature.type == type;
}

std::optional<std::vector<std::string>> read_list(const char** list)
{
    if (!list)
        return std::nullopt;
    std::vector<std::string> names;
    for (; *list; ++list)
        names.emplace_back(*list);
    return names;
}

} // namespace KPRV::broker
