#include "kldrcim/formats/Visible_Text.h"

#include "broker/values/Control_Text.h"

namespace KPRV::kldrcim {

using broker::control_size;

namespace {

std::string visible(const std::string& text, bool keep_lines)
{
    std::string result;
    for (std::size_t i = 0; i < text.size(); ++i) {
        const char c = text[i];
        const std::size_t control = control_size(std::string_view(text).substr(i));
        i += control == 2 ? 1 : 0;
        if (control == 0 || (keep_lines && (c == '\n' || c == '\t')))
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
