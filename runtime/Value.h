#pragma once

#include "runtime/Array.h"
#include "runtime/Datetime.h"
#include "runtime/Instance.h"

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
    ~Value();

    /// Releases what is held; type NONE and null.
    void clear();

    // clang-format off
    void set_value(boolean x); void set_value(uint8 x);  void set_value(sint8 x);  void set_value(uint16 x);
    void set_value(sint16 x);  void set_value(uint32 x); void set_value(sint32 x); void set_value(uint64 x);
    void set_value(sint64 x);  void set_value(real32 x); void set_value(real64 x); void set_value(char16 x);
    void set_value(const String& x); void set_value(const char* x); void set_value(const Datetime& x);
    // clang-format on
    /// Takes over the caller's count.
    void set_value(Instance* x);
    template <class T>
    void set_value(const Array<T>& x);
    /// Takes over the caller's count on each element.
    void set_value(const Array<Instance*>& x);

    /// Copies out; -1 if the type is another one (nothing is widened), and `x` is left alone.
    template <class T>
    int get_value(T& x) const;
    template <class T>
    int get_value(Array<T>& x) const;
    /// Hands the pointer out without raising the count.
    int get_value(Instance*& x) const;

    /// Loads this value from a cell. -1 for a method feature.
    int set(const Instance* instance, const Meta_Feature* feature);
    /// Stores this value into a cell of the instance. -1, with a log line, when it does not fit. A cell that
    /// held an instance is not released: this is for cells that have just been nulled.
    int get(Instance* instance, const Meta_Feature* feature) const;

    void print() const;
    void fprint(FILE* file) const;

    Type type = NONE;
    bool null = false;

private:
    union
    {
        uint64 _bits = 0;
        alignas(8) unsigned char _bytes[8];
    };
    friend struct Value_Access;
};

/// Upper-case name for printing, such as "UINT8_ARRAY".
const char* _type_name(Value::Type type);
/// Lower-case name for messages, such as "uint8_array".
const char* name_of(Value::Type type);
/// What a cell of the feature holds; NONE for a method.
Value::Type type_of(const Meta_Feature* feature);

} // namespace KPRV
