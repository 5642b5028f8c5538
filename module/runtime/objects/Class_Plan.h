#pragma once

#include "module/runtime/ground/Atomic.h"
#include "module/runtime/objects/features.h"

#include <algorithm>
#include <atomic>
#include <cstring>

// How it works. The metadata of a class lists its features; where a feature's value lies stands in the
// feature's own record. A walk by it would read three places for each cell: list, record, instance. The plan
// of a class puts what walks need side by side, in groups: all cells, the keys, the others, and those behind
// which memory stands. Beside them stands an instance that is all null, whose bytes make others.
//
// A plan is made when it is first asked for, under a mutex, out of zeroed pages of the module, and never
// given back. It enters a table by the address of its class with one release store; who looks it up follows
// open addressing with acquire loads, and takes no lock. Two threads that miss at once meet at the mutex, and
// the second finds the first one's plan. A class that is counted may go while others take its address, so
// that it gets none; nor does any class when the pages are used up. `visit_cells` then makes each cell from
// its feature on the way, and nobody sees a difference.

namespace KPRV {

enum class Cell_Kind : uint8
{
    PLAIN, ///< A scalar of bytes: nothing stands behind it.
    TEXT,
    MOMENT,
    ARRAY,
    REFERENCE,
    REFERENCE_ARRAY,
    NONE, ///< A method has no cell.
};

/// What a walk over an instance needs to know of one cell, side by side. But for a reference, whose pointer
/// tells whether it is null, the null byte stands right behind the value.
struct Cell
{
    const Meta_Feature* feature;
    uint32 end;  ///< Where the value ends and the null byte stands: of most cells nothing else is read.
    sint16 type; ///< As `Value::Type` numbers it.
    uint8 size;  ///< Bytes of the value.
    Cell_Kind kind;

    uint32 offset() const { return end - size; }

    /// Of a scalar, or of an array's elements.
    Type element_type() const { return static_cast<Type>(type & 0x7F); }
    template <class T>
    T& in(const Instance* instance) const
    {
        return cell_at<T>(instance, offset());
    }
    bool is_null(const Instance* instance) const
    {
        return kind == Cell_Kind::REFERENCE ? !in<Instance*>(instance) : null(instance) != 0;
    }
    /// Of any cell but a reference.
    uint8& null(const Instance* instance) const { return cell_at<uint8>(instance, end); }
    /// Of a holder: what stands in it, the address of what it holds.
    const void* handle(const Instance* instance) const
    {
        return reinterpret_cast<const void* const*>(reinterpret_cast<const char*>(instance) + end)[-1];
    }
    /// Copies the value's bytes, of which there are at most eight.
    void copy_bytes(const Instance* instance, void* to) const
    {
        const void* const from = &in<char>(instance);
        // A copy of a known size is one instruction.
        switch (size) {
        case 1:
            memcpy(to, from, 1);
            break;
        case 2:
            memcpy(to, from, 2);
            break;
        case 4:
            memcpy(to, from, 4);
            break;
        default:
            memcpy(to, from, 8);
        }
    }
};

Cell cell_of(const Meta_Feature* feature);

/// Whether its null byte is one of the flags that are set and asked; a reference is null by its pointer, and
/// arrays of them keep theirs to themselves.
inline bool has_null_flag(const Cell& cell)
{
    return cell.kind < Cell_Kind::REFERENCE;
}

/// What a holder holds in a fresh instance; all fresh instances share it, and nobody releases it.
const void* fresh_handle(const Cell& cell);

enum class Cells
{
    ALL,
    KEYS,
    NON_KEYS,
    HOLDERS, ///< Those that hold a text, a moment, an array or an instance.
};

bool belongs(const Cell& cell, Cells cells);

/// The cells of a class, each group in the order of the features. The records say the same, but a walk over
/// them reads three places for each cell, and the walks that make, export and release instances are what an
/// enumeration spends its time with.
struct Class_Plan
{
    const Meta_Class* owner;
    const Meta_Feature* const* features;
    std::span<const Cell> groups[4];
    bool refers;              ///< Whether some cell is a reference, or several.
    const Instance* all_null; ///< See `create_null`.

