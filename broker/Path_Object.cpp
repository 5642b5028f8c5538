// The function table of `CMPIObjectPath`, and what servers make of the keys that are added.
#include "broker/Convert.h"
#include "broker/values/Type_Words.h"
#include "broker/values/Value_Bytes.h"
#include "broker/values/Value_Text.h"

namespace KPRV::broker {

namespace {

/// A client's integer keys travel as text, so their width is lost on the way.
void widen_keys(std::vector<Named_Value>& keys, Server_Options::Key_Style style)
{
    for (Named_Value& key : keys) {
        if (!is_integer(key.value.type) || key.value.null)
            continue;
        std::int64_t number = key.value.as_sint();
        bool below_zero = is_signed(key.value.type) && number < 0;
        if (style == Server_Options::Key_Style::SINT64 || below_zero)
            key.value = Plain_Value::signed_number(CMPI_sint64, number);
        else
            key.value = Plain_Value::unsigned_number(CMPI_uint64, key.value.as_uint());
    }
}

} // namespace

Path_Object::Path_Object(Core& owner_core, Path_Value path, bool from_client)
    : Object_Of(owner_core, path_table), content(std::move(path))
{
    if (!from_client)
        return;
    widen_keys(content.keys, core.options.key_style);
    if (core.options.key_style == Server_Options::Key_Style::SINT64)
        key_state = CMPI_keyValue;
}

bool Path_Object::pack()
{
    Byte_Writer writer;
    writer.path(content);
    hold(writer.bytes());
    free_all(content);
    return true;
}

void Path_Object::unpack()
{
    content = Byte_Reader(held()).path();
    let_go();
}

namespace {

/// The setters and getters of the three texts of a path.
template <std::string Path_Value::*Member>
CMPIStatus set_text(const char* name, const CMPIObjectPath* self, const char* text)
{
    Call<Path_Object> call(name, self, nullptr, text);
    if (call && call.need_text(call.core(), text, "text"))
        call->content.*Member = text;
    return call.status();
}

template <std::string Path_Value::*Member>
CMPIString* get_text(const char* name, const CMPIObjectPath* self, CMPIStatus* rc)
{
    Call<Path_Object> call(name, self, rc);
    return call ? make_object<String_Object>(call.core(), name, call->content.*Member)->cmpi() : nullptr;
}

CMPIStatus set_name_space(const CMPIObjectPath* self, const char* text)
{
    return set_text<&Path_Value::name_space>("CMSetNameSpace", self, text);
}

CMPIString* get_name_space(const CMPIObjectPath* self, CMPIStatus* rc)
{
    return get_text<&Path_Value::name_space>("CMGetNameSpace", self, rc);
}

CMPIStatus set_host_name(const CMPIObjectPath* self, const char* text)
{
    return set_text<&Path_Value::host>("CMSetHostname", self, text);
}

CMPIString* get_host_name(const CMPIObjectPath* self, CMPIStatus* rc)
{
    return get_text<&Path_Value::host>("CMGetHostname", self, rc);
}

CMPIStatus set_class_name(const CMPIObjectPath* self, const char* text)
{
    const CMPIStatus status = set_text<&Path_Value::class_name>("CMSetClassName", self, text);
    if (status.rc == CMPI_RC_OK)
        static_cast<Path_Object*>(find_object(self))->known_class.forget();
    return status;
}

CMPIString* get_class_name(const CMPIObjectPath* self, CMPIStatus* rc)
{
    return get_text<&Path_Value::class_name>("CMGetClassName", self, rc);
}

/// Servers convert 64-bit numbers to a narrower class type of the same sign, and refuse all else.
bool fits_class(Call<Path_Object>& call, const char* name, Plain_Value& value)
{
    const Class_Info* info = call->info();
    if (!info)
        return true;
    const Feature_Info* feature = info->property(name);
    if (!feature || !feature->key) {
        call.violation(call.core(), CMPI_RC_ERR_INVALID_PARAMETER, info->name + " has no key " + name);
        return false;
    }
    bool widened = (value.type == CMPI_uint64 && is_unsigned(feature->type)) ||
                   (value.type == CMPI_sint64 && is_signed(feature->type));
    if (widened)
        value.type = feature->type;
    return fits_type(call, call.core(), *info, *feature, value.type);
}

CMPIStatus add_key(const CMPIObjectPath* self, const char* name, const CMPIValue* value, CMPIType type)
{
    Call<Path_Object> call("CMAddKey", self, nullptr, name);
    Plain_Value read;
    if (!call || !call.need_text(call.core(), name, "key name") ||
        read_value(call, call.core(), value, type, read))
        return call.status();
    if (read.null)
        call.violation(call.core(), CMPI_RC_ERR_FAILED, std::string("null key ") + name);
    else if (fits_class(call, name, read))
        KPRV::broker::set_value(call->content.keys, name, std::move(read));
    return call.status();
}

CMPIData get_key(const CMPIObjectPath* self, const char* name, CMPIStatus* rc)
{
    Call<Path_Object> call("CMGetKey", self, rc, name);
    if (!call)
        return no_data();
    CMPIData data =
        make_entry(call, call.core(), call->content.keys, name, "key name", CMPI_RC_ERR_NOT_FOUND);
    if (call.status().rc == CMPI_RC_OK)
        data.state |= call->key_state;
    return data;
}

CMPIData get_key_at(const CMPIObjectPath* self, CMPICount index, CMPIString** name, CMPIStatus* rc)
{
    Call<Path_Object> call("CMGetKeyAt", self, rc);
    if (!call)
        return no_data();
    CMPIData data = make_entry_at(call, call.core(), call->content.keys, index, name);
    data.state |= call->key_state;
    return data;
}

CMPICount get_key_count(const CMPIObjectPath* self, CMPIStatus* rc)
{
    Call<Path_Object> call("CMGetKeyCount", self, rc);
    return call ? static_cast<CMPICount>(call->content.keys.size()) : 0;
}

CMPIStatus copy_place(const char* name, const CMPIObjectPath* self, const CMPIObjectPath* from,
                      bool with_host)
{
    Call<Path_Object> call(name, self, nullptr);
    if (!call)
        return call.status();
    if (auto* source = argument_object<Path_Object>(call, call.core(), from)) {
        call->content.name_space = source->content.name_space;
        if (with_host)
            call->content.host = source->content.host;
    }
    return call.status();
}

CMPIStatus set_name_space_from(const CMPIObjectPath* self, const CMPIObjectPath* from)
{
    return copy_place("CMSetNameSpaceFromObjectPath", self, from, false);
}

CMPIStatus set_host_and_name_space_from(const CMPIObjectPath* self, const CMPIObjectPath* from)
{
    return copy_place("CMSetHostAndNameSpaceFromObjectPath", self, from, true);
}

/// Servers leave these slots null; a call that says so is kinder than a crash.
template <class... Names>
CMPIData no_qualifier(const CMPIObjectPath* self, Names..., CMPIStatus* rc)
{
    Call<Path_Object> call("CMGetQualifier", self, rc);
    if (call)
        call.violation(call.core(), CMPI_RC_ERR_NOT_SUPPORTED, "servers have no qualifiers");
    return no_data();
}

CMPIString* to_string(const CMPIObjectPath* self, CMPIStatus* rc)
{
    Call<Path_Object> call("CMObjectPathToString", self, rc);
    return call ? make_object<String_Object>(call.core(), call.name(), path_text(call->content))->cmpi()
                : nullptr;
}

} // namespace

using Text = const char*;
const CMPIObjectPathFT path_table = {CMPIVersion100,
                                     release_slot<Path_Object>,
                                     clone_slot<Path_Object>,
                                     set_name_space,
                                     get_name_space,
                                     set_host_name,
                                     get_host_name,
                                     set_class_name,
                                     get_class_name,
                                     add_key,
                                     get_key,
                                     get_key_at,
                                     get_key_count,
                                     set_name_space_from,
                                     set_host_and_name_space_from,
                                     no_qualifier<Text>,
                                     no_qualifier<Text, Text>,
                                     no_qualifier<Text, Text>,
                                     no_qualifier<Text, Text, Text>,
                                     to_string};

} // namespace KPRV::broker
