#pragma once

#include "simulator/Json_Text.h"

#include <cstdint>
#include <json/json.h>
#include <string>
#include <vector>

namespace KPRV::simulator {

/// What a fault does to a call.
enum class Fault_Kind
{
    NULL_ANSWER, // answers null
    ERROR,       // answers an object with "error"
    THROW,       // throws
    ANSWER,      // answers something else
    REMOVE,      // leaves a member out of the answer
    SET,         // puts another value into the answer
    DELAY,       // answers late
    HOLD,        // answers when told to
};

/// One way to fail: which calls it hits, and what it does to them.
struct Fault
{
    std::string call;    // an entry point, or "*" for all
    std::string address; // hits only requests that hold this text; empty for all
    unsigned first = 1;  // the first of the matching calls that it hits
    unsigned times = 0;  // how many it hits; 0 for all
    Fault_Kind kind = Fault_Kind::NULL_ANSWER;
    Json::Value words; // the fault as written, with its defaults
    unsigned seen = 0; // matching calls so far
};

/// Reads one fault; simulator/INVENTORY.md tells its shape. Throws Refused.
Fault read_fault(const Json_Text& source, const Json::Value& written);

/// Reads an array of faults. Throws Refused.
std::vector<Fault> read_faults(const Json_Text& source, const Json::Value& written);

/// True if the fault hits this call, which counts as one that it has seen.
bool strikes(Fault& fault, const std::string& call, const Json::Value& request);

/// True if the fault answers in the library's place, so that nothing that was asked for happens.
bool replaces_answer(Fault_Kind kind);

/// The answer of a fault that replaces it. Throws what a THROW fault says.
Json::Value replaced_answer(const Fault& fault);

/// Applies a REMOVE or SET fault to the library's answer; a path that leads nowhere is left alone.
void edit_answer(const Fault& fault, Json::Value& answer);

} // namespace KPRV::simulator
