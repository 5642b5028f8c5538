// Of `ProviderUtil`, the forms of WWNs and MACs: with colons and without, as bytes, in a tag.
#include "module/adapter/No_Address.h"
#include "module/adapter/ProviderUtil.h"
#include "module/adapter/ProviderUtil_Log.h"

#include <cstdio>
#include <cstring>

namespace KPRV {

String ProviderUtil::eraseColonsFromIndex(const String& text)
{
    String flat;
    flat.reserve(text.size());
    for (uint32 i = 0; i < text.size(); i++) {
        if (text[i] != ':')
            flat.append(text[i]);
    }
    return flat;
}

String ProviderUtil::getIndexInColonFormat(const String& address)
{
    if (address.find(':') != NPOS) {
        UTIL_LOG(INFO, "The string %s is already in : format", address.c_str());
        return address;
    }
    const uint32 size = address.size();
    if (size < 2)
        throw No_Address(address.c_str());
    if (size < 4)
        return address;

    String index;
    index.reserve(size + size / 2);
    for (uint32 i = 0; i < size; i++) {
        if (i > 0 && i % 2 == 0)
            index.append(':');
        index.append(address[i]);
    }
    return index;
}

namespace {

template <size_t N>
void store_low_bytes(const unsigned (&groups)[N], unsigned char* raw)
{
    for (size_t i = 0; i < N; i++)
        raw[i] = static_cast<unsigned char>(groups[i]);
}

} // namespace

void ProviderUtil::getRawMacFromStr(const char* text, unsigned char* mac)
{
    unsigned g[6] = {};
    sscanf(text, "%02X%02X%02X%02X%02X%02X", &g[0], &g[1], &g[2], &g[3], &g[4], &g[5]);
    store_low_bytes(g, mac);
}

void ProviderUtil::getRawWWNFromStr(const char* text, unsigned char* wwn)
{
    unsigned g[8] = {};
    sscanf(text, "%02X%02X%02X%02X%02X%02X%02X%02X", &g[0], &g[1], &g[2], &g[3], &g[4], &g[5], &g[6], &g[7]);
    store_low_bytes(g, wwn);
}

String ProviderUtil::getNodeMACOrWWNFromTag(const String& tag, const String&)
{
    constexpr uint32 GROUP = 19, GROUP_SIZE = 4, REST = GROUP + GROUP_SIZE + 1;
    if (tag.size() < REST)
        return String();
    String address;
    // No address begins with these digits: a MAC has its place in the last group alone.
    if (!tag.equal(GROUP, "0000", GROUP_SIZE))
        address = tag.substr(GROUP, GROUP_SIZE);
    address.append(tag.substr(REST));
    return address;
}

std::string_view ProviderUtil::trimmed(std::string_view text)
{
    const size_t first = text.find_first_not_of(' ');
    if (first == std::string_view::npos)
        return text.substr(0, 0);
    return text.substr(first, text.find_last_not_of(' ') - first + 1);
}

void ProviderUtil::trimString(const char* in, char* out)
{
    const std::string_view text = trimmed(in);
    memmove(out, text.data(), text.size());
    out[text.size()] = '\0';
}

bool ProviderUtil::valid_UTF_string(const char* text)
{
    const unsigned char first = static_cast<unsigned char>(*text);
    return first < 0x80 || (first >= 0xC2 && first <= 0xF4);
}

} // namespace KPRV
