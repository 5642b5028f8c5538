#include "module/runtime/dispatch/Provider_Handle.h"
#include "module/runtime/dispatch/Operation.h"
#include "module/runtime/dispatch/association_walk.h"
#include "module/runtime/dispatch/provider_status.h"
#include "module/runtime/ground/Answer_Blocks.h"
#include "module/runtime/objects/Ref.h"

#include <memory>

namespace KPRV {

static const void* as_argument(Instance_Handler_Proc proc)
{
    return reinterpret_cast<const void*>(proc);
}

Provider_Handle::Provider_Handle(const Registration* registration)
    : _registration(registration), _proc(registration->proc), _provider(nullptr)
{
    _query(OP_CREATE_PROVIDER, &_provider);
}

Provider_Handle::~Provider_Handle()
{
    _call(OP_DESTROY_PROVIDER);
}

int Provider_Handle::_query(int operation, void* out) const
{
    return _proc(_registration, operation, out, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr,
                 nullptr);
}

int Provider_Handle::_call(int operation, const void* arg1, const void* arg2, const void* arg3,
                           const void* arg4, const void* arg5, const void* arg6) const
{
    const auto arg = [](const void* x) { return const_cast<void*>(x); };
    return _proc(_registration, operation, _provider, arg(arg1), arg(arg2), arg(arg3), arg(arg4), arg(arg5),
                 arg(arg6), nullptr);
}

int Provider_Handle::get_meta_class(const Meta_Class*& meta_class) const
{
    return _query(OP_GET_META_CLASS, &meta_class);
}

int Provider_Handle::get_repository(const Meta_Repository*& repository) const
{
    return _query(OP_GET_REPOSITORY, &repository);
}

int Provider_Handle::load()
{
    return _call(OP_LOAD);
}

int Provider_Handle::unload()
{
    return _call(OP_UNLOAD);
}

namespace {

/// Handler that keeps the instance with the keys of the model.
struct Find_By_Key
{
    const Instance* model;
    Ref<Instance> found;

    static bool _proc(Instance* instance, int, void* client_data)
    {
        auto* const self = static_cast<Find_By_Key*>(client_data);
        if (!instance)
            return false;
        if (key_eq(self->model, instance)) {
            self->found.reset(instance);
            return false;
        }
        destroy(instance);
        return true;
    }
};

/// Handler that turns association instances into the far ends of one instance.
struct Find_Associators
{
    const Instance* instance;
    Fitting_References fitting;
    String result_class;
    String role;
    String result_role;
    Instance_Handler_Proc proc;
    void* client_data;

    static bool _proc(Instance* association, int, void* client_data)
    {
        auto* const self = static_cast<Find_Associators*>(client_data);
        if (!association)
            return false;
        const std::unique_ptr<Instance, decltype(&destroyer)> owner(association, destroyer);
        Instance* far_ends[MAX_ASSOCIATORS];
        const int count = get_associators(self->instance, self->fitting, association, self->result_class,
                                          self->role, self->result_role, far_ends);
        for (int i = 0; i < count; i++) {
            ref(far_ends[i]);
            // Either way (constant): nobody looks at the second argument.
            self->proc(far_ends[i], 0, self->client_data);
        }
        return true;
    }
};

/// Handler that lets through the association instances that refer to one instance.
struct Find_References
{
    const Instance* instance;
    String role;
    Instance_Handler_Proc proc;
    void* client_data;

