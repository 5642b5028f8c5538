#include "broker/Registration_Catalogue.h"

#include "broker/values/Type_Words.h"
#include "module/runtime/objects/Meta_Value.h"

#include <cstring>

namespace KPRV::broker {

namespace {

/// By `Type` code.
constexpr CMPIType words[] = {
    CMPI_boolean, CMPI_uint8,  CMPI_sint8,  CMPI_uint16, CMPI_sint16, CMPI_uint32, CMPI_sint32,
    CMPI_uint64,  CMPI_sint64, CMPI_real32, CMPI_real64, CMPI_char16, CMPI_string, CMPI_dateTime,
};

CMPIType word_of(uint16 type, sint16 subscript)
{
    CMPIType word = type < std::size(words) ? words[type] : CMPIType(CMPI_null);
    return subscript ? static_cast<CMPIType>(word | CMPI_ARRAY) : word;
}

template <class Number>
Number number_at(const void* base, std::size_t index)
{
    Number number;
    std::memcpy(&number, static_cast<const char*>(base) + index * sizeof number, sizeof number);
    return number;
}

Plain_Value literal(uint16 type, const void* base, std::size_t index)
{
    CMPIType word = word_of(type, 0);
    switch (type) {
    case BOOLEAN:
        return Plain_Value::boolean(number_at<uint8>(base, index) != 0);
    case UINT8:
        return Plain_Value::unsigned_number(word, number_at<uint8>(base, index));
    case SINT8:
        return Plain_Value::signed_number(word, number_at<sint8>(base, index));
    case UINT16:
    case CHAR16:
        return Plain_Value::unsigned_number(word, number_at<uint16>(base, index));
    case SINT16:
        return Plain_Value::signed_number(word, number_at<sint16>(base, index));
    case UINT32:
        return Plain_Value::unsigned_number(word, number_at<uint32>(base, index));
    case SINT32:
        return Plain_Value::signed_number(word, number_at<sint32>(base, index));
    case UINT64:
        return Plain_Value::unsigned_number(word, number_at<uint64>(base, index));
    case SINT64:
        return Plain_Value::signed_number(word, number_at<sint64>(base, index));
    case REAL32:
        return Plain_Value::real(word, number_at<real32>(base, index));
    case REAL64:
        return Plain_Value::real(word, number_at<real64>(base, index));
    default: {
        Plain_Value text = Plain_Value::text(number_at<const char*>(base, index));
        text.type = word;
        return text;
    }
    }
}

Plain_Value default_of(const Meta_Property* property)
{
    CMPIType word = word_of(property->type, property->subscript);
    if (!property->value)
        return Plain_Value::null_of(word);
    if (!property->subscript)
        return literal(property->type, property->value, 0);
    std::vector<Plain_Value> elements;
    for (uint32 i = 0; i < property->value->array_value.num_elements; ++i)
        elements.push_back(literal(property->type, property->value->array_value.elements, i));
    return Plain_Value::array(word_of(property->type, 0), std::move(elements));
}

Feature_Info feature_info(const Meta_Feature* feature)
{
    Feature_Info info;
    info.name = feature->name;
    info.key = feature->flags & FLAG_KEY;
    info.in = feature->flags & FLAG_IN;
    info.out = feature->flags & FLAG_OUT;
    if (feature->flags & FLAG_REFERENCE) {
        auto* reference = static_cast<const Meta_Reference*>(feature);
        info.type = feature->flags & FLAG_EMBEDDED ? CMPI_instance : CMPI_ref;
        if (reference->subscript)
            info.type |= CMPI_ARRAY;
        if (reference->meta_class)
            info.target_class = reference->meta_class->name;
        info.default_value = Plain_Value::null_of(info.type);
    } else {
        auto* property = static_cast<const Meta_Property*>(feature);
        info.type = word_of(property->type, property->subscript);
        info.default_value = default_of(property);
    }
    return info;
}

Method_Info method_info(const Meta_Method* method)
{
    Method_Info info;
    info.name = method->name;
    info.is_static = method->flags & FLAG_STATIC;
    info.return_type = word_of(method->return_type, 0);
    for (uint32 i = 0; i < method->num_meta_features; ++i) {
        const Meta_Feature* feature = method->meta_features[i];
        // The last record is the return value.
        if (!same_name(feature->name, "return_value"))
            info.parameters.push_back(feature_info(feature));
    }
    return info;
}

std::unique_ptr<Class_Info> class_info(const Meta_Class* meta_class, bool has_provider)
{
    auto info = std::make_unique<Class_Info>();
    info->name = meta_class->name;
    if (meta_class->super_meta_class)
        info->superclass = meta_class->super_meta_class->name;
    info->is_association = meta_class->flags & FLAG_ASSOCIATION;
    info->is_indication = meta_class->flags & FLAG_INDICATION;
    info->has_provider = has_provider;
    for (uint32 i = 0; i < meta_class->num_meta_features; ++i) {
        const Meta_Feature* feature = meta_class->meta_features[i];
        if (feature->flags & FLAG_METHOD)
            info->methods.push_back(method_info(reinterpret_cast<const Meta_Method*>(feature)));
        else
            info->properties.push_back(feature_info(feature));
    }
    return info;
}

} // namespace

std::size_t Registration_Catalogue::Name_Hash::operator()(std::string_view name) const
{
    std::size_t sum = 0;
    for (const char c : name)
        sum = sum * 31 + (static_cast<unsigned char>(c) | ('a' ^ 'A'));
    return sum;
}

Registration_Catalogue::Registration_Catalogue(const Registration* head)
{
    const Auto_Lock lock(_mutex);
    if (head && head->module_name)
        _module_name = head->module_name;
    for (const Registration* entry = head; entry; entry = entry->next) {
        add(entry->meta_class);
        _slots[entry->meta_class->name].has_provider = true;
        if (const Meta_Repository* repository = entry->meta_class->meta_repository)
            for (uint32 i = 0; i < repository->num_meta_classes; ++i)
                add(repository->meta_classes[i]);
    }
}

Registration_Catalogue::~Registration_Catalogue() = default;

void Registration_Catalogue::add(const Meta_Class* meta_class)
{
    Slot& slot = _slots[meta_class->name];
    if (slot.meta_class)
        return;
    slot.meta_class = meta_class;
    _names.emplace_back(meta_class->name);
}

const Class_Info* Registration_Catalogue::find(std::string_view name) const
{
    const Auto_Lock lock(_mutex);
    auto at = _slots.find(name);
    if (at == _slots.end())
        return nullptr;
    Slot& slot = at->second;
    if (!slot.info)
        slot.info = class_info(slot.meta_class, slot.has_provider);
    return slot.info.get();
}

const Meta_Class* Registration_Catalogue::meta_class(std::string_view name) const
{
    const Auto_Lock lock(_mutex);
    auto at = _slots.find(name);
    return at == _slots.end() ? nullptr : at->second.meta_class;
}

/// Asked of every class at every enumeration: by the module's own links, without a search for each name.
bool Registration_Catalogue::is_a(std::string_view class_name, std::string_view ancestor) const
{
    const Meta_Class* wanted = meta_class(ancestor);
    if (!wanted)
        return same_name(class_name, ancestor);
    const Meta_Class* each = meta_class(class_name);
    while (each && each != wanted)
        each = each->super_meta_class;
    return each != nullptr;
}

} // namespace KPRV::broker
