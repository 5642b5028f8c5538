#pragma once

#include "module/runtime/dispatch/Thread_Context.h"

namespace KPRV {

/// Cursor over the result of `cimom::enum_instances`. It works through the calling thread's context; without
/// one it is at its end.
class Instance_Enumerator
{
public:
    Instance_Enumerator() = default;
    ~Instance_Enumerator();
    Instance_Enumerator(const Instance_Enumerator&) = delete;
    Instance_Enumerator& operator=(const Instance_Enumerator&) = delete;

    /// There is a current instance.
    operator bool() const;
    void operator++(int);
    /// The current instance, with a count of its own; null at the end.
    Ref<Instance> operator()();

private:
    friend class cimom;
    Instance_Enumerator_Rep* _rep = nullptr;
};

} // namespace KPRV
