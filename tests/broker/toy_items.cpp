// TOY_Item: two instances with a property of each type, keys Id and Name.
#include "tests/broker/toy.h"

#include <cstring>

namespace toy {

Broker_Slot broker;

namespace {

CMPIObjectPath* item_path(const CMPIObjectPath* from, CMPIUint32 id)
{
    CMPIString* name_space = CMGetNameSpace(from, nullptr);
    CMPIObjectPath* path = CMNewObjectPath(broker, CMGetCharPtr(name_space), "TOY_Item", nullptr);
    CMAddKey(path, "Id", &id, CMPI_uint32);
    CMAddKey(path, "Name", id == 1 ? "one" : "two \"quoted\" \\", CMPI_chars);
    return path;
}

void set_scalars(CMPIInstance* item)
{
    CMPIValue value = {};
    value.boolean = 1;
    CMSetProperty(item, "Flag", &value, CMPI_boolean);
    value.uint8 = 200;
    CMSetProperty(item, "U8", &value, CMPI_uint8);
    value.uint16 = 60000;
    CMSetProperty(item, "U16", &value, CMPI_uint16);
    value.uint32 = 4000000000u;
    CMSetProperty(item, "U32", &value, CMPI_uint32);
    value.uint64 = 18000000000000000000u;
    CMSetProperty(item, "U64", &value, CMPI_uint64);
    value.sint8 = -100;
    CMSetProperty(item, "S8", &value, CMPI_sint8);
    value.sint16 = -30000;
    CMSetProperty(item, "S16", &value, CMPI_sint16);
    value.sint32 = -2000000000;
    CMSetProperty(item, "S32", &value, CMPI_sint32);
    value.sint64 = -9000000000000000000;
    CMSetProperty(item, "S64", &value, CMPI_sint64);
    value.real32 = 1.5f;
    CMSetProperty(item, "R32", &value, CMPI_real32);
    value.real64 = -0.25;
    CMSetProperty(item, "R64", &value, CMPI_real64);
    value.char16 = 'x';
    CMSetProperty(item, "C16", &value, CMPI_char16);
    CMSetProperty(item, "Nothing", nullptr, CMPI_string);
}

void set_arrays(CMPIInstance* item)
{
    CMPIArray* numbers = CMNewArray(broker, 3, CMPI_uint16, nullptr);
    for (CMPIUint16 i = 0; i < 3; ++i)
        CMSetArrayElementAt(numbers, i, &i, CMPI_uint16);
    CMSetProperty(item, "Numbers", &numbers, CMPI_uint16A);
    CMPIArray* texts = CMNewArray(broker, 2, CMPI_string, nullptr);
    CMPIString* text = CMNewString(broker, "line\nbreak", nullptr);
    CMSetArrayElementAt(texts, 0, &text, CMPI_string);
    CMSetProperty(item, "Texts", &texts, CMPI_stringA);
    CMPIArray* empty = CMNewArray(broker, 0, CMPI_boolean, nullptr);
    CMSetProperty(item, "Empty", &empty, CMPI_booleanA);
}

CMPIInstance* item(const CMPIObjectPath* from, CMPIUint32 id, const char** properties)
{
    CMPIObjectPath* path = item_path(from, id);
    CMPIInstance* item = CMNewInstance(broker, path, nullptr);
    if (properties)
        CMSetPropertyFilter(item, properties, nullptr);
    CMSetProperty(item, "Id", &id, CMPI_uint32);
    CMSetProperty(item, "Name", id == 1 ? "one" : "two \"quoted\" \\", CMPI_chars);
    set_scalars(item);
    set_arrays(item);
    CMPIDateTime* when = CMNewDateTimeFromChars(broker, "20260102030405.000006+060", nullptr);
    CMSetProperty(item, "When", &when, CMPI_dateTime);
    CMSetProperty(item, "Other", &path, CMPI_ref);
    return item;
}

/// Keys of a client come as 64-bit integers of either sign.
CMPIUint32 id_of(const CMPIObjectPath* path)
{
    for (CMPICount i = 0; i < CMGetKeyCount(path, nullptr); ++i) {
        CMPIString* name = nullptr;
        CMPIData data = CMGetKeyAt(path, i, &name, nullptr);
        if (std::strcmp(CMGetCharPtr(name), "Id") == 0 && (data.state & CMPI_nullValue) == 0)
            return static_cast<CMPIUint32>(data.value.uint64);
    }
    return 0;
}

CMPIStatus enumerate_names(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                           const CMPIObjectPath* path)
{
    for (CMPIUint32 id = 1; id <= 2; ++id)
        CMReturnObjectPath(result, item_path(path, id));
    return CMReturnDone(result);
}

CMPIStatus enumerate(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                     const CMPIObjectPath* path, const char** properties)
{
    for (CMPIUint32 id = 1; id <= 2; ++id) {
        CMPIInstance* instance = item(path, id, properties);
        CMReturnInstance(result, instance);
        CMRelease(instance);
    }
    return CMReturnDone(result);
}

CMPIStatus get(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path,
               const char** properties)
{
    CMPIUint32 id = id_of(path);
    if (id != 1 && id != 2)
        return {CMPI_RC_ERR_NOT_FOUND, CMNewString(broker, "no such item", nullptr)};
    CMReturnInstance(result, item(path, id, properties));
    return CMReturnDone(result);
}

CMPIStatus create(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path,
                  const CMPIInstance* instance)
{
    // Every property comes by index, the class's defaults among them.
    CMPICount count = CMGetPropertyCount(instance, nullptr);
    for (CMPICount i = 0; i < count; ++i)
        CMGetPropertyAt(instance, i, nullptr, nullptr);
    CMReturnObjectPath(result, path);
    return CMReturnDone(result);
}

/// Accepts a change of exactly what the list names.
CMPIStatus modify(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path,
                  const CMPIInstance*, const char** properties)
{
    if (!properties || !properties[0] || std::strcmp(properties[0], "Name") != 0)
        return failed(CMPI_RC_ERR_INVALID_PARAMETER);
    CMReturnObjectPath(result, path);
    return CMReturnDone(result);
}

CMPIStatus remove(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path)
{
    return id_of(path) == 1 ? CMReturnDone(result) : failed(CMPI_RC_ERR_NOT_FOUND);
}

CMPIStatus query(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*, const char*,
                 const char*)
{
    return failed(CMPI_RC_ERR_NOT_SUPPORTED);
}

CMPIStatus cleanup(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean)
{
    return ok;
}

/// Asks to be kept until the server stops.
CMPIStatus method_cleanup(CMPIMethodMI*, const CMPIContext*, CMPIBoolean terminating)
{
    return terminating ? ok : failed(CMPI_RC_DO_NOT_UNLOAD);
}

CMPIStatus invoke(CMPIMethodMI*, const CMPIContext* context, const CMPIResult* result,
                  const CMPIObjectPath* path, const char* name, const CMPIArgs* in, CMPIArgs* out)
{
    for (const Method* list : {methods, misdeeds})
        for (const Method* method = list; method->name; ++method)
            if (std::strcmp(method->name, name) == 0)
                return method->run({context, result, path, in, out});
    return failed(CMPI_RC_ERR_METHOD_NOT_FOUND);
}

CMPIInstanceMIFT instance_table = {100,    100,    "instance", cleanup, enumerate_names, enumerate, get,
                                   create, modify, remove,     query};
CMPIInstanceMI instance_mi = {nullptr, &instance_table};
CMPIMethodMIFT method_table = {100, 100, nullptr, method_cleanup, invoke};
CMPIMethodMI method_mi = {nullptr, &method_table};

} // namespace
} // namespace toy

TOY_EXPORT CMPIInstanceMI* TOY_Item_Provider_Create_InstanceMI(const CMPIBroker* mb, const CMPIContext*,
                                                               CMPIStatus*)
{
    toy::broker = mb;
    return &toy::instance_mi;
}

TOY_EXPORT CMPIMethodMI* TOY_Item_Provider_Create_MethodMI(const CMPIBroker* mb, const CMPIContext*,
                                                           CMPIStatus*)
{
    toy::broker = mb;
    return &toy::method_mi;
}

// A factory that fails by status, though it returns an interface.
TOY_EXPORT CMPIInstanceMI* TOY_Broken_Create_InstanceMI(const CMPIBroker* mb, const CMPIContext*,
                                                        CMPIStatus* status)
{
    status->rc = CMPI_RC_ERR_FAILED;
    status->msg = CMNewString(mb, "out of order", nullptr);
    return &toy::instance_mi;
}
