#pragma once

#include "adapter/Json_Access.h"
#include "adapter/ProviderUtil.h"

#include <string>
#include <string_view>

namespace KPRV {

// How the fixed-size records are filled: a text is cut to its field and always terminated. What reads an
// answer throws `Not_Convertible` for a member of the wrong type; a missing one is the empty text.

template <size_t N>
void copy_text(char (&field)[N], std::string_view text)
{
    field[text.copy(field, N - 1)] = '\0';
}

template <size_t N>
void copy_member(char (&field)[N], const Json::Value& object, const char* name)
{
    copy_text(field, asString(member(object, name)).c_str());
}

/// Without blanks around it.
template <size_t N>
void copy_trimmed(char (&field)[N], const Json::Value& object, const char* name)
{
    const std::string text = asString(member(object, name));
    copy_text(field, ProviderUtil::trimmed(text.c_str()));
}

/// Flat form of an address.
template <size_t N>
void copy_flat(char (&field)[N], const char* address)
{
    copy_text(field, ProviderUtil::eraseColonsFromIndex(address).c_str());
}
template <size_t N>
void copy_flat(char (&field)[N], const Json::Value& object, const char* name)
{
    copy_flat(field, asString(member(object, name)).c_str());
}

} // namespace KPRV
