#include "broker/Object_Kind.h"

namespace KPRV::broker {

namespace {

struct Names
{
    const char* name;
    const char* type;
};

constexpr Names names[] = {
    {"string", "CMPIString"},           {"array", "CMPIArray"},
    {"enumeration", "CMPIEnumeration"}, {"instance", "CMPIInstance"},
    {"object path", "CMPIObjectPath"},  {"args", "CMPIArgs"},
    {"datetime", "CMPIDateTime"},       {"context", "CMPIContext"},
    {"result", "CMPIResult"},           {"select expression", "CMPISelectExp"},
};

} // namespace

const char* kind_name(Object_Kind kind)
{
    return names[static_cast<int>(kind)].name;
}
const char* kind_type(Object_Kind kind)
{
    return names[static_cast<int>(kind)].type;
}

} // namespace KPRV::broker
