#include "kldrcim/formats/Branch_Text.h"

#include <clocale>
#include <cstring>
#include <langinfo.h>
#include <locale.h>

namespace KPRV::kldrcim {

namespace {

constexpr Twigs boxes = {"├─ ", "└─ ", "│  ", "   "};
constexpr Twigs plain = {"|- ", "`- ", "|  ", "   "};

void add(std::string& text, const Twigs& twigs, const Text_Branch& branch, const std::string& before,
         const std::string& before_children)
{
    text += before + branch.line + "\n";
    for (const Text_Branch& child : branch.children) {
        bool last = &child == &branch.children.back();
        add(text, twigs, child, before_children + (last ? twigs.last_child : twigs.child),
            before_children + (last ? twigs.nothing : twigs.passing));
    }
}

} // namespace

const Twigs& twigs(bool ascii)
{
    return ascii ? plain : boxes;
}

std::string branch_text(const std::vector<Text_Branch>& roots, bool ascii)
{
    std::string text;
    for (const Text_Branch& root : roots)
        add(text, twigs(ascii), root, "", "");
    return text;
}

bool locale_is_utf8()
{
    locale_t locale = newlocale(LC_CTYPE_MASK, "", nullptr);
    if (!locale)
        return false;
    bool utf8 = std::strcmp(nl_langinfo_l(CODESET, locale), "UTF-8") == 0;
    freelocale(locale);
    return utf8;
}

} // namespace KPRV::kldrcim
