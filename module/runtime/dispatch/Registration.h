#pragma once

#include "module/runtime/objects/Meta_Class.h"

namespace KPRV {

struct Registration;

/// The generated dispatcher of a provider: turns an operation code and its arguments into a call of the
/// provider class. Unused arguments are null. -1 for a code that the provider's kind does not serve.
using Provider_Proc = int (*)(const Registration* registration, int operation, void* arg0, void* arg1,
                              void* arg2, void* arg3, void* arg4, void* arg5, void* arg6, void* arg7);

/// One provider of the module. The list that `cimple_module` returns runs in the reverse of generated order.
struct Registration
{
    /// The same pointer in every record.
    const char* module_name;
    /// `<Class>_Provider`.
    const char* provider_name;
    Provider_Proc proc;
    const Meta_Class* meta_class;
    const Registration* next;
};

} // namespace KPRV
