// The entry of the method table: arguments become an invocation record, and come back from it.
#include "module/cmpi/Converter.h"
#include "module/cmpi/Operation_Scope.h"
#include "module/cmpi/cmpi_text.h"
#include "module/cmpi/entries.h"
#include "module/cmpi/status_translation.h"

#include <strings.h>

namespace KPRV {

static CMPIStatus invokeMethod(CMPIMethodMI* mi, const CMPIContext* context, const CMPIResult* result,
                               const CMPIObjectPath* cop, const char* method, const CMPIArgs* in,
                               CMPIArgs* out)
{
    const Operation_Scope scope(_adapter(mi), context, "invokeMethod", LOG_HERE);
    CMPI_Adapter* const adapter = scope.adapter();

    const Meta_Class* const meta_class = adapter->find_model_meta_class(class_name_of(cop));
    if (!meta_class)
        return scope.ret(LOG_HERE, CMPI_RC_ERR_FAILED, "MetaClass not found");
    const Meta_Feature* const feature = find_feature(meta_class, method, FLAG_METHOD);
    if (!feature)
        return scope.ret(LOG_HERE, CMPI_RC_ERR_METHOD_NOT_FOUND, method);
    const auto* const meta_method = static_cast<const Meta_Method*>(feature);

    // A method named like the class of its path is refused, whatever it would do.
    if (strcasecmp(class_name_of(cop), meta_method->name) == 0)
        return scope.ret(LOG_HERE, CMPI_RC_ERR_INVALID_CLASS);

    Ref<Instance> reference;
    if (const CMPIrc rc = make_cimple_reference(nullptr, meta_class, cop, reference); rc != CMPI_RC_OK)
        return scope.ret(LOG_HERE, rc, "CIMPLE reference creation failed");
    Ref<Instance> record;
    if (const CMPIrc rc =
            make_cimple_method(nullptr, meta_class, meta_method, cop, in, adapter, record, reference.ptr());
        rc != CMPI_RC_OK)
        return scope.ret(LOG_HERE, rc, "CIMPLE make_cimple_method function failed");

    const int status = adapter->invoke_method(reference.ptr(), record.ptr());
    if (const CMPIrc rc = translate(Status_Family::INVOKE_METHOD, status); rc != CMPI_RC_OK)
        return scope.ret(LOG_HERE, rc);

    // Anything else is success, also the -1 of a method that the dispatcher does not know: the client gets
    // the return value as the record holds it.
    CMPIValue value;
    CMPIType type;
    if (const CMPIrc rc =
            make_cmpi_method(scope.broker(), name_space_of(cop), record.ptr(), out, value, type);
        rc != CMPI_RC_OK)
        return scope.ret(LOG_HERE, rc);
    CMReturnData(result, &value, type);
    CMReturnDone(result);
    return scope.ret(LOG_HERE, CMPI_RC_OK);
}

void fill_method_operations(CMPIMethodMIFT& ft)
{
    ft.invokeMethod = invokeMethod;
}

} // namespace KPRV
