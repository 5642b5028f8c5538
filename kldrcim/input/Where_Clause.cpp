#include "kldrcim/input/Where_Clause.h"

namespace KPRV::kldrcim {

bool split_where_clause(const std::string& text, Where_Clause& condition)
{
    const std::size_t at = text.find_first_of("!=~");
    if (at == 0 || at == std::string::npos)
        return false;
    const bool differs = text[at] == '!';
    if (differs && text.compare(at, 2, "!=") != 0)
        return false;
    condition.name = text.substr(0, at);
    condition.kind = differs           ? Where_Clause::DIFFERS
                     : text[at] == '~' ? Where_Clause::MATCHES
                                       : Where_Clause::EQUALS;
    condition.value = text.substr(at + (differs ? 2 : 1));
    return true;
}

} // namespace KPRV::kldrcim
