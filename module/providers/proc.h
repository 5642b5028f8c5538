#pragma once

#include "module/runtime/dispatch/Provider_Dispatch.h"

/// Defines the provider proc of a class: the one line by which a provider file enters the module's
/// registration list, which is generated from the catalogue and refers to the proc by this name.
#define PROVIDER_PROC(Class)                                                                                 \
    int __cimple_##Class##_Provider_proc(const Registration* registration, int operation, void* arg0,        \
                                         void* arg1, void* arg2, void* arg3, void* arg4, void* arg5,         \
                                         void* arg6, void* arg7)                                             \
    {                                                                                                        \
        return dispatch<Class##_Provider>(registration, operation, arg0, arg1, arg2, arg3, arg4, arg5, arg6, \
                                          arg7);                                                             \
    }
