#pragma once

#include "contracts/adapter/HbaAgentError.h"

namespace KPRV {

// What the agent throws at its own callers; they add nothing but a name to catch or to look for.

/// "params" has not as many elements as the method takes.
struct ErrorParamMismatch : HbaAgentError
{
    ErrorParamMismatch() : HbaAgentError{51, "Mismatch in number of parameters."} {}
};

/// An array was expected.
struct ErrorBadJsonArray : HbaAgentError
{
    ErrorBadJsonArray() : HbaAgentError{54, "Not a JSON array format."} {}
};

/// An object was expected.
struct ErrorBadJsonObject : HbaAgentError
{
    ErrorBadJsonObject() : HbaAgentError{55, "Not a JSON Object format."} {}
};

} // namespace KPRV
