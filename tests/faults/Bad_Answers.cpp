#include "tests/faults/Bad_Answers.h"

#include <cmath>

namespace KPRV {

namespace {

/// A copy of the value in which each leaf that `replace` takes is another one. True if it took any.
template <class Replace>
bool replace_leaves(Json::Value& value, Replace&& replace)
{
    if (!value.isArray() && !value.isObject())
        return replace(value);
    bool any = false;
    for (Json::Value& each : value)
        any = replace_leaves(each, replace) || any;
    return any;
}

template <class Replace>
Json::Value replaced(Json::Value value, const Json::Value& otherwise, Replace&& replace)
{
    return replace_leaves(value, replace) ? value : otherwise;
}

/// Keeps its beginning: an address stays one for whoever looks no further.
Json::Value with_long_texts(const Json::Value& good)
{
    const std::string tail(LONG_TEXT, 'x');
    return replaced(good, tail, [&](Json::Value& leaf) {
        if (!leaf.isString())
            return false;
        leaf = leaf.asString() + tail;
        return true;
    });
}

Json::Value with_numbers(const Json::Value& good, const Json::Value& number)
{
    return replaced(good, number, [&](Json::Value& leaf) {
        // To this library a truth value is a number, too.
        if (!leaf.isNumeric() || leaf.isBool())
            return false;
        leaf = number;
        return true;
    });
}

/// Arrays for objects, objects for arrays, numbers for texts, texts for numbers; all below the top.
Json::Value of_wrong_shape(const Json::Value& good)
{
    Json::Value wrong;
    switch (good.type()) {
    case Json::objectValue:
        wrong = Json::arrayValue;
        for (const Json::Value& each : good)
            wrong.append(each);
        return wrong;
    case Json::arrayValue:
        wrong = Json::objectValue;
        for (Json::ArrayIndex i = 0; i < good.size(); i++)
            wrong[std::to_string(i)] = good[i];
        return wrong;
    case Json::stringValue:
        return 7;
    default:
        return "text";
    }
}

Json::Value with_wrong_members(const Json::Value& good)
{
    if (!good.isObject() && !good.isArray())
        return of_wrong_shape(good);
    Json::Value wrong = good;
    for (Json::Value& each : wrong)
        each = of_wrong_shape(each);
    return wrong;
}

Json::Value with_wrong_leaves(const Json::Value& good)
{
    return replaced(good, "text", [](Json::Value& leaf) {
        leaf = leaf.isString() ? Json::Value(Json::arrayValue) : of_wrong_shape(leaf);
        return true;
    });
}

Json::Value error_object(const Json::Value& error)
{
    Json::Value answer;
    answer["error"] = error;
    return answer;
}

Json::Value error_record()
{
    Json::Value error;
    error["code"] = THROWN_CODE;
    error["message"] = THROWN_TEXT;
    return error;
}

std::vector<Bad_Answer> with_exceptions(std::vector<Bad_Answer> answers)
{
    answers.push_back({"HbaAgentError", {}, Bad_Answer::AGENT_ERROR});
    answers.push_back({"std::exception", {}, Bad_Answer::STANDARD});
    answers.push_back({"an int", {}, Bad_Answer::OTHER});
    return answers;
}

} // namespace

std::string Bad_Answer::fault(const std::string& entry_point, const std::string& address) const
{
    constexpr const char* types[] = {"", "HbaAgentError", "std::runtime_error", "int"};
    Json::Value fault;
    fault["call"] = entry_point;
    if (!address.empty())
        fault["address"] = address;
    if (thrown == NOTHING) {
        fault["do"] = "answer";
        fault["answer"] = answer;
    } else {
        fault["do"] = "throw";
        fault["type"] = types[thrown];
        fault["code"] = THROWN_CODE;
        fault["message"] = THROWN_TEXT;
    }
    return Json::FastWriter().write(fault);
}

std::vector<Bad_Answer> bad_json_answers(const Json::Value& good)
{
    Json::Value mixed(Json::arrayValue);
    mixed.append(Json::Value(Json::arrayValue));
    mixed.append(Json::Value(Json::objectValue));
    mixed.append(Json::Value());
    mixed.append(1);
    mixed.append("x");
    return with_exceptions({
        {"null", {}},
        {"an error", error_object(error_record())},
        {"an error of null", error_object({})},
        {"an empty object", Json::objectValue},
        {"an array", mixed},
        {"a number", 7},
        {"a long text", std::string(LONG_TEXT, 'x')},
        {"members of the wrong shape", with_wrong_members(good)},
        {"leaves of the wrong shape", with_wrong_leaves(good)},
        {"long texts", with_long_texts(good)},
        {"numbers of 2^63", with_numbers(good, Json::UInt64(1) << 63)},
        {"numbers of 1e300", with_numbers(good, 1e300)},
        {"numbers of -1", with_numbers(good, -1)},
    });
}

std::vector<Bad_Answer> bad_answers_of(Answer_Kind kind)
{
    Json::Value good;
    good["result"] = 0;
    switch (kind) {
    case JSON:
        return bad_json_answers(good);
    case TEXT:
        return with_exceptions({{"null", {}},
                                {"an empty text", ""},
                                {"a short text", "3.2"},
                                {"a long text", std::string(LONG_TEXT, '9')}});
    case COUNT:
        return with_exceptions({{"65535", 65535u}, {"none", 0u}, {"2^32 - 1", 4294967295u}});
    case INTEGER:
        return with_exceptions({{"-1", -1}, {"the least", -2147483647 - 1}, {"the greatest", 2147483647}});
    default:
        return with_exceptions({});
    }
}

} // namespace KPRV
