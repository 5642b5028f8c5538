#pragma once

#include "module/runtime/objects/Ref.h"

namespace KPRV {

/// An instance that is kept to be copied, which is cheaper than to make each anew: what it holds is mostly
/// nothing, and then a copy is one of its bytes.
template <class T>
class Prototype
{
public:
    /// Takes the instance over.
    explicit Prototype(T* instance) : _instance(instance), _is_blank(holds_nothing(instance)) {}

    /// A deep copy with a count of 1, owned by the caller.
    T* copy() const
    {
        const T* const instance = _instance.ptr();
        return _is_blank ? static_cast<T*>(clone_of_blank(instance)) : clone_of(instance);
    }

private:
    const Ref<T> _instance;
    const bool _is_blank;
};

} // namespace KPRV
