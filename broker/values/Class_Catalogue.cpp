#include "broker/values/Class_Catalogue.h"

#include <algorithm>

namespace KPRV::broker {

namespace {

template <class Info>
const Info* find_info(const std::vector<Info>& list, std::string_view name)
{
    auto at =
        std::find_if(list.begin(), list.end(), [&](const Info& info) { return same_name(info.name, name); });
    return at == list.end() ? nullptr : &*at;
}

} // namespace

const Feature_Info* Method_Info::parameter(std::string_view wanted) const
{
    return find_info(parameters, wanted);
}

const Feature_Info* Class_Info::property(std::string_view wanted) const
{
    return find_info(properties, wanted);
}

const Method_Info* Class_Info::method(std::string_view wanted) const
{
    return find_info(methods, wanted);
}

bool Class_Catalogue::is_a(std::string_view class_name, std::string_view ancestor) const
{
    if (same_name(class_name, ancestor))
        return true;
    const Class_Info* info = find(class_name);
    return info && !info->superclass.empty() && is_a(info->superclass, ancestor);
}

} // namespace KPRV::broker