    std::span<const Cell> operator[](Cells cells) const { return groups[static_cast<size_t>(cells)]; }
};

/// Where the plans are found: open addressing, twice as many places as there are classes and methods.
inline constexpr size_t PLAN_PLACES = 512;
extern std::atomic<const Class_Plan*> plan_places[PLAN_PLACES];

inline size_t plan_place_of(const Meta_Class* meta_class)
{
    return reinterpret_cast<size_t>(meta_class) / alignof(Meta_Class) * 40503 / 16 % PLAN_PLACES;
}

/// For `plan_of`, which has looked into the first place.
const Class_Plan* find_or_make_plan(const Meta_Class* meta_class);

/// The plan of a class or method of the catalogue, made when it is first asked for. Null for all other
/// records, and when there is no room for another plan.
inline const Class_Plan* plan_of(const Meta_Class* meta_class)
{
    // Mostly it stands in its place; that it has one, it owes to what is looked at elsewhere. Either way
    // (comparison): what is not found here is found there.
    const Class_Plan* const first = plan_places[plan_place_of(meta_class)].load(std::memory_order_acquire);
    if (first && first->owner == meta_class && first->features == meta_class->meta_features &&
        atomic_get(meta_class->refs) == 0) [[likely]]
        return first;
    return find_or_make_plan(meta_class);
}

/// For visitors that look at most cells only to pass on: `[](const Cell& cell) INLINE { ... }`.
#define INLINE __attribute__((always_inline))
/// For loops over cells, most of which take less than the loop itself.
#if defined(__clang__)
#define FOUR_AT_A_TIME _Pragma("unroll 4")
#else
#define FOUR_AT_A_TIME _Pragma("GCC unroll 4")
#endif

/// Calls the visitor with each cell of the group.
template <class Visitor>
void visit_cells(const Meta_Class* meta_class, Cells cells, Visitor visitor)
{
    if (const Class_Plan* const plan = plan_of(meta_class)) {
        FOUR_AT_A_TIME
        for (const Cell& cell : (*plan)[cells])
            visitor(cell);
        return;
    }
    for (const Meta_Feature* feature : features_of(meta_class)) {
        const Cell cell = cell_of(feature);
        if (belongs(cell, cells))
            visitor(cell);
    }
}

/// Calls the visitor with each cell of the group that is not null. Most are.
template <class Visitor>
INLINE inline void visit_values(const Instance* instance, Cells cells, Visitor visitor)
{
    const Class_Plan* const plan = plan_of(instance->__meta_class);
    if (plan && !plan->refers) {
        for (const Cell& cell : (*plan)[cells]) {
            if (!cell.null(instance)) [[unlikely]]
                visitor(cell);
        }
        return;
    }
    // By value: what is in a register stays there.
    const auto visit = [=](const Cell& cell) INLINE {
        if (!cell.is_null(instance))
            visitor(cell);
    };
    if (plan) {
        for (const Cell& cell : (*plan)[cells])
            visit(cell);
    } else {
        visit_cells(instance->__meta_class, cells, visit);
    }
}

/// Whether the predicate holds for each cell of the group. The last cell is asked first: of the keys it is
/// the one that tells most objects of a host apart.
template <class Predicate>
bool all_cells(const Meta_Class* meta_class, Cells cells, Predicate&& predicate)
{
    if (const Class_Plan* const plan = plan_of(meta_class)) {
        const auto group = (*plan)[cells];
        return std::all_of(group.rbegin(), group.rend(), predicate);
    }
    const auto features = features_of(meta_class);
    return std::all_of(features.rbegin(), features.rend(), [&](const Meta_Feature* feature) {
        const Cell cell = cell_of(feature);
        return !belongs(cell, cells) || predicate(cell);
    });
}

} // namespace KPRV
