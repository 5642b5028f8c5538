#include "module/cmpi/CMPI_Containers.h"
#include "module/cmpi/Made_Objects.h"
#include "module/cmpi/cmpi_text.h"
#include "module/cmpi/cmpi_types.h"
#include "module/cmpi/to_cimple_value.h"
#include "module/cmpi/to_cmpi_data.h"
#include "module/runtime/ground/type_dispatch.h"
#include "module/runtime/system/forced_unwinding.h"
#include "module/runtime/system/log.h"

#include <cstring>

namespace KPRV {

uint32 CMPI_Container::get_size()
{
    return _count();
}

bool CMPI_Container::_in_bounds(uint32 index)
{
    if (index < _count())
        return true;
    LOG_CONVERSION(WARN, "bounds error");
    return false;
}

int CMPI_Container::get_name(uint32 index, String& name)
{
    const char* const text = peek_name(index, name);
    if (!text)
        return -1;
    name = text;
    return 0;
}

const char* CMPI_Container::peek_name(uint32 index, String&)
{
    if (!_in_bounds(index))
        return nullptr;
    CMPIString* string = nullptr;
    _at(index, &string);
    return string ? text_of(string) : nullptr;
}

int CMPI_Container::get_value(uint32 index, Value::Type type, Value& value)
{
    return _get(index, type, nullptr, value);
}

int CMPI_Container::get_reference(uint32 index, const Meta_Reference* reference, Value::Type type,
                                  Value& value)
{
    return _get(index, type, reference->meta_class, value);
}

int CMPI_Container::_get(uint32 index, Value::Type type, const Meta_Class* wanted, Value& value)
{
    value.clear();
    if (!_in_bounds(index))
        return -1;
    CMPIString* name = nullptr;
    const CMPIData data = _at(index, &name);
    const auto mismatch = [&](Value::Type actual) {
        LOG_CONVERSION(WARN, "type mismatch on %s: %s/%s", text_of(name), name_of(actual), name_of(type));
        return -1;
    };
    // An object with others in it is not taken apart for a feature that cannot hold it.
    const Value::Type sent = value_type_of(data.type);
    const bool is_object = sent == Value::INSTANCE || sent == Value::INSTANCE_ARRAY;
    if (is_object && sent != type && !(data.state & CMPI_nullValue))
        return mismatch(sent);
    if (cmpi_to_cimple_value(_repository, _broker, _name_space, data, value, {_depth, wanted}) != 0) {
        LOG_CONVERSION(WARN, "cmpi_to_cimple_value() failed");
        return -1;
    }
    if (value.type != type)
        _relax(type, value);
    return value.type == type ? 0 : mismatch(value.type);
}

void CMPI_Container::_relax(Value::Type, Value&) {}

int CMPI_Container::_not_made(const char* name)
{
    LOG_CONVERSION(WARN, "_to_cmpi_data() failed: feature=%s", name);
    return -1;
}

inline bool CMPI_Container::_find_end(const Instance* instance, const Cell& cell, CMPIData& data) const
{
    if (!_ends)
        return false;
    data.type = CMPI_ref;
    data.value.ref = _ends->find(cell.feature->name, cell.in<Instance*>(instance));
    return data.value.ref;
}

int CMPI_Container::_make_end(const Instance* instance, const Cell& cell, CMPIData& data)
{
    if (reference_to_cmpi_data(_repository, _broker, _name_space, instance, cell, data, _depth) != 0)
        return -1;
    if (_ends && data.type == CMPI_ref)
        _ends->note(cell.feature->name, cell.in<Instance*>(instance), data.value.ref);
    return 0;
}

// Each value of an export ends in one of the two.

inline int CMPIInstance_Container::_set(const char* name, const CMPIData& data)
{
    if (CMSetProperty(_instance, name, &data.value, data.type).rc == CMPI_RC_OK) [[likely]]
        return 0;
    LOG_CONVERSION(WARN, "CMSetProperty() failed: %s", name);
    return -1;
}

inline int CMPIObjectPath_Container::_set(const char* name, const CMPIData& data)
{
    if (CMAddKey(_path, name, &data.value, data.type).rc == CMPI_RC_OK)
        return 0;
    LOG_CONVERSION(WARN, "CMAddKey() failed");
    return -1;
}

template <class Final>
void CMPI_Container::_put_cells(Final& container, const Instance* instance, uint32 mask)
{
    put_each(instance, mask,
             [=, this, &container](const Cell& cell) INLINE { return _put_cell(container, instance, cell); });
}

template <class Final>
[[gnu::always_inline]] inline int CMPI_Container::_put_cell(Final& container, const Instance* instance,
                                                            const Cell& cell)
{
    CMPIData data = {};
    if (cell.kind == Cell_Kind::TEXT && !_gives_back) {
        data.type = CMPI_string;
        data.value.string = CMNewString(_broker, cell.in<String>(instance).c_str(), nullptr);
        if (!data.value.string)
            return _not_made(cell.feature->name);
    } else if (cell.kind == Cell_Kind::REFERENCE) {
        if (!_find_end(instance, cell, data) && _make_end(instance, cell, data) != 0)
            return _not_made(cell.feature->name);
    } else if (cell.kind == Cell_Kind::PLAIN) {
        data.type = cmpi_type_words[cell.type];
        cell.copy_bytes(instance, &data.value);
    } else if (cell.kind == Cell_Kind::ARRAY && !_gives_back) {
        if (array_to_cmpi_data(_broker, instance, cell, data) != 0)
            return _not_made(cell.feature->name);
    } else {
        return set_cell(instance, cell);
    }
    return container._set(cell.feature->name, data);
}

int CMPI_Container::set_value(const char* name, const Value& value, uint32 flags)
{
    CMPIData data = {};
    Made_Objects made;
    if (_to_cmpi_data(_repository, _broker, _name_space, value, flags, data, _gives_back ? &made : nullptr,
                      _depth) != 0)
        return _not_made(name);
    return _set(name, data);
}

const char* CMPIInstance_Container::peek_name(uint32 index, String&)
{
    if (!_in_bounds(index))
        return nullptr;
    try {
        CMPIString* string = nullptr;
        CMPIStatus status = {CMPI_RC_OK, nullptr};
        CMGetPropertyAt(_instance, index, &string, &status);
        if (status.rc != CMPI_RC_OK || !string) {
            LOG_CONVERSION(WARN, "CMGetPropertyAt() failed");
            return nullptr;
        }
        return text_of(string);
    } catch (...) {
        rethrow_forced_unwinding();
        LOG_CONVERSION(WARN, "CMGetPropertyAt() threw exception: index=%u size=%u", index, get_size());
        return nullptr;
    }
}

void CMPIInstance_Container::put_cells(const Instance* instance, uint32 mask)
{
    _put_cells(*this, instance, mask);
}

CMPICount CMPIInstance_Container::_count()
{
    return CMGetPropertyCount(_instance, nullptr);
}

CMPIData CMPIInstance_Container::_at(CMPICount index, CMPIString** name)
{
    return CMGetPropertyAt(_instance, index, name, nullptr);
}

void CMPIObjectPath_Container::put_cells(const Instance* instance, uint32 mask)
{
    _put_cells(*this, instance, mask);
}

CMPICount CMPIObjectPath_Container::_count()
{
    return CMGetKeyCount(_path, nullptr);
}

CMPIData CMPIObjectPath_Container::_at(CMPICount index, CMPIString** name)
{
    return CMGetKeyAt(_path, index, name, nullptr);
}

/// Plain truncation, whatever the number; the null state stays.
template <class From>
static void narrow(Value::Type type, Value& value)
{
    From wide = 0;
    value.get_value(wide);
    const bool null = value.null;
    visit_type(Type(type), [&](auto tag) {
        using T = typename decltype(tag)::type;
        if constexpr (tag.code >= UINT8 && tag.code <= SINT64)
            value.set_value(T(wide));
    });
    value.null = null;
}

void CMPIObjectPath_Container::_relax(Value::Type type, Value& value)
{
    // A signed number fits only a uint32 key: other keys of a server that sends signed ones stay unset.
    if (value.type == int(UINT64) && type >= int(UINT8) && type <= int(SINT64))
        narrow<uint64>(type, value);
    else if (value.type == int(SINT64) && type == int(UINT32))
        narrow<sint64>(type, value);
}

void CMPIArgs_Container::put_cells(const Instance* instance, uint32 mask)
{
    _put_cells(*this, instance, mask);
}

CMPICount CMPIArgs_Container::_count()
{
    return CMGetArgCount(_args, nullptr);
}

CMPIData CMPIArgs_Container::_at(CMPICount index, CMPIString** name)
{
    return CMGetArgAt(_args, index, name, nullptr);
}

int CMPIArgs_Container::_set(const char* name, const CMPIData& data)
{
    if (strcmp(name, "return_value") == 0) {
        return_value = data;
        return 0;
    }
    if (CMAddArg(_args, name, &data.value, CMPIType(data.type & 0xFFFF)).rc == CMPI_RC_OK)
        return 0;
    LOG_CONVERSION(WARN, "CMAddArg() failed");
    return -1;
}

void CMPIArgs_Container::_relax(Value::Type type, Value& value)
{
    if (value.type == int(BOOLEAN) && type == Value::INSTANCE_ARRAY) {
        value.set_value(Array<Instance*>());
        value.null = true;
    }
}

} // namespace KPRV
