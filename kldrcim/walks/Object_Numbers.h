#pragma once

#include "broker/values/Path_Digest.h"

#include <unordered_map>

namespace KPRV::kldrcim {

using namespace broker;

/// Numbers for objects, from 0 on: whoever holds many of them in many places holds each identity once, as a
/// digest.
class Object_Numbers
{
public:
    using Number = std::uint32_t;
    static constexpr Number none = ~Number(0);

    /// That of the object; a new one if it has none yet.
    Number of(const Path_Value& path);
    /// `none` if it has none.
    Number find(const Path_Value& path) const;
    std::size_t size() const { return _class_of.size(); }
    /// As the first path named it.
    const std::string& class_name(Number number) const { return _classes[_class_of[number]]; }

private:
    std::unordered_map<Path_Digest, Number> _numbers;
    std::vector<std::uint16_t> _class_of;
    std::vector<std::string> _classes;
};

} // namespace KPRV::kldrcim
