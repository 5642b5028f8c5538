#include "module/cmpi/CMPI_Thread_Context.h"
#include "module/cmpi/CMPI_Adapter.h"
#include "module/cmpi/CMPI_Containers.h"
#include "module/cmpi/Converter.h"
#include "module/cmpi/cmpi_text.h"
#include "module/cmpi/to_cimple_value.h"
#include "module/runtime/dispatch/Instance_Enumerator.h"
#include "module/runtime/system/forced_unwinding.h"
#include "module/runtime/system/log.h"

#include <memory>

namespace KPRV {

/// Cursor over what the server enumerates. The enumeration belongs to the server.
struct Instance_Enumerator_Rep
{
    CMPIEnumeration* enumeration;
    const Meta_Class* meta_class;
    /// Null at the end.
    Ref<Instance> current;
};

static CMPI_Thread_Context* _top()
{
    return static_cast<CMPI_Thread_Context*>(Thread_Context::top());
}

void CMPI_Thread_Context::operator delete(CMPI_Thread_Context* self, std::destroying_delete_t)
{
    if (self->_owned_by_scope)
        return;
    self->~CMPI_Thread_Context();
    ::operator delete(self);
}

Context_Scope::Context_Scope(const CMPIBroker* broker, const CMPIContext* context, CMPI_Adapter* adapter)
    : _thread_context(broker, context, adapter)
{
    _thread_context._owned_by_scope = true;
    Thread_Context::push(&_thread_context);
}

Context_Scope::~Context_Scope()
{
    Thread_Context::pop();
}

void* CMPI_Thread_Context::thread_create_hook(void*)
{
    const CMPI_Thread_Context* const top = _top();
    // The server's context comes last: nobody would give it back.
    auto thread = std::make_unique<CMPI_Thread_Context>(top->_broker, nullptr, top->_adapter);
    thread->_context = CBPrepareAttachThread(top->_broker, top->_context);
    return static_cast<Thread_Context*>(thread.release());
}

/// A thread of the module's own has nobody above it to catch what a server throws. It goes on as it does
/// where the server answers with a code.
template <class Call>
static void _on_own_thread(Call call)
{
    try {
        call();
    } catch (...) {
        rethrow_forced_unwinding();
    }
}

void CMPI_Thread_Context::thread_start_hook()
{
    _on_own_thread([] { CBAttachThread(_top()->_broker, _top()->_context); });
}

void CMPI_Thread_Context::thread_exit_hook()
{
    _on_own_thread([] { CBDetachThread(_top()->_broker, _top()->_context); });
}

/// The next element as an instance of the class; null at the end. An element that fails ends the walk too.
static Ref<Instance> _next_instance(const CMPIEnumeration* enumeration, const Meta_Class* meta_class)
{
    Ref<Instance> instance;
    if (!CMHasNext(enumeration, nullptr))
        return instance;
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    const CMPIData data = CMGetNext(enumeration, &status);
    if (status.rc != CMPI_RC_OK || data.type != CMPI_instance || !data.value.inst)
        return instance;
    const CMPIObjectPath* const path = CMGetObjectPath(data.value.inst, nullptr);
    if (make_cimple_instance(nullptr, meta_class, path, data.value.inst, instance) != CMPI_RC_OK)
        instance.reset();
    return instance;
}

Instance_Enumerator_Rep* CMPI_Thread_Context::instance_enumerator_create(const char* name_space,
                                                                         const Instance* model)
{
    if (!name_space || !model)
        return nullptr;
    const CMPI_Thread_Context* const top = _top();
    CMPIObjectPath* path;
    if (make_cmpi_object_path(top->_broker, model, name_space, path) != CMPI_RC_OK)
        return nullptr;
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    CMPIEnumeration* const enumeration = CBEnumInstances(top->_broker, top->_context, path, nullptr, &status);
    if (status.rc != CMPI_RC_OK || !enumeration)
        return nullptr;
    return new Instance_Enumerator_Rep{enumeration, model->__meta_class,
                                       _next_instance(enumeration, model->__meta_class)};
}

void CMPI_Thread_Context::instance_enumerator_destroy(Instance_Enumerator_Rep* rep)
{
    delete rep;
}

bool CMPI_Thread_Context::instance_enumerator_more(Instance_Enumerator_Rep* rep)
{
    return rep && rep->current;
}

void CMPI_Thread_Context::instance_enumerator_next(Instance_Enumerator_Rep* rep)
{
    if (rep)
        rep->current = _next_instance(rep->enumeration, rep->meta_class);
}

Ref<Instance> CMPI_Thread_Context::instance_enumerator_get(Instance_Enumerator_Rep* rep)
{
    return rep ? rep->current : Ref<Instance>();
}

Ref<Instance> CMPI_Thread_Context::get_instance(const char* name_space, const Instance* model)
{
    Ref<Instance> instance;
    if (!name_space || !model)
        return instance;
    const CMPI_Thread_Context* const top = _top();
    CMPIObjectPath* path;
    if (make_cmpi_object_path(top->_broker, model, name_space, path) != CMPI_RC_OK)
        return instance;
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    const CMPIInstance* const ci = CBGetInstance(top->_broker, top->_context, path, nullptr, &status);
    if (status.rc != CMPI_RC_OK || !ci)
        return instance;
    if (make_cimple_instance(nullptr, model->__meta_class, path, ci, instance) != CMPI_RC_OK)
        instance.reset();
    return instance;
}

/// Path and object of an instance that is to be created or modified.
static bool make_both(const CMPIBroker* broker, const char* name_space, const Instance* instance,
                      CMPIObjectPath*& path, CMPIInstance*& ci)
{
    return name_space && instance &&
           make_cmpi_object_path(broker, instance, name_space, path) == CMPI_RC_OK &&
           make_cmpi_instance(broker, instance, name_space, path, nullptr, ci) == CMPI_RC_OK;
}

int CMPI_Thread_Context::create_instance(const char* name_space, const Instance* instance)
{
    const CMPI_Thread_Context* const top = _top();
    CMPIObjectPath* path;
    CMPIInstance* ci;
    if (!make_both(top->_broker, name_space, instance, path, ci))
        return -1;
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    CBCreateInstance(top->_broker, top->_context, path, ci, &status);
    return status.rc == CMPI_RC_OK ? 0 : -1;
}

int CMPI_Thread_Context::modify_instance(const char* name_space, const Instance* instance)
{
    const CMPI_Thread_Context* const top = _top();
    CMPIObjectPath* path;
    CMPIInstance* ci;
    if (!make_both(top->_broker, name_space, instance, path, ci))
        return -1;
    const CMPIStatus status = CBModifyInstance(top->_broker, top->_context, path, ci, nullptr);
    return status.rc == CMPI_RC_OK ? 0 : -1;
}

int CMPI_Thread_Context::delete_instance(const char* name_space, const Instance* instance)
{
    if (!name_space || !instance)
        return -1;
    const CMPI_Thread_Context* const top = _top();
    CMPIObjectPath* path;
    if (make_cmpi_object_path(top->_broker, instance, name_space, path) != CMPI_RC_OK)
        return -1;
    return CBDeleteInstance(top->_broker, top->_context, path).rc == CMPI_RC_OK ? 0 : -1;
}

void CMPI_Thread_Context::allow_unload(bool flag)
{
    _top()->_adapter->unload_allowed = flag;
}

bool CMPI_Thread_Context::get_username(String& name)
{
    const CMPI_Thread_Context* const top = _top();
    if (!top || !top->_context)
        return false;
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    const CMPIData data = CMGetContextEntry(top->_context, CMPIPrincipal, &status);
    if (status.rc != CMPI_RC_OK) {
        LOG(ERR, "username not OK cmpirc=%d", int(status.rc));
        return false;
    }
    name = text_of(data.value.string);
    return true;
}

} // namespace KPRV
