#include "tests/bench/Lean_Text.h"

#include <algorithm>
#include <vector>

namespace KPRV::bench {

static std::string text_of(CMPIType type, const CMPIValue& value)
{
    std::string text = std::to_string(type) + ":";
    if (type & CMPI_ARRAY) {
        const auto* array = object_of<Lean_Array>(value.array);
        for (CMPICount i = 0; i < array->count; i++)
            text += "[" + text_of(CMPIType(type & ~CMPI_ARRAY), array->elements[i]) + "]";
        return text;
    }
    switch (type) {
    case CMPI_string:
        return text + object_of<Lean_String>(value.string)->text;
    case CMPI_ref:
        return text + text_of(*object_of<Lean_Path>(value.ref));
    case CMPI_boolean:
        return text + std::to_string(value.boolean);
    case CMPI_uint8:
        return text + std::to_string(value.uint8);
    case CMPI_uint16:
        return text + std::to_string(value.uint16);
    case CMPI_uint32:
        return text + std::to_string(value.uint32);
    case CMPI_uint64:
        return text + std::to_string(value.uint64);
    default:
        return text + "?";
    }
}

static std::string text_of(const Bag& bag)
{
    std::vector<std::string> lines;
    for (const Named_Data* entry = bag.first; entry; entry = entry->next)
        lines.push_back(entry->name + ("=" + text_of(entry->data.type, entry->data.value)));
    std::ranges::sort(lines);
    std::string text;
    for (const std::string& line : lines)
        text += (text.empty() ? "" : ",") + line;
    return "{" + text + "}";
}

std::string text_of(const Lean_Path& path)
{
    return object_of<Lean_String>(path.class_name)->text + text_of(path.keys);
}

std::string text_of(const Lean_Instance& instance)
{
    return text_of(*instance.path) + " " + text_of(instance.properties);
}

} // namespace KPRV::bench
