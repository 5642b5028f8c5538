// Of `Instance`, the walks over an instance and all that it refers to.
//
// How it works. An instance is one block whose class is data: a walk asks the class's plan for the cells and
// finds each at its distance from the block's beginning. What is done with every instance, to make it, to
// copy it, to let it go, is a `visit_cells` with a group of cells and what is to be done with one; what
// compares instances of two classes goes by the features. None of them looks behind a reference. Those here
// do: depth first and in the order of the features, and as often as an instance is referred to.
// `__create_refs` makes what the others walk: behind each reference an instance that has its defaults.
#include "module/runtime/objects/Instance.h"

#include "module/runtime/objects/Class_Plan.h"
#include "module/runtime/objects/features.h"

namespace KPRV {

void __visit(Instance* instance, void (*function)(Instance* instance, void* data), void* data)
{
    if (!instance)
        return;
    function(instance, data);
    if (const Class_Plan* const plan = plan_of(instance->__meta_class); plan && !plan->refers)
        return;
    visit_cells(instance->__meta_class, Cells::HOLDERS, [=](const Cell& cell) INLINE {
        if (cell.kind == Cell_Kind::REFERENCE)
            __visit(cell.in<Instance*>(instance), function, data);
        else if (cell.kind == Cell_Kind::REFERENCE_ARRAY)
            for (Instance* target : cell.in<Array<Instance*>>(instance))
                __visit(target, function, data);
    });
}

namespace {

struct Name_Space_Giver
{
    const String& name_space;
    bool force;

    static void give(Instance* instance, void* data)
    {
        const Name_Space_Giver* giver = static_cast<const Name_Space_Giver*>(data);
        if (giver->force || instance->__name_space.empty())
            instance->__name_space = giver->name_space;
    }
};

} // namespace

void __set_name_space_recursive(Instance* instance, const String& name_space, bool force)
{
    Name_Space_Giver giver{name_space, force};
    __visit(instance, Name_Space_Giver::give, &giver);
}

void __create_refs(Instance* instance)
{
    for (const Meta_Feature* feature : features_of(instance->__meta_class)) {
        visit_feature(feature, Overloaded{
                                   [=](Reference_Feature f) {
                                       if (!f.target(instance))
                                           f.target(instance) = create(f.meta->meta_class, true);
                                   },
                                   [](auto) {},
                               });
    }
}

} // namespace KPRV
