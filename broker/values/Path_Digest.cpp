#include "broker/values/Path_Digest.h"

#include "broker/values/Type_Words.h"
#include "broker/values/Value_Text.h"

#include <bit>
#include <random>

namespace KPRV::broker {

namespace {

struct Secret
{
    std::uint64_t first;
    std::uint64_t second;
};

const Secret& secret()
{
    static const Secret drawn = [] {
        std::random_device source;
        const auto number = [&] { return static_cast<std::uint64_t>(source()) << 32 | source(); };
        return Secret{number(), number()};
    }();
    return drawn;
}

/// SipHash-2-4 with a result of 128 bits, over bytes as they come.
class Hash
{
public:
    void add(char byte)
    {
        _word |= static_cast<std::uint64_t>(static_cast<unsigned char>(byte)) << 8 * (_size++ % 8);
        if (_size % 8 == 0)
            add_word();
    }
    void add(std::string_view bytes)
    {
        for (const char byte : bytes)
            add(byte);
    }
    void add(std::uint64_t number)
    {
        for (unsigned shift = 0; shift < 64; shift += 8)
            add(static_cast<char>(number >> shift));
    }

    Path_Digest result()
    {
        _word |= static_cast<std::uint64_t>(_size) << 56;
        add_word();
        _v2 ^= 0xEE;
        rounds(4);
        const std::uint64_t high = _v0 ^ _v1 ^ _v2 ^ _v3;
        _v1 ^= 0xDD;
        rounds(4);
        return {high, _v0 ^ _v1 ^ _v2 ^ _v3};
    }

private:
    void add_word()
    {
        _v3 ^= _word;
        rounds(2);
        _v0 ^= _word;
        _word = 0;
    }
    void rounds(int count)
    {
        while (count-- > 0) {
            _v0 += _v1;
            _v2 += _v3;
            _v1 = std::rotl(_v1, 13) ^ _v0;
            _v3 = std::rotl(_v3, 16) ^ _v2;
            _v0 = std::rotl(_v0, 32);
            _v2 += _v1;
            _v0 += _v3;
            _v1 = std::rotl(_v1, 17) ^ _v2;
            _v3 = std::rotl(_v3, 21) ^ _v0;
            _v2 = std::rotl(_v2, 32);
        }
    }

    std::uint64_t _v0 = secret().first ^ 0x736F6D6570736575;
    std::uint64_t _v1 = secret().second ^ 0x646F72616E646F6D ^ 0xEE;
    std::uint64_t _v2 = secret().first ^ 0x6C7967656E657261;
    std::uint64_t _v3 = secret().second ^ 0x7465646279746573;
    std::uint64_t _word = 0;
    std::size_t _size = 0;
};

void add_name(Hash& hash, std::string_view name)
{
    for (const char c : name)
        hash.add(c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c);
}

/// Each kind of value begins with a letter of its own; what follows a name is parted from it by a zero.
Path_Digest key_digest(const Named_Value& key)
{
    Hash hash;
    add_name(hash, key.name);
    hash.add('\0');
    const Plain_Value& value = key.value;
    if (const Path_Value* const path = value.as_path()) {
        const Path_Digest held = path_digest(*path);
        hash.add('p');
        hash.add(held.high);
        hash.add(held.low);
    } else if (is_integer(value.type)) {
        hash.add('i');
        hash.add(value.as_uint());
    } else {
        hash.add(static_cast<char>('0' + value.data.index()));
        if (std::holds_alternative<std::string>(value.data))
            hash.add(value.as_text());
        else
            hash.add(plain_text(value));
    }
    return hash.result();
}

} // namespace

Path_Digest path_digest(const Path_Value& path)
{
    Hash hash;
    add_name(hash, path.class_name);
    Path_Digest digest = hash.result();
    // In whatever order the keys come.
    for (const Named_Value& key : path.keys) {
        const Path_Digest added = key_digest(key);
        digest.high += added.high;
        digest.low += added.low;
    }
    return digest;
}

} // namespace KPRV::broker
