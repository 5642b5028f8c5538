#include "module/runtime/objects/Meta_Repository.h"

#include "module/runtime/ground/strutil.h"
#include "module/runtime/objects/Meta_Class.h"

namespace KPRV {

const Meta_Class* find_meta_class(const Meta_Repository* repository, const char* name)
{
    if (!repository || !name)
        return nullptr;
    for (uint32 i = 0; i < repository->num_meta_classes; i++) {
        const Meta_Class* meta_class = repository->meta_classes[i];
        if (name_eq(meta_class->name, name))
            return meta_class;
    }
    return nullptr;
}

int is_subclass(const Meta_Repository* repository, const char* name_a, const char* name_b)
{
    const Meta_Class* a = find_meta_class(repository, name_a);
    const Meta_Class* b = find_meta_class(repository, name_b);
    if (!a || !b)
        return -1;
    // 0 is the yes.
    return is_subclass(a, b) ? 0 : 1;
}

} // namespace KPRV
