#pragma once

#include "module/adapter/Json_Access.h"
#include "module/adapter/ProviderUtil.h"

#include <cstring>
#include <string_view>

namespace KPRV {

// How the fixed-size records are filled: a text is cut to its field and always terminated, and it ends at its
// first zero byte. What reads an answer throws `Not_Convertible` for a member of the wrong type; a missing
// one is the empty text.

/// Copies what there is room for and returns its size; does not terminate it.
size_t copy_cut(char* to, size_t room, std::string_view text);

/// A zero byte within the text goes along, and ends it where the field is read.
template <size_t N>
void copy_text(char (&field)[N], std::string_view text)
{
    field[copy_cut(field, N - 1, text)] = '\0';
}

/// A text where it stands, up to its first zero byte: for what is done to it before it is in a field.
inline std::string_view text_of(const Json::Value& value)
{
    const std::string_view text = asView(value);
    return text.substr(0, text.find('\0'));
}

/// The same of its first `most` bytes, taken out of the answer by whoever reads it. Whether it is a text is
/// seen at once: `Not_Convertible` comes from here.
class Cut_Text
{
public:
    /// The empty text.
    Cut_Text() = default;
    Cut_Text(const Json::Value& value, size_t most) : _value(&value), _most(most) { expectText(value); }

    std::string_view view() const
    {
        if (!_value)
            return "";
        const std::string_view text = asView(*_value).substr(0, _most);
        return text.substr(0, text.find('\0'));
    }

private:
    const Json::Value* _value = nullptr;
    size_t _most = 0;
};

template <size_t N>
void copy_member(char (&field)[N], const Json::Value& object, const char* name)
{
    copy_text(field, asView(member(object, name)));
}

/// Without blanks around it.
template <size_t N>
void copy_trimmed(char (&field)[N], const Json::Value& text)
{
    copy_text(field, ProviderUtil::trimmed(text_of(text)));
}
template <size_t N>
void copy_trimmed(char (&field)[N], const Json::Value& object, const char* name)
{
    copy_trimmed(field, member(object, name));
}

/// Flat form of an address.
template <size_t N>
void copy_flat(char (&field)[N], std::string_view address)
{
    size_t size = 0, at = 0;
    // Addresses are read for every port and target: two digits and a colon at a time.
    const auto is_pair = [&] {
        return address[at] != ':' && address[at + 1] != ':' && address[at + 2] == ':';
    };
    for (; at + 2 < address.size() && size + 2 < N && is_pair(); at += 3, size += 2)
        memcpy(field + size, address.data() + at, 2);
    for (; at < address.size() && size < N - 1; at++) {
        field[size] = address[at];
        size += address[at] != ':';
    }
    field[size] = '\0';
}
template <size_t N>
void copy_flat(char (&field)[N], const Json::Value& object, const char* name)
{
    copy_flat(field, text_of(member(object, name)));
}

} // namespace KPRV
