// Of `Instance`, the ways to a copy: whole, by keys, into another one.
#include "module/runtime/objects/Instance.h"

#include "module/runtime/ground/Answer_Blocks.h"
#include "module/runtime/ground/empty_arrays.h"
#include "module/runtime/ground/type_dispatch.h"
#include "module/runtime/objects/Ref.h"
#include "module/runtime/objects/features.h"

#include <algorithm>
#include <cstring>
#include <new>
#include <utility>

namespace KPRV {

namespace {

void release_all(Array<Instance*>& targets)
{
    for (Instance* target : targets)
        unref(target);
    targets.clear();
}

Array<Instance*> clones_of(const Array<Instance*>& targets)
{
    Array<Instance*> clones;
    clones.reserve(targets.size());
    try {
        for (const Instance* target : targets)
            clones.append(clone(target));
    } catch (...) {
        release_all(clones);
        throw;
    }
    return clones;
}

/// After all bytes of an instance were copied: gives the copy its own hold on what the bytes point to.
struct Unsharer
{
    Instance* dest;
    const Instance* src;

    void operator()(Scalar_Feature f) const
    {
        const void* value = f.value(src);
        visit_storage(
            f.type(), [&] { new (f.value(dest)) String(*static_cast<const String*>(value)); },
            [&] { new (f.value(dest)) Datetime(*static_cast<const Datetime*>(value)); }, [] {});
    }
    void operator()(Array_Feature f) const
    {
        if (!is_empty_array(f.array(src)))
            f.array(dest) = _clone(f.array(src));
    }
    void operator()(Reference_Feature f) const { f.target(dest) = clone(f.target(src)); }
    void operator()(Reference_Array_Feature f) const
    {
        new (&f.targets(dest)) Array<Instance*>(clones_of(f.targets(src)));
    }
    void operator()(Method_Feature) const {}
};

/// Makes a cell that holds the bytes of another instance hold nothing.
struct Blanker
{
    Instance* dest;

    void operator()(Scalar_Feature f) const
    {
        visit_storage(
            f.type(), [&] { new (f.value(dest)) String(); }, [&] { new (f.value(dest)) Datetime(); }, [] {});
    }
    void operator()(Array_Feature f) const { f.array(dest) = fresh_array_of(f.type()); }
    void operator()(Reference_Feature f) const { f.target(dest) = nullptr; }
    void operator()(Reference_Array_Feature f) const { new (&f.targets(dest)) Array<Instance*>(); }
    void operator()(Method_Feature) const {}
};

struct Copier
{
    Instance* dest;
    const Instance* src;
    const Instance* model;

    void operator()(Scalar_Feature f) const
    {
        if (model && f.null(model))
            return;
        f.null(dest) = f.null(src);
        void* to = f.value(dest);
        const void* from = f.value(src);
        visit_storage(
            f.type(), [=] { *static_cast<String*>(to) = *static_cast<const String*>(from); },
            [=] { *static_cast<Datetime*>(to) = *static_cast<const Datetime*>(from); },
            [=] { memcpy(to, from, type_size[f.type()]); });
    }
    void operator()(Array_Feature f) const
    {
        if (model && f.null(model))
            return;
        f.null(dest) = f.null(src);
        __assign(f.array(dest), f.array(src));
    }
    void operator()(Reference_Feature f) const
    {
        if (model && !f.target(model))
            return;
        // Cloned first: both may point to the same target.
        Instance* old = f.target(dest);
        f.target(dest) = clone(f.target(src));
        unref(old);
    }
    /// Copied whatever the model says: its null byte is no filter here.
    void operator()(Reference_Array_Feature f) const
    {
        Array<Instance*> clones = clones_of(f.targets(src));
        release_all(f.targets(dest));
        f.targets(dest) = std::move(clones);
        f.null(dest) = f.null(src);
    }
    void operator()(Method_Feature) const {}
};

void __copy(Instance* dest, const Instance* src, bool keys_only, const Instance* model)
{
    if (dest == src || dest->__meta_class != src->__meta_class)
        return;
    for (const Meta_Feature* feature : features_of(dest->__meta_class)) {
        if (!keys_only || is_key(feature))
            visit_feature(feature, Copier{dest, src, model});
    }
}

struct Clearer
{
    Instance* instance;

