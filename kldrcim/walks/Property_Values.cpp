#include "kldrcim/walks/Property_Values.h"

namespace KPRV::kldrcim {

std::optional<std::uint64_t> number_of(const Instance_Value& instance, const char* property)
{
    const Plain_Value* value = instance.property(property);
    if (value && value->is_array())
        value = value->elements().empty() ? nullptr : &value->elements().front();
    if (!value || value->null)
        return std::nullopt;
    return value->as_uint();
}

std::string text_of(const Instance_Value& instance, const char* property)
{
    const Plain_Value* const value = instance.property(property);
    return value && !value->null ? value->as_text() : "";
}

} // namespace KPRV::kldrcim
