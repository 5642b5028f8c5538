#pragma once

#include "module/runtime/dispatch/Instance_Enumerator.h"
#include "module/runtime/ground/Array.h"

namespace KPRV {

/// Up-calls from a provider to its CIM server. All go through the context on top of the calling thread's
/// stack, and fail quietly where there is none (a provider's constructor, a thread not started with
/// `Thread`).
class cimom
{
public:
    /// 0, or -1 if the enumeration could not be made.
    static int enum_instances(const char* name_space, const Instance* model, Instance_Enumerator& enumerator);
    /// Not offered: prints "NOT IMPLEMENTED." and fails an assertion. Nothing calls it.
    static int enum_instances(const char* name_space, const Instance* model, Array<Instance*>& instances);
    /// Null on failure.
    static Ref<Instance> get_instance(const char* name_space, const Instance* model);
    /// 0 or -1; so the three below.
    static int create_instance(const char* name_space, const Instance* instance);
    static int delete_instance(const char* name_space, const Instance* instance);
    static int modify_instance(const char* name_space, const Instance* instance);
    /// `method` is an invocation record; its Out cells are filled.
    static int invoke_method(const char* name_space, const Instance* instance, Instance* method);
    /// With false, the provider refuses to be unloaded while the server goes on.
    static void allow_unload(bool flag);
    /// The authenticated user of the call.
    static bool get_username(String& name);
};

} // namespace KPRV
