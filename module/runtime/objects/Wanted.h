#pragma once

#include "module/runtime/ground/Property.h"
#include "module/runtime/objects/Instance.h"

#include <algorithm>
#include <span>
#include <string_view>

namespace KPRV {

/// What a request is after, so that whoever walks or builds may leave out the rest: all objects or the one
/// with certain keys, whole or as far as it takes to name and to join them. It narrows and decides nothing:
/// what is built in vain is sorted out afterwards, by all of its keys. Whoever leaves an object out still
/// counts it, and writes the lines that it always wrote.
///
/// The instances that it is made of outlive it.
class Wanted
{
public:
    /// Everything, whole.
    constexpr Wanted() = default;
    /// Everything, by name.
    static Wanted names();
    /// The object with the keys of the model, whole.
    static Wanted object(const Instance* model);
    /// The associations that refer to the object with the keys of the end. Where its keys do not say that it
    /// is of its own class, it may be an object of another one, and nothing is left out.
    static Wanted touching(const Instance* end);

    /// False if keys and what joins read are enough.
    bool whole() const { return _whole; }

    /// False if no object is wanted that has the text, given in parts, in that key.
    template <class T>
    bool may_be(Property<String> T::*key, std::span<const std::string_view> parts) const
    {
        const String* const text = wanted_text(key);
        if (_nothing || !text)
            return !_nothing;
        std::string_view rest(text->c_str(), text->size());
        return std::ranges::all_of(parts, [&](std::string_view part) { return begins_with(rest, part); }) &&
               rest.empty();
    }

    /// The same of the beginning of that text: for callers to whom the whole of it is dear.
    template <class T>
    bool may_begin_with(Property<String> T::*key, std::string_view beginning) const
    {
        const String* const text = wanted_text(key);
        if (_nothing || !text)
            return !_nothing;
        return std::string_view(text->c_str(), text->size()).starts_with(beginning);
    }

    // Of associations: what is wanted of the lists that they are joined from, each by name.

    /// Of the list of T, which alone has objects of that class and fills that role.
    template <class T, class A, class End>
    Wanted end(End* A::*role) const
    {
        if (const T* const wanted = cast<T>(_touched))
            return named(wanted);
        const A* const association = cast<A>(_object);
        return association ? named(cast<T>(association->*role)) : names();
    }

    /// Of the list of T that fills the second role beside an end in the first one.
    template <class T, class A, class First, class Second>
    Wanted beside(const Instance* first, First* A::*first_role, Second* A::*second_role) const
    {
        if (_touched && _touched->__meta_class == first->__meta_class)
            return key_eq(_touched, first) ? names() : nothing();
        const A* const association = cast<A>(_object);
        if (association && association->*first_role && !key_eq(association->*first_role, first))
            return nothing();
        return end<T>(second_role);
    }

private:
    static Wanted nothing();
    /// The object with those keys by name, or everything if there is none.
    static Wanted named(const Instance* object);

    /// What that key must be; null for any text.
    template <class T>
    const String* wanted_text(Property<String> T::*key) const
    {
        const T* const object = cast<T>(_object);
        return object && !(object->*key).null ? &(object->*key).value : nullptr;
    }

    static bool begins_with(std::string_view& text, std::string_view part)
    {
        if (!text.starts_with(part))
            return false;
        text.remove_prefix(part.size());
        return true;
    }

    const Instance* _object = nullptr;  ///< Null: any.
    const Instance* _touched = nullptr; ///< Null: any.
    bool _whole = true;
    bool _nothing = false;
};

} // namespace KPRV
