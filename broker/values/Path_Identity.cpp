#include "broker/values/Path_Identity.h"

#include "broker/values/Type_Words.h"
#include "broker/values/Value_Text.h"

#include <algorithm>

namespace KPRV::broker {

namespace {

/// Each kind of value has a letter of its own, so that the text "1" and the number 1 stay apart.
std::string value_identity(const Plain_Value& value)
{
    if (const Path_Value* path = value.as_path())
        return "p" + quoted(path_identity(*path));
    if (is_integer(value.type))
        return "i" + std::to_string(value.as_sint());
    return std::to_string(value.data.index()) + quoted(plain_text(value));
}

} // namespace

std::string path_identity(const Path_Value& path)
{
    std::vector<std::string> keys;
    for (const Named_Value& key : path.keys)
        keys.push_back(lower_name(key.name) + "=" + value_identity(key.value));
    std::sort(keys.begin(), keys.end());
    std::string text = lower_name(path.class_name);
    for (const std::string& key : keys)
        text += "," + key;
    return text;
}

} // namespace KPRV::broker
