#pragma once

#include "module/runtime/objects/Class_Plan.h"
#include "module/runtime/objects/Meta_Repository.h"
#include "module/runtime/objects/Value.h"

#include <cmpidt.h>
#include <cmpift.h>

namespace KPRV {

class Made_Objects;

/// Translates one value for the server. `flags` are the feature's: they tell an embedded instance from a
/// reference. 0, or -1 with a log line. The objects made belong to the server; those of texts, datetimes and
/// arrays are noted in `made`, if given. `depth` is that of the object that the value lies in.
int _to_cmpi_data(const Meta_Repository* repository, const CMPIBroker* broker, const char* name_space,
                  const Value& value, uint32 flags, CMPIData& data, Made_Objects* made = nullptr,
                  unsigned depth = 0);

/// The same of a cell that holds an array of a CIM type and is not null, from where it stands. Nothing is
/// noted.
int array_to_cmpi_data(const CMPIBroker* broker, const Instance* instance, const Cell& cell, CMPIData& data);

/// The same of a cell that holds a reference.
int reference_to_cmpi_data(const Meta_Repository* repository, const CMPIBroker* broker,
                           const char* name_space, const Instance* instance, const Cell& cell, CMPIData& data,
                           unsigned depth);

template <class T>
struct to_cmpi_scalar;

/// An instance as object path (word `CMPI_ref`) or as a whole (word `CMPI_instance`). One without a name
/// space takes that of the call.
template <>
struct to_cmpi_scalar<Instance*>
{
    static int func(const Meta_Repository* repository, const CMPIBroker* broker, const char* name_space,
                    const Instance* instance, CMPIType type, CMPIData& data, unsigned depth = 0);
};

} // namespace KPRV
