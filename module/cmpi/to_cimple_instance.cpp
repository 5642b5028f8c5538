#include "module/cmpi/to_cimple_instance.h"
#include "module/cmpi/CMPI_Containers.h"
#include "module/runtime/objects/Ref.h"
#include "module/runtime/system/log.h"

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

/// From the container, which lies one level below the place where the object was met.
static Instance* import(CMPI_Container&& container, const Meta_Class* meta_class, uint32 mask,
                        Nesting nesting)
{
    if (!may_descend(nesting.depth))
        return nullptr;
    if (nesting.wanted && !is_subclass(nesting.wanted, meta_class))
        return create(meta_class, false);
    container.lies_in(nesting.depth + 1);
    Instance* instance = nullptr;
    return container.convert(meta_class, mask, instance) == 0 ? instance : nullptr;
}

Instance* _to_cimple_instance(const Meta_Repository* repository, const CMPIBroker* broker,
                              const char* name_space, const CMPIInstance* instance, Nesting nesting)
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
    return import(CMPIInstance_Container(repository, broker, name_space, instance), meta_class, 0, nesting);
}

Instance* _to_cimple_instance(const Meta_Repository* repository, const CMPIBroker* broker,
                              const char* name_space, const CMPIObjectPath* path, Nesting nesting)
{
    if (!path) {
        LOG_CONVERSION(WARN, "null instance");
        return nullptr;
    }
    const Meta_Class* const meta_class = class_of(repository, path);
    if (!meta_class)
        return nullptr;
    return import(CMPIObjectPath_Container(repository, broker, name_space, path), meta_class, FLAG_KEY,
                  nesting);
}

} // namespace KPRV
