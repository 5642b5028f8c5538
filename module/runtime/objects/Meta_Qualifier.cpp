#include "module/runtime/objects/Meta_Qualifier.h"

#include "module/runtime/ground/strutil.h"

namespace KPRV {

const Meta_Qualifier* find(const Meta_Qualifier* const* qualifiers, size_t count, const char* name)
{
    for (size_t i = 0; i < count; i++) {
        if (name_eq(qualifiers[i]->name, name))
            return qualifiers[i];
    }
    return nullptr;
}

} // namespace KPRV
