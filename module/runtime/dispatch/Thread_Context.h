#pragma once

#include "module/runtime/objects/Ref.h"

namespace KPRV {

struct Instance_Enumerator_Rep;

/// The way from any code to the CIM server call that it runs in: a per-thread stack of contexts. The stack
/// does not own its elements; whoever pushes deletes. The order of the virtual operations is part of the
/// interface.
class Thread_Context
{
public:
    virtual ~Thread_Context();

    /// Runs in the parent thread; the result is the context of the new thread, as void*.
    virtual void* thread_create_hook(void* argument) = 0;
    virtual void thread_start_hook() = 0;
    virtual void thread_exit_hook() = 0;

    virtual Instance_Enumerator_Rep* instance_enumerator_create(const char* name_space,
                                                                const Instance* model) = 0;
    virtual void instance_enumerator_destroy(Instance_Enumerator_Rep* rep) = 0;
    virtual bool instance_enumerator_more(Instance_Enumerator_Rep* rep) = 0;
    virtual void instance_enumerator_next(Instance_Enumerator_Rep* rep) = 0;
    virtual Ref<Instance> instance_enumerator_get(Instance_Enumerator_Rep* rep) = 0;

    virtual Ref<Instance> get_instance(const char* name_space, const Instance* model) = 0;
    virtual int create_instance(const char* name_space, const Instance* instance) = 0;
    virtual int delete_instance(const char* name_space, const Instance* instance) = 0;
    virtual int modify_instance(const char* name_space, const Instance* instance) = 0;
    virtual int invoke_method(const char* name_space, const Instance* instance, Instance* method) = 0;
    virtual void allow_unload(bool flag) = 0;
    virtual bool get_username(String& name) = 0;

    /// Top of the calling thread's stack; null if it is empty.
    static Thread_Context* top();
    static void push(Thread_Context* context);
    static void pop();

private:
    Thread_Context* _next = nullptr;
};

} // namespace KPRV
