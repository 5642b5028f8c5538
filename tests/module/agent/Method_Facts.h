#pragma once

#include "tests/support/Fake_Library.h"

#include <sstream>

namespace KPRV {

/// How the answer becomes the result.
enum Form
{
    PLAIN,
    WRAPPED,
    PASSED,
    OWN,
};

struct Fact
{
    const char* wire;
    const char* handler;
    const char* symbol;
    Form form;
    const char* constants;
    const char* parameters;
};

inline constexpr Fact facts[] = {
#define ROW(wire, handler, symbol, form, constants, parameters)                                              \
    {wire, handler, symbol, form, constants, parameters},
#include "tests/module/agent/methods.inc"
#undef ROW
};

struct Parameter
{
    std::string key;
    char type;
};

inline std::vector<Parameter> parameters_of(const Fact& fact)
{
    std::vector<Parameter> result;
    std::istringstream words(fact.parameters);
    for (std::string word; words >> word;)
        result.push_back({word.substr(0, word.find(':')), word.back()});
    return result;
}

inline Json::Value constants_of(const Fact& fact)
{
    return *fact.constants ? json(fact.constants) : Json::Value();
}

/// A value of the type that no other position has.
inline Json::Value sample(char type, unsigned position)
{
    const std::string text = "text " + std::to_string(position);
    Json::Value value;
    switch (type) {
    case 'S':
    case 'M':
        return text;
    case 'I':
        return 40 + int(position);
    case 'B':
        return true;
    case 'A':
        value.append(text);
        return value;
    case 'O':
        value["member"] = text;
        return value;
    case '-':
        return 1.5;
    default:
        return value;
    }
}

inline Json::Value samples(const Fact& fact)
{
    Json::Value params(Json::arrayValue);
    unsigned position = 0;
    for (const Parameter& parameter : parameters_of(fact))
        params.append(sample(parameter.type, position++));
    return params;
}

/// The request that reaches the library.
inline Json::Value expected_query(const Fact& fact, const Json::Value& params)
{
    if (fact.form == PASSED)
        return params;
    Json::Value query = constants_of(fact);
    unsigned position = 0;
    for (const Parameter& parameter : parameters_of(fact)) {
        if (parameter.type != '-')
            query[parameter.key] = params[position];
        position++;
    }
    return query;
}

} // namespace KPRV
