// Of `CMPI_Thread_Context`, the up-call of a method, which converts in both directions.
#include "module/cmpi/CMPI_Containers.h"
#include "module/cmpi/CMPI_Thread_Context.h"
#include "module/cmpi/Converter.h"
#include "module/cmpi/cmpi_text.h"
#include "module/cmpi/to_cimple_value.h"
#include "module/runtime/system/log.h"

namespace KPRV {

/// One failing step; the words do not say which, the line does.
#define STEP(CONDITION)                                                                                      \
    do {                                                                                                     \
        if (!(CONDITION)) {                                                                                  \
            LOG(WARN, "failed");                                                                             \
            return -1;                                                                                       \
        }                                                                                                    \
    } while (0)

int CMPI_Thread_Context::invoke_method(const char* name_space, const Instance* instance, Instance* method)
{
    STEP(name_space);
    STEP(instance);
    STEP(method);
    const Meta_Class* const meta_class = instance->__meta_class;
    STEP(meta_class);
    const Meta_Repository* const repository = meta_class->meta_repository;
    STEP(repository);
    const auto* const top = static_cast<const CMPI_Thread_Context*>(Thread_Context::top());
    STEP(top);
    const CMPIBroker* const broker = top->broker();
    STEP(broker);
    const CMPIContext* const context = top->context();
    STEP(context);

    // A method record is only the head of a class record: it has no repository of its own.
    const Meta_Class* const method_class = method->__meta_class;

    CMPIObjectPath* path;
    if (method_class->flags & FLAG_STATIC)
        path = CMNewObjectPath(broker, name_space, meta_class->name, nullptr);
    else
        make_cmpi_object_path(broker, instance, name_space, path);
    STEP(path);

    CMPIArgs* const in = CMNewArgs(broker, nullptr);
    STEP(in);
    CMPIArgs_Container in_container(repository, broker, name_space, in);
    STEP(in_container.convert(method, FLAG_IN) == 0);

    CMPIArgs* const out = CMNewArgs(broker, nullptr);
    STEP(out);

    CMPIStatus status = {CMPI_RC_OK, nullptr};
    const CMPIData data = CBInvokeMethod(broker, context, path, method_class->name, in, out, &status);
    if (status.rc != CMPI_RC_OK) {
        LOG(WARN, "failed[%u]", unsigned(status.rc));
        return -1;
    }

    const char* const path_name_space = name_space_of(path);
    CMPIArgs_Container out_container(repository, broker, path_name_space, out);
    STEP(out_container.convert(method_class, FLAG_OUT, method) == 0);
    __set_name_space_recursive(method, path_name_space, false);

    Value value;
    STEP(cmpi_to_cimple_value(repository, broker, path_name_space, data, value) == 0);
    const Meta_Feature* const feature = find_feature(method_class, "return_value", FLAG_PROPERTY);
    STEP(feature);
    STEP(value.get(method, feature) == 0);
    return 0;
}

} // namespace KPRV
