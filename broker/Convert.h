#pragma once

#include "broker/Call.h"
#include "broker/Objects.h"

namespace KPRV::broker {

/// Copies what a provider passes as value pointer and type word (see cmpimacs.h) into a host value. Wrong
/// type words and objects are violations; the code is that of the call.
CMPIrc read_value(Call_Base& call, Core& core, const CMPIValue* value, CMPIType type, Plain_Value& result);

/// Presents a host value to the provider; objects that it needs are made under the name of the call.
CMPIData make_data(Core& core, const char* maker, const Plain_Value& value);

/// The array's elements as a host value.
CMPIrc read_array(Call_Base& call, Core& core, const Array_Object& array, Plain_Value& result);

/// The entry of that name for the getters by name, whose code for a name that is not there differs. A null
/// name is a violation; `what` calls it by its role.
CMPIData make_entry(Call_Base& call, Core& core, const std::vector<Named_Value>& entries, const char* name,
                    const char* what, CMPIrc missing);

/// `entries[index]` for the getters by index: the name goes out as a string object. An index beyond the end
/// is a violation and gives code 12.
CMPIData make_entry_at(Call_Base& call, Core& core, const std::vector<Named_Value>& entries, CMPICount index,
                       CMPIString** name);

/// True if a value of that type may become the class's property or key; otherwise a violation.
bool fits_type(Call_Base& call, Core& core, const Class_Info& info, const Feature_Info& feature,
               CMPIType type);

/// Null-terminated list to vector; nothing for a null list.
std::optional<std::vector<std::string>> read_list(const char** list);

} // namespace KPRV::broker
