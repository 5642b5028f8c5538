#pragma once

#include "module/runtime/objects/Class_Plan.h"
#include "module/runtime/objects/Value.h"

namespace KPRV {

/// A bag of named values outside the runtime. The two `convert` operations are the only walkers of an
/// instance's features for export and import; a new outside format only provides the four pure operations.
class Container
{
public:
    explicit Container(const Meta_Repository* repository) : _repository(repository) {}
    virtual ~Container();

    virtual uint32 get_size() = 0;
    /// 0, or -1 on failure; so the two below.
    virtual int get_name(uint32 index, String& name) = 0;
    virtual int get_value(uint32 index, Value::Type type, Value& value) = 0;
    virtual int set_value(const char* name, const Value& value, uint32 flags) = 0;

    /// The name where it stands, or in `hold`; null on failure. It lasts until the container is next asked.
    virtual const char* peek_name(uint32 index, String& hold)
    {
        return get_name(index, hold) == 0 ? hold.c_str() : nullptr;
    }

    /// `get_value` for a reference, where the container may spare itself what the reference cannot hold.
    virtual int get_reference(uint32 index, const Meta_Reference*, Value::Type type, Value& value)
    {
        return get_value(index, type, value);
    }

    /// Export: each feature with a flag of the mask (0: all) and a value goes to `set_value`. A feature that
    /// fails is logged and left out. -1 only for a null instance.
    int convert(const Instance* instance, uint32 mask);
    /// Import into `instance`, created when null: every cell null but those that the container names and the
    /// class knows. A value that fails is logged and stays null. Always 0.
    int convert(const Meta_Class* meta_class, uint32 mask, Instance*& instance);

protected:
    /// The walk of the export. A container that takes a cell without a value in between has its own.
    virtual void put_cells(const Instance* instance, uint32 mask);
    /// `put(cell)`, 0 or -1, for each cell with a flag of the mask (0: all) that is not null.
    template <class Put>
    INLINE static void put_each(const Instance* instance, uint32 mask, Put put)
    {
        const bool keys = mask == FLAG_KEY;
        visit_values(instance, keys ? Cells::KEYS : Cells::ALL, [=](const Cell& cell) INLINE {
            if (!keys && mask && !(cell.feature->flags & mask))
                return;
            if (put(cell) != 0) [[unlikely]]
                tell_refused(instance, cell);
        });
    }
    /// `set_value` of what the cell holds, which is not null.
    int set_cell(const Instance* instance, const Cell& cell);

    const Meta_Repository* _repository;

private:
    static void tell_refused(const Instance* instance, const Cell& cell);
};

} // namespace KPRV
