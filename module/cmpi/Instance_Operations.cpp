// The entries of the instance table: enumerate, get, create, modify, delete.
#include "module/cmpi/Converter.h"
#include "module/cmpi/Operation_Scope.h"
#include "module/cmpi/Shared_Ends.h"
#include "module/cmpi/cmpi_text.h"
#include "module/cmpi/entries.h"
#include "module/cmpi/status_translation.h"
#include "module/runtime/ground/Answer_Blocks.h"

namespace KPRV {

/// The keys of the path as an instance. 1 for a class that the module does not know.
static CMPIrc model_of(const Operation_Scope& scope, const CMPIObjectPath* cop, Ref<Instance>& model)
{
    const Meta_Class* const meta_class = scope.adapter()->find_model_meta_class(class_name_of(cop));
    return meta_class ? make_cimple_reference(nullptr, meta_class, cop, model) : CMPI_RC_ERR_FAILED;
}

/// The instance of the request. 1 for a class that the module does not know.
static CMPIrc instance_of(const Operation_Scope& scope, const CMPIObjectPath* cop, const CMPIInstance* ci,
                          Ref<Instance>& instance)
{
    const Meta_Class* const meta_class = scope.adapter()->find_model_meta_class(class_name_of(cop));
    return meta_class ? make_cimple_instance(scope.broker(), meta_class, cop, ci, instance)
                      : CMPI_RC_ERR_FAILED;
}

namespace {

// The handlers stop converting after the first failure, and nobody looks at the rc that they keep: an
// instance that does not convert cuts the stream short, and the client sees a normal end. That is settled.

struct enum_instances
{
    const CMPIBroker* broker;
    const CMPIResult* result;
    const CMPIObjectPath* cop;
    const char** properties;
    CMPIrc rc;
    Shared_Ends ends;

    static bool _proc(Instance* instance, int, void* client_data)
    {
        const Ref<Instance> owner(instance);
        auto* const self = static_cast<enum_instances*>(client_data);
        if (!instance || self->rc != CMPI_RC_OK)
            return false;
        const char* const name_space = name_space_of(self->cop);
        CMPIObjectPath* path;
        make_cmpi_object_path(self->broker, instance, name_space, path, &self->ends);
        CMPIInstance* ci;
        self->rc =
            make_cmpi_instance(self->broker, instance, name_space, path, self->properties, ci, &self->ends);
        if (self->rc != CMPI_RC_OK)
            return false;
        CMReturnInstance(self->result, ci);
        CMRelease(ci);
        return true;
    }
};

struct enum_instance_names
{
    const CMPIBroker* broker;
    const CMPIResult* result;
    const char* name_space;
    CMPIrc rc;
    Shared_Ends ends;

