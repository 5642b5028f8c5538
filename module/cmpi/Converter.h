#pragma once

#include "module/runtime/objects/Meta_Class.h"
#include "module/runtime/objects/Ref.h"

#include <cmpidt.h>
#include <cmpift.h>

// Between whole objects of the server and instances. Each function returns 0, or 1 on failure (a failing
// property filter's own code excepted). Objects made for the server belong to it; a single property that does
// not convert is logged and left out.

namespace KPRV {

class Shared_Ends;

/// The path with every key that has a value. Null on failure. `ends` shares the paths of references among
/// all that is made with it.
CMPIrc make_cmpi_object_path(const CMPIBroker* broker, const Instance* instance, const char* name_space,
                             CMPIObjectPath*& path, Shared_Ends* ends = nullptr);

/// The instance under a property list (null-terminated; null for all). A null path is built from the keys,
/// for a thread that no end of a request cleans up behind: all that is made but the instance is given back.
CMPIrc make_cmpi_instance(const CMPIBroker* broker, const Instance* instance, const char* name_space,
                          const CMPIObjectPath* path, const char** properties, CMPIInstance*& ci,
                          Shared_Ends* ends = nullptr);

/// Out parameters into `out`; the return value apart, with type 0 when it is null.
CMPIrc make_cmpi_method(const CMPIBroker* broker, const char* name_space, const Instance* method_record,
                        const CMPIArgs* out, CMPIValue& value, CMPIType& type);

CMPIrc make_cimple_instance(const CMPIBroker* broker, const Meta_Class* meta_class,
                            const CMPIObjectPath* path, const CMPIInstance* ci, Ref<Instance>& instance);

/// An invocation record with the In parameters. `client_data` is not read. The record shares the text of its
/// name space with the instance on which the method is called, if that is given and has the same.
CMPIrc make_cimple_method(const CMPIBroker* broker, const Meta_Class* meta_class,
                          const Meta_Method* meta_method, const CMPIObjectPath* path, const CMPIArgs* in,
                          void* client_data, Ref<Instance>& record, const Instance* called_on = nullptr);

/// An instance with the keys of the path; all else null.
CMPIrc make_cimple_reference(const CMPIBroker* broker, const Meta_Class* meta_class,
                             const CMPIObjectPath* path, Ref<Instance>& instance);

} // namespace KPRV
