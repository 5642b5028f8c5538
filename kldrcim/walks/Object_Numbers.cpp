#include "kldrcim/walks/Object_Numbers.h"

#include "broker/values/Path_Identity.h"

#include <algorithm>

namespace KPRV::kldrcim {

Object_Numbers::Number Object_Numbers::of(const Path_Value& path)
{
    const auto [at, is_new] = numbers_.try_emplace(path_identity(path), static_cast<Number>(size()));
    if (is_new) {
        const auto known = std::ranges::find(classes_, path.class_name);
        class_of_.push_back(static_cast<std::uint16_t>(known - classes_.begin()));
        if (known == classes_.end())
            classes_.push_back(path.class_name);
    }
    return at->second;
}

Object_Numbers::Number Object_Numbers::find(const Path_Value& path) const
{
    const auto at = numbers_.find(path_identity(path));
    return at == numbers_.end() ? none : at->second;
}

} // namespace KPRV::kldrcim
