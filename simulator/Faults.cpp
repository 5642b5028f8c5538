#include "simulator/Faults.h"

#include "contracts/adapter/HbaAgentError.h"
#include "simulator/Address.h"
#include "simulator/Answers.h"
#include "simulator/Entry_Points.h"
#include "simulator/Members.h"

#include <algorithm>
#include <iterator>
#include <sstream>
#include <stdexcept>

namespace KPRV::simulator {

namespace {

// clang-format off
constexpr Member fault_members[] = {
    {"call",         Type::TEXT,    Presence::REQUIRED},
    {"do",           Type::TEXT,    Presence::REQUIRED},
    {"address",      Type::TEXT,    Presence::OPTIONAL, "\"\""},
    {"at",           Type::COUNT,   Presence::OPTIONAL},
    {"times",        Type::COUNT,   Presence::OPTIONAL},
    {"type",         Type::TEXT,    Presence::OPTIONAL, "\"HbaAgentError\""},
    {"code",         Type::INTEGER, Presence::OPTIONAL, "99"},
    {"message",      Type::TEXT,    Presence::OPTIONAL, "\"injected\""},
    {"error",        Type::ANY,     Presence::OPTIONAL},
    {"answer",       Type::ANY,     Presence::OPTIONAL},
    {"member",       Type::TEXT,    Presence::OPTIONAL},
    {"value",        Type::ANY,     Presence::OPTIONAL},
    {"milliseconds", Type::COUNT,   Presence::OPTIONAL},
};

struct Kind_Row
{
    const char* name;
    Fault_Kind kind;
    const char* needs; // members without which the fault says nothing
};

constexpr Kind_Row kind_rows[] = {
    {"null",   Fault_Kind::NULL_ANSWER, ""},
    {"error",  Fault_Kind::ERROR,       ""},
    {"throw",  Fault_Kind::THROW,       ""},
    {"answer", Fault_Kind::ANSWER,      "answer"},
    {"remove", Fault_Kind::REMOVE,      "member"},
    {"set",    Fault_Kind::SET,         "member value"},
    {"delay",  Fault_Kind::DELAY,       "milliseconds"},
    {"hold",   Fault_Kind::HOLD,        ""},
};

constexpr const char* thrown_types[] = {"HbaAgentError", "std::runtime_error", "int"};
// clang-format on

const Kind_Row& kind_row(const Json_Text& source, const Json::Value& written)
{
    const std::string name = written["do"].asString();
    for (const Kind_Row& row : kind_rows) {
        if (name != row.name)
            continue;
        std::istringstream needs(row.needs);
        for (std::string need; needs >> need;)
            if (!written.isMember(need))
                source.refuse(written,
                              "missing member \"" + need + "\" in a fault that does \"" + name + "\"");
        return row;
    }
    source.refuse(written["do"], "unknown fault \"" + name + "\"");
}

void check_thrown_type(const Json_Text& source, const Json::Value& type)
{
    const auto same = [&](const char* each) { return type == each; };
    if (!type.isNull() && std::none_of(std::begin(thrown_types), std::end(thrown_types), same))
        source.refuse(type, "unknown exception " + compact_text(type));
}

bool holds_text(const Json::Value& request, const std::string& text)
{
    return request.isObject() && std::any_of(request.begin(), request.end(), [&](const Json::Value& value) {
               return value.isString() && lower_case(value.asString()) == text;
           });
}

// The number that a step of a path is, or no valid one.
Json::ArrayIndex step_index(const std::string& step)
{
    const bool number = !step.empty() && step.size() < 9 && step.find_first_not_of("0123456789") == step.npos;
    return number ? static_cast<Json::ArrayIndex>(std::stoul(step)) : ~0U;
}

// The value below `from` that the step names, a member or an element by its number, or null.
Json::Value* step_into(Json::Value* from, const std::string& step)
{
    if (from->type() == Json::objectValue)
        return from->isMember(step) ? &(*from)[step] : nullptr;
    const Json::ArrayIndex index = step_index(step);
    const bool element = from->type() == Json::arrayValue && from->isValidIndex(index);
    return element ? &(*from)[index] : nullptr;
}

} // namespace

Fault read_fault(const Json_Text& source, const Json::Value& written)
{
    check_members(source, written, fault_members, "a fault");
    Fault fault;
    fault.call = written["call"].asString();
    if (fault.call != "*" && !find_entry(fault.call))
        source.refuse(written["call"], "unknown entry point \"" + fault.call + "\"");
    fault.kind = kind_row(source, written).kind;
    check_thrown_type(source, written["type"]);
    fault.address = lower_case(written["address"].asString());
    fault.first = std::max(1U, written["at"].asUInt());
    fault.times = written.get("times", written.isMember("at") ? 1U : 0U).asUInt();
    fault.words = written;
    fill_defaults(fault.words, fault_members);
    return fault;
}

std::vector<Fault> read_faults(const Json_Text& source, const Json::Value& written)
{
    std::vector<Fault> faults;
    for (const Json::Value& each : written)
        faults.push_back(read_fault(source, each));
    return faults;
}

bool strikes(Fault& fault, const std::string& call, const Json::Value& request)
{
    if (fault.call != "*" && fault.call != call)
        return false;
    if (!fault.address.empty() && !holds_text(request, fault.address))
        return false;
    const unsigned number = ++fault.seen;
    return number >= fault.first && (fault.times == 0 || number - fault.first < fault.times);
}

bool replaces_answer(Fault_Kind kind)
{
    return kind == Fault_Kind::NULL_ANSWER || kind == Fault_Kind::ERROR || kind == Fault_Kind::THROW ||
           kind == Fault_Kind::ANSWER;
}

Json::Value replaced_answer(const Fault& fault)
{
    const Json::Value& words = fault.words;
    const int code = words["code"].asInt();
    if (fault.kind == Fault_Kind::ANSWER)
        return words["answer"];
    if (fault.kind == Fault_Kind::ERROR) {
        Json::Value answer = error_answer(code, words["message"].asString());
        if (words.isMember("error"))
            answer["error"] = words["error"];
        return answer;
    }
    if (fault.kind == Fault_Kind::THROW) {
        if (words["type"] == "HbaAgentError")
            throw HbaAgentError{code, words["message"].asString()};
        if (words["type"] == "std::runtime_error")
            throw std::runtime_error(words["message"].asString());
        throw words["code"].asInt();
    }
    return {};
}

void edit_answer(const Fault& fault, Json::Value& answer)
{
    std::istringstream path(fault.words["member"].asString());
    Json::Value* at = &answer;
    std::string step;
    std::getline(path, step, '.');
    for (std::string next; at && std::getline(path, next, '.'); step = next)
        at = step_into(at, step);
    if (!at)
        return;
    Json::Value* value = step_into(at, step);
    if (fault.kind == Fault_Kind::SET && value)
        *value = fault.words["value"];
    else if (at->type() == Json::objectValue && fault.kind == Fault_Kind::SET)
        (*at)[step] = fault.words["value"];
    else if (at->type() == Json::objectValue)
        at->removeMember(step);
    else if (value)
        at->removeIndex(step_index(step), nullptr);
}

} // namespace KPRV::simulator
