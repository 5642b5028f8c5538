// The up_call_table of `getInstance` and its like: requests that a provider sends to its server, and thread
// attachment.
#include "broker/Broker.h"
#include "broker/Convert.h"
#include "broker/Thread_Attachment.h"
#include "broker/values/Value_Text.h"

namespace KPRV::broker {

namespace {

std::string text_or_empty(const char* text)
{
    return text ? text : "";
}

/// Builds the request, sends it and hands the status on. The results need a frame to be recorded on.
class Up_Call : public Broker_Call
{
public:
    Up_Call(const char* name, const CMPIBroker* mb, const CMPIContext* ctx, const CMPIObjectPath* path,
            CMPIStatus* rc, Operation operation)
        : Broker_Call(name, mb, rc, path_argument(path))
    {
        if (!*this)
            return;
        if (!Call_Frame::top())
            violation(core(), CMPI_RC_ERR_FAILED, "up-call on a thread that is not attached");
        Context_Object* entries = *this ? context(ctx) : nullptr;
        Path_Object* target = *this ? argument_object<Path_Object>(*this, core(), path) : nullptr;
        if (!entries || !target)
            return;
        request.operation = operation;
        request.path = target->content;
        request.context = entries->entries;
        request.from_client = false;
    }

    /// False if the request failed; the status is set.
    bool send()
    {
        if (!*this)
            return false;
        result = (*this)->up_calls().up_call(request);
        set(result.rc);
        return result.ok();
    }

