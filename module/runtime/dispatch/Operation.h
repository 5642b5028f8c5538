#pragma once

namespace KPRV {

/// Operation codes of a `Provider_Proc`, with its arguments. The numbers are fixed.
enum Operation : int
{
    OP_GET_META_CLASS = 0,   ///< const Meta_Class*& out
    OP_CREATE_PROVIDER = 1,  ///< void*& out
    OP_DESTROY_PROVIDER = 2, ///< provider
    OP_LOAD = 3,             ///< provider
    OP_UNLOAD = 4,           ///< provider
    OP_GET_INSTANCE = 5,     ///< provider, model, Instance*& out
    OP_ENUM_INSTANCES = 6,   ///< provider, model, handler proc, client data, const Wanted* (null: everything)
    OP_CREATE_INSTANCE = 7,  ///< provider, instance
    OP_DELETE_INSTANCE = 8,  ///< provider, instance
    OP_MODIFY_INSTANCE = 9,  ///< provider, model, instance
    OP_INVOKE_METHOD = 10,   ///< provider, reference instance, invocation record
    OP_ENABLE_INDICATIONS = 11,  ///< provider, handler proc, client data
    OP_DISABLE_INDICATIONS = 12, ///< provider
    OP_GET_REPOSITORY = 13,      ///< const Meta_Repository*& out
    OP_ENUM_ASSOCIATOR_NAMES =
        14, ///< provider, instance, result class, role, result role, handler proc, client data
    OP_ENUM_REFERENCES = 15,  ///< provider, instance, model, role, handler proc, client data
    OP_ENUM_ASSOCIATORS = 16, ///< as OP_ENUM_ASSOCIATOR_NAMES
};

/// What a provider's proc serves.
enum class Provider_Kind
{
    INSTANCE,
    ASSOCIATION,
    INDICATION,
};

} // namespace KPRV
