#include "module/runtime/text/flags.h"

#include "module/runtime/ground/strutil.h"

namespace KPRV {

constinit const char* const flag_names[num_flag_names] = {
    "Property",
    "Reference",
    "Method",
    "Class",
    "Abstract",
    "Aggregate",
    "Aggregation",
    "Association",
    "Composition",
    "Counter",
    "Delete",
    "DN",
    "EmbeddedObject",
    "Exception",
    "Expensive",
    "Experimental",
    "Gauge",
    "IfDeleted",
    "In",
    "Indication",
    "Invisible",
    "Key",
    "Large",
    "OctetString",
    "Out",
    "Read",
    "Required",
    "Static",
    "Terminal",
    "Weak",
    "Write",
    "EmbeddedInstance",
};

sint32 flag_name_to_index(const char* name)
{
    for (uint32 i = 0; i < num_flag_names; i++) {
        if (name_eq(flag_names[i], name))
            return static_cast<sint32>(i);
    }
    return -1;
}

} // namespace KPRV
