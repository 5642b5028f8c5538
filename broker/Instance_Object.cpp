// The function table of `CMPIInstance`, and how the class that it knows shapes what is set.
#include "broker/Convert.h"
#include "broker/values/Type_Words.h"
#include "broker/values/Value_Bytes.h"

#include <algorithm>

namespace KPRV::broker {

Path_Value Instance_Object::path() const
{
    Path_Value path = content.path;
    if (const Class_Info* const known = info())
        for (const Named_Value& property : content.properties)
            if (const Feature_Info* feature = known->property(property.name);
                feature && feature->key && !property.value.null)
                set_value(path.keys, feature->name, property.value);
    if (filter && core.options.filter_style == Server_Options::Filter_Style::EARLY)
        std::erase_if(path.keys, [&](const Named_Value& key) { return !contains_name(*filter, key.name); });
    return path;
}

Instance_Value Instance_Object::value() const
{
    Instance_Value value{path(), content.properties};
    if (filter)
        std::erase_if(value.properties,
                      [&](const Named_Value& property) { return !contains_name(*filter, property.name); });
    return value;
}

bool Instance_Object::pack()
{
    Byte_Writer writer;
    writer.instance(content);
    hold(writer.bytes());
    free_all(content);
    return true;
}

void Instance_Object::unpack()
{
    content = Byte_Reader(held()).instance();
    let_go();
}

namespace {

CMPIData get_property(const CMPIInstance* self, const char* name, CMPIStatus* rc)
{
    Call<Instance_Object> call("CMGetProperty", self, rc, name);
    return call ? make_entry(call, call.core(), call->content.properties, name, "property name",
                             CMPI_RC_ERR_NO_SUCH_PROPERTY)
                : no_data();
}

CMPIData get_property_at(const CMPIInstance* self, CMPICount index, CMPIString** name, CMPIStatus* rc)
{
    Call<Instance_Object> call("CMGetPropertyAt", self, rc);
    return call ? make_entry_at(call, call.core(), call->content.properties, index, name) : no_data();
}

CMPICount get_property_count(const CMPIInstance* self, CMPIStatus* rc)
{
    Call<Instance_Object> call("CMGetPropertyCount", self, rc);
    return call ? static_cast<CMPICount>(call->content.properties.size()) : 0;
}

/// What the class says about a property that is being set. Servers drop an unknown name without a word.
bool fits_class(Call<Instance_Object>& call, const char* name, const Plain_Value& value)
{
    const Class_Info* info = call->info();
    if (!info)
        return true;
    const Feature_Info* feature = info->property(name);
    if (!feature) {
        call.core().violations.add(call.name(), info->name + " has no property " + name);
        return false;
    }
    return fits_type(call, call.core(), *info, *feature, value.type);
}

CMPIStatus set_property(const CMPIInstance* self, const char* name, const CMPIValue* value, CMPIType type)
{
    Call<Instance_Object> call("CMSetProperty", self, nullptr, name);
    Plain_Value read;
    if (!call || !call.need_text(call.core(), name, "property name") ||
        read_value(call, call.core(), value, type, read) || !fits_class(call, name, read))
        return call.status();
    bool early = call.core().options.filter_style == Server_Options::Filter_Style::EARLY;
    if (!early || !call->filter || contains_name(*call->filter, name))
        KPRV::broker::set_value(call->content.properties, name, std::move(read));
    return call.status();
}

CMPIObjectPath* get_object_path(const CMPIInstance* self, CMPIStatus* rc)
{
    Call<Instance_Object> call("CMGetObjectPath", self, rc);
    return call ? make_object<Path_Object>(call.core(), call.name(), call->path())->cmpi() : nullptr;
}

CMPIStatus set_property_filter(const CMPIInstance* self, const char** names, const char**)
{
    Call<Instance_Object> call("CMSetPropertyFilter", self, nullptr);
    if (!call || !names)
        return call.status();
    call->filter = read_list(names);
    if (call.core().options.filter_style == Server_Options::Filter_Style::EARLY)
        std::erase_if(call->content.properties, [&](const Named_Value& property) {
            return !contains_name(*call->filter, property.name);
        });
    return call.status();
}

CMPIStatus set_object_path(const CMPIInstance* self, const CMPIObjectPath* path)
{
    Call<Instance_Object> call("CMSetObjectPath", self, nullptr);
    if (!call)
        return call.status();
    if (auto* source = argument_object<Path_Object>(call, call.core(), path)) {
        call->content.path = source->content;
        call->known_class.forget();
    }
    return call.status();
}

} // namespace

const CMPIInstanceFT instance_table = {CMPIVersion100,
                                       release_slot<Instance_Object>,
                                       clone_slot<Instance_Object>,
                                       get_property,
                                       get_property_at,
                                       get_property_count,
                                       set_property,
                                       get_object_path,
                                       set_property_filter,
                                       set_object_path};

} // namespace KPRV::broker
