// Of `Value`, its dump for debugging.
#include "module/runtime/objects/Value.h"

#include "module/runtime/objects/print_instance.h"
#include "module/runtime/objects/print_scalar.h"

namespace KPRV {

void Value::print() const
{
    fprint(stdout);
}

void Value::fprint(FILE* file) const
{
    fprintf(file, "Value\n{\n    type=%s\n    null=%s\n", _type_name(type), null ? "true" : "false");
    if (null) {
        // The record of a null stays open.
        fputs("    value= NONE\n", file);
        return;
    }
    fputs("    value=", file);
    if (type == INSTANCE_ARRAY) {
        fputs("\n    {\n", file);
        for (const Instance* target : _as<Array<Instance*>>())
            fprint_nested(file, target, 2);
        fputs("    }\n", file);
    } else if (type == INSTANCE) {
        if (const Instance* instance = _as<Instance*>())
            KPRV::fprint(file, instance);
    } else if (type == NONE) {
        // A new value is not null, and yet holds nothing to show.
    } else if (type & ARRAY_BIT) {
        fprint_array_value(file, static_cast<KPRV::Type>(type & ~ARRAY_BIT), _as<__Array_Rep*>());
    } else {
        fprint_scalar_value(file, static_cast<KPRV::Type>(type), _bytes);
    }
    fputs("}\n", file);
}

} // namespace KPRV