    static bool _proc(Instance* association, int, void* client_data)
    {
        auto* const self = static_cast<Find_References*>(client_data);
        if (!association)
            return false;
        if (is_reference_of(self->instance, association, self->role))
            self->proc(association, 0, self->client_data);
        else
            destroy(association);
        return true;
    }
};

} // namespace

int Provider_Handle::get_instance(const Instance* model, Instance*& instance)
{
    instance = nullptr;
    const int status = _call(OP_GET_INSTANCE, model, &instance);
    if (status != GET_INSTANCE_UNSUPPORTED)
        return status;

    Find_By_Key data{model, {}};
    if (enum_instances(model, Find_By_Key::_proc, &data, Wanted::object(model)) != ENUM_INSTANCES_OK ||
        !data.found)
        return GET_INSTANCE_NOT_FOUND;
    instance = data.found.steal();
    return GET_INSTANCE_OK;
}

int Provider_Handle::enum_instances(const Instance* model, Instance_Handler_Proc proc, void* client_data,
                                    const Wanted& wanted)
{
    const Answer_Blocks blocks;
    return _call(OP_ENUM_INSTANCES, model, as_argument(proc), client_data, &wanted);
}

int Provider_Handle::create_instance(Instance* instance)
{
    return _call(OP_CREATE_INSTANCE, instance);
}

int Provider_Handle::delete_instance(const Instance* instance)
{
    return _call(OP_DELETE_INSTANCE, instance);
}

int Provider_Handle::modify_instance(const Instance* model, const Instance* instance)
{
    return _call(OP_MODIFY_INSTANCE, model, instance);
}

int Provider_Handle::invoke_method(const Instance* instance, Instance* method)
{
    return _call(OP_INVOKE_METHOD, instance, method);
}

int Provider_Handle::enable_indications(Indication_Handler_Proc proc, void* client_data)
{
    return _call(OP_ENABLE_INDICATIONS, reinterpret_cast<const void*>(proc), client_data);
}

int Provider_Handle::disable_indications()
{
    return _call(OP_DISABLE_INDICATIONS);
}

const Meta_Class* Provider_Handle::_association_class() const
{
    const Meta_Class* meta_class = nullptr;
    get_meta_class(meta_class);
    return meta_class && (meta_class->flags & FLAG_ASSOCIATION) ? meta_class : nullptr;
}

int Provider_Handle::enum_associators(const Instance* instance, const String& result_class,
                                      const String& role, const String& result_role,
                                      Instance_Handler_Proc proc, void* client_data)
{
    return _call(OP_ENUM_ASSOCIATORS, instance, &result_class, &role, &result_role, as_argument(proc),
                 client_data);
}

int Provider_Handle::enum_associator_names(const Instance* instance, const String& result_class,
                                           const String& role, const String& result_role,
                                           Instance_Handler_Proc proc, void* client_data)
{
    const Meta_Class* const meta_class = _association_class();
    if (!meta_class)
        return ENUM_ASSOCIATOR_NAMES_FAILED;

    switch (_call(OP_ENUM_ASSOCIATOR_NAMES, instance, &result_class, &role, &result_role, as_argument(proc),
                  client_data)) {
    case ENUM_ASSOCIATOR_NAMES_OK:
        return ENUM_ASSOCIATOR_NAMES_OK;
    case ENUM_ASSOCIATOR_NAMES_FAILED:
    case ENUM_ASSOCIATOR_NAMES_ACCESS_DENIED:
        // The provider's own denial comes out as a failure; only the enumeration below can deny access.
        return ENUM_ASSOCIATOR_NAMES_FAILED;
    default:
        break;
    }

    const Ref<Instance> model(create(meta_class, false));
    __set_null_flags(model.ptr(), false, true, 1);
    Find_Associators data{instance,   Fitting_References(instance), result_class, role, result_role, proc,
                          client_data};
    const int status =
        enum_instances(model.ptr(), Find_Associators::_proc, &data, Wanted::touching(instance));
    proc(nullptr, 0, client_data);

    switch (status) {
    case ENUM_INSTANCES_FAILED:
        return ENUM_ASSOCIATOR_NAMES_FAILED;
    case ENUM_INSTANCES_ACCESS_DENIED:
        return ENUM_ASSOCIATOR_NAMES_ACCESS_DENIED;
    default:
        return ENUM_ASSOCIATOR_NAMES_OK;
    }
}

int Provider_Handle::enum_references(const Instance* instance, const Instance* model, const String& role,
                                     Instance_Handler_Proc proc, void* client_data)
{
    if (!_association_class())
        return ENUM_REFERENCES_FAILED;

    const int own = _call(OP_ENUM_REFERENCES, instance, model, &role, as_argument(proc), client_data);
    switch (own) {
    case ENUM_REFERENCES_OK:
    case ENUM_REFERENCES_FAILED:
    case ENUM_REFERENCES_ACCESS_DENIED:
        return own;
    default:
        break;
    }

    Find_References data{instance, role, proc, client_data};
    const int status = enum_instances(model, Find_References::_proc, &data, Wanted::touching(instance));
    proc(nullptr, 0, client_data);

    switch (status) {
    case ENUM_INSTANCES_FAILED:
        return ENUM_REFERENCES_FAILED;
    case ENUM_INSTANCES_ACCESS_DENIED:
        return ENUM_REFERENCES_ACCESS_DENIED;
    default:
        return ENUM_REFERENCES_OK;
    }
}

} // namespace KPRV
