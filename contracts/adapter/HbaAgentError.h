#pragma once

#include <cstdint>
#include <string>

namespace KPRV {

/// An application failure, told by a number and a text.
///
/// The adapter library throws it at its callers, and the agent throws it for failures of its own.
/// `code` is the thrower's number and `message` its text; both reach an agent's client untouched.
///
/// A catch must match what the other library threw, so the type is visible although all else is
/// hidden, and stays as it is: no base, no virtual operations, these two fields in this order. With
/// no key function each library carries weak type information of its own, and the two compare equal.
struct __attribute__((visibility("default"))) HbaAgentError
{
    std::int32_t code = 0;
    std::string message;
};

} // namespace KPRV