    Request request;
    Result result;

private:
    /// The class of the path, for the call log.
    const char* path_argument(const CMPIObjectPath* path)
    {
        Object* object = find_object(path);
        if (!object || object->kind != Object_Kind::PATH || !object->live)
            return nullptr;
        return static_cast<Path_Object*>(object)->content.class_name.c_str();
    }
};

CMPIEnumeration* answer(Up_Call& call)
{
    if (!call.send())
        return nullptr;
    std::vector<Plain_Value> elements;
    for (Instance_Value& instance : call.result.instances)
        elements.push_back(Plain_Value::instance(std::move(instance)));
    for (Path_Value& path : call.result.paths)
        elements.push_back(Plain_Value::path(std::move(path)));
    return make_object<Enumeration_Object>(call.core(), call.name(), std::move(elements))->cmpi();
}

CMPIEnumeration* enumerate_instance_names(const CMPIBroker* mb, const CMPIContext* ctx,
                                          const CMPIObjectPath* path, CMPIStatus* rc)
{
    Up_Call call("CBEnumInstanceNames", mb, ctx, path, rc, Operation::ENUMERATE_INSTANCE_NAMES);
    return answer(call);
}

CMPIEnumeration* enumerate_instances(const CMPIBroker* mb, const CMPIContext* ctx, const CMPIObjectPath* path,
                                     const char** properties, CMPIStatus* rc)
{
    Up_Call call("CBEnumInstances", mb, ctx, path, rc, Operation::ENUMERATE_INSTANCES);
    call.request.properties = read_list(properties);
    return answer(call);
}

CMPIInstance* get_instance(const CMPIBroker* mb, const CMPIContext* ctx, const CMPIObjectPath* path,
                           const char** properties, CMPIStatus* rc)
{
    Up_Call call("CBGetInstance", mb, ctx, path, rc, Operation::GET_INSTANCE);
    call.request.properties = read_list(properties);
    if (!call.send())
        return nullptr;
    if (call.result.instances.empty())
        return call.fail(CMPI_RC_ERR_NOT_FOUND);
    return make_object<Instance_Object>(call.core(), call.name(), call.result.instances.front())->cmpi();
}

/// Adds the instance to the request; false after a violation.
bool add_instance(Up_Call& call, const CMPIInstance* instance)
{
    auto* object = call ? argument_object<Instance_Object>(call, call.core(), instance) : nullptr;
    if (object)
        call.request.instance = object->value();
    return object != nullptr;
}

CMPIObjectPath* create_instance(const CMPIBroker* mb, const CMPIContext* ctx, const CMPIObjectPath* path,
                                const CMPIInstance* instance, CMPIStatus* rc)
{
    Up_Call call("CBCreateInstance", mb, ctx, path, rc, Operation::CREATE_INSTANCE);
    if (!add_instance(call, instance) || !call.send())
        return nullptr;
    if (call.result.paths.empty())
        return call.fail(CMPI_RC_ERR_FAILED);
    return make_object<Path_Object>(call.core(), call.name(), call.result.paths.front())->cmpi();
}

CMPIStatus modify_instance(const CMPIBroker* mb, const CMPIContext* ctx, const CMPIObjectPath* path,
                           const CMPIInstance* instance, const char** properties)
{
    Up_Call call("CBModifyInstance", mb, ctx, path, nullptr, Operation::MODIFY_INSTANCE);
    call.request.properties = read_list(properties);
    if (add_instance(call, instance))
        call.send();
    return call.status();
}

CMPIStatus delete_instance(const CMPIBroker* mb, const CMPIContext* ctx, const CMPIObjectPath* path)
{
    Up_Call call("CBDeleteInstance", mb, ctx, path, nullptr, Operation::DELETE_INSTANCE);
    call.send();
    return call.status();
}

CMPIEnumeration* exec_query(const CMPIBroker* mb, const CMPIContext*, const CMPIObjectPath*,
                            const char* query, const char*, CMPIStatus* rc)
{
    Broker_Call call("CBExecQuery", mb, rc, query);
    return call ? call.fail(CMPI_RC_ERR_NOT_SUPPORTED) : nullptr;
}

CMPIEnumeration* associators(const CMPIBroker* mb, const CMPIContext* ctx, const CMPIObjectPath* path,
                             const char* association_class, const char* result_class, const char* role,
                             const char* result_role, const char** properties, CMPIStatus* rc)
{
    Up_Call call("CBAssociators", mb, ctx, path, rc, Operation::ASSOCIATORS);
    call.request.filter = {text_or_empty(association_class), text_or_empty(result_class), text_or_empty(role),
                           text_or_empty(result_role)};
    call.request.properties = read_list(properties);
    return answer(call);
}

CMPIEnumeration* associator_names(const CMPIBroker* mb, const CMPIContext* ctx, const CMPIObjectPath* path,
                                  const char* association_class, const char* result_class, const char* role,
                                  const char* result_role, CMPIStatus* rc)
{
    Up_Call call("CBAssociatorNames", mb, ctx, path, rc, Operation::ASSOCIATOR_NAMES);
    call.request.filter = {text_or_empty(association_class), text_or_empty(result_class), text_or_empty(role),
                           text_or_empty(result_role)};
    return answer(call);
}

CMPIEnumeration* references(const CMPIBroker* mb, const CMPIContext* ctx, const CMPIObjectPath* path,
                            const char* result_class, const char* role, const char** properties,
                            CMPIStatus* rc)
{
    Up_Call call("CBReferences", mb, ctx, path, rc, Operation::REFERENCES);
    call.request.filter = {"", text_or_empty(result_class), text_or_empty(role), ""};
    call.request.properties = read_list(properties);
    return answer(call);
}

CMPIEnumeration* reference_names(const CMPIBroker* mb, const CMPIContext* ctx, const CMPIObjectPath* path,
                                 const char* result_class, const char* role, CMPIStatus* rc)
{
    Up_Call call("CBReferenceNames", mb, ctx, path, rc, Operation::REFERENCE_NAMES);
    call.request.filter = {"", text_or_empty(result_class), text_or_empty(role), ""};
    return answer(call);
}

CMPIData invoke_method(const CMPIBroker* mb, const CMPIContext* ctx, const CMPIObjectPath* path,
                       const char* method, const CMPIArgs* in, CMPIArgs* out, CMPIStatus* rc)
{
    Up_Call call("CBInvokeMethod", mb, ctx, path, rc, Operation::INVOKE_METHOD);
    if (!call || !call.need_text(call.core(), method, "method name"))
        return no_data();
    auto* given = argument_object<Args_Object>(call, call.core(), in);
    auto* answered = given ? argument_object<Args_Object>(call, call.core(), out) : nullptr;
    if (!answered)
        return no_data();
    call.request.method = method;
    call.request.in = given->content;
    if (!call.send())
        return no_data();
    answered->content = std::move(call.result.out);
    return make_data(call.core(), call.name(), call.result.return_value);
}

/// Both public servers have these two as stubs.
CMPIStatus set_property(const CMPIBroker* mb, const CMPIContext*, const CMPIObjectPath*, const char* name,
                        const CMPIValue*, CMPIType)
{
    Broker_Call call("CBSetProperty", mb, nullptr, name);
    if (call)
        call.fail(CMPI_RC_ERR_NOT_SUPPORTED);
    return call.status();
}

CMPIData get_property(const CMPIBroker* mb, const CMPIContext*, const CMPIObjectPath*, const char* name,
                      CMPIStatus* rc)
{
    Broker_Call call("CBGetProperty", mb, rc, name);
    if (call)
        call.fail(CMPI_RC_ERR_NOT_SUPPORTED);
    return no_data();
}

CMPIContext* prepare_attach_thread(const CMPIBroker* mb, const CMPIContext* ctx)
{
    Broker_Call call("CBPrepareAttachThread", mb, nullptr);
    Context_Object* source = call ? call.context(ctx) : nullptr;
    return source ? prepare_attach(call.core(), *source)->cmpi() : nullptr;
}

CMPIStatus attach_current_thread(const CMPIBroker* mb, const CMPIContext* ctx)
{
    Broker_Call call("CBAttachThread", mb, nullptr);
    if (Context_Object* prepared = call ? call.context(ctx) : nullptr)
        attach_thread(call, call->core(), *prepared);
    return call.status();
}

CMPIStatus detach_current_thread(const CMPIBroker* mb, const CMPIContext* ctx)
{
    Broker_Call call("CBDetachThread", mb, nullptr);
    if (Context_Object* prepared = call ? call.context(ctx) : nullptr)
        detach_thread(call, call.core(), *prepared);
    return call.status();
}

CMPIStatus deliver_indication(const CMPIBroker* mb, const CMPIContext* ctx, const char* name_space,
                              const CMPIInstance* instance)
{
    Broker_Call call("CBDeliverIndication", mb, nullptr, name_space);
    if (!call || !call.context(ctx) || !call.need_text(call.core(), name_space, "name space"))
        return call.status();
    if (auto* indication = argument_object<Instance_Object>(call, call.core(), instance))
        call.fail(call->up_calls().deliver(name_space, indication->value()));
    if (Call_Frame* const frame = Call_Frame::top())
        frame->pack_old();
    return call.status();
}

constexpr CMPIBrokerFT up_call_level_100 = {CMPI_MB_InstanceManipulation | CMPI_MB_AssociationTraversal |
                                                CMPI_MB_Indications | CMPI_MB_OSEncapsulationSupport,
                                            CMPIVersion100,
                                            "kldrcim",
                                            prepare_attach_thread,
                                            attach_current_thread,
                                            detach_current_thread,
                                            deliver_indication,
                                            enumerate_instance_names,
                                            get_instance,
                                            create_instance,
                                            modify_instance,
                                            delete_instance,
                                            exec_query,
                                            enumerate_instances,
                                            associators,
                                            associator_names,
                                            references,
                                            reference_names,
                                            invoke_method,
                                            set_property,
                                            get_property};

constexpr With_Null_Slots<CMPIBrokerFT, 3> up_call_table = {up_call_level_100, {}};

} // namespace

const CMPIBrokerFT* const broker_table = &up_call_table.table;

} // namespace KPRV::broker
