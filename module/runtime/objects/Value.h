#pragma once

#include "module/runtime/ground/Array.h"
#include "module/runtime/ground/Datetime.h"
#include "module/runtime/ground/type_dispatch.h"
#include "module/runtime/objects/Instance.h"

#include <cstdio>

namespace KPRV {

/// Tagged variant that carries one property or parameter between an instance and anything outside the
/// runtime. It owns its text, datetime, array, and one count on each instance that it holds.
class Value
{
public:
    enum Type : sint32
    {
        NONE = -1,
        // 0 to 13 are the CIM types of `KPRV::Type`.
        INSTANCE = 14,
        ARRAY_BIT = 128,
        INSTANCE_ARRAY = ARRAY_BIT | INSTANCE,
    };

    /// Type NONE, not null: unlike a cleared value, which is null.
    Value() = default;
    Value(const Value& x);
    Value& operator=(const Value& x);
    ~Value()
    {
        if (type != NONE)
            _release();
    }

    /// Releases what is held; type NONE and null.
    void clear();

    // clang-format off
    void set_value(boolean x) { _set(x); }
    void set_value(uint8 x)   { _set(x); }
    void set_value(sint8 x)   { _set(x); }
    void set_value(uint16 x)  { _set(x); }
    void set_value(sint16 x)  { _set(x); }
    void set_value(uint32 x)  { _set(x); }
    void set_value(sint32 x)  { _set(x); }
    void set_value(uint64 x)  { _set(x); }
    void set_value(sint64 x)  { _set(x); }
    void set_value(real32 x)  { _set(x); }
    void set_value(real64 x)  { _set(x); }
    void set_value(char16 x)  { _set(x); }
    void set_value(const String& x)   { _set(x); }
    void set_value(String&& x)        { _take(x); }
    void set_value(const char* x)     { set_value(String(x)); }
    void set_value(const Datetime& x) { _set(x); }
    // clang-format on
    /// Takes over the caller's count. Null is a value here: `null` stays false.
    void set_value(Instance* x);
    template <class T>
    void set_value(const Array<T>& x)
    {
        _set_array(array_type<T>, reinterpret_cast<const __Array&>(x).rep);
    }
    /// Takes over the caller's count on each element.
    void set_value(const Array<Instance*>& x)
    {
        _set_array(INSTANCE_ARRAY, reinterpret_cast<const __Array&>(x).rep);
    }
    /// Null of a known type: zero, an empty text or array, no instance.
    void set_null(Type x);

    /// Copies out; -1 if the type is another one (nothing is widened), and `x` is left alone.
    template <class T>
    int get_value(T& x) const
    {
        if (type != static_cast<Type>(Type_Code<T>::value))
            return -1;
        x = _as<T>();
        return 0;
    }
    template <class T>
    int get_value(Array<T>& x) const
    {
        return _get_array(array_type<T>, reinterpret_cast<__Array&>(x).rep);
    }
    /// Hands the elements out without raising their counts.
    int get_value(Array<Instance*>& x) const
    {
        return _get_array(INSTANCE_ARRAY, reinterpret_cast<__Array&>(x).rep);
    }
    /// Hands the pointer out without raising the count.
    int get_value(Instance*& x) const;
    /// What is held, where it stands; null if the type is another one. T may be an array.
    template <class T>
    const T* peek() const
    {
        return type == type_code(static_cast<const T*>(nullptr)) ? &_as<T>() : nullptr;
    }

    /// Loads this value from a cell. -1 for a method feature.
    int set(const Instance* instance, const Meta_Feature* feature);
    /// Stores this value into a cell of the instance. -1, with a log line, when it does not fit. A cell that
    /// held an instance is not released: this is for cells that have just been nulled.
    int get(Instance* instance, const Meta_Feature* feature) const;
    /// As `get`, but hands over a text that it holds.
    int give(Instance* instance, const Meta_Feature* feature);

    void print() const;
    void fprint(FILE* file) const;

    Type type = NONE;
    bool null = false;

private:
    friend class Lent_Value;

    template <class T>
    static constexpr Type type_code(const T*)
    {
        return static_cast<Type>(Type_Code<T>::value);
    }
    template <class T>
    static constexpr Type type_code(const Array<T>*)
    {
        return array_type<T>;
    }
    static constexpr Type type_code(const Array<Instance*>*) { return INSTANCE_ARRAY; }

    template <class T>
    static constexpr Type array_type = static_cast<Type>(ARRAY_BIT |
                                                         static_cast<sint32>(Type_Code<T>::value));

    template <class T>
    T& _as()
    {
        return *reinterpret_cast<T*>(_bytes);
    }
    template <class T>
    const T& _as() const
    {
        return *reinterpret_cast<const T*>(_bytes);
    }

    template <class T>
    void _set(const T& x)
    {
        // Copied first: it may lie in what is released.
        const T hold(x); // NOLINT(performance-unnecessary-copy-initialization)
        _release();
        new (_bytes) T(hold);
        _become(static_cast<Type>(Type_Code<T>::value));
    }
    void _take(String& x)
    {
        String hold(std::move(x));
        _release();
        new (_bytes) String(std::move(hold));
        _become(static_cast<Type>(STRING));
    }
    void _set_array(Type x, const __Array_Rep* rep);
    int _get_array(Type x, __Array_Rep*& rep) const;
    void _become(Type x)
    {
        type = x;
        null = false;
    }
    void _release();
    void _copy_from(const Value& x);

    /// Any scalar, a `String` or `Datetime` handle, an `Instance*`, an array handle.
    alignas(8) unsigned char _bytes[8] = {};
};

/// Upper-case name for printing, such as "UINT8_ARRAY".
const char* _type_name(Value::Type type);
/// Lower-case name for messages, such as "uint8_array".
const char* name_of(Value::Type type);
/// What a cell of the feature holds; NONE for a method.
Value::Type type_of(const Meta_Feature* feature);

} // namespace KPRV
