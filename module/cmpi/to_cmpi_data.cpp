#include "module/cmpi/to_cmpi_data.h"
#include "module/cmpi/CMPI_Containers.h"
#include "module/cmpi/Made_Objects.h"
#include "module/cmpi/Nesting.h"
#include "module/cmpi/cmpi_types.h"
#include "module/runtime/ground/type_dispatch.h"
#include "module/runtime/system/log.h"

#include <cmpimacs.h>

namespace KPRV {

namespace {

/// Where objects come from, and who takes note of them: null if nobody does.
struct Maker
{
    const CMPIBroker* broker;
    Made_Objects* made;

    template <class T>
    T* noted(T* object) const
    {
        return made ? made->note(object) : object;
    }
};

} // namespace

/// One scalar into the union. False if the server does not make the object.
template <class T>
static bool store_scalar(const Maker&, const T& x, CMPIValue& value)
{
    store_plain(value, x);
    return true;
}

static bool store_scalar(const Maker& maker, const String& x, CMPIValue& value)
{
    value.string = maker.noted(CMNewString(maker.broker, x.c_str(), nullptr));
    return value.string != nullptr;
}

static bool store_scalar(const Maker& maker, const Datetime& x, CMPIValue& value)
{
    char text[32];
    x.ascii(text, false);
    value.dateTime = maker.noted(CMNewDateTimeFromChars(maker.broker, text, nullptr));
    return value.dateTime != nullptr;
}

static CMPIArray* new_array(const Maker& maker, uint32 count, CMPIType element_word, CMPIData& data)
{
    data.type = CMPIType(element_word | CMPI_ARRAY);
    data.value.array = maker.noted(CMNewArray(maker.broker, count, element_word, nullptr));
    return data.value.array;
}

static int set_element(CMPIArray* array, uint32 index, const CMPIValue& value, CMPIType element_word)
{
    if (CMSetArrayElementAt(array, index, &value, element_word).rc == CMPI_RC_OK)
        return 0;
    LOG_CONVERSION(WARN, "CMSetArrayElementAt() failed");
    return -1;
}

template <class T>
static int scalar_to_data(const Maker& maker, const Value& value, CMPIType word, CMPIData& data)
{
    data.type = word;
    return store_scalar(maker, *value.peek<T>(), data.value) ? 0 : -1;
}

template <class T>
static int array_to_data(const Maker& maker, const Array<T>& elements, CMPIType element_word, CMPIData& data)
{
    CMPIArray* const array = new_array(maker, elements.size(), element_word, data);
    if (!array)
        return -1;
    for (uint32 i = 0; i < elements.size(); i++) {
        CMPIValue element = {};
        if (!store_scalar(maker, elements[i], element) || set_element(array, i, element, element_word) != 0)
            return -1;
    }
    return 0;
}

static int instance_array_to_data(const Meta_Repository* repository, const Maker& maker,
                                  const char* name_space, const Value& value, CMPIType element_word,
                                  CMPIData& data, unsigned depth)
{
    const Array<Instance*>& elements = *value.peek<Array<Instance*>>();
    CMPIArray* const array = new_array(maker, elements.size(), element_word, data);
    if (!array)
        return -1;
    for (uint32 i = 0; i < elements.size(); i++) {
        CMPIData element = {};
        if (to_cmpi_scalar<Instance*>::func(repository, maker.broker, name_space, elements[i], element_word,
                                            element, depth) != 0) {
            LOG_CONVERSION(WARN, "element conversion failed");
            return -1;
        }
        if (set_element(array, i, element.value, element_word) != 0)
            return -1;
    }
    return 0;
}

static CMPIType instance_word_of(uint32 flags)
{
    return flags & (FLAG_EMBEDDED_INSTANCE | FLAG_EMBEDDED_OBJECT) ? CMPI_instance : CMPI_ref;
}

int _to_cmpi_data(const Meta_Repository* repository, const CMPIBroker* broker, const char* name_space,
                  const Value& value, uint32 flags, CMPIData& data, Made_Objects* made, unsigned depth)
{
    const Maker maker = {broker, made};
    data = CMPIData();
    const CMPIType instance_word = instance_word_of(flags);
    if (value.type == Value::NONE) {
        LOG_CONVERSION(WARN, "missing type");
        return -1;
    }
    if (value.type == Value::INSTANCE) {
        Instance* instance = nullptr;
        value.get_value(instance);
        return to_cmpi_scalar<Instance*>::func(repository, broker, name_space, instance, instance_word, data,
                                               depth);
    }
    if (value.type == Value::INSTANCE_ARRAY)
        return instance_array_to_data(repository, maker, name_space, value, instance_word, data, depth);

    const uint32 scalar = uint32(value.type) & ~uint32(Value::ARRAY_BIT);
    if (scalar >= NUM_TYPES) {
        if (value.null)
            data.state = CMPI_nullValue;
        return 0;
    }
    return visit_type(Type(scalar), [&](auto tag) {
        using T = typename decltype(tag)::type;
        return value.type & Value::ARRAY_BIT
                   ? array_to_data(maker, *value.peek<Array<T>>(), cmpi_type_words[tag.code], data)
                   : scalar_to_data<T>(maker, value, cmpi_type_words[tag.code], data);
    });
}

int array_to_cmpi_data(const CMPIBroker* broker, const Instance* instance, const Cell& cell, CMPIData& data)
{
    data = CMPIData();
    return visit_type(cell.element_type(), [&](auto tag) {
        using T = typename decltype(tag)::type;
        return array_to_data(Maker{broker, nullptr}, cell.in<Array<T>>(instance), cmpi_type_words[tag.code],
                             data);
    });
}

int reference_to_cmpi_data(const Meta_Repository* repository, const CMPIBroker* broker,
                           const char* name_space, const Instance* instance, const Cell& cell, CMPIData& data,
                           unsigned depth)
{
    data = CMPIData();
    return to_cmpi_scalar<Instance*>::func(repository, broker, name_space, cell.in<Instance*>(instance),
                                           instance_word_of(cell.feature->flags), data, depth);
}

int to_cmpi_scalar<Instance*>::func(const Meta_Repository* repository, const CMPIBroker* broker,
                                    const char* name_space, const Instance* instance, CMPIType type,
                                    CMPIData& data, unsigned depth)
{
    if (!instance) {
        LOG_CONVERSION(WARN, "null instance argument");
        return -1;
    }
    if (!instance->__name_space.empty())
        name_space = instance->__name_space.c_str();
    if (!name_space || !*name_space) {
        LOG_CONVERSION(WARN, "null namespace");
        return -1;
    }
    const char* const class_name = instance->__meta_class->name;
    if (!class_name || !*class_name) {
        LOG_CONVERSION(WARN, "null classname");
        return -1;
    }
    if (!may_descend(depth))
        return -1;

    CMPIObjectPath* const path = CMNewObjectPath(broker, name_space, class_name, nullptr);
    if (!path) {
        LOG_CONVERSION(WARN, "CMNewObjectPath() failed");
        return -1;
    }
    CMPIObjectPath_Container path_container(repository, broker, name_space, path);
    path_container.lies_in(depth + 1);
    if (path_container.convert(instance, FLAG_KEY) != 0) {
        LOG_CONVERSION(WARN, "Container::convert() failed");
        return -1;
    }

    data.type = type;
    switch (type) {
    case CMPI_ref:
        data.value.ref = path;
        return 0;
    case CMPI_instance: {
        data.value.inst = CMNewInstance(broker, path, nullptr);
        if (!data.value.inst) {
            LOG_CONVERSION(WARN, "CMNewInstance() failed");
            return -1;
        }
        CMPIInstance_Container container(repository, broker, name_space, data.value.inst);
        container.lies_in(depth + 1);
        if (container.convert(instance, 0) != 0) {
            LOG_CONVERSION(WARN, "Container::convert() failed");
            return -1;
        }
        return 0;
    }
    default:
        LOG_CONVERSION(WARN, "unexpected type");
        return -1;
    }
}

} // namespace KPRV
