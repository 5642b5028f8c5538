#pragma once

#include <string>

namespace KPRV::kldrcim {

/// What --where asks of a result.
struct Where_Clause
{
    enum Kind
    {
        EQUALS,
        DIFFERS,
        /// * and ? as in file names, in any letter case.
        MATCHES,
    };

    std::string name;
    Kind kind = EQUALS;
    std::string value;
};

/// "NAME=VALUE", "NAME!=VALUE" or "NAME~PATTERN" apart; false for a text that is none of them.
bool split_where_clause(const std::string& text, Where_Clause& condition);

} // namespace KPRV::kldrcim
