#pragma once

#include "module/runtime/dispatch/Thread_Context.h"

#include <cmpidt.h>
#include <cmpift.h>
#include <new>

namespace KPRV {

class CMPI_Adapter;

/// Turns up-calls into calls of the CIM server's broker. It owns neither broker, context nor adapter. Every
/// operation works with the context on top of the calling thread's stack rather than with its own object.
class CMPI_Thread_Context : public Thread_Context
{
public:
    CMPI_Thread_Context(const CMPIBroker* broker, const CMPIContext* context, CMPI_Adapter* adapter)
        : _broker(broker), _context(context), _adapter(adapter)
    {
    }

    void* thread_create_hook(void* argument) override;
    void thread_start_hook() override;
    void thread_exit_hook() override;

    Instance_Enumerator_Rep* instance_enumerator_create(const char* name_space,
                                                        const Instance* model) override;
    void instance_enumerator_destroy(Instance_Enumerator_Rep* rep) override;
    bool instance_enumerator_more(Instance_Enumerator_Rep* rep) override;
    void instance_enumerator_next(Instance_Enumerator_Rep* rep) override;
    Ref<Instance> instance_enumerator_get(Instance_Enumerator_Rep* rep) override;

    Ref<Instance> get_instance(const char* name_space, const Instance* model) override;
    int create_instance(const char* name_space, const Instance* instance) override;
    int delete_instance(const char* name_space, const Instance* instance) override;
    int modify_instance(const char* name_space, const Instance* instance) override;
    int invoke_method(const char* name_space, const Instance* instance, Instance* method) override;
    void allow_unload(bool flag) override;
    bool get_username(String& name) override;

    const CMPIBroker* broker() const { return _broker; }
    const CMPIContext* context() const { return _context; }

    /// A context that a scope has pushed outlives a `delete` by anybody else: thread creation that fails
    /// deletes its parent's context where it stands on the stack, and the frame has still to be closed.
    static void operator delete(CMPI_Thread_Context* self, std::destroying_delete_t);

private:
    friend class Context_Scope;

    const CMPIBroker* _broker;
    const CMPIContext* _context;
    CMPI_Adapter* _adapter;
    bool _owned_by_scope = false;
};

/// A context on the calling thread's stack for the length of a scope.
class Context_Scope
{
public:
    Context_Scope(const CMPIBroker* broker, const CMPIContext* context, CMPI_Adapter* adapter);
    ~Context_Scope();
    Context_Scope(const Context_Scope&) = delete;
    Context_Scope& operator=(const Context_Scope&) = delete;

private:
    CMPI_Thread_Context _thread_context;
};

} // namespace KPRV
