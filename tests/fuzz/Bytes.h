#pragma once

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string>

namespace KPRV {

/// Reads structured data out of a fuzzer's bytes; beyond their end all is zero and empty.
class Bytes
{
public:
    Bytes(const std::uint8_t* data, std::size_t size) : _at(data), _end(data + size) {}

    bool empty() const { return _at == _end; }
    std::uint8_t byte() { return empty() ? 0 : *_at++; }
    /// 0 to n - 1.
    unsigned below(unsigned n) { return byte() % n; }

    template <class Number>
    Number number()
    {
        unsigned char raw[sizeof(Number)] = {};
        for (unsigned char& part : raw)
            part = byte();
        Number value;
        std::memcpy(&value, raw, sizeof value);
        return value;
    }

    /// A text whose length stands before it.
    std::string text()
    {
        std::string value;
        for (unsigned length = byte(); length > 0 && !empty(); --length)
            value += static_cast<char>(byte());
        return value;
    }

    std::string rest() { return {reinterpret_cast<const char*>(_at), static_cast<std::size_t>(_end - _at)}; }

private:
    const std::uint8_t* _at;
    const std::uint8_t* const _end;
};

} // namespace KPRV
