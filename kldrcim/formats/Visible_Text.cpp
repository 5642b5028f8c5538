#include "kldrcim/formats/Visible_Text.h"

namespace KPRV::kldrcim {

namespace {

std::string visible(const std::string& text, bool keep_lines)
{
    std::string result;
    for (char c : text) {
        bool control = static_cast<unsigned char>(c) < 0x20 || c == 0x7F;
        if (!control || (keep_lines && (c == '\n' || c == '\t')))
            result += c;
        else if (c == '\n')
            result += "\\n";
        else if (c == '\t')
            result += "\\t";
        else
            result += '?';
    }
    return result;
}

} // namespace

std::string visible_text(const std::string& text)
{
    return visible(text, false);
}

std::string visible_lines(const std::string& text)
{
    return visible(text, true);
}

} // namespace KPRV::kldrcim
