#pragma once

#include "module/runtime/objects/Class_Plan.h"
#include "module/runtime/objects/Value.h"

#include <cstring>

namespace KPRV {

/// What a cell holds, as a value that neither copies nor counts it: for readers that are done before the
/// instance changes. It stands in the innermost loop of every export, hence inline.
class Lent_Value
{
public:
    Lent_Value() = default;
    ~Lent_Value() { _value.type = Value::NONE; }
    Lent_Value(const Lent_Value&) = delete;
    Lent_Value& operator=(const Lent_Value&) = delete;

    /// Shows another cell, which is not null.
    void show(const Instance* instance, const Cell& cell)
    {
        memset(_value._bytes, 0, sizeof _value._bytes);
        cell.copy_bytes(instance, _value._bytes);
        _value.type = static_cast<Value::Type>(cell.type);
    }

    const Value& operator*() const { return _value; }

private:
    Value _value;
};

} // namespace KPRV
