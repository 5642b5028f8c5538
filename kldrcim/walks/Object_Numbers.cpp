#include "kldrcim/walks/Object_Numbers.h"

#include <algorithm>

namespace KPRV::kldrcim {

Object_Numbers::Number Object_Numbers::of(const Path_Value& path)
{
    const auto [at, is_new] = _numbers.try_emplace(path_digest(path), static_cast<Number>(size()));
    if (is_new) {
        const auto known = std::ranges::find(_classes, path.class_name);
        _class_of.push_back(static_cast<std::uint16_t>(known - _classes.begin()));
        if (known == _classes.end())
            _classes.push_back(path.class_name);
    }
    return at->second;
}

Object_Numbers::Number Object_Numbers::find(const Path_Value& path) const
{
    const auto at = _numbers.find(path_digest(path));
    return at == _numbers.end() ? none : at->second;
}

} // namespace KPRV::kldrcim
