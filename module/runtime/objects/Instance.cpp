#include "module/runtime/objects/Instance.h"

#include "module/runtime/ground/Answer_Blocks.h"
#include "module/runtime/ground/Atomic.h"
#include "module/runtime/ground/empty_arrays.h"
#include "module/runtime/ground/type_dispatch.h"
#include "module/runtime/objects/Class_Plan.h"
#include "module/runtime/objects/Ref.h"
#include "module/runtime/objects/features.h"

#include <cstring>
#include <new>

namespace KPRV {

constinit const Meta_Class Instance::static_meta_class = {
    {{0, FLAG_CLASS, "Instance", nullptr, 0}}, nullptr, 0, sizeof(Instance), nullptr, nullptr, 0, nullptr};

namespace {

/// Elements of text types are `const char*` in a default.
template <class T>
__Array_Rep* array_of_texts(const Meta_Value* value)
{
    const char* const* texts = static_cast<const char* const*>(value->array_value.elements);
    __Array_Rep* rep;
    __construct(rep, __Array_Traits_Factory<T>::traits());
    __reserve(rep, value->array_value.num_elements);
    for (uint32 i = 0; i < value->array_value.num_elements; i++) {
        const T element(texts[i]);
        __append(rep, &element, 1);
    }
    return rep;
}

__Array_Rep* default_array(Type type, const Meta_Value* value)
{
    return visit_storage(
        type, [value] { return array_of_texts<String>(value); },
        [value] { return array_of_texts<Datetime>(value); },
        [type, value] {
            __Array_Rep* rep;
            __construct(rep, __cim_array_traits[type]);
            __append(rep, value->array_value.elements, value->array_value.num_elements);
            return rep;
        });
}

/// Gives an empty cell its default, or makes it null if it has none. References have no defaults, and their
/// null bytes are left alone.
struct Default_Giver
{
    Instance* instance;

    void operator()(Scalar_Feature f) const
    {
        const Meta_Value* literal = f.meta->value;
        void* value = f.value(instance);
        if (literal)
            visit_storage(
                f.type(), [=] { *static_cast<String*>(value) = literal->string_value; },
                [=] { *static_cast<Datetime*>(value) = Datetime(literal->string_value); },
                [=] { memcpy(value, literal, type_size[f.type()]); });
        f.null(instance) = literal == nullptr;
    }
    void operator()(Array_Feature f) const
    {
        const Meta_Value* literal = f.meta->value;
        if (literal)
            f.array(instance) = default_array(f.type(), literal);
        f.null(instance) = literal == nullptr;
    }
    template <class Feature>
    void operator()(Feature) const
    {
    }
};

void give_defaults(Instance* instance)
{
    for (const Meta_Feature* feature : features_of(instance->__meta_class))
        visit_feature(feature, Default_Giver{instance});
}

/// True of what many cells hold and none releases; of most cells of an instance.
bool is_shared_by_all(const void* held)
{
    return held == &String::_empty || is_of_empty_arrays(held) || held == &Datetime::_zero;
}

/// Releases what a cell holds that is no text.
void release(Instance* instance, const Cell& cell)
{
    using Targets = Array<Instance*>;
    switch (cell.kind) {
    case Cell_Kind::MOMENT:
        cell.in<Datetime>(instance).~Datetime();
        break;
    case Cell_Kind::ARRAY:
        __destruct(cell.in<__Array_Rep*>(instance));
        break;
    case Cell_Kind::REFERENCE:
        unref(cell.in<Instance*>(instance));
        break;
    case Cell_Kind::REFERENCE_ARRAY:
        for (const Instance* target : cell.in<Targets>(instance))
            unref(target);
        cell.in<Targets>(instance).~Targets();
        break;
    default:
        break;
    }
}

} // namespace

Instance* create(const Meta_Class* meta_class, bool defaults)
{
    Instance* instance = static_cast<Instance*>(take_block(meta_class->size));
    __default_construct(meta_class, instance, true, false);
    if (!defaults)
        return instance;
    Ref<Instance> owner(instance);
    give_defaults(instance);
    return owner.steal();
}

Instance* create(const Meta_Method* meta_method)
{
    return create(as_class(meta_method), false);
}

Instance* create_null(const Meta_Class* meta_class)
{
    Instance* const instance = static_cast<Instance*>(take_block(meta_class->size));
    if (const Class_Plan* const plan = plan_of(meta_class)) {
        // Without a count: a class that has a plan is not counted.
        memcpy(static_cast<void*>(instance), static_cast<const void*>(plan->all_null), meta_class->size);
        return instance;
    }
    __default_construct(meta_class, instance, true, false);
    __set_null_flags(instance, true, true, 1);
    return instance;
}

void __default_construct(const Meta_Class* meta_class, Instance* instance, bool clear, bool defaults)
{
    ref(meta_class);
    if (clear)
        memset(static_cast<void*>(instance), 0, meta_class->size);
    write_head(instance, meta_class);
    visit_cells(meta_class, Cells::HOLDERS,
                [=](const Cell& cell) { cell.in<const void*>(instance) = fresh_handle(cell); });
    if (defaults)
        give_defaults(instance);
}

void write_head(Instance* instance, const Meta_Class* meta_class)
{
    instance->__magic = INSTANCE_MAGIC;
    instance->__refs = 1;
    instance->__meta_class = meta_class;
    new (&instance->__name_space) String();
}

void __destruct(Instance* instance)
{
    visit_cells(instance->__meta_class, Cells::HOLDERS, [=](const Cell& cell) INLINE {
        if (is_shared_by_all(cell.handle(instance))) [[likely]]
            return;
        if (cell.kind == Cell_Kind::TEXT)
            cell.in<String>(instance).~String();
        else
            release(instance, cell);
    });
    unref(instance->__meta_class);
    instance->__name_space.~String();
}

void ref(const Instance* instance)
{
    if (instance)
        atomic_inc(const_cast<Instance*>(instance)->__refs);
}

void unref(const Instance* instance)
{
    if (instance && atomic_release(const_cast<Instance*>(instance)->__refs))
        destroy(const_cast<Instance*>(instance));
}

void destroy(Instance* instance)
{
    __destruct(instance);
    give_block(instance);
}

void destroyer(Instance* instance)
{
    if (instance)
        destroy(instance);
}

} // namespace KPRV