    static bool _proc(Instance* instance, int, void* client_data)
    {
        const Ref<Instance> owner(instance);
        auto* const self = static_cast<enum_instance_names*>(client_data);
        if (!instance || self->rc != CMPI_RC_OK)
            return false;
        CMPIObjectPath* path;
        self->rc = make_cmpi_object_path(self->broker, instance, self->name_space, path, &self->ends);
        if (self->rc != CMPI_RC_OK)
            return false;
        CMReturnObjectPath(self->result, path);
        CMRelease(path);
        return true;
    }
};

} // namespace

static CMPIStatus enumerateInstanceNames(CMPIInstanceMI* mi, const CMPIContext* context,
                                         const CMPIResult* result, const CMPIObjectPath* cop)
{
    const Operation_Scope scope(_adapter(mi), context, "enumInstanceNames", LOG_HERE);
    const Answer_Blocks blocks;
    Ref<Instance> model;
    if (const CMPIrc rc = model_of(scope, cop, model); rc != CMPI_RC_OK)
        return scope.ret(LOG_HERE, rc);
    __set_null_flags(model.ptr(), false, true, 1);

    enum_instance_names data{scope.broker(), result, name_space_of(cop), CMPI_RC_OK, {}};
    const int status = scope.adapter()->Provider_Handle::enum_instances(
        model.ptr(), enum_instance_names::_proc, &data, Wanted::names());
    const CMPIrc rc = translate(Status_Family::ENUM_INSTANCES, status);
    // Unlike the enumeration of instances, this one ends the result only on success itself.
    if (status == ENUM_INSTANCES_OK)
        CMReturnDone(result);
    return scope.ret(LOG_HERE, rc);
}

static CMPIStatus enumerateInstances(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                                     const CMPIObjectPath* cop, const char** properties)
{
    const Operation_Scope scope(_adapter(mi), context, "enumInstances", LOG_HERE);
    const Answer_Blocks blocks;
    Ref<Instance> model;
    if (const CMPIrc rc = model_of(scope, cop, model); rc != CMPI_RC_OK)
        return scope.ret(LOG_HERE, rc);
    // Without a list the model keeps its null non-keys, where `getInstance` marks all as wanted.
    if (properties)
        filter_properties(model.ptr(), properties, true);

    enum_instances data{scope.broker(), result, cop, properties, CMPI_RC_OK, {}};
    const int status =
        scope.adapter()->Provider_Handle::enum_instances(model.ptr(), enum_instances::_proc, &data);
    const CMPIrc rc = translate(Status_Family::ENUM_INSTANCES, status);
    if (rc == CMPI_RC_OK)
        CMReturnDone(result);
    return scope.ret(LOG_HERE, rc);
}

static CMPIStatus getInstance(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                              const CMPIObjectPath* cop, const char** properties)
{
    const Operation_Scope scope(_adapter(mi), context, "getInstance", LOG_HERE);
    const Answer_Blocks blocks;
    Ref<Instance> model;
    if (const CMPIrc rc = model_of(scope, cop, model); rc != CMPI_RC_OK)
        return scope.ret(LOG_HERE, rc);
    __set_null_flags(model.ptr(), true, true, 0);
    if (properties)
        filter_properties(model.ptr(), properties, true);

    Instance* found = nullptr;
    const int status = scope.adapter()->get_instance(model.ptr(), found);
    const Ref<Instance> instance(found);
    if (const CMPIrc rc = translate(Status_Family::GET_INSTANCE, status); rc != CMPI_RC_OK)
        return scope.ret(LOG_HERE, rc);

    // A status of success comes with an instance: that is the provider's part of the contract.
    CMPIInstance* ci;
    const CMPIrc rc =
        make_cmpi_instance(scope.broker(), instance.ptr(), name_space_of(cop), cop, properties, ci);
    if (rc != CMPI_RC_OK)
        return scope.ret(LOG_HERE, rc);
    CMReturnInstance(result, ci);
    CMReturnDone(result);
    return scope.ret(LOG_HERE, CMPI_RC_OK);
}

static CMPIStatus createInstance(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                                 const CMPIObjectPath* cop, const CMPIInstance* ci)
{
    const Operation_Scope scope(_adapter(mi), context, "createInstance", LOG_HERE);
    Ref<Instance> instance;
    if (const CMPIrc rc = instance_of(scope, cop, ci, instance); rc != CMPI_RC_OK)
        return scope.ret(LOG_HERE, rc);

    const int status = scope.adapter()->create_instance(instance.ptr());
    // A status outside the table is no failure, but there is no path to answer either.
    if (status != CREATE_INSTANCE_OK)
        return scope.ret(LOG_HERE, translate(Status_Family::CREATE_INSTANCE, status));

    // The path comes from the instance, not the request: the provider may have chosen keys.
    CMPIObjectPath* path;
    const CMPIrc rc = make_cmpi_object_path(scope.broker(), instance.ptr(), name_space_of(cop), path);
    if (rc != CMPI_RC_OK)
        return scope.ret(LOG_HERE, rc);
    CMReturnObjectPath(result, path);
    CMReturnDone(result);
    return scope.ret(LOG_HERE, CMPI_RC_OK);
}

static CMPIStatus modifyInstance(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                                 const CMPIObjectPath* cop, const CMPIInstance* ci, const char** properties)
{
    const Operation_Scope scope(_adapter(mi), context, "modifyInstance", LOG_HERE);
    Ref<Instance> instance;
    if (const CMPIrc rc = instance_of(scope, cop, ci, instance); rc != CMPI_RC_OK)
        return scope.ret(LOG_HERE, rc);
    const Ref<Instance> model(clone(instance.ptr()));
    filter_properties(model.ptr(), properties, true);

    const int status = scope.adapter()->modify_instance(model.ptr(), instance.ptr());
    if (status == MODIFY_INSTANCE_OK) {
        CMReturnObjectPath(result, cop);
        CMReturnDone(result);
    }
    return scope.ret(LOG_HERE, translate(Status_Family::MODIFY_INSTANCE, status));
}

static CMPIStatus deleteInstance(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                                 const CMPIObjectPath* cop)
{
    const Operation_Scope scope(_adapter(mi), context, "deleteInstance", LOG_HERE);
    Ref<Instance> instance;
    if (const CMPIrc rc = model_of(scope, cop, instance); rc != CMPI_RC_OK)
        return scope.ret(LOG_HERE, rc);

    const int status = scope.adapter()->delete_instance(instance.ptr());
    const CMPIrc rc = translate(Status_Family::DELETE_INSTANCE, status);
    if (rc == CMPI_RC_OK)
        CMReturnDone(result);
    return scope.ret(LOG_HERE, rc);
}

/// Servers disagree on the order of language and query; neither is read.
static CMPIStatus execQuery(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                            const char*, const char*)
{
    CMPI_Adapter::ent(__FILE_NAME__, __LINE__, "execQuery");
    CMPI_Adapter::ret(__FILE_NAME__, __LINE__, "execQuery", CMPI_RC_ERR_NOT_SUPPORTED);
    return {CMPI_RC_ERR_NOT_SUPPORTED, nullptr};
}

void fill_instance_operations(CMPIInstanceMIFT& ft)
{
    ft.enumerateInstanceNames = enumerateInstanceNames;
    ft.enumerateInstances = enumerateInstances;
    ft.getInstance = getInstance;
    ft.createInstance = createInstance;
    ft.modifyInstance = modifyInstance;
    ft.deleteInstance = deleteInstance;
    ft.execQuery = execQuery;
}

} // namespace KPRV
