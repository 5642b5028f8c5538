#include "module/runtime/dispatch/Instance_Enumerator.h"

namespace KPRV {

Instance_Enumerator::~Instance_Enumerator()
{
    Thread_Context* const context = Thread_Context::top();
    if (context && _rep)
        context->instance_enumerator_destroy(_rep);
}

Instance_Enumerator::operator bool() const
{
    Thread_Context* const context = Thread_Context::top();
    return context && context->instance_enumerator_more(_rep);
}

void Instance_Enumerator::operator++(int)
{
    if (Thread_Context* const context = Thread_Context::top())
        context->instance_enumerator_next(_rep);
}

Ref<Instance> Instance_Enumerator::operator()()
{
    Thread_Context* const context = Thread_Context::top();
    return context ? context->instance_enumerator_get(_rep) : Ref<Instance>();
}

} // namespace KPRV
