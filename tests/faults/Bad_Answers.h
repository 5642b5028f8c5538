#pragma once

#include <json/json.h>

#include <string>
#include <vector>

namespace KPRV {

/// One way in which an entry point can answer badly.
struct Bad_Answer
{
    enum Thrown
    {
        NOTHING,
        AGENT_ERROR,
        STANDARD,
        OTHER,
    };

    std::string name;
    /// What it answers, if it throws nothing.
    Json::Value answer = {};
    Thrown thrown = NOTHING;

    /// True for what nobody takes for an answer: null, an "error", an exception.
    bool is_failure() const
    {
        return thrown || answer.isNull() || (answer.isObject() && answer.isMember("error"));
    }

    /// The fault that makes the simulator answer so, to each request or only to those that hold the address.
    std::string fault(const std::string& entry_point, const std::string& address = "") const;
};

/// What an exception says, and the code of the two kinds that have one.
inline constexpr const char* THROWN_TEXT = "library fault";
inline constexpr int THROWN_CODE = 17;

/// Longer than any buffer that a text could meet on its way.
inline constexpr std::size_t LONG_TEXT = 70 * 1024;

/// The kinds, for an entry point that answers `good` otherwise. Members of the wrong shape, over-long texts
/// and numbers out of range stand in the places where the good answer has members, texts and numbers; where
/// it has none, such a value is the whole answer.
std::vector<Bad_Answer> bad_json_answers(const Json::Value& good);

/// What a function of the library has for a result.
enum Answer_Kind
{
    JSON,
    TEXT,
    COUNT,
    INTEGER,
    NONE,
};

/// The kinds that such a function can give, a JSON one with a status as its good answer.
std::vector<Bad_Answer> bad_answers_of(Answer_Kind kind);

} // namespace KPRV
