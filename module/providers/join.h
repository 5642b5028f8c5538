#pragma once

#include "module/providers/Position_Index.h"
#include "module/providers/deliver.h"
#include "module/runtime/ground/Property.h"
#include "module/runtime/objects/Prototype.h"

namespace KPRV {

// The frame that the associations share. A provider file says which lists it joins, on what counts it insists
// and which elements belong together. Pairs are delivered in the order of nested loops, the left list
// outside.

/// Where the counts have been checked.
#define TRACE_BUILDING() LOG(DBG, "Building and returning association instances")

/// Puts an end, whole, into a role, as the class that the role declares. All associations of an end share it,
/// by its count: who receives an association reads its ends and does not write to them.
template <class A, class Target>
void set_end(A* association, Target* A::*role, const Target* end)
{
    if (end) {
        ref(end);
        association->*role = const_cast<Target*>(end);
    }
}
template <class A, class Target>
void set_end(A* association, Target* A::*role, const Instance* end)
{
    set_end(association, role, cast<Target>(end));
}

/// An association without ends, its other properties as `create` with defaults leaves them.
template <class A>
A* create_association()
{
    static const Prototype<A> as_created(create<A>(true));
    return as_created.copy();
}

/// Makes associations of two ends and hands each over. An end that is not wanted, null, joins nothing.
template <class A, class First, class Second>
class Pairs
{
public:
    Pairs(Enum_Instances_Handler<A>* handler, First* A::*first_role, Second* A::*second_role)
        : _handler(handler), _first_role(first_role), _second_role(second_role)
    {
    }

    void operator()(const Instance* first, const Instance* second) const
    {
        if (!first || !second)
            return;
        Ref<A> association(create_association<A>());
        set_end(association.ptr(), _first_role, first);
        set_end(association.ptr(), _second_role, second);
        _handler->handle(association.steal());
    }

private:
    Enum_Instances_Handler<A>* _handler;
    First* A::*_first_role;
    Second* A::*_second_role;
};

/// Each element of the left list with each of the right one.
template <class L, class R, class Pair>
Enum_Instances_Status join_each(const List<L>& lefts, const List<R>& rights, Pair pair)
{
    for (uint32 i = 0; i < lefts.size(); i++) {
        for (uint32 j = 0; j < rights.size(); j++)
            pair(lefts[i], rights[j]);
    }
    return ENUM_INSTANCES_OK;
}

/// The first element of the left list, whatever the length of that list, with each of the right one.
template <class L, class R, class Pair>
Enum_Instances_Status join_first_with_each(const List<L>& lefts, const List<R>& rights, Pair pair)
{
    for (uint32 j = 0; j < rights.size() && !lefts.empty(); j++)
        pair(lefts[0], rights[j]);
    return ENUM_INSTANCES_OK;
}

enum class Matches
{
    FIRST,
    ALL,
};

/// Pairs the elements of two lists whose texts are equal whatever their case: each outer element with its
/// first match, or with all of them. A null property counts as its empty text.
template <class Outer, class Inner, class Pair>
Enum_Instances_Status join_equal(Matches matches, const List<Outer>& outers,
                                 Property<String> Outer::*outer_key, const List<Inner>& inners,
                                 Property<String> Inner::*inner_key, Pair pair)
{
    Position_Index index;
    for (uint32 j = 0; j < inners.size(); j++)
        if (inners[j])
            index.add(view_of((inners[j]->*inner_key).value), j);
    for (uint32 i = 0; i < outers.size(); i++) {
        if (!outers[i])
            continue;
        const auto* found = index.find(view_of((outers[i]->*outer_key).value));
        for (size_t n = 0; found && n < found->size() && (n == 0 || matches == Matches::ALL); n++)
            pair(outers[i], inners[(*found)[n]]);
    }
    return ENUM_INSTANCES_OK;
}

} // namespace KPRV
