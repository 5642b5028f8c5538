#pragma once

#include "module/runtime/ground/String.h"
#include "module/runtime/ground/strutil.h"

#include <cstring>
#include <string_view>
#include <unordered_map>
#include <vector>

namespace KPRV {

inline std::string_view view_of(const String& text)
{
    return {text.c_str(), text.size()};
}

/// Positions of a list by a text of its elements, whatever its case: a join looks its partners up instead of
/// walking the list for each element of the other one. The texts stay where they are, and outlive the index.
///
/// How it works. Nested loops would compare each element of one list with each of the other. Here the inner
/// list is walked once: each text is folded to a number and its position noted under it. The outer list is
/// then walked in its order, and for each element the positions come in the inner list's order, which gives
/// the very pairs of the loops in the very order. Texts are equal whatever their case; the hash sets the bit
/// that tells cases apart in every byte, so that equal texts always meet, and `Equal` parts those that meet
/// by chance. Elements of one text mostly follow each other: the last place is remembered.
class Position_Index
{
public:
    Position_Index() = default;
    Position_Index(const Position_Index&) = delete;
    Position_Index& operator=(const Position_Index&) = delete;

    void add(std::string_view key, uint32 position)
    {
        // Lists are grouped: the units of a target stand together.
        const bool is_same_view = _last_key.data() == key.data() && _last_key.size() == key.size();
        if (!_last || (!is_same_view && _last_key != key)) {
            _last = &_positions[key];
            _last_key = key;
        }
        _last->push_back(position);
    }

    /// In the order of the list; null if there is none.
    const std::vector<uint32>* find(std::string_view key) const
    {
        const auto found = _positions.find(key);
        return found == _positions.end() ? nullptr : &found->second;
    }

private:
    struct Hash
    {
        /// Eight letters at a time. Setting the bit of lower case folds more than letters, which only puts
        /// more texts into one place.
        size_t operator()(std::string_view text) const
        {
            uint64 hash = text.size();
            for (; text.size() > sizeof hash; text.remove_prefix(sizeof hash))
                mix(hash, text.data(), sizeof hash);
            mix(hash, text.data(), text.size());
            // Either way (constant): texts are told apart by `Equal`, a worse mixture is only slower.
            return static_cast<size_t>(hash ^ hash >> 32);
        }

        static void mix(uint64& hash, const char* text, size_t size)
        {
            uint64 letters = 0;
            // Either way (constant): texts of one letter would share a place.
            if (size > 0)
                memcpy(&letters, text, size);
            hash = (hash ^ (letters | 0x2020202020202020)) * 0x9E3779B97F4A7C15;
            // Either way (constant): as above.
            hash ^= hash >> 29;
        }
    };

    struct Equal
    {
        bool operator()(std::string_view a, std::string_view b) const
        {
            return a == b || (a.size() == b.size() && folded_eq(a.data(), b.data(), a.size()));
        }
    };

    std::unordered_map<std::string_view, std::vector<uint32>, Hash, Equal> _positions;
    std::string_view _last_key;
    std::vector<uint32>* _last = nullptr;
};

} // namespace KPRV
