#include "module/runtime/dispatch/cimom.h"
#include "module/runtime/system/assert.h"

#include <cstdio>

namespace KPRV {

int cimom::enum_instances(const char* name_space, const Instance* model, Instance_Enumerator& enumerator)
{
    Thread_Context* const context = Thread_Context::top();
    if (!context)
        return -1;
    if (enumerator._rep)
        context->instance_enumerator_destroy(enumerator._rep);
    enumerator._rep = context->instance_enumerator_create(name_space, model);
    return enumerator._rep ? 0 : -1;
}

int cimom::enum_instances(const char*, const Instance*, Array<Instance*>&)
{
    printf("NOT IMPLEMENTED.\n");
    fflush(stdout);
    CIMPLE_ASSERT(false);
    return -1;
}

Ref<Instance> cimom::get_instance(const char* name_space, const Instance* model)
{
    Thread_Context* const context = Thread_Context::top();
    return context ? context->get_instance(name_space, model) : Ref<Instance>();
}

int cimom::create_instance(const char* name_space, const Instance* instance)
{
    Thread_Context* const context = Thread_Context::top();
    return context ? context->create_instance(name_space, instance) : -1;
}

int cimom::delete_instance(const char* name_space, const Instance* instance)
{
    Thread_Context* const context = Thread_Context::top();
    return context ? context->delete_instance(name_space, instance) : -1;
}

int cimom::modify_instance(const char* name_space, const Instance* instance)
{
    Thread_Context* const context = Thread_Context::top();
    return context ? context->modify_instance(name_space, instance) : -1;
}

int cimom::invoke_method(const char* name_space, const Instance* instance, Instance* method)
{
    Thread_Context* const context = Thread_Context::top();
    return context ? context->invoke_method(name_space, instance, method) : -1;
}

void cimom::allow_unload(bool flag)
{
    if (Thread_Context* const context = Thread_Context::top())
        context->allow_unload(flag);
}

bool cimom::get_username(String& name)
{
    Thread_Context* const context = Thread_Context::top();
    return context && context->get_username(name);
}

} // namespace KPRV
