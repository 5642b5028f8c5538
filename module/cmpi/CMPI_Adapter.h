#pragma once

#include "module/cmpi/CMPI_Static_Data.h"
#include "module/cmpi/Name_Space_Entry.h"
#include "module/runtime/dispatch/Provider_Handle.h"
#include "module/runtime/ground/Array.h"
#include "module/runtime/system/Mutex.h"

#include <atomic>

namespace KPRV {

/// One provider as the server sees it: shared by its MIs of all kinds, from the first factory call to the
/// last cleanup.
class CMPI_Adapter : public Provider_Handle
{
public:
    /// Creates and loads the provider. The load status is ignored: a provider that fails to load is offered
    /// all the same. An exception of the provider passes on, and the static block is left without adapter.
    CMPI_Adapter(const CMPIBroker* broker, const CMPIContext* context, const char* provider_name,
                 const Registration* registration, CMPI_Static_Data* static_data);
    ~CMPI_Adapter();

    /// Any class of the module's repository, not only the provider's own; null for an unknown name.
    const Meta_Class* find_meta_class(const char* name) const;
    /// As above: one provider may be asked about any class of the module.
    const Meta_Class* find_model_meta_class(const char* name) const;
    /// As above, as a plain function; `data` is the adapter.
    static const Meta_Class* find_meta_class_callback(const char* name, void* data);

    /// Ends one factory call's use. 50 while the provider has vetoed its unloading and the server goes on.
    /// The last one unloads and deletes the adapter.
    static CMPIStatus cleanup(CMPI_Adapter* adapter, const CMPIContext* context, bool terminating);

    // Traces, at DBG.
    static void ent(const char* file, uint32 line, const char* function);
    static void ret(const char* file, uint32 line, const char* function);
    static void ret(const char* file, uint32 line, const char* function, CMPIrc rc);
    static void ret(const char* file, uint32 line, const char* function, CMPIrc rc, const char* text);
    static void trc(const char* file, uint32 line, const char* function, const char* format, ...)
        __attribute__((format(printf, 4, 5)));

    /// Of the first factory call; never refreshed by later ones.
    const CMPIBroker* broker;
    CMPI_Static_Data* static_data;
    /// Factory calls not yet matched by a cleanup.
    uint32 load_count;
    /// Cleared and set by `cimom::allow_unload`.
    bool unload_allowed;
    /// Name spaces with active filters, in order of first activation.
    Array<Name_Space_Entry> name_spaces GUARDED_BY(adapter_mutex);
    /// The provider's own class.
    const Meta_Class* model_meta_class;
    bool indications_enabled GUARDED_BY(adapter_mutex);
    /// An operation that holds the mutex waits for the provider's worker to end.
    std::atomic<bool> is_disabling = false;
    /// Recursive. One provider runs one operation at a time; an up-call may come back on the same thread.
    Mutex adapter_mutex;
};

} // namespace KPRV
