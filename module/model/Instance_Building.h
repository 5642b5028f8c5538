#pragma once

#include "module/adapter/Class_Names.h"
#include "module/adapter/ProviderUtil.h"
#include "module/runtime/ground/Array.h"
#include "module/runtime/ground/Lasting_Array.h"
#include "module/runtime/objects/Instance.h"
#include "module/runtime/objects/Ref.h"
#include "module/runtime/objects/Wanted.h"

#include <initializer_list>
#include <string_view>

namespace KPRV {

/// A fresh instance, in which every property is null, those with a default in the schema too (what a builder
/// does not set is not known), if an instance with that text, given in parts, in its telling key is wanted;
/// else null.
template <class T>
Ref<T> create_wanted(const Wanted& wanted, Property<String> T::*key, std::span<const std::string_view> parts)
{
    return Ref<T>(wanted.may_be(key, parts) ? create_null<T>() : nullptr);
}
template <class T>
Ref<T> create_wanted(const Wanted& wanted, Property<String> T::*key, std::string_view text)
{
    return create_wanted(wanted, key, {&text, 1});
}

template <class T>
Array<T> array_of(std::initializer_list<T> elements)
{
    return Array<T>(elements.begin(), static_cast<uint32>(elements.size()));
}

/// Of one element, which is not copied on the way.
template <class T>
Array<T> array_of(const T& element)
{
    return Array<T>(&element, 1);
}

/// The keys that all that belongs to the host has: its own class, and the host's class and name.
template <class T>
void set_system_keys(T& instance, classId_t id, const String& system_name)
{
    instance.CreationClassName.set(class_name_text(id));
    instance.SystemCreationClassName.set(class_name_text(COMPUTERSYSTEM));
    instance.SystemName.set(system_name);
}

inline String to_String(std::string_view text)
{
    return String(text.data(), text.size());
}

} // namespace KPRV
