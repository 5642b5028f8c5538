#pragma once

#include "runtime/Value.h"
#include "runtime/features.h"

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

    /// Shows another cell. False, and nothing changes, for a null cell and for a method.
    bool show(const Instance* instance, const Meta_Feature* feature)
    {
        if (feature->flags & FLAG_PROPERTY) {
            const auto* meta = static_cast<const Meta_Property*>(feature);
            const char* const cell = &cell_at<char>(instance, meta->offset);
            const uint32 size = null_offset(meta);
            return !cell[size] &&
                   lend(meta->subscript ? Value::ARRAY_BIT | meta->type : meta->type, cell, size);
        }
        return visit_feature(feature, Overloaded{
                                          [&](Reference_Feature f) {
                                              const auto& target = f.target(instance);
                                              return target && lend(Value::INSTANCE, &target, sizeof target);
                                          },
                                          [&](Reference_Array_Feature f) {
                                              const auto& targets = f.targets(instance);
                                              return !f.null(instance) &&
                                                     lend(Value::INSTANCE_ARRAY, &targets, sizeof targets);
                                          },
                                          [](auto) { return false; },
                                      });
    }

    const Value& operator*() const { return _value; }

private:
    bool lend(sint32 type, const void* bytes, uint32 size)
    {
        memset(_value._bytes, 0, sizeof _value._bytes);
        // A copy of a known size is one instruction.
        switch (size) {
        case 1:
            memcpy(_value._bytes, bytes, 1);
            break;
        case 2:
            memcpy(_value._bytes, bytes, 2);
            break;
        case 4:
            memcpy(_value._bytes, bytes, 4);
            break;
        default:
            memcpy(_value._bytes, bytes, 8);
        }
        _value.type = static_cast<Value::Type>(type);
        return true;
    }

    Value _value;
};

} // namespace KPRV
