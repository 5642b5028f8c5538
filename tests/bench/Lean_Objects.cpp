#include "tests/bench/Lean_Objects.h"

#include <strings.h>

namespace KPRV::bench {

namespace {

template <class Handle>
CMPIStatus release_nothing(Handle*)
{
    return okay();
}

template <class Object>
Object* make(Lean_Broker& broker, size_t size = sizeof(Object))
{
    return static_cast<Object*>(broker.allocate(size));
}

void clear(Bag& bag)
{
    bag.first = nullptr;
    bag.end = &bag.first;
    bag.count = 0;
}

void add(Lean_Broker& broker, Bag& bag, const char* name, const CMPIValue* value, CMPIType type)
{
    auto* entry = make<Named_Data>(broker);
    entry->name = name;
    entry->next = nullptr;
    entry->data.type = type;
    entry->data.state = CMPI_goodValue;
    if (type == CMPI_chars) {
        // By the interface's custom the pointer is the text itself.
        entry->data.type = CMPI_string;
        entry->data.value.string = new_string(broker, reinterpret_cast<const char*>(value));
    } else {
        entry->data.value = *value;
    }
    *bag.end = entry;
    bag.end = &entry->next;
    bag.count++;
}

CMPIData found(const Named_Data* entry, CMPIStatus* status)
{
    if (status)
        *status = {entry ? CMPI_RC_OK : CMPI_RC_ERR_NO_SUCH_PROPERTY, nullptr};
    return entry ? entry->data : CMPIData{CMPI_null, CMPI_notFound, {}};
}

CMPIData get(const Bag& bag, const char* name, CMPIStatus* status)
{
    const Named_Data* entry = bag.first;
    while (entry && strcasecmp(entry->name, name) != 0)
        entry = entry->next;
    return found(entry, status);
}

CMPIData get_at(Lean_Broker& broker, const Bag& bag, CMPICount index, CMPIString** name, CMPIStatus* status)
{
    const Named_Data* entry = bag.first;
    while (entry && index-- > 0)
        entry = entry->next;
    if (entry && name)
        *name = new_string(broker, entry->name);
    return found(entry, status);
}

const CMPIStringFT string_ft = [] {
    CMPIStringFT ft = {};
    ft.ftVersion = 200;
    ft.release = release_nothing;
    ft.getCharPtr = [](const CMPIString* string, CMPIStatus* status) {
        set_okay(status);
        return object_of<Lean_String>(string)->text;
    };
    return ft;
}();

const CMPIObjectPathFT path_ft = [] {
    CMPIObjectPathFT ft = {};
    ft.ftVersion = 200;
    ft.release = release_nothing;
    ft.getNameSpace = [](const CMPIObjectPath* path, CMPIStatus* status) {
        set_okay(status);
        return object_of<Lean_Path>(path)->name_space;
    };
    ft.getClassName = [](const CMPIObjectPath* path, CMPIStatus* status) {
        set_okay(status);
        return object_of<Lean_Path>(path)->class_name;
    };
    ft.addKey = [](const CMPIObjectPath* path, const char* name, const CMPIValue* value, CMPIType type) {
        add(broker_of(path), object_of<Lean_Path>(path)->keys, name, value, type);
        return okay();
    };
    ft.getKey = [](const CMPIObjectPath* path, const char* name, CMPIStatus* status) {
        return get(object_of<Lean_Path>(path)->keys, name, status);
    };
    ft.getKeyAt = [](const CMPIObjectPath* path, CMPICount index, CMPIString** name, CMPIStatus* status) {
        return get_at(broker_of(path), object_of<Lean_Path>(path)->keys, index, name, status);
    };
    ft.getKeyCount = [](const CMPIObjectPath* path, CMPIStatus* status) {
        set_okay(status);
        return object_of<Lean_Path>(path)->keys.count;
    };
    return ft;
}();

const CMPIInstanceFT instance_ft = [] {
    CMPIInstanceFT ft = {};
    ft.ftVersion = 200;
    ft.release = release_nothing;
    ft.setProperty = [](const CMPIInstance* instance, const char* name, const CMPIValue* value,
                        CMPIType type) {
        add(broker_of(instance), object_of<Lean_Instance>(instance)->properties, name, value, type);
        return okay();
    };
    ft.getObjectPath = [](const CMPIInstance* instance, CMPIStatus* status) {
        set_okay(status);
        return &object_of<Lean_Instance>(instance)->path->handle;
    };
    return ft;
}();

const CMPIArgsFT args_ft = [] {
    CMPIArgsFT ft = {};
    ft.ftVersion = 200;
    ft.release = release_nothing;
    ft.addArg = [](const CMPIArgs* args, const char* name, const CMPIValue* value, CMPIType type) {
        add(broker_of(args), object_of<Lean_Args>(args)->arguments, name, value, type);
        return okay();
    };
    ft.getArg = [](const CMPIArgs* args, const char* name, CMPIStatus* status) {
        return get(object_of<Lean_Args>(args)->arguments, name, status);
    };
    ft.getArgAt = [](const CMPIArgs* args, CMPICount index, CMPIString** name, CMPIStatus* status) {
        return get_at(broker_of(args), object_of<Lean_Args>(args)->arguments, index, name, status);
    };
    ft.getArgCount = [](const CMPIArgs* args, CMPIStatus* status) {
        set_okay(status);
        return object_of<Lean_Args>(args)->arguments.count;
    };
    return ft;
}();

const CMPIDateTimeFT datetime_ft = [] {
    CMPIDateTimeFT ft = {};
    ft.ftVersion = 200;
    ft.release = release_nothing;
    return ft;
}();

const CMPIArrayFT array_ft = [] {
    CMPIArrayFT ft = {};
    ft.ftVersion = 200;
    ft.release = release_nothing;
    ft.setElementAt = [](const CMPIArray* array, CMPICount index, const CMPIValue* value, CMPIType) {
        object_of<Lean_Array>(array)->elements[index] = *value;
        return okay();
    };
    return ft;
}();

} // namespace

CMPIString* new_string(Lean_Broker& broker, const char* text)
{
    const size_t size = strlen(text) + 1;
    auto* string = make<Lean_String>(broker, sizeof(Lean_String) + size);
    string->handle = {&broker, &string_ft};
    string->text = static_cast<const char*>(memcpy(string + 1, text, size));
    return &string->handle;
}

CMPIObjectPath* new_path(Lean_Broker& broker, const char* name_space, const char* class_name)
{
    auto* path = make<Lean_Path>(broker);
    path->handle = {&broker, &path_ft};
    path->name_space = new_string(broker, name_space);
    path->class_name = new_string(broker, class_name);
    clear(path->keys);
    return &path->handle;
}

CMPIInstance* new_instance(Lean_Broker& broker, const CMPIObjectPath* path)
{
    auto* instance = make<Lean_Instance>(broker);
    instance->handle = {&broker, &instance_ft};
    instance->path = object_of<Lean_Path>(path);
    clear(instance->properties);
    return &instance->handle;
}

CMPIArgs* new_args(Lean_Broker& broker)
{
    auto* args = make<Lean_Args>(broker);
    args->handle = {&broker, &args_ft};
    clear(args->arguments);
    return &args->handle;
}

CMPIDateTime* new_datetime(Lean_Broker& broker, const char* text)
{
    auto* datetime = make<Lean_Datetime>(broker);
    datetime->handle = {&broker, &datetime_ft};
    datetime->text = new_string(broker, text);
    return &datetime->handle;
}

CMPIArray* new_array(Lean_Broker& broker, CMPICount count, CMPIType type)
{
    auto* array = make<Lean_Array>(broker, sizeof(Lean_Array) + count * sizeof(CMPIValue));
    array->handle = {&broker, &array_ft};
    array->type = type;
    array->count = count;
    return &array->handle;
}

} // namespace KPRV::bench
