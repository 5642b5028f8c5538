#include "kldrcim/input/Nearest_Word.h"

#include <algorithm>
#include <numeric>

namespace KPRV::kldrcim {

namespace {

/// How many letters must be added, dropped, replaced, or swapped with their neighbour.
std::size_t distance(const std::string& a, const std::string& b)
{
    std::vector<std::size_t> before_last, last, row(b.size() + 1);
    std::iota(row.begin(), row.end(), 0);
    for (std::size_t i = 1; i <= a.size(); ++i) {
        before_last = std::move(last);
        last = row;
        row[0] = i;
        for (std::size_t j = 1; j <= b.size(); ++j) {
            row[j] = std::min({last[j] + 1, row[j - 1] + 1, last[j - 1] + (a[i - 1] != b[j - 1])});
            if (i > 1 && j > 1 && a[i - 1] == b[j - 2] && a[i - 2] == b[j - 1])
                row[j] = std::min(row[j], before_last[j - 2] + 1);
        }
    }
    return row[b.size()];
}

} // namespace

std::string nearest_word(const std::string& written, const std::vector<std::string>& words)
{
    // In a short word one mistake is much.
    std::size_t least = (written.size() <= 3 ? 1 : written.size() <= 7 ? 2 : 3) + 1;
    std::string nearest;
    for (const std::string& word : words) {
        // Somebody may have written the beginning only.
        const bool begins = written.size() > 2 && word.starts_with(written);
        const std::size_t far = begins ? 0 : distance(written, word);
        if (far < least && far < word.size()) {
            least = far;
            nearest = word;
        }
    }
    return nearest;
}

std::string suggestion(const std::string& written, const std::vector<std::string>& words)
{
    const std::string word = nearest_word(written, words);
    return word.empty() ? "" : " (did you mean \"" + word + "\"?)";
}

} // namespace KPRV::kldrcim
