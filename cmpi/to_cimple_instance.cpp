#include "cmpi/to_cimple_instance.h"
#include "cmpi/CMPI_Containers.h"
#include "runtime/Ref.h"
#include "runtime/log.h"

#include <cmpimacs.h>

namespace KPRV {

static const Meta_Class* class_of(const Meta_Repository* repository, const CMPIObjectPath* path)
{
    const CMPIString* const string = CMGetClassName(path, nullptr);
    const char* const name = string ? CMGetCharPtr(string) : nullptr;
    if (!name) {
        LOG_CONVERSION(WARN, "CMGetClassName() failed");
        return nullptr;
    }
    const Meta_Class* const meta_class = find_meta_class(repository, name);
    if (!meta_class)
        LOG_CONVERSION(WARN, "failed to find meta class: %s", name);
    return meta_class;
}

static Instance* import(Container&& container, const Meta_Class* meta_class, uint32 mask)
{
    Ref<Instance> instance(create(meta_class, false));
    Instance* target = instance.ptr();
    return container.convert(meta_class, mask, target) == 0 ? instance.steal() : nullptr;
}

Instance* _to_cimple_instance(const Meta_Repository* repository, const CMPIBroker* broker,
                              const char* name_space, const CMPIInstance* instance)
{
    if (!instance)
        return nullptr;
    const CMPIObjectPath* const path = CMGetObjectPath(instance, nullptr);
    if (!path) {
        LOG_CONVERSION(WARN, "CMGetObjectPath() failed");
        return nullptr;
    }
    const Meta_Class* const meta_class = class_of(repository, path);
    if (!meta_class)
        return nullptr;
    return import(CMPIInstance_Container(repository, broker, name_space, instance), meta_class, 0);
}

Instance* _to_cimple_instance(const Meta_Repository* repository, const CMPIBroker* broker,
                              const char* name_space, const CMPIObjectPath* path)
{
    if (!path) {
        LOG_CONVERSION(WARN, "null instance");
        return nullptr;
    }
    const Meta_Class* const meta_class = class_of(repository, path);
    if (!meta_class)
        return nullptr;
    return import(CMPIObjectPath_Container(repository, broker, name_space, path), meta_class, FLAG_KEY);
}

} // namespace KPRV
