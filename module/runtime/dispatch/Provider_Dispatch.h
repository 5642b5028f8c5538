#pragma once

#include "module/runtime/dispatch/Handler.h"
#include "module/runtime/dispatch/Operation.h"
#include "module/runtime/dispatch/Registration.h"
#include "module/runtime/dispatch/provider_status.h"
#include "module/runtime/dispatch/version.h"

namespace KPRV {

/// The body of every provider proc. `Provider` derives from its generated skeleton, which names its `Class`,
/// its `kind`, whether it `has_methods`, and offers `invoke`; dispatch is static.
template <class Provider>
int dispatch(const Registration*, int operation, void* arg0, void* arg1, void* arg2, void* arg3, void* arg4,
             void* arg5, void* arg6, void*)
{
    using Class = typename Provider::Class;
    constexpr bool has_instances = Provider::kind != Provider_Kind::INDICATION;

    auto* const provider = static_cast<Provider*>(arg0);
    const auto instance = [](void* arg) { return static_cast<Class*>(static_cast<Instance*>(arg)); };
    const auto text = [](void* arg) -> const String& { return *static_cast<const String*>(arg); };
    const auto proc = [](void* arg) { return reinterpret_cast<Instance_Handler_Proc>(arg); };

    switch (operation) {
    case OP_GET_META_CLASS:
        *static_cast<const Meta_Class**>(arg0) = &Class::static_meta_class;
        return 0;
    case OP_GET_REPOSITORY:
        *static_cast<const Meta_Repository**>(arg0) = Class::static_meta_class.meta_repository;
        return 0;
    case OP_CREATE_PROVIDER:
        *static_cast<void**>(arg0) = new Provider;
        return 0;
    case OP_DESTROY_PROVIDER:
        delete provider;
        return 0;
    case OP_LOAD:
        return provider->load();
    case OP_UNLOAD:
        return provider->unload();
    default:
        break;
    }

    if constexpr (has_instances) {
        switch (operation) {
        case OP_GET_INSTANCE: {
            Class* found = nullptr;
            const int status = provider->get_instance(instance(arg1), found);
            *static_cast<Instance**>(arg2) = found;
            return status;
        }
        case OP_ENUM_INSTANCES: {
            Enum_Instances_Handler<Class> handler(proc(arg2), arg3, static_cast<const Wanted*>(arg4));
            const int status = provider->enum_instances(instance(arg1), &handler);
            proc(arg2)(nullptr, status, arg3);
            return status;
        }
        case OP_CREATE_INSTANCE:
            return provider->create_instance(instance(arg1));
        case OP_DELETE_INSTANCE:
            return provider->delete_instance(instance(arg1));
        case OP_MODIFY_INSTANCE:
            return provider->modify_instance(instance(arg1), instance(arg2));
        case OP_INVOKE_METHOD:
            if constexpr (Provider::has_methods)
                return Provider::invoke(*provider, cast<Class>(static_cast<Instance*>(arg1)),
                                        static_cast<Instance*>(arg2));
            else
                return -1;
        default:
            break;
        }
    }

    if constexpr (Provider::kind == Provider_Kind::INDICATION) {
        switch (operation) {
        case OP_ENABLE_INDICATIONS:
            return provider->enable_indications(
                new Indication_Handler<Class>(reinterpret_cast<Indication_Handler_Proc>(arg1), arg2));
        case OP_DISABLE_INDICATIONS:
            return provider->disable_indications();
        default:
            break;
        }
    }

    if constexpr (Provider::kind == Provider_Kind::ASSOCIATION) {
        // An unsupported answer carries no end mark: the caller's fallback sends its own.
        switch (operation) {
        case OP_ENUM_ASSOCIATOR_NAMES: {
            Enum_Associator_Names_Handler<Instance> handler(proc(arg5), arg6);
            const int status = provider->enum_associator_names(static_cast<Instance*>(arg1), text(arg2),
                                                               text(arg3), text(arg4), &handler);
            if (status != ENUM_ASSOCIATOR_NAMES_UNSUPPORTED)
                proc(arg5)(nullptr, status, arg6);
            return status;
        }
        case OP_ENUM_REFERENCES: {
            Enum_References_Handler<Class> handler(proc(arg4), arg5);
            const int status =
                provider->enum_references(static_cast<Instance*>(arg1), instance(arg2), text(arg3), &handler);
            if (status != ENUM_REFERENCES_UNSUPPORTED)
                proc(arg4)(nullptr, status, arg5);
            return status;
        }
        case OP_ENUM_ASSOCIATORS: {
            Enum_Associators_Handler<Instance> handler(proc(arg5), arg6);
            const int status = provider->enum_associators(static_cast<Instance*>(arg1), text(arg2),
                                                          text(arg3), text(arg4), &handler);
            if (status != ENUM_ASSOCIATORS_UNSUPPORTED)
                proc(arg5)(nullptr, status, arg6);
            return status;
        }
        default:
            break;
        }
    }
    return -1;
}

} // namespace KPRV
