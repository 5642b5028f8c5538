#pragma once

#include "module/runtime/dispatch/Handler.h"
#include "module/runtime/dispatch/Operation.h"
#include "module/runtime/dispatch/provider_status.h"
#include "module/runtime/ground/Property.h"

#include <strings.h>

namespace KPRV {

/// The operations of a provider that implements none of them, by kind. A generated `<Class>_Skeleton` derives
/// from one of these and adds the class's methods; a provider derives from its skeleton and hides what it
/// implements. Dispatch is static, so nothing is virtual.
template <class C>
class Provider_Skeleton
{
public:
    using Class = C;
    static constexpr bool has_methods = false;

    Load_Status load() { return LOAD_OK; }
    Unload_Status unload() { return UNLOAD_OK; }
};

template <class C>
class Instance_Skeleton : public Provider_Skeleton<C>
{
public:
    static constexpr Provider_Kind kind = Provider_Kind::INSTANCE;

    /// The caller owns the instance. Unsupported makes the caller look for it by enumeration.
    Get_Instance_Status get_instance(const C* /*model*/, C*& /*instance*/)
    {
        return GET_INSTANCE_UNSUPPORTED;
    }
    Enum_Instances_Status enum_instances(const C* /*model*/, Enum_Instances_Handler<C>* /*handler*/)
    {
        return ENUM_INSTANCES_OK;
    }
    Create_Instance_Status create_instance(C* /*instance*/) { return CREATE_INSTANCE_UNSUPPORTED; }
    Delete_Instance_Status delete_instance(const C* /*instance*/) { return DELETE_INSTANCE_UNSUPPORTED; }
    Modify_Instance_Status modify_instance(const C* /*model*/, const C* /*instance*/)
    {
        return MODIFY_INSTANCE_UNSUPPORTED;
    }
};

template <class C>
class Association_Skeleton : public Instance_Skeleton<C>
{
public:
    static constexpr Provider_Kind kind = Provider_Kind::ASSOCIATION;

    /// Unsupported makes the caller walk the instances of the association, in all three.
    Enum_Associator_Names_Status enum_associator_names(const Instance* /*instance*/,
                                                       const String& /*result_class*/, const String& /*role*/,
                                                       const String& /*result_role*/,
                                                       Enum_Associator_Names_Handler<Instance>* /*handler*/)
    {
        return ENUM_ASSOCIATOR_NAMES_UNSUPPORTED;
    }
    Enum_References_Status enum_references(const Instance* /*instance*/, const C* /*model*/,
                                           const String& /*role*/, Enum_References_Handler<C>* /*handler*/)
    {
        return ENUM_REFERENCES_UNSUPPORTED;
    }
    Enum_Associators_Status enum_associators(const Instance* /*instance*/, const String& /*result_class*/,
                                             const String& /*role*/, const String& /*result_role*/,
                                             Enum_Associators_Handler<Instance>* /*handler*/)
    {
        return ENUM_ASSOCIATORS_UNSUPPORTED;
    }
};

template <class C>
class Indication_Skeleton : public Provider_Skeleton<C>
{
public:
    static constexpr Provider_Kind kind = Provider_Kind::INDICATION;

    /// The provider owns the handler from here on.
    /// The handler was made for the provider, so even one that delivers nothing has to delete it.
    Enable_Indications_Status enable_indications(Indication_Handler<C>* handler)
    {
        delete handler;
        return ENABLE_INDICATIONS_FAILED;
    }
    Disable_Indications_Status disable_indications() { return DISABLE_INDICATIONS_FAILED; }
};

} // namespace KPRV
