#pragma once

#include "simulator/Entry_Points.h"
#include "simulator/State.h"

#include <json/json.h>
#include <string>

namespace KPRV::simulator {

/// The `code` in the "error" member of a refusal.
enum class Error_Code
{
    REQUEST = 1,     // the request lacks a member, or has one of the wrong type
    ADDRESS = 2,     // no adapter or port has the address
    UNSUPPORTED = 3, // nothing answers this entry point
    INVENTORY = 4,   // the inventory was refused
    EMPTY_SLOT = 5,  // nothing is plugged into the port
    DUPLICATE = 6,   // what is to be made is there already
    NOT_FOUND = 7,   // what was once made, or was to be, is not there
    CONFLICT = 8,    // not in the present state of things
    INJECTED = 99,   // a fault asked for it
};

/// The answer of a library that refuses: {"error": {"name", "code", "message"}}.
Json::Value error_answer(int code, const std::string& message);
Json::Value error_answer(Error_Code code, const std::string& message);

/// The answer to an action that was done: {"status": 0}.
Json::Value done_answer();

/// The first of the members in `asked` (see Behaviours.def) that the request lacks, or that is no text
/// though it names an address; empty if there is none.
std::string missing_member(const std::string& asked, const Json::Value& request);

/// Answers `request` as the row says, under the simulator's lock: checks the request's members,
/// then prefers an answer of the inventory's author to the row's behaviour.
Json::Value answer_by_row(State& state, const Entry_Row& row, const Json::Value& request);

} // namespace KPRV::simulator