    void operator()(Scalar_Feature f) const
    {
        void* value = f.value(instance);
        visit_storage(
            f.type(), [=] { static_cast<String*>(value)->clear(); },
            [=] { static_cast<Datetime*>(value)->clear(); }, [=] { memset(value, 0, type_size[f.type()]); });
        f.null(instance) = 1;
    }
    void operator()(Array_Feature f) const
    {
        __clear(f.array(instance));
        f.null(instance) = 1;
    }
    void operator()(Reference_Feature f) const
    {
        unref(f.target(instance));
        f.target(instance) = nullptr;
    }
    void operator()(Reference_Array_Feature f) const
    {
        release_all(f.targets(instance));
        f.null(instance) = 1;
    }
    void operator()(Method_Feature) const {}
};

/// The count of the class is not raised, though the destructor lowers it: it only matters to classes built at
/// run time, which no request clones.
Instance* copy_of_bytes(const Instance* instance)
{
    const uint32 size = instance->__meta_class->size;
    Instance* copy = static_cast<Instance*>(take_block(size));
    memcpy(static_cast<void*>(copy), static_cast<const void*>(instance), size);
    copy->__refs = 1;
    return copy;
}

} // namespace

bool holds_nothing(const Instance* instance)
{
    const Datetime none;
    const auto is_blank = [&](const Meta_Feature* feature) {
        return visit_feature(
            feature,
            Overloaded{
                [&](Scalar_Feature f) {
                    const void* value = f.value(instance);
                    return visit_storage(
                        f.type(),
                        [=] { return static_cast<const String*>(value)->c_str() == String::_empty.data; },
                        [&] { return memcmp(value, static_cast<const void*>(&none), sizeof none) == 0; },
                        [] { return true; });
                },
                [&](Array_Feature f) {
                    return is_empty_array(f.array(instance)) || is_lasting(f.array(instance));
                },
                [&](Reference_Feature f) { return f.target(instance) == nullptr; },
                [](Reference_Array_Feature) { return false; },
                [](Method_Feature) { return true; },
            });
    };
    return instance->__name_space.empty() &&
           std::ranges::all_of(features_of(instance->__meta_class), is_blank);
}

Instance* clone_of_blank(const Instance* instance)
{
    return copy_of_bytes(instance);
}

Instance* clone(const Instance* instance)
{
    if (!instance)
        return nullptr;
    Instance* copy = copy_of_bytes(instance);
    new (&copy->__name_space) String(instance->__name_space);
    const auto features = features_of(instance->__meta_class);
    auto next = features.begin();
    try {
        for (; next != features.end(); ++next)
            visit_feature(*next, Unsharer{copy, instance});
    } catch (...) {
        // What stands in the cells from here on is the other's.
        for (; next != features.end(); ++next)
            visit_feature(*next, Blanker{copy});
        destroy(copy);
        throw;
    }
    return copy;
}

Instance* key_clone(const Instance* instance)
{
    if (!instance)
        return nullptr;
    Ref<Instance> keys(create_null(instance->__meta_class));
    copy_keys(keys.ptr(), instance);
    return keys.steal();
}

void copy(Instance* dest, const Instance* src)
{
    __copy(dest, src, false, nullptr);
}

void copy(Instance* dest, const Instance* src, const Instance* model)
{
    __copy(dest, src, false, model);
}

void copy_keys(Instance* dest, const Instance* src)
{
    __copy(dest, src, true, nullptr);
}

void clear(Instance* instance)
{
    instance->__name_space.clear();
    for (const Meta_Feature* feature : features_of(instance->__meta_class))
        visit_feature(feature, Clearer{instance});
}

} // namespace KPRV
