#include "module/cmpi/to_cimple_value.h"
#include "module/cmpi/cmpi_types.h"
#include "module/cmpi/to_cimple_instance.h"
#include "module/runtime/ground/type_dispatch.h"
#include "module/runtime/objects/Ref.h"
#include "module/runtime/system/log.h"

#include <cmpimacs.h>

namespace KPRV {

/// Tolerant: what has no text is empty, with a line in the log.
static String string_of(const CMPIString* string)
{
    if (!string) {
        LOG_CONVERSION(INFO, "ignored null CMPI string");
        return String();
    }
    const char* const text = CMGetCharPtr(string);
    if (!text) {
        LOG_CONVERSION(WARN, "CMGetCharsPtr() failed");
        return String();
    }
    return String(text);
}

template <class T>
static bool load_scalar(const CMPIValue& value, T& x)
{
    x = load_plain<T>(value);
    return true;
}

static bool load_scalar(const CMPIValue& value, String& x)
{
    x = string_of(value.string);
    return true;
}

static bool load_scalar(const CMPIValue& value, Datetime& x)
{
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    const CMPIString* const string = value.dateTime ? CMGetStringFormat(value.dateTime, &status) : nullptr;
    const char* const text = string && status.rc == CMPI_RC_OK ? CMGetCharPtr(string) : nullptr;
    if (!text) {
        LOG_CONVERSION(WARN, "CMGetStringFormat() failed");
        return false;
    }
    if (!x.set(text)) {
        LOG_CONVERSION(WARN, "conversion error");
        return false;
    }
    return true;
}

template <class T>
struct to_cimple_array_value
{
    static int func(const Meta_Repository*, const CMPIData& data, Value& value)
    {
        const CMPIArray* const array = data.value.array;
        if (!array)
            return -1;
        const uint32 count = CMGetArrayCount(array, nullptr);
        Array<T> elements;
        elements.reserve(count);
        for (uint32 i = 0; i < count; i++) {
            const CMPIData element = CMGetArrayElementAt(array, i, nullptr);
            if (element.type != (data.type & ~CMPI_ARRAY)) {
                LOG_CONVERSION(WARN, "type mismatch");
                return -1;
            }
            if (element.state & CMPI_nullValue) {
                LOG_CONVERSION(WARN, "encountered null array element");
                return -1;
            }
            T x = T();
            if (!load_scalar(element.value, x))
                return -1;
            elements.append(x);
        }
        value.set_value(elements);
        return 0;
    }
};

namespace {

/// Where embedded instances and references find their classes.
struct Instance_Source
{
    const Meta_Repository* repository;
    const CMPIBroker* broker;
    const char* name_space;
    Nesting nesting;

    Instance* make(CMPIType word, const CMPIValue& value) const
    {
        return word == CMPI_instance
                   ? _to_cimple_instance(repository, broker, name_space, value.inst, nesting)
                   : _to_cimple_instance(repository, broker, name_space, value.ref, nesting);
    }
};

/// Instances collected so far, released unless they are handed on.
struct Collected_Instances
{
    Array<Instance*> elements;

    ~Collected_Instances()
    {
        for (Instance* instance : elements)
            unref(instance);
    }
    void hand_to(Value& value)
    {
        value.set_value(elements);
        elements.clear();
    }
};

} // namespace

static bool has_object(CMPIType word, const CMPIValue& value)
{
    return word == CMPI_instance ? value.inst != nullptr : value.ref != nullptr;
}

static int load_instance(const Instance_Source& source, const CMPIData& data, Value& value)
{
    if (!has_object(data.type, data.value)) {
        value.set_value(static_cast<Instance*>(nullptr));
        value.null = true;
        return 0;
    }
    Instance* const instance = source.make(data.type, data.value);
    if (!instance) {
        LOG_CONVERSION(WARN, "failed to create CIMPLE instance");
        return -1;
    }
    value.set_value(instance);
    return 0;
}

/// Unlike arrays of scalars these keep null elements.
static int load_instance_array(const Instance_Source& source, const CMPIData& data, Value& value)
{
    const CMPIArray* const array = data.value.array;
    if (!array)
        return -1;
    const CMPIType element_word = data.type & ~CMPI_ARRAY;
    const uint32 count = CMGetArrayCount(array, nullptr);
    Collected_Instances collected;
    collected.elements.reserve(count);
    for (uint32 i = 0; i < count; i++) {
        const CMPIData element = CMGetArrayElementAt(array, i, nullptr);
        if (element.type != element_word) {
            LOG_CONVERSION(WARN, "array element type mismatch");
            return -1;
        }
        Instance* instance = nullptr;
        if (!(element.state & CMPI_nullValue)) {
            if (!has_object(element_word, element.value)) {
                LOG_CONVERSION(WARN, "encountered null instance element");
                return -1;
            }
            instance = source.make(element_word, element.value);
            if (!instance) {
                LOG_CONVERSION(WARN, "failed to create CIMPLE instance");
                return -1;
            }
        }
        collected.elements.append(instance);
    }
    collected.hand_to(value);
    return 0;
}

static void set_typed_null(Value::Type type, Value& value)
{
    if (type == Value::INSTANCE)
        value.set_value(static_cast<Instance*>(nullptr));
    else if (type == Value::INSTANCE_ARRAY)
        value.set_value(Array<Instance*>());
    else
        visit_type(Type(type & ~Value::ARRAY_BIT), [&](auto tag) {
            using T = typename decltype(tag)::type;
            if (type & Value::ARRAY_BIT)
                value.set_value(Array<T>());
            else
                value.set_value(T());
        });
    value.null = true;
}

int cmpi_to_cimple_value(const Meta_Repository* repository, const CMPIBroker* broker, const char* name_space,
                         const CMPIData& data, Value& value, Nesting nesting)
{
    value.clear();
    const Value::Type type = value_type_of(data.type);
    const bool null = data.state & CMPI_nullValue;

    if (type == Value::NONE) {
        if (null)
            LOG_CONVERSION(WARN, "unknown cmpi type %u", unsigned(data.type));
        else
            LOG_CONVERSION(WARN, "unreachable");
        return -1;
    }
    if (null) {
        set_typed_null(type, value);
        return 0;
    }

    const Instance_Source source{repository, broker, name_space, nesting};
    if (type == Value::INSTANCE)
        return load_instance(source, data, value);
    if (type == Value::INSTANCE_ARRAY)
        return load_instance_array(source, data, value);

    return visit_type(Type(type & ~Value::ARRAY_BIT), [&](auto tag) {
        using T = typename decltype(tag)::type;
        if (type & Value::ARRAY_BIT)
            return to_cimple_array_value<T>::func(repository, data, value);
        T x = T();
        if (!load_scalar(data.value, x))
            return -1;
        value.set_value(std::move(x));
        return 0;
    });
}

} // namespace KPRV
