#pragma once

#include "module/runtime/dispatch/Handler.h"
#include "module/runtime/dispatch/Registration.h"

namespace KPRV {

/// Typed caller of a provider proc. It makes the provider object and destroys it. Each wrapper returns the
/// provider's status; those with logic of their own say so.
class Provider_Handle
{
public:
    explicit Provider_Handle(const Registration* registration);
    ~Provider_Handle();
    Provider_Handle(const Provider_Handle&) = delete;
    Provider_Handle& operator=(const Provider_Handle&) = delete;

    int get_meta_class(const Meta_Class*& meta_class) const;
    int get_repository(const Meta_Repository*& repository) const;
    int load();
    int unload();

    /// Falls back on enumeration and `key_eq` when the provider has no such operation (61); the fallback
    /// answers 0 or 60. On 0 the caller owns the instance.
    int get_instance(const Instance* model, Instance*& instance);
    /// Gives what is wanted, and may give more.
    int enum_instances(const Instance* model, Instance_Handler_Proc proc, void* client_data,
                       const Wanted& wanted = {});
    int create_instance(Instance* instance);
    int delete_instance(const Instance* instance);
    int modify_instance(const Instance* model, const Instance* instance);
    int invoke_method(const Instance* instance, Instance* method);

    int enable_indications(Indication_Handler_Proc proc, void* client_data);
    int disable_indications();

    int enum_associators(const Instance* instance, const String& result_class, const String& role,
                         const String& result_role, Instance_Handler_Proc proc, void* client_data);
    /// Falls back on enumeration of the association and `get_associators`. 110 for a class that is no
    /// association; an access denied by the provider's own body comes out as failed (110), one met in the
    /// fallback as 112.
    int enum_associator_names(const Instance* instance, const String& result_class, const String& role,
                              const String& result_role, Instance_Handler_Proc proc, void* client_data);
    /// Falls back on enumeration of the association and `is_reference_of`.
    int enum_references(const Instance* instance, const Instance* model, const String& role,
                        Instance_Handler_Proc proc, void* client_data);

private:
    /// Null if the provider's class is no association.
    const Meta_Class* _association_class() const;
    /// The operations whose first argument is where the answer goes.
    int _query(int operation, void* out) const;
    /// The operations on the provider object.
    int _call(int operation, const void* arg1 = nullptr, const void* arg2 = nullptr,
              const void* arg3 = nullptr, const void* arg4 = nullptr, const void* arg5 = nullptr,
              const void* arg6 = nullptr) const;

    const Registration* _registration;
    Provider_Proc _proc;
    void* _provider;
};

} // namespace KPRV
