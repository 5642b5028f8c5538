#pragma once

#include "tests/bench/Lean_Broker.h"

#include <cstring>

namespace KPRV::bench {

// What stands behind the handles of the lean server. Each object begins with its handle, whose `hdl` is the
// broker.

struct Named_Data
{
    const char* name;
    CMPIData data;
    Named_Data* next;
};

/// Names and values in the order in which they were set. A name that is set twice stands twice.
struct Bag
{
    Named_Data* first;
    Named_Data** end;
    CMPICount count;
};

struct Lean_String
{
    CMPIString handle;
    const char* text;
};

struct Lean_Datetime
{
    CMPIDateTime handle;
    CMPIString* text;
};

struct Lean_Path
{
    CMPIObjectPath handle;
    CMPIString* name_space;
    CMPIString* class_name;
    Bag keys;
};

struct Lean_Instance
{
    CMPIInstance handle;
    Lean_Path* path;
    Bag properties;
};

struct Lean_Args
{
    CMPIArgs handle;
    Bag arguments;
};

struct Lean_Array
{
    CMPIArray handle;
    CMPIType type;
    CMPICount count;
    CMPIValue elements[1];
};

template <class Object, class Handle>
Object* object_of(const Handle* handle)
{
    return reinterpret_cast<Object*>(const_cast<Handle*>(handle));
}

template <class Handle>
Lean_Broker& broker_of(const Handle* handle)
{
    return *static_cast<Lean_Broker*>(handle->hdl);
}

inline CMPIStatus okay()
{
    return {CMPI_RC_OK, nullptr};
}

inline void set_okay(CMPIStatus* status)
{
    if (status)
        *status = okay();
}

// The makers of objects; each takes what it keeps from the broker's block.
CMPIString* new_string(Lean_Broker& broker, const char* text);
CMPIObjectPath* new_path(Lean_Broker& broker, const char* name_space, const char* class_name);
CMPIInstance* new_instance(Lean_Broker& broker, const CMPIObjectPath* path);
CMPIArgs* new_args(Lean_Broker& broker);
CMPIDateTime* new_datetime(Lean_Broker& broker, const char* text);
CMPIArray* new_array(Lean_Broker& broker, CMPICount count, CMPIType type);

} // namespace KPRV::bench
