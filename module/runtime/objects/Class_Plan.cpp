#include "module/runtime/objects/Class_Plan.h"

#include "module/runtime/ground/Datetime.h"
#include "module/runtime/ground/String.h"
#include "module/runtime/ground/empty_arrays.h"
#include "module/runtime/system/Standard_Mutex.h"

#include <algorithm>

namespace KPRV {

namespace {

/// As `Value::Type` numbers them.
constexpr sint16 INSTANCE = 14, ARRAY_BIT = 128;

Cell_Kind kind_of(const Meta_Property* meta)
{
    if (meta->subscript)
        return Cell_Kind::ARRAY;
    return meta->type == STRING     ? Cell_Kind::TEXT
           : meta->type == DATETIME ? Cell_Kind::MOMENT
                                    : Cell_Kind::PLAIN;
}

// Plans live in the module's own zeroed pages and are never given back: there is nothing that could fail, be
// released under a thread that still walks, or outlive the module.
constexpr size_t ROOM = 20480 * sizeof(Cell);
constinit Standard_Mutex<> room_mutex;
alignas(Class_Plan) constinit char room[ROOM] GUARDED_BY(room_mutex) = {};
constinit size_t room_used GUARDED_BY(room_mutex) = 0;

constinit size_t places_used GUARDED_BY(room_mutex) = 0;

template <class T>
T* take(size_t count) REQUIRES(room_mutex)
{
    const size_t begin = (room_used + alignof(T) - 1) / alignof(T) * alignof(T);
    if (begin + count * sizeof(T) > ROOM)
        return nullptr;
    room_used = begin + count * sizeof(T);
    return reinterpret_cast<T*>(room + begin);
}

bool fill_group(const Meta_Class* meta_class, Cells cells, Class_Plan& plan) REQUIRES(room_mutex)
{
    size_t count = 0;
    for (const Meta_Feature* feature : features_of(meta_class))
        count += belongs(cell_of(feature), cells);
    Cell* const group = take<Cell>(count);
    if (!group)
        return false;
    Cell* next = group;
    for (const Meta_Feature* feature : features_of(meta_class)) {
        if (const Cell cell = cell_of(feature); belongs(cell, cells))
            *next++ = cell;
    }
    plan.groups[static_cast<size_t>(cells)] = {group, count};
    return true;
}

const Instance* make_all_null(const Meta_Class* meta_class, const Class_Plan& plan) REQUIRES(room_mutex)
{
    const void** const words = take<const void*>((meta_class->size + sizeof(void*) - 1) / sizeof(void*));
    if (!words)
        return nullptr;
    Instance* const instance = reinterpret_cast<Instance*>(words);
    write_head(instance, meta_class);
    for (const Cell& cell : plan[Cells::HOLDERS])
        cell.in<const void*>(instance) = fresh_handle(cell);
    for (const Cell& cell : plan[Cells::ALL]) {
        if (has_null_flag(cell))
            cell.null(instance) = 1;
    }
    return instance;
}

const Class_Plan* make_plan(const Meta_Class* meta_class) REQUIRES(room_mutex)
{
    Class_Plan* const plan = take<Class_Plan>(1);
    if (!plan)
        return nullptr;
    plan->owner = meta_class;
    plan->features = meta_class->meta_features;
    plan->refers = std::ranges::any_of(
        features_of(meta_class), [](const Meta_Feature* feature) { return feature->flags & FLAG_REFERENCE; });
    for (const Cells cells : {Cells::ALL, Cells::KEYS, Cells::NON_KEYS, Cells::HOLDERS}) {
        if (!fill_group(meta_class, cells, *plan))
            return nullptr;
    }
    plan->all_null = make_all_null(meta_class, *plan);
    return plan->all_null ? plan : nullptr;
}

/// Where the class's plan stands or would stand.
std::atomic<const Class_Plan*>& find_place(const Meta_Class* meta_class)
{
    size_t at = plan_place_of(meta_class);
    for (;; at = (at + 1) % PLAN_PLACES) {
        const Class_Plan* const plan = plan_places[at].load(std::memory_order_acquire);
        if (!plan || plan->owner == meta_class)
            return plan_places[at];
    }
}

/// Once a class: apart, so that finding a plan needs few registers.
[[gnu::noinline]] const Class_Plan* add_plan(const Meta_Class* meta_class)
{
    const Auto_Lock lock(room_mutex);
    std::atomic<const Class_Plan*>& place = find_place(meta_class);
    if (const Class_Plan* const earlier = place.load(std::memory_order_relaxed))
        return earlier;
    if (places_used == PLAN_PLACES / 2)
        return nullptr;
    const Class_Plan* const plan = make_plan(meta_class);
    if (plan) {
        places_used++;
        place.store(plan, std::memory_order_release);
    }
    return plan;
}

} // namespace

constinit std::atomic<const Class_Plan*> plan_places[PLAN_PLACES] = {};

Cell cell_of(const Meta_Feature* feature)
{
    const auto code = [](sint16 type, bool array) { return sint16(array ? ARRAY_BIT | type : type); };
    if (feature->flags & FLAG_PROPERTY) {
        const auto* const meta = static_cast<const Meta_Property*>(feature);
        const uint32 size = null_offset(meta);
        return {feature, meta->offset + size, code(sint16(meta->type), meta->subscript != 0), uint8(size),
                kind_of(meta)};
    }
    if (feature->flags & FLAG_REFERENCE) {
        const auto* const meta = static_cast<const Meta_Reference*>(feature);
        return {feature, uint32(meta->offset + sizeof(void*)), code(INSTANCE, meta->subscript != 0),
                sizeof(void*), meta->subscript ? Cell_Kind::REFERENCE_ARRAY : Cell_Kind::REFERENCE};
    }
    return {feature, 0, -1, 0, Cell_Kind::NONE};
}

const void* fresh_handle(const Cell& cell)
{
    switch (cell.kind) {
    case Cell_Kind::TEXT:
        return &String::_empty;
    case Cell_Kind::MOMENT:
        return &Datetime::_zero;
    case Cell_Kind::ARRAY:
        return fresh_array_of(cell.element_type());
    case Cell_Kind::REFERENCE_ARRAY:
        return fresh_array_of(__pointer_array_traits);
    default:
        return nullptr;
    }
}

bool belongs(const Cell& cell, Cells cells)
{
    if (cell.kind == Cell_Kind::NONE)
        return false;
    switch (cells) {
    case Cells::KEYS:
        return is_key(cell.feature);
    case Cells::NON_KEYS:
        return !is_key(cell.feature);
    case Cells::HOLDERS:
        return cell.kind != Cell_Kind::PLAIN;
    default:
        return true;
    }
}

const Class_Plan* find_or_make_plan(const Meta_Class* meta_class)
{
    // A record that is counted may go, and another may take its place. A method's ends before the repository.
    const bool lasts = meta_class->flags & FLAG_METHOD || meta_class->meta_repository;
    if (atomic_get(meta_class->refs) != 0 || !lasts)
        return nullptr;
    const Class_Plan* plan = find_place(meta_class).load(std::memory_order_acquire);
    if (!plan)
        plan = add_plan(meta_class);
    return plan && plan->features == meta_class->meta_features ? plan : nullptr;
}

} // namespace KPRV
