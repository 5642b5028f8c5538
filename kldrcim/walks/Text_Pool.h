#pragma once

#include <algorithm>
#include <cstring>
#include <memory>
#include <string_view>
#include <vector>

namespace KPRV::kldrcim {

/// Keeps many short texts, one behind the other, until it goes.
class Text_Pool
{
public:
    /// The copy lives as long as the pool, also where that moves to.
    std::string_view keep(std::string_view text)
    {
        if (text.empty())
            return {};
        if (text.size() > _room) {
            _room = std::max(text.size(), PIECE_SIZE);
            _pieces.push_back(std::make_unique_for_overwrite<char[]>(_room));
            _next = _pieces.back().get();
        }
        char* const copy = _next;
        std::memcpy(copy, text.data(), text.size());
        _next += text.size();
        _room -= text.size();
        return {copy, text.size()};
    }

private:
    static constexpr std::size_t PIECE_SIZE = std::size_t(1) << 16;

    std::vector<std::unique_ptr<char[]>> _pieces;
    char* _next = nullptr;
    std::size_t _room = 0;
};

} // namespace KPRV::kldrcim
