#include "module/runtime/objects/Container.h"

#include "module/runtime/objects/Lent_Value.h"
#include "module/runtime/objects/Ref.h"
#include "module/runtime/system/log.h"

namespace KPRV {

Container::~Container() = default;

int Container::set_cell(const Instance* instance, const Cell& cell)
{
    Lent_Value value;
    value.show(instance, cell);
    return set_value(cell.feature->name, *value, cell.feature->flags);
}

void Container::put_cells(const Instance* instance, uint32 mask)
{
    put_each(instance, mask, [=, this](const Cell& cell) { return set_cell(instance, cell); });
}

void Container::tell_refused(const Instance* instance, const Cell& cell)
{
    LOG_CONVERSION(WARN, "conversion error: %s.%s", instance->__meta_class->name, cell.feature->name);
}

int Container::convert(const Instance* instance, uint32 mask)
{
    if (!instance) {
        LOG_CONVERSION(WARN, "ignored null instance arg");
        return -1;
    }
    put_cells(instance, mask);
    return 0;
}

/// The instances that a reference of either kind points to.
static Array<Instance*> targets_of(const Instance* instance, const Meta_Feature* feature)
{
    return visit_feature(feature, Overloaded{
                                      [=](Reference_Feature f) {
                                          Array<Instance*> targets;
                                          if (f.target(instance))
                                              targets.append(f.target(instance));
                                          return targets;
                                      },
                                      [=](Reference_Array_Feature f) { return f.targets(instance); },
                                      [](auto) { return Array<Instance*>(); },
                                  });
}

/// As `Value::get`, for a cell that may be taken already: a server may name a reference twice, and then the
/// instance that came first is given back.
static int replace(Instance* instance, const Meta_Feature* feature, Value& value)
{
    if (!(feature->flags & FLAG_REFERENCE))
        return value.give(instance, feature);
    const Array<Instance*> earlier = targets_of(instance, feature);
    const int status = value.get(instance, feature);
    if (status == 0 || !(targets_of(instance, feature) == earlier))
        for (Instance* target : earlier)
            unref(target);
    return status;
}

int Container::convert(const Meta_Class* meta_class, uint32 mask, Instance*& instance)
{
    Ref<Instance> fresh(instance ? nullptr : create_null(meta_class));
    Instance* const target = fresh ? fresh.ptr() : instance;
    if (!fresh)
        __set_null_flags(target, true, true, 1);

    const uint32 size = get_size();
    String hold;
    for (uint32 i = 0; i < size; i++) {
        const char* const name = peek_name(i, hold);
        if (!name) {
            LOG_CONVERSION(WARN, "get_name() failed: class=%s, index=%u", meta_class->name, i);
            continue;
        }
        const Meta_Feature* feature = find_feature(meta_class, name, FLAG_PROPERTY | FLAG_REFERENCE);
        if (!feature) {
            LOG_CONVERSION(WARN, "unknown feature: %s.%s", meta_class->name, name);
            continue;
        }
        if (mask && !(feature->flags & mask))
            continue;
        const Value::Type type = type_of(feature);
        if (type == Value::NONE) {
            LOG_CONVERSION(WARN, "unexpected error: %s.%s", meta_class->name, feature->name);
            continue;
        }
        Value value;
        const int status = feature->flags & FLAG_REFERENCE
                               ? get_reference(i, static_cast<const Meta_Reference*>(feature), type, value)
                               : get_value(i, type, value);
        if (status != 0 || replace(target, feature, value) != 0)
            LOG_CONVERSION(WARN, "conversion error: %s.%s", meta_class->name, feature->name);
    }
    if (fresh)
        instance = fresh.steal();
    return 0;
}

} // namespace KPRV
