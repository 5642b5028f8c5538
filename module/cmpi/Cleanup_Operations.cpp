// The four entries by which a server takes its leave of a provider.
#include "module/cmpi/CMPI_Adapter.h"
#include "module/cmpi/CMPI_Thread_Context.h"
#include "module/cmpi/entries.h"

// The four cleanups differ in what they trace and in whether `unload` finds a context; their differences are
// kept as they are. None of them locks: a server does not clean up a provider that it is still calling.

namespace KPRV {

static CMPIStatus cleanup_with_context(CMPI_Adapter* adapter, const CMPIContext* context,
                                       CMPIBoolean terminating)
{
    const Context_Scope scope(adapter->broker, context, adapter);
    return CMPI_Adapter::cleanup(adapter, context, terminating != 0);
}

static CMPIStatus instanceCleanup(CMPIInstanceMI* mi, const CMPIContext* context, CMPIBoolean terminating)
{
    return cleanup_with_context(_adapter(mi), context, terminating);
}

static CMPIStatus methodCleanup(CMPIMethodMI* mi, const CMPIContext* context, CMPIBoolean terminating)
{
    return cleanup_with_context(_adapter(mi), context, terminating);
}

static CMPIStatus indicationCleanup(CMPIIndicationMI* mi, const CMPIContext* context, CMPIBoolean terminating)
{
    CMPI_Adapter::ent(__FILE_NAME__, __LINE__, "indicationCleanup");
    return cleanup_with_context(_adapter(mi), context, terminating);
}

/// An `unload` reached through here runs with whatever context the thread happens to have.
static CMPIStatus associationCleanup(CMPIAssociationMI* mi, const CMPIContext* context,
                                     CMPIBoolean terminating)
{
    CMPI_Adapter::ent(__FILE_NAME__, __LINE__, "associationCleanup");
    return CMPI_Adapter::cleanup(_adapter(mi), context, terminating != 0);
}

void fill_cleanup_operations(CMPI_Static_Data& data)
{
    data.instance_ft.cleanup = instanceCleanup;
    data.method_ft.cleanup = methodCleanup;
    data.indication_ft.cleanup = indicationCleanup;
    data.association_ft.cleanup = associationCleanup;
}

} // namespace KPRV
