// Of `Instance`, what hides properties that nobody asked for.
#include "module/runtime/objects/Instance.h"

#include "module/runtime/objects/Class_Plan.h"
#include "module/runtime/objects/features.h"

namespace KPRV {

void __set_null_flags(Instance* instance, bool include_keys, bool include_non_keys, uint8 null_value)
{
    if (!include_keys && !include_non_keys)
        return;
    const Cells cells = !include_keys ? Cells::NON_KEYS : include_non_keys ? Cells::ALL : Cells::KEYS;
    visit_cells(instance->__meta_class, cells, [=](const Cell& cell) INLINE {
        if (has_null_flag(cell))
            cell.null(instance) = null_value;
    });
}

int filter_properties(Instance* instance, const char* const* names, bool keep_keys)
{
    if (!names) {
        __set_null_flags(instance, true, true, 0);
        return 0;
    }
    __set_null_flags(instance, !keep_keys, true, 1);
    for (; *names; names++) {
        const Meta_Feature* feature = find_feature(instance->__meta_class, *names, ANY_FEATURE);
        // Keys follow keep_keys alone, named or not.
        if (!feature || is_key(feature))
            continue;
        const int rc = visit_feature(feature, Overloaded{
                                                  [=](Reference_Feature f) {
                                                      if (!f.target(instance))
                                                          f.target(instance) =
                                                              create(f.meta->meta_class, false);
                                                      return 0;
                                                  },
                                                  [](Method_Feature) { return -1; },
                                                  [=](auto f) {
                                                      f.null(instance) = 0;
                                                      return 0;
                                                  },
                                              });
        if (rc != 0)
            return rc;
    }
    return 0;
}

} // namespace KPRV
