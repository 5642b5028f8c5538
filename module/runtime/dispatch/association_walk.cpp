#include "module/runtime/dispatch/association_walk.h"
#include "module/runtime/ground/strutil.h"

namespace KPRV {

static Instance* target_of(const Instance* association, const Meta_Reference* reference)
{
    const char* const cell = reinterpret_cast<const char*>(association) + reference->offset;
    return *reinterpret_cast<Instance* const*>(cell);
}

/// Calls `visit(reference, target)` for each scalar reference that is set, until it answers false.
template <class Visit>
static void for_each_target(const Instance* association, Visit visit)
{
    const Meta_Class* const meta_class = association->__meta_class;
    for (uint32 i = 0; i < meta_class->num_meta_features; i++) {
        const Meta_Feature* const feature = meta_class->meta_features[i];
        if (!(feature->flags & FLAG_REFERENCE))
            continue;
        const auto* const reference = static_cast<const Meta_Reference*>(feature);
        if (reference->subscript != 0)
            continue;
        Instance* const target = target_of(association, reference);
        if (target && !visit(reference, target))
            return;
    }
}

static bool passes(const String& filter, const char* name)
{
    return filter.empty() || name_eq(filter.c_str(), name);
}

/// The class itself or one of its ancestors bears the name.
static bool is_a(const Meta_Class* meta_class, const String& name)
{
    for (; meta_class; meta_class = meta_class->super_meta_class) {
        if (passes(name, meta_class->name))
            return true;
    }
    return false;
}

bool Fitting_References::fits(const Meta_Reference* reference)
{
    for (Known& known : _known) {
        if (!known.reference)
            known = {reference, is_subclass(reference->meta_class, _class)};
        if (known.reference == reference)
            return known.fits;
    }
    return is_subclass(reference->meta_class, _class);
}

int get_associators(const Instance* instance, const Instance* association, const String& result_class,
                    const String& role, const String& result_role, Instance* (&out)[MAX_ASSOCIATORS])
{
    Fitting_References fitting(instance);
    return get_associators(instance, fitting, association, result_class, role, result_role, out);
}

int get_associators(const Instance* instance, Fitting_References& fitting, const Instance* association,
                    const String& result_class, const String& role, const String& result_role,
                    Instance* (&out)[MAX_ASSOCIATORS])
{
    bool found = false;
    size_t count = 0;
    for_each_target(association, [&](const Meta_Reference* reference, Instance* target) {
        // Both ends of a self-association are near ends, so neither is an answer.
        if (fitting.fits(reference) && key_eq(instance, target)) {
            if (passes(role, reference->name))
                found = true;
        } else if (is_a(target->__meta_class, result_class) && passes(result_role, reference->name)) {
            if (count < MAX_ASSOCIATORS)
                out[count++] = target;
        }
        return true;
    });
    return found ? int(count) : -1;
}

bool is_reference_of(const Instance* instance, const Instance* association, const String& role)
{
    bool found = false;
    for_each_target(association, [&](const Meta_Reference* reference, Instance* target) {
        found = passes(role, reference->name) && key_eq(instance, target);
        return !found;
    });
    return found;
}

} // namespace KPRV
